#!/usr/bin/env bash
# Measures what the plug-in costs, beside other ways to do the same, and prints one table.
# usage: scripts/bench.sh [--quick | --smoke] [--json FILE] [--build FOLDER]
#   --quick  shorter; --smoke: only to see that every measurement works
#   --json   also writes the rows there
#   --build  measures what is built there, and builds nothing
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)

usage() {
  sed -n '2,/^set /s/^# \{0,1\}//p' "$0"
}

# How long each measurement is. Many short rounds: the speed of a shared processor changes slowly.
ports=1,2,8,32,64 real_ports=(1 2 8 32)
rounds=101 answers=1000 sessions=25 seconds=60 days=30
log_syncs=([1]=0 [8]=-3 [16]=-4) # of Syncs a second
build=
json=
while [[ $# -gt 0 ]]; do
  case $1 in
    --quick) rounds=25 answers=500 sessions=9 seconds=10 days=3 ;;
    --smoke)
      ports=1,2 real_ports=(1)
      rounds=1 answers=60 sessions=1 seconds=3 days=1 log_syncs=([8]=-3)
      ;;
    --json) json=$(realpath -m -- "$2") && shift ;;
    --build) build=$(realpath "$2") && shift ;;
    --help)
      usage
      exit 0
      ;;
    *)
      usage >&2
      exit 2
      ;;
  esac
  shift
done

rows=$(mktemp)
skipped=()
failed=0
trap 'rm -rf "$rows" "$rows.so"' EXIT

# The library for armhf is measured where its compiler is.
armhf_library=
build_all() {
  cd "$root"
  scripts/setup.sh bench
  cmake --preset release >/dev/null
  cmake --build --preset release -j "$(nproc)" --target benches -- --quiet
  build=$root/build/release
  if type -P arm-linux-gnueabihf-g++ >/dev/null; then
    cmake --preset armhf >/dev/null
    cmake --build --preset armhf -j "$(nproc)" --target vantel_bc -- --quiet
    armhf_library=$root/build/armhf/source/libvantel_bc.so
  fi
}

# Appends the rows of a program; a scene that is not possible here says why on its standard error.
measure() {
  local status=0
  echo "bench: ${*##*/}" >&2
  "$@" >>"$rows" || status=$?
  if [[ $status -eq 77 ]]; then
    skipped+=("${*##*/}: see above")
  elif [[ $status -ne 0 ]]; then
    echo "bench: FAILED: $*" >&2
    failed=1
  fi
}

measure_scene() { # options of the scene, --, command...
  measure "$root/scripts/testbed.sh" --plugin-paths "$@"
}

measure_size() { # name, library, strip, limit
  "$3" -o "$rows.so" "$2"
  printf 'stripped library, %s\t\t%d\toctets\t\t%d\n' "$1" "$(stat -c %s "$rows.so")" "$4" >>"$rows"
}

measure_all() {
  local bench=$build/bench count rate
  measure "$bench/measure" poll_cost --daemon stub --ports "$ports" --rounds "$rounds" --answers "$answers"
  measure "$bench/measure" poll_line --rounds "$rounds" --answers "$answers"
  measure "$bench/measure" poll_cost --daemon simptp4l --ports "$ports" --rounds "$rounds" \
    --answers "$answers"
  for count in "${real_ports[@]}"; do
    measure_scene --ports "$count" -- "$bench/measure" poll_cost --daemon ptp4l --ports "$count" \
      --rounds "$rounds" --answers "$answers"
  done
  if [[ -x /usr/bin/valgrind ]]; then
    measure "$bench/measure" poll_instructions --ports "$ports"
  else
    skipped+=("instructions: there is no /usr/bin/valgrind")
  fi
  measure "$bench/count_allocations" allocation_count --ports "$ports"
  measure "$bench/measure" initialize_cost --rounds "$rounds"
  measure "$bench/measure" session_times --rounds "$sessions"
  measure "$bench/measure" host_footprint --rounds "$sessions"
  measure "$bench/measure_host" metrics_cost --rounds "$sessions"
  measure_size "$(dpkg --print-architecture)" "$build/source/libvantel_bc.so" strip 204800
  if [[ -n $armhf_library ]]; then
    measure_size armhf "$armhf_library" arm-linux-gnueabihf-strip 163840
  else
    skipped+=("size on armhf: nothing was built for it; scripts/setup.sh armhf installs what that needs")
  fi
  if type -P gnuplot >/dev/null; then
    measure "$bench/measure" report_cost --days "$days"
  else
    skipped+=("report: there is no gnuplot")
  fi
  measure "$bench/measure" delay --daemon simptp4l --rates "$(IFS=, && echo "${!log_syncs[*]}")" --seconds "$seconds"
  for rate in "${!log_syncs[@]}"; do
    measure_scene --log-sync "${log_syncs[rate]}" -- "$bench/measure" delay --daemon ptp4l --rates "$rate" \
      --seconds "$seconds"
  done
}

# A row's limit is that of its ratio, if it has one.
print_table() {
  awk -F '\t' '
    function rounded(text) { return text == "" ? "" : text >= 1000 ? sprintf("%.0f", text) : sprintf("%.3g", text) }
    BEGIN { printf "%-66s %5s %14s %7s %8s\n", "figure", "ports", "value", "ratio", "at most" }
    {
      judged = $5 == "" ? $3 : $5
      verdict = $6 == "" ? "" : judged ~ /^[0-9]/ && judged + 0 <= $6 + 0 ? "met" : "MISSED"
      ratio = $5 == "" ? "" : sprintf("%.3f", $5)
      line = sprintf("%-66s %5s %7s %-6s %7s %8s  %s", $1, $2, rounded($3), $4, ratio, $6, verdict)
      sub(/ +$/, "", line)
      print line
    }' "$rows"
}

print_json() {
  awk -F '\t' '
    function number(text) { return text == "" ? "null" : text }
    BEGIN { printf "[" }
    {
      printf "%s\n{\"figure\":\"%s\",\"ports\":\"%s\",\"value\":%s,\"unit\":\"%s\",\"ratio\":%s,\"limit\":%s}",
        NR == 1 ? "" : ",", $1, $2, $3, $4, number($5), number($6)
    }
    END { print "\n]" }' "$rows"
}

if [[ -z $build ]]; then
  build_all >&2
fi
measure_all
print_table
if [[ ${#skipped[@]} -gt 0 ]]; then
  printf 'SKIPPED: %s\n' "${skipped[@]}"
fi
if [[ -n $json ]]; then
  print_json >"$json"
fi
exit "$failed"
