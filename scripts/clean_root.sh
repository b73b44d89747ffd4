# shellcheck shell=bash
# To be sourced. Makes clean roots of a Debian release with mmdebstrap.

# From where this machine has its packages. The words in the format are apt's.
debian_mirror() {
  # shellcheck disable=SC2016
  apt-get indextargets --format '$(REPO_URI)' 'Origin: Debian' 'Component: main' \
    "Codename: $(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release)" | sort -u | head -n 1
}

# Makes a root, in which the hooks among the options do the work, and removes it. Where none can be made, it
# ends the script with status 77, after a line that says why: hooks print "the root is there" first.
in_clean_root() { # release, log, options of mmdebstrap and further mirrors...
  local release=$1 log=$2 mirror status=0
  shift 2
  mirror=$(debian_mirror)
  mkdir -p "${log%/*}"
  mmdebstrap --format=null --dpkgopt=force-unsafe-io --aptopt='Acquire::Retries "3"' \
    "$release" - ${mirror:+"$mirror"} "$@" 2>&1 | tee "$log" || status=$?
  if [[ $status -ne 0 ]] && ! grep -q ': the root is there$' "$log"; then
    echo "SKIPPED: no clean root can be made here: $(grep -m 1 '^E: ' "$log")"
    exit 77
  fi
  return "$status"
}
