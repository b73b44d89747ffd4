#!/usr/bin/env bash
# Runs clang-tidy over files and folders (default: the library); every finding fails.
# The exit status is 77, after a line with the reason, where there is no clang-tidy of the right version.
# usage: scripts/tidy.sh [file or folder]...
set -euo pipefail
cd "$(dirname "$0")/.."

for tool in clang-tidy-14 clang++; do
  if ! command -v "$tool" >/dev/null; then
    echo "SKIPPED: $tool is missing. Another version would find other things. Debian 12 has it: run" \
      "scripts/setup.sh checks" >&2
    exit 77
  fi
done
if [[ $# -eq 0 ]]; then
  set -- source support
fi

# The compile commands must be clang's: it does not know all of GCC's warnings.
cmake --preset clang >/dev/null
find "$@" -name '*.cpp' -print0 | sort -z |
  xargs -0 -r -n 1 -P "$(nproc)" clang-tidy-14 -p build/clang --quiet 2>&1 |
  sed '/^[0-9]* warnings\? generated\.$/d'
