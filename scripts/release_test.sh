#!/usr/bin/env bash
# Runs what README tells first, the demo and all tests, in a clean root of a Debian release, on a fresh copy
# of what is committed; with arguments for scripts/check.sh, that alone. A warning of CMake or of a compiler
# fails, too. The last lines are the counts.
# usage: scripts/release_test.sh bookworm|trixie [PRESET [OPTION]...]
set -euo pipefail
cd "$(dirname "$0")/.."
. scripts/clean_root.sh

# The hook of mmdebstrap, below.
if [[ ${1-} == --inside ]]; then
  echo "release_test: the root is there"
  if [[ $# -eq 2 ]]; then
    run_booted "$2" sh -euc 'cd /project; scripts/demo.sh; scripts/check.sh'
  else
    # The words of the inner shell are its own.
    # shellcheck disable=SC2016
    run_booted "$2" sh -euc 'cd /project; scripts/check.sh "$@"' check "${@:3}"
  fi
  exit
fi
release=${1-}
case $release in
  bookworm | trixie) ;;
  *)
    echo "usage: $0 bookworm|trixie [PRESET [OPTION]...]" >&2
    exit 2
    ;;
esac
shift

log=build/release-test-$release${1:+-$1}.log
project_in_clean_root "$release" "$log" "${PWD@Q}/scripts/release_test.sh --inside \"\$1\" ${*@Q}"
if grep -E '^CMake .*Warning|: warning: ' "$log" | grep -v '^update-alternatives: '; then
  echo "release_test: these are warnings" >&2
  exit 1
fi
echo
if [[ $# -eq 0 ]]; then
  echo "$release: demo: $(grep -m 1 ' pairs, .* errors' "$log")"
fi
echo "$release: check${1:+ $1}: $(grep '% tests passed' "$log" | tail -n 1)"
