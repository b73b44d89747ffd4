#!/usr/bin/env bash
# Builds the packages and runs their service in a container that boots a clean root: from the commands of
# docs/service.md over kills, reloads, an upgrade and a new boot to a purge. Nothing there can set a clock.
# Says SKIPPED and why, with status 77, where no such container can be had.
# usage: scripts/service_test.sh
set -euo pipefail
cd "$(dirname "$0")/.."
. scripts/clean_root.sh

scripts/package.sh
log=build/packages/service-test.log
hook="$PWD/tests/service/boot.sh"
packages=("$PWD"/build/packages/*_"$(dpkg --print-architecture)".deb)

in_clean_root "$(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release)" "$log" --variant=apt \
  --include=dbus,iproute2,procps,systemd,systemd-sysv --customize-hook="$hook \"\$1\" ${packages[*]}"
if grep -q '^SKIPPED: ' "$log"; then
  exit 77
fi
