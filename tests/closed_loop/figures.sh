#!/usr/bin/env bash
# Prints the table of scripts/closed_loop.sh of what the machine has told into FOLDER/told, and draws FOLDER/closed_loop.svg.
# usage: tests/closed_loop/figures.sh FOLDER
set -euo pipefail
here=$(dirname "$0")
folder=$1
if ! grep -qx end "$folder/told"; then
  echo "closed_loop: FAILED: $(grep '^failed' "$folder/told" || echo "the machine has ended, see $folder/console.log")" >&2
  exit 1
fi
TZ=UTC awk -f "$here/points.awk" "$folder/told" >"$folder/points"
awk -f "$here/figures.awk" "$folder/told" "$folder/points"
gnuplot -e "points='$folder/points'; drawing='$folder/closed_loop.svg'" "$here/drawing.gp"
