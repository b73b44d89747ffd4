#!/usr/bin/env bash
# Builds the Debian packages into build/packages/ and checks them with lintian and hardening-check. The same
# sources give the same octets.
# usage: scripts/package.sh [amd64|arm64|armhf]   (default: this machine's architecture)
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/setup.sh packages
native=$(dpkg --print-architecture)
architecture=${1:-$native}
case $architecture in
  "$native") preset=package ;;
  arm64 | armhf)
    preset=package-$architecture
    scripts/setup.sh "$architecture"
    ;;
  *)
    echo "usage: $0 [$native|arm64|armhf]" >&2
    exit 2
    ;;
esac

# Debian's compiler flags, without paths of this machine. dpkg-architecture warns of the native compiler.
export DEB_BUILD_MAINT_OPTIONS=hardening=+bindnow
flags=$(dpkg-architecture -a"$architecture" -f -c dpkg-buildflags --export=sh 2>/dev/null)
eval "$flags"
export CFLAGS="$CFLAGS $CPPFLAGS" CXXFLAGS="$CXXFLAGS $CPPFLAGS"

rm -f build/packages/*_"$architecture".deb
cmake --fresh --preset "$preset" >/dev/null
cmake --build --preset "$preset" -j "$(nproc)"
cpack --preset "$preset"
tests/packaging/lintian.sh build/packages/*_"$architecture".deb
tests/packaging/hardening.sh build/packages/*_"$architecture".deb
