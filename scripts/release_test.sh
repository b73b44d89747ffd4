#!/usr/bin/env bash
# Runs what README tells first, the demo and all tests, in a clean root of a Debian release, on a fresh copy
# of what is committed. A warning of CMake or of a compiler fails, too. The last two lines are the counts.
# usage: scripts/release_test.sh bookworm|trixie
set -euo pipefail
cd "$(dirname "$0")/.."
. scripts/clean_root.sh

# The hook of mmdebstrap. To the scenes of the tests the root must look as one that was booted: / is a mount
# point, which it is in no chroot.
run_in_root() { # root
  echo "release_test: the root is there"
  # The words of the inner shell are its own.
  # shellcheck disable=SC2016
  unshare --mount --pid --fork --kill-child bash -euc '
    mount --rbind "$1" "$1"
    cd "$1"
    mount -t proc proc proc
    mount --move . /
    exec chroot . env -i PATH=/usr/sbin:/usr/bin:/sbin:/bin HOME=/root LC_ALL=C.UTF-8 \
      sh -euc "cd /project; scripts/demo.sh; scripts/check.sh"' inside "$1" </dev/null
}

if [[ ${1-} == --inside ]]; then
  run_in_root "$2"
  exit
fi
release=${1-}
case $release in
  bookworm | trixie) ;;
  *)
    echo "usage: $0 bookworm|trixie" >&2
    exit 2
    ;;
esac

log=build/release-test-$release.log
folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT
chmod 755 "$folder"
git archive --prefix project/ --output "$folder/project.tar" HEAD

in_clean_root "$release" "$log" --variant=apt --include=mount \
  --customize-hook="tar-in $folder/project.tar /" \
  --customize-hook="$PWD/scripts/release_test.sh --inside \"\$1\""
if grep -E '^CMake .*Warning|: warning: ' "$log" | grep -v '^update-alternatives: '; then
  echo "release_test: these are warnings" >&2
  exit 1
fi
echo
echo "$release: demo: $(grep -m 1 ' pairs, .* errors' "$log")"
echo "$release: check: $(grep '% tests passed' "$log" | tail -n 1)"
