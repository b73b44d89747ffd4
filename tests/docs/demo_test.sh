#!/usr/bin/env bash
# scripts/demo.sh stops at the first step that fails: with a status, that step's message last, and
# without a run of what was built before.
# usage: tests/docs/demo_test.sh
set -euo pipefail
project=$(cd "$(dirname "$0")/../.." && pwd)

place=$(mktemp -d)
trap 'rm -rf "$place"' EXIT
mkdir -p "$place/programs" "$place/build/demo/tools/host"
cp -r "$project/scripts" "$place"
export PATH=$place/programs:$PATH

put_program() { # path, content of a shell script
  printf '#!/bin/sh\n%s\n' "$2" >"$place/$1"
  chmod 755 "$place/$1"
}

failed=0
expect_stop() { # the last line's beginning, options of the demo...
  local output status=0
  output=$("$place/scripts/demo.sh" "${@:2}" 2>&1) || status=$?
  echo "==> demo.sh ${*:2}: status $status"
  echo "$output"
  if [[ $status -eq 0 || ${output##*$'\n'} != "$1"* || -e $place/stale ]]; then
    echo "FAILED: status 0, a run of a stale program, or not at the end: $1"
    failed=1
  fi
}

# Nothing is installed, and nobody may do so.
put_program programs/dpkg-query ''
put_program programs/id 'echo 1000'
put_program programs/sudo 'exit 1'
expect_stop "  apt-get install --no-install-recommends cmake "

# All is installed, and does not compile.
put_program scripts/setup.sh ''
# shellcheck disable=SC2016
put_program programs/cmake 'if [ "$1" = --build ]; then echo "error: broken"; exit 1; fi'
put_program build/demo/tools/host/vantel-host "touch '$place/stale'"
expect_stop "error: broken"
expect_stop "error: broken" --simulated

exit "$failed"
