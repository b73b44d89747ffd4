#!/usr/bin/env bash
# Compiles every header that an integrator includes, alone and twice, as one standard of C or C++. It is a
# test of ctest for each compiler and standard.
# usage: tests/contract/headers_test.sh HEADERS_FOLDER COMPILER STANDARD
set -euo pipefail
folder=$1
compiler=$2
standard=$3

if ! command -v "$compiler" >/dev/null; then
  echo "SKIPPED: $compiler is missing; run scripts/setup.sh checks"
  exit 77
fi
language=c
if [[ $standard == c++* ]]; then
  language=c++
fi

count=0
for header in "$folder"/vantel_bc/*.h; do
  # A unit may not be empty, and macros are not looked at until they are used.
  "$compiler" -fsyntax-only -std="$standard" -Wall -Wextra -pedantic -Werror -Wundef \
    -I"$folder" -x "$language" - <<END
#include <vantel_bc/${header##*/}>
#include <vantel_bc/${header##*/}>
#ifdef ZEKEL_QUALITY_LENGTH
extern const double qualities[2][ZEKEL_QUALITY_LENGTH];
const double qualities[2][ZEKEL_QUALITY_LENGTH] = {ZEKEL_QUALITY_USABLE, ZEKEL_QUALITY_UNUSABLE};
#else
typedef int notEmpty;
#endif
END
  count=$((count + 1))
done
if [[ $count -lt 4 ]]; then
  echo "FAILED: $count headers found in $folder" >&2
  exit 1
fi
