#!/usr/bin/env bash
# Runs every row of the fault matrix of docs/testing.md so many times (default 3), and prints what
# stop took at most in each, beside what it may take. Fails when a row fails.
# usage: scripts/faults.sh [times]
set -euo pipefail
cd "$(dirname "$0")/.."

times=${1:-3}
if [[ $# -gt 1 || ! $times =~ ^[1-9][0-9]*$ ]]; then
  echo "usage: $0 [times]" >&2
  exit 2
fi
log=build/release/faults.log

scripts/setup.sh tests
cmake --preset release >/dev/null
cmake --build --preset release -j "$(nproc)" --target faults -- --quiet

# Each row is a process in a folder of its own, which sleeps most of the time.
status=0
ctest --test-dir build/release/tests/faults --verbose --repeat "until-fail:$times" \
  -j $((2 * $(nproc))) >"$log" || status=$?

awk '
  match($0, /\[ STOP \] .* s of at most .* s$/) {
    split(substr($0, RSTART + 9, RLENGTH - 9), part, / s$|: | s of at most /)
    name = part[1]
    if (part[2] > worst[name]) worst[name] = part[2]
    bound[name] = part[3]
    ++runs[name]
  }
  END {
    printf "%-90s %9s %9s %5s\n", "row", "worst", "bound", "runs"
    fflush()
    for (name in runs)
      printf "%-90s %7.3f s %7.1f s %5d\n", name, worst[name], bound[name], runs[name] | "sort"
  }' "$log"
# What failed and what was skipped, from the summary of ctest on.
sed -n '/tests passed/,$p' "$log"
if [[ $status -ne 0 ]]; then
  echo "faults: FAILED; see $log" >&2
fi
exit "$status"
