#!/usr/bin/env bash
# Runs the tests under checkers of memory and threads; each finding fails. Default: all of them.
#   asan      all tests under AddressSanitizer, LeakSanitizer and UndefinedBehaviorSanitizer
#   tsan      all tests under ThreadSanitizer
#   memcheck  the library as it is shipped, with the real ptp4l, under valgrind's memcheck
# usage: scripts/sanitize.sh [asan|tsan|memcheck]...
set -euo pipefail
cd "$(dirname "$0")/.."

# The reference host is checked too where a test starts it; daemons and tools of the system are not.
memcheck() {
  local launcher="valgrind --quiet --error-exitcode=99 --fair-sched=yes --leak-check=full"
  launcher+=" --errors-for-leak-kinds=definite,possible --trace-children=yes"
  launcher+=" --trace-children-skip=/bin/*,/sbin/*,/usr/bin/*,/usr/sbin/*,*/simptp4l"
  scripts/setup.sh checks &&
    TESTBED_LAUNCHER=$launcher scripts/check.sh release --label-regex scene
}

if [[ $# -eq 0 ]]; then
  set -- asan tsan memcheck
fi
# Nothing is suppressed, here or in the presets.
summary=()
failed=0
for checker in "$@"; do
  status=0
  case $checker in
    asan | tsan) scripts/check.sh "$checker" || status=$? ;;
    memcheck) memcheck || status=$? ;;
    *)
      sed -n 's/^# usage: /usage: /p' "scripts/${0##*/}" >&2
      exit 2
      ;;
  esac
  case $status in
    0) outcome=clean ;;
    77) outcome="SKIPPED: no test could run" ;;
    *) outcome=FAILED failed=1 ;;
  esac
  summary+=("$(printf '%-8s %s' "$checker" "$outcome")")
done
printf '%s\n' "" "${summary[@]}"
exit "$failed"
