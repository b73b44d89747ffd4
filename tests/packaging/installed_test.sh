#!/usr/bin/env bash
# Checks the packages in a clean root, which mmdebstrap has made: it calls this as a hook. A native root
# gets the packages by apt, and loses them again; a foreign one was made with them unpacked.
# usage: tests/packaging/installed_test.sh ROOT native|arm64|armhf PACKAGE.deb...
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
# shellcheck source=scripts/clean_root.sh
. "$here/../../scripts/clean_root.sh"
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
  # It warns of the native compiler.
  compiler=$(dpkg-architecture -a"$kind" -f -q DEB_HOST_GNU_TYPE 2>/dev/null)-gcc
  emulator=qemu-$(dpkg-architecture -a"$kind" -f -q DEB_HOST_GNU_CPU 2>/dev/null)-static
  in_root() { # program, arguments...
    local program=$1
    shift
    LD_LIBRARY_PATH='' "$emulator" -L "$root" "$root$program" "$@"
  }
fi

# What packages may leave changed: apt's and dpkg's own records, and what the next boot removes.
list_files() {
  (cd "$root" && find . -xdev \( -path ./proc -o -path ./sys -o -path ./dev -o -path ./tmp \
    -o -path ./run -o -path ./packages -o -path ./var/lib/apt -o -path ./var/lib/dpkg -o -path ./var/cache \
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
  local flags folder=("$root"/usr/lib/*/pkgconfig)
  read -ra flags < <(PKG_CONFIG_LIBDIR=${folder[0]} PKG_CONFIG_SYSROOT_DIR=$root \
    pkg-config --cflags --libs vantel_bc)
  "$compiler" "$1" "${flags[@]}" -o "$root$2"
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
  for page in "$here"/../../docs/man/*.[1-8]; do
    if [[ -e $page ]]; then
      gzip -dc "$root/usr/share/man/man${page##*.}/${page##*/}.gz" | cmp - "$page"
    fi
  done
}

# The plug-in is built for the place where Debian has ptp4l.
check_daemon_path() {
  grep -qF /usr/sbin/ptp4l "$root"/usr/lib/*/libvantel_bc.so.19 ||
    fail "the library does not know /usr/sbin/ptp4l"
}

# Nothing but the packages is there: no link, no folder made by hand. Where the root has no time stamps in
# hardware, ptp4l becomes a script as README.Debian says.
check_clock() {
  local output status=0
  [[ -d $root/run/morwen/ClockHub ]] || fail "the folder of configFile was not made"
  output=$(in_root vantel-host check --interface lo --set networkTransport=UDPv4) || true
  grep -q '^ok    daemon  */usr/sbin/ptp4l' <<<"$output" || fail "check says: $output"

  in_root dpkg-divert --add --rename /usr/sbin/ptp4l
  printf '#!/bin/sh\nexec /usr/sbin/ptp4l.distrib -S "$@"\n' >"$root/usr/sbin/ptp4l"
  chmod 755 "$root/usr/sbin/ptp4l"
  cp "$here/../../scripts/testbed.sh" "$root"
  # A scene has an empty /run, as a boot has.
  output=$(run_booted "$root" /testbed.sh -- sh -ec '
    systemd-tmpfiles --create libvantel-bc19.conf
    vantel-host run --interface bc0 --set networkTransport=UDPv4 --create-fifo --seconds 15 --plain' \
    2>&1) || status=$?
  if [[ $status -eq 77 ]] && skipped=$(grep '^SKIPPED: ' <<<"$output"); then
    echo "$skipped"
  else
    [[ $status -eq 0 && $output =~ pair\ .*pair\  ]] || fail "run ended with $status: $output"
    tail -n 1 <<<"$output"
  fi
  rm "$root/usr/sbin/ptp4l" "$root/testbed.sh"
  in_root dpkg-divert --rename --remove /usr/sbin/ptp4l
}

skipped= # the line that says why the clock was not run
echo "installed_test: the root is there"
before=$(list_files)
if [[ $kind == native ]]; then
  install_packages "$@"
fi
check_hosts
check_tools
check_daemon_path
if [[ $kind == native ]]; then
  check_clock
  purge_packages
  diff <(echo "$before") <(list_files) || fail "this is left, or lost"
fi
echo "installed_test: passed${skipped:+, but a run of the clock was $skipped}"
