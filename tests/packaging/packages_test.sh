#!/usr/bin/env bash
# Checks the Debian packages that cpack makes of a build folder. Each check is a test of ctest.
# usage: tests/packaging/packages_test.sh BUILD_FOLDER native|arm64|armhf CHECK
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
build=$1
architecture=${2/#native/$(dpkg --print-architecture)}
check=$3
packages=$build/tests/packaging/packages
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT

fail() {
  echo "FAILED: $*" >&2
  exit 1
}

skip() {
  echo "SKIPPED: $*"
  exit 77
}

for tool in lintian dpkg-gensymbols dpkg-shlibdeps; do
  if ! command -v "$tool" >/dev/null; then
    skip "$tool is missing; run scripts/setup.sh packages"
  fi
done
if [[ ! -e $build/CPackConfig.cmake ]]; then
  skip "dpkg-dev was missing when the build was configured; run scripts/setup.sh packages"
fi

make_packages() { # folder
  rm -rf "$1"
  cpack --config "$build/CPackConfig.cmake" -B "$1" >"$scratch/cpack.log" 2>&1 ||
    fail "$(cat "$scratch/cpack.log")"
}

deb() { # package
  compgen -G "$packages/$1_19.0.0_*.deb" || fail "there is no $1"
}

field() { # package, field
  dpkg-deb --field "$(deb "$1")" "$2"
}

expect_equal() { # what, expected, actual
  [[ $2 == "$3" ]] || fail "$1: expected, and found:" $'\n'"$(diff <(echo "$2") <(echo "$3"))"
}

expect_field() { # package, field, value
  expect_equal "$2 of $1" "$3" "$(field "$1" "$2")"
}

# The files of a package, with links as "name -> target", sorted; the triplet stands as TRIPLET.
files() { # package
  dpkg-deb --fsys-tarfile "$(deb "$1")" | tar -t -v |
    sed -nE '/^d/d; s/^([^ ]+ +){5}\.\///; s/(x86_64|aarch64|arm)-linux-gnu(eabihf)?/TRIPLET/; p' |
    LC_ALL=C sort
}

unpack_library() {
  dpkg-deb -x "$(deb libvantel-bc19)" "$scratch/root"
  echo "$scratch"/root/usr/lib/*/libvantel_bc.so.19.0.0
}

PackagesAreMade() {
  make_packages "$packages"
  expect_equal "count of packages" 3 "$(find "$packages" -maxdepth 1 -name '*.deb' | wc -l)"
}

SameBuildGivesTheSameOctets() {
  make_packages "$scratch/again"
  local first
  for first in "$packages"/*.deb; do
    cmp "$first" "$scratch/again/${first##*/}" || fail "${first##*/} differs"
  done
}

LibraryPackageHoldsTheLibraryAlone() {
  expect_equal "files" "usr/lib/TRIPLET/libvantel_bc.so.19 -> libvantel_bc.so.19.0.0
usr/lib/TRIPLET/libvantel_bc.so.19.0.0
usr/lib/tmpfiles.d/libvantel-bc19.conf
usr/share/doc/libvantel-bc19/CHANGELOG.md
usr/share/doc/libvantel-bc19/README.Debian
usr/share/doc/libvantel-bc19/changelog.gz
usr/share/doc/libvantel-bc19/copyright
usr/share/lintian/overrides/libvantel-bc19" "$(files libvantel-bc19)"
}

DevelopmentPackageHoldsWhatHostsAreWrittenWith() {
  expect_equal "files" "usr/include/vantel_bc/quality.h
usr/include/vantel_bc/status.h
usr/include/vantel_bc/zekel.h
usr/include/vantel_bc/zekeltr.h
usr/lib/TRIPLET/libvantel_bc.so -> libvantel_bc.so.19
usr/lib/TRIPLET/pkgconfig/vantel_bc.pc
usr/share/doc/libvantel-bc-dev/changelog.gz
usr/share/doc/libvantel-bc-dev/configuration.md
usr/share/doc/libvantel-bc-dev/copyright
usr/share/doc/libvantel-bc-dev/examples/minimal_host.c
usr/share/doc/libvantel-bc-dev/host-interface.md
usr/share/doc/libvantel-bc-dev/oddities.md
usr/share/doc/libvantel-bc-dev/operations.md
usr/share/doc/libvantel-bc-dev/wire-format.md" "$(files libvantel-bc-dev)"
}

HostPackageHoldsBothToolsWithManualPagesDocumentsAndScripts() {
  local expected=(usr/bin/simptp4l usr/bin/vantel-host
    usr/share/bash-completion/completions/vantel-host) file
  for file in configuration host-interface metrics oddities operations security service simptp4l vantel-host; do
    expected+=("usr/share/doc/vantel-host/$file.md")
  done
  for file in "$here"/../../monitoring/*; do
    expected+=("usr/share/doc/vantel-host/monitoring/${file##*/}")
  done
  for file in "$here"/../../tools/simptp4l/examples/*.sim; do
    expected+=("usr/share/doc/vantel-host/examples/${file##*/}")
  done
  for file in "$here"/../../docs/man/*.[1-8]; do
    [[ -e $file ]] && expected+=("usr/share/man/man${file##*.}/${file##*/}.gz")
  done
  files vantel-host >"$scratch/files"
  for file in "${expected[@]}"; do
    grep -qxF "$file" "$scratch/files" || fail "$file is missing"
  done
  if grep -E '^usr/(lib/TRIPLET|include)' "$scratch/files"; then
    fail "these belong to another package"
  fi
}

