#!/usr/bin/env bash
# Runs the host as its service does, in a scene of scripts/testbed.sh: with kills of the daemon, losses of the
# grandmaster, and scrapes, in every second span of time. In each of the others it must be locked all the time;
# memory and descriptors must not grow.
# usage: tests/soak/service_soak.sh BUILD_FOLDER SECONDS SEED    (in the scene)
set -euo pipefail
build=$1
seconds=$2
RANDOM=$3
readonly address=127.0.0.1 port=9993 allowedGrowth=1024 # KiB
folder=$TESTBED_FOLDER/soak
mkdir "$folder"
record=$folder/record.jsonl

# An hour has 60 spans; a fault must be over after the first half of one.
span=$((seconds / 60))
((span >= 40)) || span=40

fail() {
  echo "FAILED: $*"
  grep -aE '"event":"(health|restart|daemon-ended|error)"' "$record" | tail -n 20
  exit 1
}

start_host() {
  # Announce messages as the grandmaster sends them: a loss shows within some seconds.
  "$build/tools/host/vantel-host" run --library "$build/source/libvantel_bc.so.19" --restart --create-fifo \
    --quiet --interface bc0 --set networkTransport=UDPv4 --set logAnnounceInterval=0 \
    --metrics "$address:$port" --record "$record" >"$folder/output" 2>&1 </dev/null &
  host=$!
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

# One after the other, each at a moment of the first quarter of a span; it is over before the second half.
cause_a_fault() {
  local faults=(kill_daemon silence_grandmaster)
  sleep $((RANDOM % (span / 4)))
  "${faults[fault_count++ % ${#faults[@]}]}"
}

# --- judgement

# The states in a span of time, from the one that it begins with.
states_between() { # nanoseconds since 1970
  sed -nE 's/^\{"event":"health",.*"time":([0-9]+),.*"state":"([a-z]+)".*/\1 \2/p' "$record" |
    awk -v from="$1" -v to="$2" '$1 <= from { first = $2 } $1 > from && $1 < to { print $2 }
      END { print first == "" ? "starting" : first }' | sort -u | tr '\n' ' '
}

memory() { awk '/^VmRSS:/ { print $2 }' "/proc/$host/status"; }
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
  ((locked_spans > 2)) || before=$now # what the first restarts take is kept
  echo "$((SECONDS / 60)) min: $now"
  ((${now%% *} <= ${before%% *} + allowedGrowth)) || fail "memory grew from $before"
  [[ ${now#*, } == "${before#*, }" ]] || fail "descriptors: $now, before: $before"
}

locked_spans=0
fault_count=0
start_host
keep_scraping &
scraper=$!
sleep "$span"
while ((SECONDS + 2 * span <= seconds)); do
  stay_locked
  ((locked_spans += 1))
  judge_holdings
  fault_end=$((SECONDS + span))
  cause_a_fault
  sleep $((fault_end > SECONDS ? fault_end - SECONDS : 0))
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
