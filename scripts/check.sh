#!/usr/bin/env bash
# Installs what is missing, builds one preset (default: release), or one target of it, and runs all its
# tests, or those that options of ctest choose. The last line is the count of ctest, which counts skipped
# tests as passed: they are listed above. The exit status is 77 when all were skipped. On Debian 12 the preset
# riscv64 takes what is committed to a clean root of Debian 13.
#   scripts/check.sh [PRESET [--target NAME] [OPTION]...]
set -euo pipefail
cd "$(dirname "$0")/.."

preset=${1:-release}
target=all
options=("${@:2}")
if [[ ${2-} == --target ]]; then
  target=${3:?--target needs a name}
  options=("${@:4}")
fi
case $preset in
  --help)
    sed -n '2,/^set /s/^# \{0,1\}//p' "scripts/${0##*/}"
    exit 0
    ;;
  -*)
    sed -n 's/^#   /usage: /p' "scripts/${0##*/}" >&2
    exit 2
    ;;
  armhf | arm64 | s390x) groups=("$preset") ;;
  riscv64)
    groups=(riscv64)
    if grep -qx VERSION_CODENAME=bookworm /etc/os-release; then
      # It has no packages for it.
      scripts/setup.sh packages
      exec scripts/release_test.sh trixie "$@"
    fi
    ;;
  clang | fuzz) groups=(tests checks) ;;
  hardened) groups=(tests packages) ;;
  *) groups=(tests) ;;
esac
jobs=$(nproc)
# Most tests wait most of the time; less so in an emulator, or with a sanitizer.
case $preset in
  armhf | arm64 | riscv64 | s390x | asan | tsan) test_jobs=$((jobs * 4)) ;;
  *) test_jobs=$((jobs * 12)) ;;
esac
log=build/$preset/ctest.log

# Lists the tests that did not run, each with its reason: the text behind GoogleTest's
# "file:line: Skipped", else the last line that the test printed. First those of ctest, then those of
# GoogleTest that share a process with others.
list_skipped() {
  awk '
    FNR == 1 { ++file }
    file == 1 && sub(/^[0-9]+\/[0-9]+ Testing: /, "") { test = $0; text = announced = done = "" }
    file == 1 && /^\[ RUN      \] / { part = $4; text = announced = done = "" }
    file == 1 && /^\[  SKIPPED \] .*\([0-9]+ ms\)$/ { parts[++count] = part; reason[part] = text }
    file == 1 && /^<end of output>$/ { reason[test] = text; inside = 0 }
    inside && !done && /./ { text = $0 }
    inside && announced { done = 1 }
    inside && /: Skipped$/ { announced = 1 }
    file == 1 && /^Output:$/ { inside = 1; getline }

    file == 2 && /^$/ { listed = 0 }
    listed {
      sub(/^[ \t]*[0-9]+ - /, "")
      sub(/ \([A-Za-z ]+\)$/, "")
      print "skipped: " $0 ": " (reason[$0] ? reason[$0] : "disabled")
      told[$0] = 1
    }
    file == 2 && /^The following tests did not run:$/ { listed = 1 }

    END {
      for (i = 1; i <= count; ++i) {
        if (!(parts[i] in told)) print "skipped: " parts[i] ": " reason[parts[i]]
      }
    }
  ' "build/$preset/Testing/Temporary/LastTest.log" "$log"
}

scripts/setup.sh "${groups[@]}"
cmake --preset "$preset"
cmake --build --preset "$preset" -j "$jobs" --target "$target"

status=0
ctest --preset "$preset" -j "$test_jobs" "${options[@]}" | tee "$log" || status=$?
if ! count=$(grep '% tests passed' "$log"); then
  echo "check: no test ran; see the messages above" >&2
  exit 1
fi

echo
skipped=$(list_skipped)
[[ -z $skipped ]] || echo "$skipped"
echo "$count"
if [[ $status -eq 0 && $(grep --count '^skipped: ' <<<"$skipped") -eq ${count##* } ]]; then
  exit 77
fi
exit "$status"
