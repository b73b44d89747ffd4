#!/usr/bin/env bash
# Builds all that is committed with each compiler of a Debian release that can, GCC from 12 on and clang from 14
# on, in a clean root, and runs the unit tests; with --quick, the library and its tools alone. Every warning is an
# error. The last lines tell what came of each.
# usage: scripts/compilers.sh bookworm|trixie [--quick] [COMPILER]...   (such as g++-13 or clang-19; default: all)
set -euo pipefail
cd "$(dirname "$0")/.."
. scripts/clean_root.sh

release=$(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release)

# The newest ones come with updates of security: browsers are built with them.
add_newest() {
  echo "deb http://deb.debian.org/debian-security $release-security main" >/etc/apt/sources.list.d/security.list
  apt-get -qq update
}

# From clang 20 on Boost must be younger than that of Debian 12.
list_compilers() {
  local newest=99
  [[ $release != bookworm ]] || newest=19
  apt-cache search --names-only '^(clang|g\+\+)-[0-9]+$' | sed 's/ .*//' | sort --version-sort |
    awk -F - -v newest=$newest '$2 >= ($1 == "clang" ? 14 : 12) && $2 <= newest'
}

build_and_test() { # compiler, target...
  local cc=${1/g++/gcc} cxx=${1/clang/clang++}
  rm -rf build/release
  apt-get -qq install --no-install-recommends "$1"
  # GCC 13 in Debian 13 brings a C++ library of its own to link, in which the release's libraries miss something.
  cmake --preset release -DCMAKE_C_COMPILER="$cc" -DCMAKE_CXX_COMPILER="$cxx" -DVANTEL_UNITE=ON \
    -DCMAKE_CXX_STANDARD_LIBRARIES=-l:libstdc++.so.6
  cmake --build --preset release -j "$(nproc)" --target "${@:2}" -- -k 0
  if [[ $2 == all ]]; then
    ctest --preset release -j "$(nproc)" --label-regex '^unit$'
  fi
}

# Prints what a compiler, or a test, found, and of each compiler one line.
check() { # compiler...
  local compiler log start
  for compiler in "$@"; do
    log=build/$compiler.log
    start=$SECONDS
    if "$0" --build "$compiler" "${targets[@]}" >"$log" 2>&1; then
      echo "passed $compiler: ${targets[*]}, after $((SECONDS - start)) s"
    else
      grep -E '(warning|error|FAILED|E): |undefined reference|\*\*\*' "$log" || tail -n 3 "$log"
      echo "FAILED $compiler, after $((SECONDS - start)) s"
    fi
  done
}

case ${1-} in
  bookworm | trixie) ;;
  --hook) # of mmdebstrap, below
    echo "compilers: the root is there"
    run_booted "$2" /project/scripts/compilers.sh --inside "${@:3}"
    exit
    ;;
  --inside)
    mkdir -p build
    add_newest
    scripts/setup.sh tests
    targets=(all)
    if [[ ${2-} == --quick ]]; then
      targets=(vantel_bc vantel-host simptp4l)
      shift
    fi
    compilers=("${@:2}")
    [[ $# -gt 1 ]] || mapfile -t compilers < <(list_compilers)
    check "${compilers[@]}"
    exit
    ;;
  --build) # by check
    build_and_test "${@:2}"
    exit
    ;;
  *)
    sed -n 's/^# usage: /usage: /p' "scripts/${0##*/}" >&2
    exit 2
    ;;
esac

log=build/compilers-$1.log
project_in_clean_root "$1" "$log" "${PWD@Q}/scripts/compilers.sh --hook \"\$1\" ${*:2}"
printf '\n'
grep -E '^(passed|FAILED) ' "$log"
if grep -q '^FAILED ' "$log"; then
  exit 1
fi
