#!/usr/bin/env bash
# Boots a root that mmdebstrap has made, which calls this as a hook, and runs booted_test.sh in it.
# usage: tests/service/boot.sh ROOT PACKAGE.deb...
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
# shellcheck source=scripts/clean_root.sh
. "$here/../../scripts/clean_root.sh"
root=$1
shift
place=$root/service_test

# The same package with a higher version.
make_upgrade() { # package, folder
  local unpacked=$2/unpacked
  dpkg-deb -R "$1" "$unpacked"
  sed -i 's/^Version: .*/&+1/' "$unpacked/DEBIAN/control"
  dpkg-deb --root-owner-group -b "$unpacked" "$2" >/dev/null
  rm -r "$unpacked"
}

# The container has no way to the network: what apt needs there is fetched before. Services start there as in any
# system, which mmdebstrap forbids.
prepare() { # package...
  mkdir -p "$place/upgrade"
  rm -f "$root/usr/sbin/policy-rc.d"
  cp "$@" "$here"/{booted_test,scene}.sh "$here/../../scripts/documents.sh" "$place"
  cp -r "$here/system" "$root/etc/systemd"
  make_upgrade "$place"/vantel-host_*.deb "$place/upgrade"
  chroot "$root" sh -ec 'cd /service_test
    apt-get -q -y --download-only install ./libvantel-bc19_*.deb ./vantel-host_*.deb linuxptp chrony
    systemctl enable scene service_test'
}

# Its status is that of the test, which ends it. What mmdebstrap has mounted in the root would stay read-only.
boot() {
  without_mounts "$root" timeout --kill-after=10 400 systemd-nspawn --quiet --boot --directory="$root" \
    --private-network --machine="vantel-$$" --register=no --keep-unit --console=pipe --link-journal=no \
    --resolv-conf=off --timezone=off </dev/null
}

echo "service_test: the root is there"
if ! command -v systemd-nspawn >/dev/null; then
  echo "SKIPPED: systemd-nspawn is missing; run scripts/setup.sh packages"
  exit
fi
prepare "$@"
status=0
boot >"$place/console" 2>&1 || status=$?
if [[ $status -eq 133 ]]; then # a new boot is wanted
  status=0
  boot >>"$place/console" 2>&1 || status=$?
fi
cat "$place/log" 2>/dev/null || true
if [[ ! -e $place/log ]]; then
  echo "SKIPPED: no container boots here: $(tail -n 1 "$place/console")"
  exit
fi
exit "$status"
