#!/bin/sh
# The interface eth0 of this machine, at whose other end is a network for a grandmaster.
set -e
ip netns add grandmaster
ip link add eth0 type veth peer name gm0 netns grandmaster
ip address add 10.9.0.1/24 dev eth0
ip link set eth0 up
ip -n grandmaster address add 10.9.0.2/24 dev gm0
ip -n grandmaster link set gm0 up
cat >/run/grandmaster.conf <<END
[global]
network_transport UDPv4
free_running 1
priority1 10
logAnnounceInterval 0
logSyncInterval -3
logMinDelayReqInterval -3
uds_address /run/grandmaster.uds
END
