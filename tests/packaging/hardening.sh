#!/usr/bin/env bash
# Checks that the library and the programs in packages are hardened. For which calls _FORTIFY_SOURCE has a
# check of its own is up to the C library: one such call is enough.
# usage: tests/packaging/hardening.sh PACKAGE.deb...
set -euo pipefail

if ! command -v hardening-check >/dev/null; then
  echo "SKIPPED: hardening-check is missing; run scripts/setup.sh packages"
  exit 77
fi
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
for package in "$@"; do
  dpkg-deb -x "$package" "$scratch"
done
mapfile -t files < <(find "$scratch" -type f \( -name '*.so.*' -o -path '*/bin/*' \))
if [[ ${#files[@]} -ne 3 ]]; then
  echo "FAILED: one library and two programs are expected, and found: ${files[*]}" >&2
  exit 1
fi
# The marks of control flow protection are gone when one object lacks them, and Debian's C library brings such.
hardening-check --verbose --nocfprotection "${files[@]}"
