#!/usr/bin/env bash
# Runs the commands that tests/docs/commands.txt says are run, as the documents show them.
# usage: tests/docs/commands_test.sh BUILD_FOLDER run|scene
set -euo pipefail
project=$(cd "$(dirname "$0")/../.." && pwd)
build=$1
kind=$2

failed=0
fail() {
  echo "FAILED: $*"
  failed=1
}

# A folder that looks like the project, with this build in place of those that the documents make.
make_place() {
  local entry
  place=$(mktemp -d)
  trap 'rm -rf "$place"' EXIT
  mkdir "$place/build" "$place/programs"
  for entry in "$project"/*; do
    [[ ${entry##*/} == build ]] || ln -s "$entry" "$place"
  done
  ln -s "$build" "$place/build/release"
  ln -s "$build" "$place/build/demo"
  ln -s "$build" "$place/build/package"
  ln -s "$build/tools/host/vantel-host" "$place/programs"
  # The demo would build again what is there.
  # shellcheck disable=SC2016
  printf '#!/bin/sh\ncase $1 in --install) exec %s "$@";; esac\n' "$(command -v cmake)" \
    >"$place/programs/cmake"
  chmod 755 "$place/programs/cmake"
  export PATH=$place/programs:$PATH LD_LIBRARY_PATH=$build/source DESTDIR=$place/root
}

interrupt_when_shown() { # process group, text, file
  local tries=800
  until grep -qF -- "$2" "$3" || ! kill -0 "$1" 2>/dev/null || ((--tries == 0)); do
    sleep 0.05
  done
  kill -INT -- "-$1" 2>/dev/null || true
}

check() { # status, command, text
  local output=$place/output status=0
  echo "==> $2"
  : >"$output" # what the last command showed counts for that one alone
  set -m # a process group of its own, which hears interrupts
  bash -c "$2" >"$output" 2>&1 </dev/null &
  set +m
  [[ $1 != ^C ]] || interrupt_when_shown "$!" "$3" "$output"
  wait "$!" || status=$?
  cat "$output"
  [[ $(<"$output") == *"$3"* ]] || fail "$2 does not show '$3'"
  [[ $status == "${1/^C/0}" ]] || fail "$2 ended with status $status and not $1"
}

run_all() {
  local how status command text
  while IFS='|' read -r how command text; do
    read -r how status <<<"$how"
    command=${command% }
    check "$status" "${command# }" "${text# }"
  done < <(grep "^$kind " "$project/tests/docs/commands.txt")
  exit "$failed"
}

# What the machine must provide, and Debian's does not.
prepare_scene() {
  ip link set bc0 down
  ip link set bc0 name eth0
  ip link set eth0 up
}

if [[ ${3-} == --inside ]]; then
  place=$PWD
  prepare_scene
  run_all
fi
make_place
cd "$place"
# Where there are no scenes, it says SKIPPED and why.
scripts/testbed.sh -- true
case $kind in
  run) run_all ;;
  scene) scripts/testbed.sh --plugin-paths -- "$project/tests/docs/commands_test.sh" "$@" --inside ;;
esac
