#!/usr/bin/env bash
# Fuzzes each target for a time (default: 60 seconds), as many at once as there are processors. Reports
# executions and findings, and how much of the code under test the inputs reach.
#   scripts/fuzz.sh [--minimise] [SECONDS [TARGET]...]
# --minimise leaves in fuzz/corpus the inputs that have a name, and of the others, and of those found, what
# reaches code that no other does. With 0 seconds it does only that.
set -euo pipefail
cd "$(dirname "$0")/.."
# Targets may work in a folder of their own.
corpora=$PWD/fuzz/corpus
work=$PWD/build/fuzz/work

minimise=no
if [[ ${1-} == --minimise ]]; then
  minimise=yes
  shift
fi
seconds=${1:-60}
targets=("${@:2}")
if ! [[ $seconds =~ ^(0|[1-9][0-9]*)$ ]] || [[ $seconds == 0 && $minimise == no ]]; then
  sed -n 's/^#   /usage: /p' "scripts/${0##*/}" >&2
  exit 2
fi
if [[ ${#targets[@]} -eq 0 ]]; then
  targets=("$corpora"/*)
  targets=("${targets[@]##*/}")
fi
# One target. libFuzzer ends at its first finding, and leaves the input in findings/.
fuzz() { # target
  local target=$1 status=0
  mkdir -p "$work/corpus/$target" "$work/findings"
  build/fuzz/fuzz/"$target" -max_total_time="$seconds" -timeout=60 -print_final_stats=1 \
    -artifact_prefix="$work/findings/$target-" "$work/corpus/$target" "$corpora/$target" \
    >"$work/$target.log" 2>&1 </dev/null || status=$?
  echo "$status" >"$work/$target.status"
  echo "fuzz: $target has ended"
}

report() {
  local target status
  printf '\n%-22s %12s %10s %7s  %s\n' target executions features inputs findings
  for target in "${targets[@]}"; do
    status=$(<"$work/$target.status")
    awk -v target="$target" -v outcome="$([[ $status -eq 0 ]] && echo none || echo "see $work/$target.log")" '
      / ft: / { for (i = 1; i < NF; ++i) { if ($i == "ft:") features = $(i + 1) } }
      / corp: / { for (i = 1; i < NF; ++i) { if ($i == "corp:") split($(i + 1), corpus, "/") } }
      /^stat::number_of_executed_units:/ { executions = $2 }
      END { printf "%-22s %12s %10s %7s  %s\n", target, executions, features, corpus[1], outcome }
    ' "$work/$target.log"
    [[ $status -eq 0 ]] || failed=1
  done
}

# Replays what was found in a build for gcov.
report_coverage() {
  local target
  cmake --preset coverage >/dev/null
  cmake --build --preset coverage -j "$(nproc)" --target "${targets[@]}" -- --quiet
  find build/coverage -name '*.gcda' -delete
  for target in "${targets[@]}"; do
    build/coverage/fuzz/"$target" "$corpora/$target" >/dev/null
    build/coverage/fuzz/"$target" "$work/corpus/$target" >/dev/null
  done
  printf '\nlines of the library that these inputs reach:\n'
  gcovr --object-directory build/coverage build/coverage |
    awk '$4 != "0%" || !/^(source|support)/'
}

minimise_corpus() { # target
  local target=$1 corpus=$corpora/$1 merged=$work/merged/$1
  rm -rf "$merged"
  mkdir -p "$merged" "$work/corpus/$target"
  # Those that have a name stay, whatever they reach.
  find "$corpus" -type f -regextype posix-extended ! -regex '.*/[0-9a-f]{40}' \
    -exec cp -t "$merged" {} +
  # How often code is reached does not matter.
  build/fuzz/fuzz/"$target" -merge=1 -use_counters=0 "$merged" "$corpus" "$work/corpus/$target" \
    >"$work/$target-merge.log" 2>&1
  rm -rf "$corpus"
  mv "$merged" "$corpus"
  printf '%s: %d inputs\n' "$corpus" "$(find "$corpus" -type f | wc -l)"
}

scripts/setup.sh tests checks
cmake --preset fuzz >/dev/null
cmake --build --preset fuzz -j "$(nproc)" --target "${targets[@]}" -- --quiet

failed=0
if [[ $seconds -gt 0 ]]; then
  for target in "${targets[@]}"; do
    while [[ $(jobs -rp | wc -l) -ge $(nproc) ]]; do
      wait -n
    done
    fuzz "$target" &
  done
  wait
  report
  if [[ $failed -eq 0 ]]; then
    report_coverage
  fi
fi
if [[ $failed -eq 0 && $minimise == yes ]]; then
  for target in "${targets[@]}"; do
    minimise_corpus "$target"
  done
fi
exit "$failed"
