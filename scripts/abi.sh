#!/usr/bin/env bash
# Compares the binary interface of the built library with docs/abi.txt. With --update, makes what
# was built the new docs/abi.txt, after a change that is meant.
set -euo pipefail
cd "$(dirname "$0")/.."

if [[ $# -gt 1 || ${1:---update} != --update ]]; then
  echo "usage: $0 [--update]" >&2
  exit 2
fi

preset=release
scripts/setup.sh tests
cmake --preset "$preset" >/dev/null
cmake --build --preset "$preset" --target contract_tests -j "$(nproc)"
tests=build/$preset/tests/contract
rm -f "$tests/abi.txt"
status=0
"$tests/contract_tests" --gtest_filter=AbiTest.IsAsDescribed --gtest_brief=1 || status=$?
if [[ ${1-} == --update ]]; then
  cp "$tests/abi.txt" docs/abi.txt
  echo "abi: docs/abi.txt is up to date; look at 'git diff docs/abi.txt'"
  status=0
fi
exit "$status"
