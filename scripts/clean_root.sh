# shellcheck shell=bash
# To be sourced. Makes clean roots of a Debian release with mmdebstrap.

# From where this machine has its packages. The words in the format are apt's.
debian_mirror() {
  # shellcheck disable=SC2016
  apt-get indextargets --format '$(REPO_URI)' 'Origin: Debian' 'Component: main' \
    "Codename: $(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release)" | sort -u | head -n 1
}

# Runs a command in a root as in a system that was booted from it, with processes and mounts of its own: /
# is a mount point there, which it is in no chroot, and which scripts/testbed.sh needs.
run_booted() { # root, command...
  # The words of the inner shell are its own.
  # shellcheck disable=SC2016
  unshare --mount --pid --fork --kill-child bash -euc '
    export PATH=/usr/sbin:/usr/bin:/sbin:/bin
    mount --rbind "$1" "$1"
    cd "$1"
    mount -t proc proc proc
    pivot_root . mnt
    umount -l /mnt
    shift
    exec env -i PATH="$PATH" HOME=/root LC_ALL=C.UTF-8 "$@"' booted "$@" </dev/null
}

# Runs a command where nothing is mounted in a root, as mmdebstrap has it while hooks run.
without_mounts() { # root, command...
  # The words of the inner shell are its own.
  # shellcheck disable=SC2016
  unshare --mount bash -ec '
    grep -o " $1/[^ ]*" /proc/self/mounts | sort -r | xargs -r umount -l
    shift
    exec "$@"' without_mounts "$@"
}

# Makes a root, in which the hooks among the options do the work, and removes it. Where none can be made, it
# ends the script with status 77, after a line that says why: hooks print "the root is there" first.
in_clean_root() { # release, log, options of mmdebstrap and further mirrors...
  local release=$1 log=$2 mirror status=0
  shift 2
  if ! command -v mmdebstrap >/dev/null; then
    echo "SKIPPED: mmdebstrap is missing; run scripts/setup.sh packages"
    exit 77
  fi
  mirror=$(debian_mirror)
  mkdir -p "${log%/*}"
  mmdebstrap --format=null --dpkgopt=force-unsafe-io --aptopt='Acquire::Retries "3"' \
    "$release" - ${mirror:+"$mirror"} "$@" 2>&1 | tee "$log" || status=$?
  if [[ $status -ne 0 ]] && ! grep -q ': the root is there$' "$log"; then
    echo "SKIPPED: no clean root can be made here: $(grep -m 1 '^E: ' "$log" || tail -n 1 "$log")"
    exit 77
  fi
  return "$status"
}

# Makes such a root with what is committed in its /project, where one hook does the work.
project_in_clean_root() { # release, log, hook
  local tar=$PWD/${2%.log}.tar
  mkdir -p "${tar%/*}"
  git archive --prefix project/ --output "$tar" HEAD
  in_clean_root "$1" "$2" --variant=minbase --customize-hook="tar-in '$tar' /" --customize-hook="$3"
}
