#!/usr/bin/env bash
# Compares the interface of a library with that of the last release, types of parameters and the layout of
# records included: hosts built for the release must work with the library. Only new functions pass.
# usage: tests/contract/abidiff_test.sh LIBRARY DESCRIPTION HEADERS_FOLDER
set -euo pipefail
library=$1
description=$2
headers=$3

if ! command -v abidiff >/dev/null; then
  echo "SKIPPED: abidiff is missing; run scripts/setup.sh checks"
  exit 77
fi
if [[ ! -e $description ]]; then
  echo "SKIPPED: the last release had no ${description##*/}"
  exit 77
fi
abidiff --no-added-syms --exported-interfaces-only --drop-private-types --headers-dir2 "$headers" \
  "$description" "$library"
