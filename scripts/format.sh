#!/usr/bin/env bash
# Formats all C and C++ files. With --check it changes nothing and fails when one needs formatting.
# The exit status is 77, after a line with the reason, where there is no formatter of the right version.
set -euo pipefail
cd "$(dirname "$0")/.."

case ${1:-} in
  '') mode=(-i) ;;
  --check) mode=(--dry-run --Werror) ;;
  *)
    echo "usage: $0 [--check]" >&2
    exit 2
    ;;
esac
if ! command -v clang-format-14 >/dev/null; then
  echo "SKIPPED: clang-format-14 is missing. Another version would format otherwise. Debian 12 has it: run" \
    "scripts/setup.sh checks" >&2
  exit 77
fi

# Hidden folders and build folders are not ours.
if ! find . -path './.?*' -prune -o -path './build*' -prune -o -type f \
  -regex '.*\.\(c\|cc\|cpp\|h\|hpp\)' -print0 | xargs -0 -r clang-format-14 "${mode[@]}"; then
  echo "format: run scripts/format.sh and look at what it changed" >&2
  exit 1
fi
