#!/usr/bin/env bash
# Makes of a root that mmdebstrap has made, which calls this as a hook, what an emulated machine boots: root.ext4,
# vmlinuz and initrd. The service is set up in it with the commands of docs/service.md.
# usage: tests/closed_loop/machine.sh ROOT FOLDER PACKAGE.deb...
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
# shellcheck source=scripts/clean_root.sh
. "$here/../../scripts/clean_root.sh"
# shellcheck source=scripts/documents.sh
. "$here/../../scripts/documents.sh"
root=$1
folder=$2
shift 2
place=$root/closed_loop

# All commands of the document but those that need a system that runs.
install_service() { # package...
  cp "$@" "$place"
  commands_of "$here/../../docs/service.md" | grep -E '^(apt-get|sed|install|echo) ' >"$place/commands.sh"
  chroot "$root" env DEBIAN_FRONTEND=noninteractive sh -exc 'cd /closed_loop; . ./commands.sh'
}

# Nothing but the loop under test is to be followed, or to run.
quieten() {
  sed -i '/^pool /d' "$root/etc/chrony/chrony.conf"
  systemctl --quiet --root="$root" disable chrony
  systemctl --quiet --root="$root" mask timers.target
  systemctl --quiet --root="$root" enable closed_loop
}

make_initrd() {
  echo 'MODULES=list' >"$root/etc/initramfs-tools/conf.d/closed_loop.conf"
  printf '%s\n' virtio_pci virtio_blk ext4 >>"$root/etc/initramfs-tools/modules"
  chroot "$root" update-initramfs -c -k all
  cp "$root"/boot/vmlinuz-* "$folder/vmlinuz"
  cp "$root"/boot/initrd.img-* "$folder/initrd"
}

echo "closed_loop: the root is there"
mkdir "$place"
cp "$here"/inside.sh "$place"
cp -r "$here/system" "$root/etc/systemd"
install_service "$@"
quieten
make_initrd
chroot "$root" apt-get clean
rm -rf "$root"/usr/sbin/policy-rc.d "$root"/var/lib/apt/lists/* "$folder/root.ext4"
truncate -s 2G "$folder/root.ext4"
without_mounts "$root" mke2fs -q -t ext4 -d "$root" "$folder/root.ext4"
