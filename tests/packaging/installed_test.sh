#!/usr/bin/env bash
# Checks the packages in a clean root, which mmdebstrap has made: it calls this as a hook. A native root
# gets the packages by apt, and loses them again; a foreign one was made with them unpacked.
# usage: tests/packaging/installed_test.sh ROOT native|armhf PACKAGE.deb...
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
root=$1
kind=$2
shift 2

fail() {
  echo "FAILED: $*" >&2
  exit 1
}

in_root() { # command...
  chroot "$root" env DEBIAN_FRONTEND=noninteractive LC_ALL=C.UTF-8 "$@"
}
compiler=cc
if [[ $kind != native ]]; then
  compiler=arm-linux-gnueabihf-gcc
  in_root() { # program, arguments...
    local program=$1
    shift
    LD_LIBRARY_PATH='' qemu-arm-static -L "$root" "$root$program" "$@"
  }
fi

# What packages may leave changed: apt's and dpkg's own records.
list_files() {
  (cd "$root" && find . -xdev \( -path ./proc -o -path ./sys -o -path ./dev -o -path ./tmp \
    -o -path ./packages -o -path ./var/lib/apt -o -path ./var/lib/dpkg -o -path ./var/cache \
    -o -path ./var/log \) -prune -o -print) | sort
}

expect_output() { # text, command...
  local text=$1 output
  shift
  output=$(in_root "$@") || fail "$* ended with status $?: $output"
  [[ $output == *"$text"* ]] || fail "$* does not show '$text': $output"
}

install_packages() {
  mkdir "$root/packages"
  cp "$@" "$root/packages"
  in_root sh -c 'apt-get -q -y --no-install-recommends install /packages/*.deb'
}

purge_packages() {
  in_root apt-get -q -y --purge autoremove vantel-host libvantel-bc-dev libvantel-bc19
  if in_root dpkg-query --list '*vantel*'; then
    fail "dpkg still knows the packages"
  fi
}

# The headers and libraries come from the root, all else from here.
compile() { # source, program
  "$compiler" -I"$root/usr/include" "$1" -rdynamic -ldl -o "$root$2"
}

check_hosts() {
  compile "$here/smallHost.c" /small_host
  expect_output $'2\nIEEE 1588-2008 BC\n{' /small_host
  compile "$root/usr/share/doc/libvantel-bc-dev/examples/minimal_host.c" /minimal_host
  rm "$root/small_host" "$root/minimal_host"
}

check_tools() {
  local page
  expect_output priority1 /usr/bin/vantel-host schema
  expect_output 'usage: simptp4l' /usr/bin/simptp4l --help
  for page in "$here"/../../docs/man/*.1; do
    if [[ -e $page ]]; then
      gzip -dc "$root/usr/share/man/man1/${page##*/}.gz" | cmp - "$page"
    fi
  done
}

echo "installed_test: the root is there"
before=$(list_files)
if [[ $kind == native ]]; then
  install_packages "$@"
fi
check_hosts
check_tools
if [[ $kind == native ]]; then
  purge_packages
  diff <(echo "$before") <(list_files) || fail "this is left, or lost"
fi
echo "installed_test: passed"
