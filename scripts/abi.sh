#!/usr/bin/env bash
# Compares the binary interface of the built library with docs/abi.txt. With --update, makes what was built the
# new docs/abi.txt, after a change that is meant. With --release, describes what was built in docs/abi-*.xml,
# with which all later builds must be compatible.
# usage: scripts/abi.sh [--update|--release]
set -euo pipefail
cd "$(dirname "$0")/.."

if [[ $# -gt 1 || ! ${1:---update} =~ ^--(update|release)$ ]]; then
  echo "usage: $0 [--update|--release]" >&2
  exit 2
fi

describe_release() { # preset, processor
  cmake --preset "$1" >/dev/null
  cmake --build --preset "$1" --target vantel_bc -j "$(nproc)"
  abidw --exported-interfaces-only --drop-private-types --headers-dir include --no-corpus-path \
    --no-comp-dir-path --no-show-locs --no-elf-needed --out-file "docs/abi-$2.xml" \
    "build/$1/source/libvantel_bc.so.19"
}

if [[ ${1-} == --release ]]; then
  scripts/setup.sh tests checks armhf arm64
  describe_release release "$(uname -m)"
  describe_release armhf arm
  describe_release arm64 aarch64
  exit
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