HostPackageHoldsAServiceWithItsUserFifoAndConfiguration() {
  expect_equal "files" "etc/vantel-host/vantel-host.toml
usr/lib/systemd/system/vantel-host.service
usr/lib/sysusers.d/vantel-host.conf
usr/lib/tmpfiles.d/vantel-host.conf
usr/lib/udev/rules.d/60-vantel-host.rules
usr/libexec/vantel-host/ptp4l-software
usr/share/vantel-host/chrony-socket.conf
usr/share/vantel-host/software-time-stamps.conf" \
    "$(files vantel-host | grep -E '^etc/|^usr/(lib|libexec|share/vantel-host)/')"
  expect_equal "configuration files" /etc/vantel-host/vantel-host.toml \
    "$(dpkg-deb --info "$(deb vantel-host)" conffiles)"
}

unpack_service() {
  command -v systemd-analyze >/dev/null || skip "systemd-analyze is missing (package systemd)"
  dpkg-deb -x "$(deb vantel-host)" "$scratch/root"
  service=$scratch/root/usr/lib/systemd/system/vantel-host.service
}

# The scale goes from 0 to 10; the threshold is in tenths.
ServiceHasFewRights() {
  unpack_service
  systemd-analyze security --no-pager --offline=true --threshold=40 "$service"
}

# It would also say that the program is not installed.
ServiceIsUnderstoodBySystemd() {
  unpack_service
  sed -i 's,=/usr/bin/vantel-host ,=/bin/true ,' "$service"
  expect_equal "what systemd-analyze says" "" "$(systemd-analyze verify --man=no "$service" 2>&1)"
}

# Links to other places, without the headings there, as "document link".
links_in() { # folder
  (cd "$1" && grep -roE --include='*.md' '\]\([^)#]+' . | grep -v '://' | sed 's/:](/ /')
}

