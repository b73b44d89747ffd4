#!/usr/bin/env bash
# Makes small changes in source/ and support/, one at a time, and lists those that no test notices, with the score of
# each file. All of them are built once, into build/mutants; what was found out is kept there, so that a run that was
# ended goes on: what a test noticed once is not tried again before that folder is removed. Survivors that are no
# fault of the tests are in tests/mutation/judged.txt, each with its reason. The exit status is 1 if there is one
# that is not.
# usage: scripts/mutants.sh [--share K/N] [FILE]...
#   --share K/N   every N-th change, from the K-th on
#   FILE          changes in these files alone, as source/tMsgBuffer.h
set -euo pipefail
cd "$(dirname "$0")/.."

usage() {
  sed -n 's/^# usage: /usage: /p' "scripts/${0##*/}" >&2
  exit 2
}
files=("$@")
if [[ ${1-} == --share ]]; then
  [[ ${2-} =~ ^([1-9][0-9]*)/([1-9][0-9]*)$ && ${BASH_REMATCH[1]} -le ${BASH_REMATCH[2]} ]] || usage
  files=("${@:3}")
fi
for file in "${files[@]}"; do
  if [[ ! -f $file ]]; then
    echo "mutants: there is no file $file" >&2
    usage
  fi
done

scripts/setup.sh mutants
folder=$PWD/build/mutants
tree=$folder/tree
build=$folder/build

rm -rf "$tree"
mkdir -p "$tree"
git ls-files -z --cached --others --exclude-standard | tar --create --null --ignore-failed-read --files-from=- |
  tar --extract --directory="$tree"
cmake -S "$tree" -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=None -DCMAKE_EXPORT_COMPILE_COMMANDS=ON \
  -DCMAKE_CXX_FLAGS="-O0 -w -D_GLIBCXX_ASSERTIONS -include $tree/tests/mutation/mutant.h" >"$folder/configure.log"
tests/mutation/mutate.py "$tree" "$build" "$folder/mutants.jsonl"
cmake --build "$build" --target units contract_tests session_tests faults >"$folder/build.log" || {
  tail -n 40 "$folder/build.log" >&2
  exit 1
}
tests/mutation/run.py "$build" "$folder/mutants.jsonl" tests/mutation/judged.txt "$folder/results.jsonl" "$@"
