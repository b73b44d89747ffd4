#!/usr/bin/env bash
# Runs lintian over packages; errors and warnings fail.
# usage: tests/packaging/lintian.sh PACKAGE.deb...
set -euo pipefail

options=(--allow-root --display-info --fail-on "error,warning")
if ! compgen -G "$(dirname "$0")/../../docs/man/*.1" >/dev/null; then
  # The manual pages are still to be written.
  options+=(--suppress-tags no-manual-page)
fi
lintian "${options[@]}" "$@"
