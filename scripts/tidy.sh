#!/usr/bin/env bash
# Runs clang-tidy over files and folders (default: the library); every finding fails.
# usage: scripts/tidy.sh [file or folder]...
set -euo pipefail
cd "$(dirname "$0")/.."

if ! command -v clang-tidy-14 clang++ >/dev/null; then
  echo "tidy: clang-tidy-14 or clang is missing; run scripts/setup.sh checks" >&2
  exit 1
fi
if [[ $# -eq 0 ]]; then
  set -- source support
fi

# The compile commands must be clang's: it does not know all of GCC's warnings.
cmake --preset clang >/dev/null
find "$@" -name '*.cpp' -print0 | sort -z |
  xargs -0 -r -n 1 -P "$(nproc)" clang-tidy-14 -p build/clang --quiet 2>&1 |
  sed '/^[0-9]* warnings\? generated\.$/d'
