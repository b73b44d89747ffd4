#!/usr/bin/env bash
# Runs every row of the fault matrix of docs/testing.md so many times (default 3), and prints what
# stop took at most in each, beside what it may take and by how much sleeps in it were late. Fails
# when a row fails, or has measured no stop and was not skipped.
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
ctest --test-dir build/release/tests/faults --no-tests=error --verbose --repeat "until-fail:$times" \
  -j $((2 * $(nproc))) >"$log" || status=$?

# First the rows, then what was printed.
awk '
  FNR == NR {
    if (match($0, /s \| `[A-Za-z]+\.[A-Za-z0-9]+` \|$/))
      rows[substr($0, RSTART + 5, RLENGTH - 8)]
    next
  }
  match($0, /\[ STOP \] .* s of at most .* s late$/) {
    split(substr($0, RSTART + 9, RLENGTH - 9), part, /: | s of at most | s \+ | s late$/)
    name = part[1]
    if (!(name in runs) || part[2] - part[4] > worst[name] - late[name]) {
      worst[name] = part[2]
      late[name] = part[4]
    }
    bound[name] = part[3]
    ++runs[name]
  }
  match($0, /\[  SKIPPED \] [^ ]+ \(/) {
    name = substr($0, RSTART + 13, RLENGTH - 15)
    sub(/^[^.]*\//, "", name)
    sub(/\/.*/, "", name)
    skipped[name]
  }
  END {
    printf "%-72s %9s %9s %9s %5s\n", "row", "worst", "bound", "late", "runs"
    fflush()
    for (name in runs)
      printf "%-72s %7.3f s %7.1f s %7.1f s %5d\n", name, worst[name], bound[name], late[name],
        runs[name] | "sort"
    close("sort")
    for (name in rows)
      if (!(name in runs) && !(name in skipped)) {
        print "no stop was measured: " name
        missing = 1
      }
    exit missing
  }' docs/testing.md "$log" || status=1
# What failed and what was skipped, from the summary of ctest on.
sed -n '/tests passed/,$p' "$log"
if [[ $status -ne 0 ]]; then
  echo "faults: FAILED; see $log" >&2
fi
exit "$status"
