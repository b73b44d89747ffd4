#!/usr/bin/env bash
# The machine's side of scripts/closed_loop.sh: its clock is followed in one way after the other, while an observer
# of its own looks at it. What is seen goes out line by line, as does what the outside is asked for: "sound" and
# "silence" of the grandmaster and the server that is followed.
set -euo pipefail
cd /closed_loop
readonly outside=10.9.0.2 observations=/var/log/observer/measurements.log
# Seconds; a quick run has a third of them.
part=$(sed -n 's/.* closed_loop.part=\([0-9]\).*/\1/p' /proc/cmdline)
readonly part free=8 settling=$((45 / part)) steady=$((60 / part)) silence=$((60 / part)) return=$((25 / part)) \
  killed=$((20 / part))

fail() {
  echo "failed: $*"
  exit 1
}

await() { # seconds, command...
  local end=$((SECONDS + $1))
  shift
  until "$@"; do
    ((SECONDS < end)) || fail "never held: $*"
    sleep 0.2
  done
}

# --- observers

# Of the outside's clock, four times a second; it steers nothing.
start_observer() {
  install -d -o _chrony /var/log/observer
  cat >observer.conf <<END
server $outside minpoll -2 maxpoll -2 xleave noselect
port 0
cmdport 0
bindcmdaddress /
pidfile /run/observer.pid
logdir ${observations%/*}
log rawmeasurements
END
  chronyd -x -f "$PWD/observer.conf"
  await 20 test -s "$observations"
}

# Tells each time by how many seconds CLOCK_REALTIME was set: what is slewed is slewed in CLOCK_MONOTONIC as well. Of
# five readings the one between the two closest of the other clock.
tell_steps() {
  perl -MTime::HiRes=clock_gettime,sleep,CLOCK_REALTIME,CLOCK_MONOTONIC -e '
    $| = 1;
    sub distance {
      my ($best, $shortest) = (0, 9);
      for (1 .. 5) {
        my $before = clock_gettime(CLOCK_MONOTONIC);
        my $now = clock_gettime(CLOCK_REALTIME);
        my $after = clock_gettime(CLOCK_MONOTONIC);
        ($best, $shortest) = ($now - ($before + $after) / 2, $after - $before) if $after - $before < $shortest;
      }
      return $best;
    }
    for (my $last = distance(); ; sleep(0.2)) {
      my $now = distance();
      next if abs($now - $last) < 20e-6;
      printf("step %.6f %.6f\n", clock_gettime(CLOCK_REALTIME), $now - $last);
      $last = $now;
    }'
}

# --- what is followed, and how

start_pairs() {
  cp pairs.conf /etc/chrony/conf.d/vantel-host.conf
  systemctl start chrony vantel-host
}
kill_pairs() { pkill --exact --signal KILL ptp4l; }
stop_pairs() {
  sed -e '/^free_running/d' -e 's/^step_threshold .*/step_threshold 0/' \
    /run/vantel-host/morwen/ClockHub/ptp4l_bc.conf >servo.conf
  systemctl stop vantel-host chrony
}

start_servo() {
  systemd-run --quiet --unit=servo --property=Restart=always --property=RestartSec=1 \
    /usr/sbin/ptp4l -S -f "$PWD/servo.conf" -i eth0
}
kill_servo() { systemctl kill --signal=KILL servo; }
stop_servo() { systemctl stop servo; }

start_ntp() {
  echo "server $outside port 124 iburst" >/etc/chrony/conf.d/vantel-host.conf
  systemctl start chrony
}
kill_ntp() { systemctl kill --signal=KILL chrony; }
stop_ntp() { systemctl stop chrony; }

# --- a way from start to end

mark() { # way, phase
  echo "mark $1 $2 $EPOCHREALTIME"
}

phase() { # way, name, seconds
  mark "$1" "$2"
  sleep "$3"
}

count_observations() { grep -c " $outside " "$observations"; }
are_observations() { (($(count_observations) >= $1)); }

# By what the observer sees. A step is told before what follows.
set_ahead() { # seconds
  await 10 are_observations $(($(count_observations) + 4))
  phc_ctl -qQ CLOCK_REALTIME -- adj "$(tail -n 4 "$observations" |
    awk -v ahead="$1" '{ sum += $12 } END { printf "%.6f", sum / NR + ahead }')"
  sleep 0.5
}

# At its own frequency, and 50 ms ahead.
displace_clock() { # way
  rm -f /var/lib/chrony/*
  phc_ctl -qQ CLOCK_REALTIME -- freq 0
  set_ahead 0
  phase "$1" free "$free"
  set_ahead 0.05
}

follow() { # way
  displace_clock "$1"
  mark "$1" start
  "start_$1"
  sleep "$settling"
  phase "$1" steady "$steady"
  echo silence
  phase "$1" silence "$silence"
  echo sound
  phase "$1" return "$return"
  "kill_$1"
  phase "$1" killed "$killed"
  mark "$1" end
  "stop_$1"
}

ip address add 10.9.0.1/24 dev eth0
ip link set eth0 up
await 20 test -e /dev/virtio-ports/report
exec >/dev/virtio-ports/report 2>&1
trap '[[ $? == 0 ]] || echo "failed: line $LINENO"; sync' EXIT
cp /etc/chrony/conf.d/vantel-host.conf pairs.conf
start_observer
tell_steps &
echo sound
for way in pairs servo ntp; do
  follow "$way"
done
sed -n "s/^20.* $outside /seen &/p" "$observations"
journalctl --boot --no-pager --unit=vantel-host --unit=chrony --unit=servo --identifier=ptp4l | sed 's/^/journal /'
echo "end"
