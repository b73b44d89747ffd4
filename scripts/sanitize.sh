#!/usr/bin/env bash
# Runs the tests under checkers of memory and threads; each finding fails. Default: all of them.
#   asan      all tests under AddressSanitizer, LeakSanitizer and UndefinedBehaviorSanitizer
#   tsan      all tests under ThreadSanitizer
#   memcheck  the library as it is shipped, with the real ptp4l, under valgrind's memcheck
# usage: scripts/sanitize.sh [asan|tsan|memcheck]...
set -euo pipefail
cd "$(dirname "$0")/.."

# Nothing is suppressed, here or in the presets.
memcheck() {
  local launcher="valgrind --quiet --error-exitcode=99 --fair-sched=yes --leak-check=full"
  launcher+=" --errors-for-leak-kinds=definite,possible"
  scripts/setup.sh tests checks
  cmake --preset release
  cmake --build --preset release -j "$(nproc)" -- --quiet
  TESTBED_LAUNCHER=$launcher ctest --preset release --label-regex scene -j "$(nproc)"
}

if [[ $# -eq 0 ]]; then
  set -- asan tsan memcheck
fi
summary=()
failed=0
for checker in "$@"; do
  # In the background: there, its first error ends it.
  case $checker in
    asan | tsan) scripts/check.sh "$checker" & ;;
    memcheck) memcheck & ;;
    *)
      sed -n 's/^# usage: /usage: /p' "$0" >&2
      exit 2
      ;;
  esac
  outcome=clean
  wait "$!" || outcome=FAILED
  [[ $outcome == clean ]] || failed=1
  summary+=("$(printf '%-8s %s' "$checker" "$outcome")")
done
printf '%s\n' "" "${summary[@]}"
exit "$failed"
