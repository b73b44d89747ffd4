#!/usr/bin/env bash
# Lists the lines and branches of source/ and support/ that no test of the library reaches, and fails when there
# are any. Line by line: build/coverage/report/index.html. gcovr.cfg says what counts; code that cannot be
# reached is marked GCOVR_EXCL_..., with the reason in the same line.
#   scripts/coverage.sh
set -euo pipefail
cd "$(dirname "$0")/.."

if [[ $# -gt 0 ]]; then
  sed -n 's/^#   /usage: /p' "scripts/${0##*/}" >&2
  exit 2
fi
build=build/coverage
report=$build/report
log=$build/ctest.log
jobs=$(nproc)

scripts/setup.sh tests checks
cmake --preset coverage >/dev/null
# What was counted before, by other code.
find "$build" -name '*.gcda' -delete
cmake --build --preset coverage -j "$jobs" --target units contract_tests session_tests faults -- --quiet

if ! ctest --preset coverage -j $((jobs * 4)) --label-regex '^(unit|contract|session|faults)$' >"$log"; then
  sed -n '/tests passed/,$p' "$log"
  echo "coverage: tests FAILED; see $log" >&2
  exit 1
fi
grep '% tests passed' "$log"

# Code that an object has twice, of a header or a template, counts where it is run. Where it is not, gcov of
# GCC 12 does not tell which branches are those of exceptions.
run_gcov() {
  gcov "$@"
  find . -maxdepth 1 -name '*.gcov' -exec sed -i '/^branch .* never executed/d' {} +
}
export -f run_gcov
rm -rf "$report"
mkdir "$report"
gcovr -j "$jobs" --gcov-executable "bash -c 'run_gcov \"\$@\"' gcov" --json "$report/coverage.json" \
  --html-details "$report/index.html" "$build"

# Prints the files that have something left, with its lines.
list_left() { # what, option of gcovr...
  local left
  left=$(gcovr --add-tracefile "$report/coverage.json" "${@:2}" | awk '/^(source|support)\// && $5 != ""')
  [[ -z $left ]] || printf '\n%s that no test reaches:\n%s\n' "$1" "$left"
}

list_left lines
list_left branches --branches
echo
gcovr --add-tracefile "$report/coverage.json" --txt "$report/summary.txt" --print-summary --fail-under-line 100 \
  --fail-under-branch 100
