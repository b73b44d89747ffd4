#!/usr/bin/env bash
# Installs a build under a prefix, as for a system that has no packages, and builds a host with what is there.
# usage: tests/packaging/install_test.sh BUILD_FOLDER COMPILER [EMULATOR]
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
build=$1
compiler=$2
prefix=$(mktemp -d)
trap 'rm -rf "$prefix"' EXIT

cmake --install "$build" --prefix "$prefix"
pkg_config=$(find "$prefix" -name vantel_bc.pc -printf '%h')
export PKG_CONFIG_PATH=$pkg_config

read -ra flags < <(pkg-config --cflags --libs vantel_bc)
"$compiler" "$here/smallHost.c" "${flags[@]}" -o "$prefix/small_host"
plugin=$(pkg-config --variable=plugin vantel_bc)
name=$(LD_LIBRARY_PATH=${plugin%/*} ${3-} "$prefix/small_host" | sed -n 2p)
if [[ $name != "IEEE 1588-2008 BC" ]]; then
  echo "FAILED: the plug-in's name is '$name'" >&2
  exit 1
fi