LinksOfDocumentsLeadToWhatThePackageHolds() {
  local package folder document link
  for package in libvantel-bc-dev vantel-host; do
    dpkg-deb -x "$(deb $package)" "$scratch/$package"
    folder=$scratch/$package/usr/share/doc/$package
    links_in "$folder" >"$scratch/links"
    while read -r document link; do
      [[ -e $folder/${document%/*}/$link ]] || fail "$package: $document links to $link"
    done <"$scratch/links"
    for link in configuration.md oddities.md operations.md host-interface.md; do
      grep -q " $link\$" "$scratch/links" || fail "$package: nothing links to $link"
    done
  done
  # The last package is vantel-host.
  grep -qxF "./configuration.md vantel-host.md" "$scratch/links" || fail "vantel-host.md is not linked to"
  grep -qF "as DaemonMessages.cpp lists it" "$folder/vantel-host.md" || fail "a link's text is lost"
}

FieldsSayWhatDebianMustKnow() {
  local package
  for package in libvantel-bc19 libvantel-bc-dev vantel-host; do
    expect_field $package Version 19.0.0
    expect_field $package Architecture "$architecture"
    expect_field $package Source vantel-bc
    expect_field $package Priority optional
  done
  expect_field libvantel-bc19 Section libs
  expect_field libvantel-bc19 Multi-Arch same
  expect_field libvantel-bc19 Recommends "linuxptp (>= 1.8)"
  expect_field libvantel-bc-dev Section libdevel
  expect_field libvantel-bc-dev Multi-Arch same
  expect_field libvantel-bc-dev Depends "libvantel-bc19 (= 19.0.0)"
  expect_field vantel-host Section net
  expect_field vantel-host Recommends "linuxptp (>= 1.8)"
}

DependenciesNameTheLibrariesInUse() {
  names() { field "$1" Depends | sed 's/ ([^)]*)//g'; }
  expect_equal "libraries of the library" "libc6, libcjson1, libgcc-s1, libstdc++6" \
    "$(names libvantel-bc19)"
  # Each release of Debian has its own fmt and prometheus-cpp.
  expect_equal "libraries of the tools" "libc6, libfmtN, libgcc-s1, libprometheus-cpp-pullN,\
 libstdc++6, libsystemd0, libvantel-bc19" \
    "$(names vantel-host | sed -E 's/(libfmt|libprometheus-cpp-[a-z]+)[0-9.]+/\1N/g')"
}

# Scripts of the packages, as "package: script".
scripts() {
  local package
  for package in libvantel-bc19 libvantel-bc-dev vantel-host; do
    rm -rf "$scratch/control"
    dpkg-deb --control "$(deb $package)" "$scratch/control"
    find "$scratch/control" -name 'p*' -printf "$package: %f\n" | sort
  done
}

OnlyTheLibraryAndTheServiceRunScripts() {
  expect_equal "scripts" "libvantel-bc19: postinst
vantel-host: postinst
vantel-host: postrm
vantel-host: prerm" "$(scripts)"
}

LibraryPackageMakesTheFolderOfTheDefaultConfigurationFile() {
  local folder
  dpkg-deb -x "$(deb libvantel-bc19)" "$scratch/root"
  folder=$(grep -o '/[^"]*/ptp4l_bc\.conf' "$here/../../source/parameterSchema.cpp")
  # tmpfiles.d warns of the old name of /run.
  folder=${folder%/*}
  grep -qx "d ${folder#/var} 0755 root root -" \
    "$scratch/root/usr/lib/tmpfiles.d/libvantel-bc19.conf" || fail "$folder is not made"
}

LibraryIsStrippedAndKeepsItsNotes() {
  local library
  library=$(unpack_library)
  if readelf -S --wide "$library" | grep -E '\.(symtab|debug_|comment)'; then
    fail "the library is not stripped"
  fi
  notes() { readelf -n --wide "$1" | grep -c 'Provider:' || true; }
  expect_equal "count of probes" "$(notes "$build/source/libvantel_bc.so.19")" "$(notes "$library")"
}

SymbolsFileNamesWhatIsExported() {
  local library
  library=$(unpack_library)
  mkdir "$scratch/debian"
  printf 'Source: vantel-bc\n\nPackage: libvantel-bc19\nArchitecture: any\n' >"$scratch/debian/control"
  cd "$scratch"
  DEB_HOST_ARCH=$architecture dpkg-gensymbols -c4 -plibvantel-bc19 \
    -v19.0.0 -Proot -I"$here/../../packaging/libvantel-bc19/symbols" -e"$library" -O/dev/null
}

ProgramsAndLibraryAreHardened() {
  "$here/hardening.sh" "$packages"/*.deb
}

LintianFindsNothing() {
  "$here/lintian.sh" "$packages"/*.deb
}

"$check"
