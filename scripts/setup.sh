#!/usr/bin/env bash
# Installs the Debian packages of the named groups (default: tests), if any is missing.
#   tests     build the library and its tools, run the tests
#   demo      build, and run the plug-in with the real daemon
#   checks    what CI has besides: clang, abidiff, format and tidy checks, valgrind, chronyd, prometheus
#   armhf, arm64     what tests needs, for that architecture under emulation
#   riscv64, s390x   the same, for the library alone
#   bench     what tests needs, and counters for scripts/bench.sh
#   packages  build Debian packages, check and install them
#   mutants   what tests needs, and what finds what can be changed: scripts/mutants.sh
#   loop      an emulated machine, what is around it, and a drawing: scripts/closed_loop.sh
set -euo pipefail

# GCC optimises across files with make, and warns without it.
build=(cmake ninja-build g++ make pkg-config libcjson-dev libsystemd-dev libboost-dev nlohmann-json3-dev
  libcli11-dev libfmt-dev prometheus-cpp-dev systemtap-sdt-dev)
daemon=(linuxptp iproute2 mount util-linux procps)
tests=("${build[@]}" "${daemon[@]}" libgtest-dev libgmock-dev libbenchmark-dev librapidcheck-dev binutils locales
  gnuplot-nox libxml2-utils mandoc groff-base)
# chrony would take the place of another time daemon, and prometheus serves at once: nobody gets them who only
# wants to build.
checks=(abigail-tools clang libclang-rt-dev gcovr shellcheck valgrind chrony prometheus)
# Another version formats and finds otherwise. Debian 12 alone has this one; elsewhere scripts/format.sh and
# scripts/tidy.sh say SKIPPED.
if [[ $(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release) == bookworm ]]; then
  checks+=(clang-format-14 clang-tidy-14)
fi
# Of another architecture, for the library, and for all else. Of prometheus-cpp the libraries alone: what it
# is developed with would bring curl's, and with that the C library's. Its headers are those of any architecture.
library=(libc6 libstdc++6 libcjson-dev libgtest-dev libgmock-dev)
all_else=(libsystemd-dev libfmt-dev libbenchmark-dev librapidcheck-dev libprometheus-cpp-core1.0
  libprometheus-cpp-pull1.0)
bench=("${tests[@]}" valgrind)
debs=("${build[@]}" devscripts dpkg-dev gzip lintian mmdebstrap systemd-container uidmap)
mutants=("${tests[@]}" clang python3-clang)
loop=("${daemon[@]}" chrony e2fsprogs gcc gnuplot-nox mmdebstrap qemu-system-x86)

packages=()
architectures=() # that are not this machine's
add_foreign() { # architecture, triplet, its packages...
  architectures+=("$1")
  packages+=("${tests[@]}" qemu-user-static "g++-$2" "${@:3}")
}

for group in "${@:-tests}"; do
  case $group in
    tests) packages+=("${tests[@]}") ;;
    demo) packages+=("${build[@]}" "${daemon[@]}") ;;
    checks) packages+=("${checks[@]}") ;;
    armhf) add_foreign armhf arm-linux-gnueabihf "${library[@]/%/:armhf}" "${all_else[@]/%/:armhf}" ;;
    arm64) add_foreign arm64 aarch64-linux-gnu "${library[@]/%/:arm64}" "${all_else[@]/%/:arm64}" ;;
    riscv64 | s390x) add_foreign "$group" "$group-linux-gnu" "${library[@]/%/:$group}" ;;
    bench) packages+=("${bench[@]}") ;;
    packages) packages+=("${debs[@]}") ;;
    mutants) packages+=("${mutants[@]}") ;;
    loop) packages+=("${loop[@]}") ;;
    *)
      echo "usage: $0 [tests|demo|checks|armhf|arm64|riscv64|s390x|bench|packages|mutants|loop]..." >&2
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

unknown=() # architectures to dpkg
for architecture in "${architectures[@]}"; do
  if ! dpkg --print-foreign-architectures | grep -qx "$architecture"; then
    unknown+=("$architecture")
  fi
done

as_root=(env)
if [[ $(id -u) -ne 0 ]]; then
  if ! sudo -n true 2>/dev/null; then
    echo "setup: packages are missing and this user may not install them. As root, run:" >&2
    for architecture in "${unknown[@]}"; do
      echo "  dpkg --add-architecture $architecture" >&2
    done
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
for architecture in "${unknown[@]}"; do
  "${as_root[@]}" dpkg --add-architecture "$architecture"
done
apt update || echo "setup: warning: some package lists could not be fetched" >&2
# libsystemd's own library must have the same version for all architectures that have it, and the lists of some
# lag behind at times.
mapfile -t lzma < <(printf '%s\n' "${missing[@]}" | sed -n 's/^libsystemd-dev:/liblzma5:/p')
if [[ ${#lzma[@]} -gt 0 ]]; then
  mapfile -t -O "${#lzma[@]}" lzma < <(dpkg-query -W -f '${Package}:${Architecture}\n' liblzma5)
  version=$(apt-cache policy "${lzma[@]}" | sed -n 's/^ *Candidate: //p' | sort -V | head -n 1)
  missing+=("${lzma[@]/%/=$version}")
fi
apt install -y --no-install-recommends "${missing[@]}" || true

find_missing
if [[ ${#missing[@]} -gt 0 ]]; then
  # One that this release of Debian does not have would stay in apt's way.
  for architecture in "${unknown[@]}"; do
    "${as_root[@]}" dpkg --remove-architecture "$architecture" 2>/dev/null || true
  done
  echo "setup: still missing: ${missing[*]}. Look at apt-get's messages above, then run" \
    "'apt-get install --no-install-recommends ${missing[*]}'" >&2
  exit 1
fi
