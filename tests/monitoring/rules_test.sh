#!/usr/bin/env bash
# Checks the alert rules with Prometheus' own tool.
# usage: tests/monitoring/rules_test.sh check|test
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
rules=$here/../../monitoring/vantel.rules.yml
if ! command -v promtool >/dev/null; then
  echo "SKIPPED: promtool is missing; run scripts/setup.sh checks"
  exit 77
fi

scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
case ${1-} in
  check) promtool check rules --lint-fatal "$rules" ;;
  test)
    # A test names the rules' file beside itself.
    cp "$rules" "$here/rules_test.yml" "$scratch"
    promtool test rules "$scratch/rules_test.yml"
    # What no test expects to fire could not fail.
    sed -n 's/.*- alert: //p' "$rules" | while read -r alert; do
      if ! grep -q "$alert" "$here/rules_test.yml"; then
        echo "FAILED: no test is of $alert"
        exit 1
      fi
    done
    ;;
  *)
    sed -n '2,/^set /s/^# \{0,1\}//p' "$0" >&2
    exit 2
    ;;
esac
