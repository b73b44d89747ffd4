#!/usr/bin/env bash
# Runs the plug-in against the simulated daemon, session after session in one process, while daemon,
# host and FIFO misbehave at random. Fails when the process dies, a session does not recover, or memory
# or descriptors grow. The same seed and time give the same faults.
#   scripts/soak.sh [--seed N] [--plan] [MINUTES]
#   scripts/soak.sh --service [--seed N] [MINUTES]
# MINUTES is 10 by default. --plan only prints what would go wrong. Ctrl-C ends with a report.
# With --service the host runs as its service does, in front of a real ptp4l and a grandmaster: daemons are killed or
# hang, grandmasters are lost, settings change, metrics are scraped. It must be locked in all minutes between; for an
# hour these are 25 at least. 3 minutes are the least.
set -euo pipefail
cd "$(dirname "$0")/.."

usage() {
  sed -n 's/^#   /usage: /p' "scripts/${0##*/}" >&2
  exit 2
}

minutes=10
seed=$((RANDOM * 32768 + RANDOM))
service=no
options=()
while [[ $# -gt 0 ]]; do
  case $1 in
    --seed)
      # Without zeros in front: it would be read as octal.
      [[ ${2-} =~ ^(0|[1-9][0-9]{0,17})$ ]] || usage
      seed=$2
      shift
      ;;
    --plan) options+=(--plan) ;;
    --service) service=yes ;;
    *)
      [[ $1 =~ ^[1-9][0-9]{0,3}$ ]] || usage
      minutes=$1
      ;;
  esac
  shift
done

scripts/setup.sh tests
cmake --preset release >/dev/null
build() { # target...
  cmake --build --preset release -j "$(nproc)" --target "$@" -- --quiet
}

if [[ $service == yes ]]; then
  build vantel-host vantel_bc
  exec scripts/testbed.sh --plugin-paths -- tests/soak/service_soak.sh build/release $((minutes * 60)) "$seed"
fi
build soak

# A process group of its own, so that nothing stays behind when the host dies. A session that cannot be
# stopped hangs the host, which then cannot tell of it.
folder=$(mktemp -d)
set -m
TMPDIR=$folder timeout --foreground --kill-after=60 $((minutes * 75 + 120)) \
  build/release/tests/soak/soak --seconds $((minutes * 60)) --seed "$seed" "${options[@]}" &
job=$!
set +m
trap 'kill -KILL -- "-$job" 2>/dev/null || true; rm -rf "$folder"' EXIT
trap 'kill -INT "$job" 2>/dev/null || true' INT TERM

status=0
wait "$job" || status=$?
while kill -0 "$job" 2>/dev/null; do
  status=0
  wait "$job" || status=$?
done
if [[ $status -gt 2 ]]; then
  echo "soak: FAILED: the host died or hung, status $status" >&2
fi
exit "$status"
