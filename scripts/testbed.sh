#!/bin/bash
# Runs a command in a network of its own: a grandmaster at the other end of the interface bc0, and a
# slave at the other end of each further interface. Needs no privileges where user namespaces are
# allowed. Everything is in private namespaces (mount, network, process ids) and is gone with them,
# however this script ends.
set -euo pipefail

usage() {
    cat <<'END'
usage: scripts/testbed.sh [OPTION]... -- COMMAND [ARGUMENT]...

  --ports P          interfaces bc0 to bc(P-1) for the command (default 1)
  --no-grandmaster   nobody at the other end of bc0
  --log-sync L       logSyncInterval of the grandmaster (default -3: 8 Syncs a second)
  --ahead NS         the grandmaster's clock is so much ahead (default 0)
  --plugin-paths     /usr/bin/ptp4l is linuxptp's ptp4l with software time stamping, and new
                     files in /tmp itself, such as the epoch FIFO, are private
  --help             this text

The command finds /run private and empty, and in its environment:

  TESTBED_INTERFACES       its interfaces, "bc0 bc1 ..."
  TESTBED_GRANDMASTER_UDS  management socket of the grandmaster
  TESTBED_GRANDMASTER_PID  process id of the grandmaster; empty with --no-grandmaster
  TESTBED_FOLDER           a folder for its files, removed afterwards; holds the daemons' logs

TESTBED_LAUNCHER, if set, is a program with arguments that runs the command, such as valgrind.

The exit status is the command's. It is 77, after one line "SKIPPED: reason", where namespaces are
not allowed or linuxptp is not installed. An interrupt (Ctrl-C) reaches the command, which ends in
its own time; any other end of this script takes the command with it.
END
}

readonly ptp4l=/usr/sbin/ptp4l
readonly folder=/run/testbed
readonly grandmaster_uds=$folder/grandmaster.uds

skip() {
    echo "SKIPPED: $1" >&2
    exit 77
}

fail() {
    echo "testbed: $1" >&2
    exit 1
}

# --- outside the namespaces

unshare_all=(unshare --mount --net --pid --fork --kill-child)

# Names of the namespaces that this user may have, as a command prefix.
find_prefix() {
    if "${unshare_all[@]}" true 2>/dev/null; then
        prefix=(setpriv --pdeathsig KILL "${unshare_all[@]}")
    elif unshare --user --map-root-user "${unshare_all[@]}" true 2>/dev/null; then
        # The signal is set behind the change of user, which would take it away.
        prefix=(unshare --user --map-root-user setpriv --pdeathsig KILL "${unshare_all[@]}")
    else
        skip "namespaces are not allowed here"
    fi
}

run_in_namespaces() {
    local prefix child tool status=0
    [[ -x $ptp4l ]] || skip "there is no $ptp4l (package linuxptp)"
    for tool in ip nsenter setpriv unshare; do
        type -P "$tool" >/dev/null || skip "there is no $tool (packages iproute2, util-linux)"
    done
    find_prefix
    # In the background, so that this shell hears signals at once; a background command would
    # ignore interrupts and read nothing if it were not told otherwise.
    env --default-signal=INT,QUIT "${prefix[@]}" /bin/bash "$0" --inside "$@" <&0 &
    child=$!
    trap 'kill -KILL "$child" 2>/dev/null || true' EXIT
    trap 'exit 143' TERM
    trap 'exit 129' HUP
    trap : INT
    wait "$child" || status=$?
    while kill -0 "$child" 2>/dev/null; do
        status=0
        wait "$child" || status=$?
    done
    exit "$status"
}

# --- inside

mount_private() {
    mount --make-rprivate / || skip "mounting is not allowed here"
    mount -t tmpfs -o mode=755 testbed /run || skip "mounting is not allowed here"
    mount -t proc proc /proc 2>/dev/null || true
    mkdir -p "$folder" /run/netns
}

# A private /tmp in which what was there still is: the command may be one of it. Others of the
# machine may remove theirs meanwhile.
mount_private_tmp() {
    local entry
    mkdir -p /run/tmp
    mount --rbind /tmp /run/tmp
    mount -t tmpfs -o mode=1777 testbed /tmp
    for entry in /run/tmp/* /run/tmp/.[!.]*; do
        [[ $entry == */quillEpochOffset ]] && continue
        if [[ -L $entry ]]; then
            cp --no-dereference "$entry" /tmp/ || [[ ! -L $entry ]]
        elif [[ -d $entry ]]; then
            mkdir "/tmp/${entry##*/}"
            mount --rbind "$entry" "/tmp/${entry##*/}" || [[ ! -e $entry ]]
        elif [[ -f $entry ]]; then
            : >"/tmp/${entry##*/}"
            mount --bind "$entry" "/tmp/${entry##*/}" || [[ ! -e $entry ]]
        fi
    done
}

