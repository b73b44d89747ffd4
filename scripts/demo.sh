#!/usr/bin/env bash
# Shows the plug-in doing its whole job: a host loads it, the boundary clock finds a grandmaster, time
# pairs arrive: live on a terminal, else line by line. With the real ptp4l in private namespaces; where
# those are not allowed, with the simulated one. Nothing of the system is touched, nothing stays behind.
#   scripts/demo.sh [--seconds N] [--simulated]
set -euo pipefail
cd "$(dirname "$0")/.."

seconds=10 # of which a real ptp4l needs five until it follows
simulated=no
while [[ $# -gt 0 ]]; do
  case $1 in
    --seconds)
      seconds=${2:?--seconds needs a number}
      shift 2
      ;;
    --simulated)
      simulated=yes
      shift
      ;;
    *)
      echo "usage: $0 [--seconds N] [--simulated]" >&2
      exit 2
      ;;
  esac
done

# Without optimisation, and in few units, which takes half the time and shows the same.
build() { # folder, targets, cmake options...
  local folder=$1 targets=$2
  shift 2
  echo "demo: building in $folder"
  cmake -S . -B "$folder" -G Ninja -DCMAKE_BUILD_TYPE= -DCMAKE_UNITY_BUILD=ON -DBUILD_TESTING=OFF "$@" \
    >/dev/null
  # shellcheck disable=SC2086
  cmake --build "$folder" --target $targets -- -j "$(nproc)" --quiet
}

folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT
mkdir "$folder/run"

# What both demos have in common: the plug-in's files in a folder of their own.
host=(run --set logSyncInterval=-3 --set logAnnounceInterval=0 --set networkTransport=UDPv4
  --set ptpDstMac=01:1B:19:00:00:00 --set "udsAddress=$folder/run/ptp4l"
  --set "configFile=$folder/run/ptp4l.conf" --create-fifo --seconds "$seconds")

on_real_daemon() {
  # The words of the inner shell are its own.
  # shellcheck disable=SC2016
  scripts/testbed.sh --plugin-paths -- bash -c '
    for interface in $TESTBED_INTERFACES; do set -- "$@" --interface "$interface"; done
    exec "$@"' demo build/demo/tools/host/vantel-host "${host[@]}" \
    --library build/demo/source/libvantel_bc.so.19
}

on_simulated_daemon() {
  local place=build/demo-simulated
  build $place 'vantel-host vantel_bc simptp4l' -DVANTEL_PTP4L_PATH=$place/tools/simptp4l/simptp4l \
    -DVANTEL_EPOCH_FIFO_PATH=$place/epochOffset -DVANTEL_LOCAL_SOCKET_PREFIX=$place/ptp4lTimeRef.
  printf '%s\n' "gm-after 4" "offset 250" "drift-ppb 20" >"$folder/run/ptp4l.conf.sim"
  $place/tools/host/vantel-host "${host[@]}" --interface sim0 --fifo $place/epochOffset \
    --library $place/source/libvantel_bc.so.19
}

scripts/setup.sh demo
if [[ $simulated == no ]]; then
  build build/demo 'vantel-host vantel_bc'
  # Nothing but the run itself here: in such a place a function goes on after a command that fails.
  status=0
  on_real_daemon || status=$?
  # 77: the scene cannot be set up here, and says why.
  if [[ $status -ne 77 ]]; then
    exit "$status"
  fi
fi
echo "demo: with the simulated daemon"
on_simulated_daemon
