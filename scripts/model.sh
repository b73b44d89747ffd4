#!/usr/bin/env bash
# Runs random sequences of what hosts, daemons and machines do against the model of what hosts are promised, in two
# shares for each processor. Fails when a promise is broken: the sequence is then made shorter, and printed with
# what repeats it.
#   scripts/model.sh [--seed N] [PRESET [SEQUENCES]]
# PRESET is release by default, SEQUENCES 1000. The same seed gives the same sequences. The exit status is 77 where
# rapidcheck is missing.
set -euo pipefail
cd "$(dirname "$0")/.."

usage() {
  sed -n 's/^#   /usage: /p' "scripts/${0##*/}" >&2
  exit 2
}

seed=$((RANDOM * 32768 + RANDOM))
if [[ ${1-} == --seed ]]; then
  [[ ${2-} =~ ^(0|[1-9][0-9]{0,17})$ ]] || usage
  seed=$2
  shift 2
fi
preset=${1:-release}
sequences=${2:-1000}
[[ $# -le 2 && $preset != -* && $sequences =~ ^[1-9][0-9]{0,8}$ ]] || usage

emulator=()
case $preset in
  armhf)
    scripts/setup.sh armhf
    emulator=(qemu-arm-static)
    ;;
  arm64)
    scripts/setup.sh arm64
    emulator=(qemu-aarch64-static)
    ;;
  riscv64 | s390x)
    echo "model: the preset $preset has the library alone" >&2
    exit 2
    ;;
  clang) scripts/setup.sh tests checks ;;
  *) scripts/setup.sh tests ;;
esac
cmake --preset "$preset" >/dev/null
if ! [[ $(cmake --build --preset "$preset" --target help) =~ [[:space:]]model_tests: ]]; then
  echo "SKIPPED: rapidcheck is missing" >&2
  exit 77
fi
cmake --build --preset "$preset" -j "$(nproc)" --target model_tests -- --quiet

# Sequences wait half of the time.
shares=$(($(nproc) * 2))
folder=$(mktemp -d)
jobs=()
# Each job is a group, with its sessions and their daemons.
set -m
trap 'kill -KILL -- "${jobs[@]/#/-}" 2>/dev/null || true; rm -rf "$folder"' EXIT
echo "model: seeds $seed to $((seed + shares - 1))"
program=("${emulator[@]}" build/"$preset"/tests/model/model_tests)
for ((share = 0; share < shares; ++share)); do
  RC_PARAMS="seed=$((seed + share)) max_success=$(((sequences + shares - 1) / shares))" \
    TMPDIR=$folder "${program[@]}" >"$folder/$share.log" 2>&1 &
  jobs+=("$!")
done
status=0
for ((share = 0; share < shares; ++share)); do
  if wait "${jobs[share]}"; then
    grep '^OK, passed' "$folder/$share.log"
  else
    cat "$folder/$share.log"
    status=1
  fi
done
jobs=()
if [[ $status -ne 0 ]]; then
  echo "model: FAILED. To repeat it: RC_PARAMS=... ${program[*]}" >&2
fi
exit "$status"