provide_plugin_paths() {
    local layers=/run/overlay
    mkdir -p "$layers/upper" "$layers/work"
    mount -t overlay overlay /usr/bin -o \
        "lowerdir=/usr/bin,upperdir=$layers/upper,workdir=$layers/work" ||
        skip "overlays are not allowed here"
    # Started with an empty environment.
    rm -f /usr/bin/ptp4l
    printf '#!/bin/sh\nexec %s -S "$@"\n' "$ptp4l" >/usr/bin/ptp4l
    chmod 755 /usr/bin/ptp4l
    mount_private_tmp
}

# Joins an interface of the command's network to one of a network of its own.
join() {
    local near=$1 network=$2 far=$3 subnet=$4
    unshare --net="/run/netns/$network" true
    ip link add "$near" type veth peer name "$far" netns "/run/netns/$network" 2>/dev/null ||
        skip "there are no veth interfaces here"
    ip address add "10.$subnet.0.1/24" dev "$near"
    ip link set "$near" up
    nsenter --net="/run/netns/$network" ip address add "10.$subnet.0.2/24" dev "$far"
    nsenter --net="/run/netns/$network" ip link set "$far" up
}

write_configuration() {
    local name=$1
    cat - >"$folder/$name.conf" <<END
[global]
network_transport UDPv4
time_stamping software
free_running 1
logAnnounceInterval 0
logSyncInterval -3
logMinDelayReqInterval -3
uds_address $folder/$name.uds
END
}

start_daemon() {
    local name=$1 interface=$2
    shift 2
    write_configuration "$name"
    printf '%s\n' "$@" >>"$folder/$name.conf"
    nsenter --net="/run/netns/$name" "$ptp4l" -m -q -S -f "$folder/$name.conf" -i "$interface" \
        >"$folder/$name.log" 2>&1 </dev/null &
}

wait_until_ready() {
    local name=$1 pid=$2 tries=200
    until [[ -S $folder/$name.uds ]]; do
        if ! kill -0 "$pid" 2>/dev/null || ((--tries == 0)); then
            cat "$folder/$name.log" >&2
            fail "$name does not start"
        fi
        sleep 0.05
    done
}

run_inside() {
    local interfaces=(bc0) launcher port status=0
    mount_private
    ip link set lo up
    : >/run/netns/grandmaster
    join bc0 grandmaster gm0 10
    for ((port = 1; port < ports; ++port)); do
        : >"/run/netns/slave$port"
        join "bc$port" "slave$port" sl0 "$((10 + port))"
        interfaces+=("bc$port")
    done

    export TESTBED_INTERFACES="${interfaces[*]}"
    export TESTBED_FOLDER=$folder
    export TESTBED_GRANDMASTER_UDS=$grandmaster_uds
    export TESTBED_GRANDMASTER_PID=
    if ((grandmaster)); then
        start_daemon grandmaster gm0 "priority1 10" "logSyncInterval $log_sync" \
            "egressLatency $ahead" "ingressLatency -$ahead"
        TESTBED_GRANDMASTER_PID=$!
        wait_until_ready grandmaster "$TESTBED_GRANDMASTER_PID"
    fi
    for ((port = 1; port < ports; ++port)); do
        start_daemon "slave$port" sl0 "slaveOnly 1"
        wait_until_ready "slave$port" "$!"
    done

    if ((plugin_paths)); then
        provide_plugin_paths
    fi
    # This shell is the first process of its namespace: when it exits, the kernel ends the others.
    trap : INT
    read -ra launcher <<<"${TESTBED_LAUNCHER-}"
    "${launcher[@]}" "$@" || status=$?
    exit "$status"
}

inside=0
if [[ ${1-} == --inside ]]; then
    inside=1
    shift
fi
arguments=("$@")
ports=1
grandmaster=1
log_sync=-3
ahead=0
plugin_paths=0
while (($# > 0)) && [[ $1 != -- ]]; do
    case $1 in
    --ports)
        [[ ${2-} =~ ^[1-9][0-9]?$ ]] || fail "--ports takes a number from 1 to 99"
        ports=$2
        shift
        ;;
    --no-grandmaster) grandmaster=0 ;;
    --log-sync)
        [[ ${2-} =~ ^-?[0-7]$ ]] || fail "--log-sync takes a number from -7 to 7"
        log_sync=$2
        shift
        ;;
    --ahead)
        [[ ${2-} =~ ^[0-9]{1,9}$ ]] || fail "--ahead takes nanoseconds, below a second"
        ahead=$2
        shift
        ;;
    --plugin-paths) plugin_paths=1 ;;
    --help)
        usage
        exit 0
        ;;
    *)
        usage >&2
        exit 2
        ;;
    esac
    shift
done
if (($# < 2)); then
    usage >&2
    exit 2
fi
shift

if ((inside)); then
    run_inside "$@"
else
    run_in_namespaces "${arguments[@]}"
fi
