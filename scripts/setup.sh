#!/usr/bin/env bash
# Installs the Debian packages of the named groups (default: tests), if any is missing.
#   tests     build the library and its tools, run the tests
#   demo      build, and run the plug-in with the real daemon
#   checks    what CI has besides: clang, abidiff, format and tidy checks, valgrind, chronyd, prometheus
#   armhf     what tests needs, for 32-bit ARM under emulation
#   bench     what tests needs, and counters for scripts/bench.sh
#   packages  build Debian packages, check and install them
#   loop      an emulated machine, what is around it, and a drawing: scripts/closed_loop.sh
set -euo pipefail

# GCC optimises across files with make, and warns without it.
build=(cmake ninja-build g++ make pkg-config libcjson-dev libsystemd-dev libboost-dev nlohmann-json3-dev
  libcli11-dev libfmt-dev prometheus-cpp-dev systemtap-sdt-dev)
daemon=(linuxptp iproute2 mount util-linux procps)
tests=("${build[@]}" "${daemon[@]}" libgtest-dev libgmock-dev libbenchmark-dev binutils locales
  gnuplot-nox libxml2-utils mandoc groff-base)
# chrony would take the place of another time daemon, and prometheus serves at once: nobody gets them who only
# wants to build.
checks=(abigail-tools clang libclang-rt-dev gcovr shellcheck valgrind chrony prometheus)
# Another version formats and finds otherwise. Debian 12 alone has this one; elsewhere scripts/format.sh and
# scripts/tidy.sh say SKIPPED.
if [[ $(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release) == bookworm ]]; then
  checks+=(clang-format-14 clang-tidy-14)
fi
# Of prometheus-cpp the libraries alone: what it is developed with would bring curl's, and with that the C
# library's. Its headers are those of any architecture.
armhf=("${tests[@]}" g++-arm-linux-gnueabihf qemu-user-static libc6:armhf libstdc++6:armhf
  libcjson-dev:armhf libsystemd-dev:armhf libgtest-dev:armhf libgmock-dev:armhf libfmt-dev:armhf
  libbenchmark-dev:armhf libprometheus-cpp-core1.0:armhf libprometheus-cpp-pull1.0:armhf)
bench=("${tests[@]}" valgrind)
debs=("${build[@]}" devscripts dpkg-dev gzip lintian mmdebstrap systemd-container uidmap)
loop=("${daemon[@]}" chrony e2fsprogs gcc gnuplot-nox mmdebstrap qemu-system-x86)

packages=()
for group in "${@:-tests}"; do
  case $group in
    tests) packages+=("${tests[@]}") ;;
    demo) packages+=("${build[@]}" "${daemon[@]}") ;;
    checks) packages+=("${checks[@]}") ;;
    armhf) packages+=("${armhf[@]}") ;;
    bench) packages+=("${bench[@]}") ;;
    packages) packages+=("${debs[@]}") ;;
    loop) packages+=("${loop[@]}") ;;
    *)
      echo "usage: $0 [tests|demo|checks|armhf|bench|packages|loop]..." >&2
      exit 2
      ;;
  esac
done

if ! command -v dpkg-query >/dev/null; then
  echo "setup: this is no Debian system. Install the equivalents of: ${packages[*]}" >&2
  exit 1
fi

# Sets missing to those packages that are not installed.
find_missing() {
  local native installed package
  native=$(dpkg --print-architecture)
  installed=$(dpkg-query -W -f '${db:Status-Status} ${Package}:${Architecture}\n' |
    sed -n "s/:$native\$//; s/:all\$//; s/^installed //p")
  missing=()
  for package in "${packages[@]}"; do
    if ! grep -qxF "$package" <<<"$installed"; then
      missing+=("$package")
    fi
  done
}

find_missing
if [[ ${#missing[@]} -eq 0 ]]; then
  exit 0
fi

foreign=no
if [[ "${missing[*]}" == *:armhf* ]] && ! dpkg --print-foreign-architectures | grep -qx armhf; then
  foreign=yes
fi

as_root=(env)
if [[ $(id -u) -ne 0 ]]; then
  if ! sudo -n true 2>/dev/null; then
    echo "setup: packages are missing and this user may not install them. As root, run:" >&2
    if [[ $foreign == yes ]]; then
      echo "  dpkg --add-architecture armhf" >&2
    fi
    echo "  apt-get update" >&2
    echo "  apt-get install --no-install-recommends ${missing[*]}" >&2
    exit 1
  fi
  as_root=(sudo -n env)
fi

apt() {
  "${as_root[@]}" DEBIAN_FRONTEND=noninteractive apt-get -qq -o Acquire::Retries=3 \
    -o DPkg::Lock::Timeout=300 "$@" </dev/null
}

echo "setup: installing ${missing[*]}"
if [[ $foreign == yes ]]; then
  "${as_root[@]}" dpkg --add-architecture armhf
fi
apt update || echo "setup: warning: some package lists could not be fetched" >&2
# libsystemd's own library must have the same version for both, and the lists of an architecture lag behind at times.
if [[ "${missing[*]}" == *libsystemd-dev:armhf* ]]; then
  version=$(apt-cache policy liblzma5:armhf | sed -n 's/^ *Candidate: //p')
  missing+=("liblzma5=$version" "liblzma5:armhf=$version")
fi
apt install -y --no-install-recommends "${missing[@]}" || true

find_missing
if [[ ${#missing[@]} -gt 0 ]]; then
  echo "setup: still missing: ${missing[*]}. Look at apt-get's messages above, then run" \
    "'apt-get install --no-install-recommends ${missing[*]}'" >&2
  exit 1
fi
