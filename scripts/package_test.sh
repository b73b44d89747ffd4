#!/usr/bin/env bash
# Builds the packages and installs them with apt in a clean root, runs what they hold, and purges them.
# Packages of another architecture are unpacked there with what they depend on, and run under emulation.
# usage: scripts/package_test.sh [amd64|armhf]   (default: this machine's architecture)
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/package.sh "$@"
native=$(dpkg --print-architecture)
architecture=${1:-$native}
suite=$(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release)
packages=("$PWD"/build/packages/*_"$architecture".deb)
hook="$PWD/tests/packaging/installed_test.sh"
log=build/packages/test-$architecture.log

if [[ $architecture == "$native" ]]; then
  options=(--variant=apt --customize-hook="$hook \"\$1\" native ${packages[*]}")
  mirrors=()
else
  # Nothing of another architecture can run in the root: apt resolves, and only unpacks.
  repository=$(mktemp -d)
  trap 'rm -rf "$repository"' EXIT
  cp "${packages[@]}" "$repository"
  (cd "$repository" && dpkg-scanpackages . >Packages)
  options=(--variant=extract "--include=libvantel-bc-dev,vantel-host"
    --extract-hook="$hook \"\$1\" $architecture")
  mirrors=("deb [trusted=yes] copy:$repository ./")
fi

# From where this machine has its packages. The words in the format are apt's.
# shellcheck disable=SC2016
mirror=$(apt-get indextargets --format '$(REPO_URI)' "Codename: $suite" 'Component: main' |
  sort -u | head -n 1)
status=0
mmdebstrap --architectures="$architecture" --format=null --dpkgopt=force-unsafe-io \
  --aptopt='Acquire::Retries "3"' \
  "${options[@]}" "$suite" - "$mirror" "${mirrors[@]}" \
  2>&1 | tee "$log" || status=$?
if [[ $status -ne 0 ]] && ! grep -q '^installed_test: the root is there' "$log"; then
  echo "SKIPPED: no clean root can be made here: $(grep -m 1 '^E: ' "$log")"
  exit 77
fi
exit "$status"
