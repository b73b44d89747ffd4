#!/usr/bin/env bash
# Runs the host as its service does, in a scene of scripts/testbed.sh, while it is scraped: with a file of options, a
# record of limited size, and after each span of time a fault: a daemon that is killed or hangs, a grandmaster that
# falls silent, new settings. From when it is locked again it must be so for a whole span; memory and descriptors must
# not grow, and no zombie may stay.
# usage: tests/soak/service_soak.sh BUILD_FOLDER SECONDS SEED    (in the scene)
set -euo pipefail
build=$1
seconds=$2
RANDOM=$3
readonly address=127.0.0.1 port=9993
# KiB: the offsets of an hour, for those who ask for the status, and a copy while it is made.
readonly allowedGrowth=2048
# Seconds: a session that is given up, its stop, the longest wait before the next one, and its start.
readonly longestOutage=120
folder=$TESTBED_FOLDER/soak
mkdir "$folder"
record=$folder/record.jsonl
settings=$folder/vantel-host.toml

# An hour has 60 spans; a fault must be over after the first half of one.
span=$((seconds / 60))
((span >= 40)) || span=40

fail() {
  echo "FAILED: $*"
  grep -aE '"event":"(health|restart|daemon-ended|error)"' "$record" | tail -n 20
  exit 1
}

# Announce messages as the grandmaster sends them: a loss shows within some seconds, and a session is given up before a
# fault is over.
write_settings() { # priority1
  cat >"$settings" <<END
interface = ["bc0"]
restart = true
give-up-after = 4
create-fifo = true
quiet = true
status-socket = "$folder/status.sock"
metrics = "$address:$port"
record = "$record"
record-append = true
record-size = "1M"
record-keep = 3

[settings]
networkTransport = "UDPv4"
logAnnounceInterval = 0
configFile = "$folder/ptp4l.conf"
priority1 = $1
END
}

start_host() {
  write_settings 128
  "$build/tools/host/vantel-host" run --library "$build/source/libvantel_bc.so.19" --config "$settings" \
    >"$folder/output" 2>&1 </dev/null &
  host=$!
}

is_locked() {
  "$build/tools/host/vantel-host" status --socket "$folder/status.sock" >/dev/null 2>&1
}

# Waits for a command to succeed.
await() { # seconds, command...
  local end=$((SECONDS + $1))
  shift
  until "$@"; do
    ((SECONDS < end)) || fail "never held: $*"
    sleep 0.2
  done
}

daemon_of_host() {
  pgrep --parent "$host" --exact ptp4l
}

# --- scrapes

scrape() {
  exec 3<>"/dev/tcp/$address/$port"
  printf 'GET /metrics HTTP/1.1\r\nHost: soak\r\nConnection: close\r\n\r\n' >&3
  grep -ac '^vantel_' <&3
}

keep_scraping() {
  while sleep 0.1; do
    (scrape) 2>/dev/null || true
  done >"$folder/scrapes"
}

# --- faults

kill_daemon() {
  kill -KILL "$(daemon_of_host)"
}

silence_grandmaster() {
  kill -STOP "$TESTBED_GRANDMASTER_PID"
  sleep $((span / 4))
  kill -CONT "$TESTBED_GRANDMASTER_PID"
}

has_another_daemon() { # former
  local now
  now=$(daemon_of_host) && [[ $now != "$1" ]]
}

hang_daemon() {
  local daemon
  daemon=$(daemon_of_host)
  kill -STOP "$daemon"
  await $longestOutage has_another_daemon "$daemon"
}

reload_settings() {
  local daemon
  daemon=$(daemon_of_host)
  write_settings $((100 + fault_count))
  kill -HUP "$host"
  await 30 has_another_daemon "$daemon"
  grep -Eq "^priority1[[:space:]]+$((100 + fault_count))$" "$folder/ptp4l.conf" || fail "ptp4l has the old settings"
}

# One after the other, each at a moment of the first quarter of a span; it lasts as long at least.
cause_a_fault() {
  local faults=(kill_daemon silence_grandmaster reload_settings hang_daemon)
  sleep $((RANDOM % (span / 4)))
  "${faults[fault_count++ % ${#faults[@]}]}"
}

# --- judgement

# The states in a span of time, from the one that it begins with.
states_between() { # nanoseconds since 1970
  # Those before the first ones are not there yet.
  { cat "$record".{3,2,1} "$record" 2>/dev/null || true; } |
    sed -nE 's/^\{"event":"health",.*"time":([0-9]+),.*"state":"([a-z]+)".*/\1 \2/p' |
    awk -v from="$1" -v to="$2" '$1 <= from { first = $2 } $1 > from && $1 < to { print $2 }
      END { print first == "" ? "starting" : first }' | sort -u | tr '\n' ' '
}

memory() { awk '/^VmRSS:/ { print $2 }' "/proc/$host/status"; }
zombies() { pgrep --count --parent "$host" --runstates Z || true; }
descriptors() { find "/proc/$host/fd" -mindepth 1 | wc -l; }

stay_locked() {
  local from to states
  from=$(date +%s%N)
  sleep "$span"
  to=$(date +%s%N)
  kill -0 "$host" 2>/dev/null || fail "the host has ended: $(tail -n 3 "$folder/output")"
  states=$(states_between "$from" "$to")
  [[ $states == "locked " ]] || fail "it was $states in a span without a fault"
}

judge_holdings() {
  local now
  now="$(memory) KiB, $(descriptors) descriptors"
  ((locked_spans > 5)) || before=$now # what the first fault of each kind takes is kept
  echo "$((SECONDS / 60)) min: $now"
  ((${now%% *} <= ${before%% *} + allowedGrowth)) || fail "memory grew from $before"
  [[ ${now#*, } == "${before#*, }" ]] || fail "descriptors: $now, before: $before"
  [[ $(zombies) == 0 ]] || fail "$(zombies) zombies"
}

locked_spans=0
fault_count=0
start_host
keep_scraping &
scraper=$!
await "$span" is_locked
while ((SECONDS + 2 * span <= seconds)); do
  stay_locked
  ((locked_spans += 1))
  judge_holdings
  fault_end=$((SECONDS + span))
  cause_a_fault
  sleep $((fault_end > SECONDS ? fault_end - SECONDS : 0))
  await $longestOutage is_locked
done
stay_locked
kill "$scraper"
kill -TERM "$host"
status=0
wait "$host" || status=$?
((status == 0)) || fail "the host ended with status $status: $(tail -n 3 "$folder/output")"
scrapes=$(grep -c '^[1-9]' "$folder/scrapes" || true)
((scrapes >= seconds)) || fail "only $scrapes scrapes in $seconds s"
echo "passed: $fault_count faults; locked in $((locked_spans + 1)) spans of $span s; $scrapes scrapes"
