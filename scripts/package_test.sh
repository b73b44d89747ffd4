#!/usr/bin/env bash
# Builds the packages and installs them with apt in a clean root, runs what they hold, and purges them.
# Packages of another architecture are unpacked there with what they depend on, and run under emulation.
# usage: scripts/package_test.sh [amd64|arm64|armhf]   (default: this machine's architecture)
set -euo pipefail
cd "$(dirname "$0")/.."
. scripts/clean_root.sh

scripts/package.sh "$@"
native=$(dpkg --print-architecture)
architecture=${1:-$native}
release=$(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release)
packages=("$PWD"/build/packages/*_"$architecture".deb)
hook="$PWD/tests/packaging/installed_test.sh"

if [[ $architecture == "$native" ]]; then
  options=(--variant=apt "--include=iproute2,linuxptp,mount,systemd-standalone-tmpfiles"
    --customize-hook="$hook \"\$1\" native ${packages[*]}")
else
  # Nothing of another architecture can run in the root: apt resolves, and only unpacks.
  repository=$(mktemp -d)
  trap 'rm -rf "$repository"' EXIT
  cp "${packages[@]}" "$repository"
  (cd "$repository" && dpkg-scanpackages . >Packages)
  options=(--variant=extract "--include=libvantel-bc-dev,vantel-host"
    --extract-hook="$hook \"\$1\" $architecture" "deb [trusted=yes] copy:$repository ./")
fi

in_clean_root "$release" "build/packages/test-$architecture.log" --architectures="$architecture" \
  "${options[@]}"
