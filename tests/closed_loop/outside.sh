#!/usr/bin/env bash
# The outside of scripts/closed_loop.sh, in a scene of scripts/testbed.sh: the grandmaster, the server that is followed
# and the one that the observer asks, all of this machine's clock, on a tap device; and the emulated machine. Writes
# what that tells into FOLDER/told.
# usage: tests/closed_loop/outside.sh FOLDER PART    (PART: 1, or 3 for a third of the time)
set -euo pipefail
folder=$1
part=$2

make_tap() {
  ip tuntap add dev tap0 mode tap
  ip address add 10.9.0.2/24 dev tap0
  ip link set tap0 up
}

start_grandmaster() {
  cat >"$TESTBED_FOLDER/grandmaster.conf" <<END
[global]
network_transport UDPv4
free_running 1
priority1 10
logAnnounceInterval 0
logSyncInterval -3
logMinDelayReqInterval -3
uds_address $TESTBED_FOLDER/grandmaster.uds
END
  /usr/sbin/ptp4l -m -q -S -f "$TESTBED_FOLDER/grandmaster.conf" -i tap0 >>"$folder/grandmaster.log" 2>&1 </dev/null &
  grandmaster=$!
}

# It serves the time and steers nothing.
start_server() { # port
  cat >"$TESTBED_FOLDER/server$1.conf" <<END
local stratum 1
allow
port $1
cmdport 0
bindcmdaddress /
pidfile $TESTBED_FOLDER/server$1.pid
END
  /usr/sbin/chronyd -x -d -U -u root -f "$TESTBED_FOLDER/server$1.conf" >>"$folder/server.log" 2>&1 </dev/null &
  server=$!
}

sound() {
  start_grandmaster
  start_server 124
}

silence() {
  kill -KILL "$grandmaster" "$server"
  wait "$grandmaster" "$server" || true
}

# Its clock is 40 ppm fast: it takes its counter for one that is slower, and has nothing to find out by. Its processor
# never idles: to wake one that is emulated takes longer than all else on the way.
run_machine() {
  local kHz
  kHz=$("$folder/tsc_khz")
  exec qemu-system-x86_64 -machine q35,hpet=off -accel tcg -cpu max -m 1024 -nodefaults -no-reboot \
    -display none -kernel "$folder/vmlinuz" -initrd "$folder/initrd" -append "root=/dev/vda rw console=ttyS0 \
net.ifnames=0 hpet=disable pmtmr=0 tsc_early_khz=$((kHz - kHz * 40 / 1000000)) tsc=reliable clocksource=tsc \
no-kvmclock nowatchdog idle=poll closed_loop.part=$part" -drive "file=$folder/root.ext4,if=virtio,format=raw,snapshot=on" \
    -netdev tap,id=net,ifname=tap0,script=no,downscript=no -device virtio-net-pci,netdev=net,romfile= \
    -serial "file:$folder/console.log" -chardev file,id=report,path=/dev/stdout -device virtio-serial \
    -device virtserialport,chardev=report,name=report </dev/null 2>"$folder/machine.log"
}

# Does what the machine asks for, and keeps what it tells.
attend() {
  local line
  while IFS= read -r line; do
    case $line in
      sound | silence) "$line" ;;
      mark*) echo "${line#mark }" >&2 ;;
    esac
    printf '%s\n' "$line"
  done
}

rm -f "$folder"/*.log
make_tap
start_server 123
run_machine | attend >"$folder/told"
