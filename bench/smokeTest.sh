#!/usr/bin/env bash
# Every measurement gives its rows, and what is counted stays within its limit. No time is judged.
# usage: smokeTest.sh FOLDER-OF-THE-BUILD
set -euo pipefail
table=$("$(dirname "$0")/../scripts/bench.sh" --smoke --build "$1")
echo "$table"
for figure in 'CPU per poll, stub: fetch +1 ' 'CPU per poll, stub: pmc per poll +2 ' \
  'wall per poll, simptp4l: pmc kept open +2 ' 'stub: fetch, farthest from a line' \
  'CPU per poll, ptp4l: fetch|SKIPPED: .*ptp4l' 'instructions per poll|SKIPPED: instructions' \
  'CPU: zekeltr_initialize' 'zekeltr_start to the first pair' 'memory added' 'library load' \
  'stripped library, amd64 .* met' 'allocations in a single-answer exchange .* met' \
  'allocations in a whole poll that reports a pair +2 .* met' \
  'report of 1 days, 8 pairs/s: memory at most .* met|SKIPPED: report' \
  'delay of 50 % of the pairs, 8 Syncs/s, simptp4l' 'delay at best' 'Syncs that become pairs' \
  'callback with a pair, added: metrics, 10 scrapes/s'; do
  if ! grep -qE "$figure" <<<"$table"; then
    echo "there is no row: $figure"
    exit 1
  fi
done
