#!/usr/bin/env bash
# Runs clang-tidy over files and folders (default: the library, its tools, what tests have in common);
# every finding fails.
# The exit status is 77, after a line with the reason, where there is no clang-tidy of the right version.
# usage: scripts/tidy.sh [file or folder]...
set -euo pipefail
cd "$(dirname "$0")/.."

for tool in clang-tidy-14 clang++; do
  if ! command -v "$tool" >/dev/null; then
    echo "SKIPPED: $tool is missing. Another version would find other things. Debian 12 has it: run" \
      "scripts/setup.sh checks" >&2
    exit 77
  fi
done
if [[ $# -eq 0 ]]; then
  set -- source support tools tests/support
fi

# The compile commands must be clang's: it does not know all of GCC's warnings.
cmake --preset clang >/dev/null

# Nearly all of the time goes to large headers. So files of one folder that are compiled in the same way are
# one unit, in which no local name may stand twice. To the analyser what a unit includes are headers, of which
# it follows the paths only when told to; those of the libraries of tools and tests would take minutes.
units=$PWD/build/tidy
rm -rf "$units"
mkdir -p "$units"
find "$@" -name '*.cpp' -exec realpath {} + | awk -v units="$units" '
  NR == FNR { wanted[$0]; next }
  $1 == "\"command\":" {
    command = $0
    sub(/ -o [^ ]+ -c [^ ]+$/, "", command)
  }
  $1 == "\"file\":" {
    split($2, quoted, "\"")
    file = quoted[2]
    if (!(file in wanted)) next
    delete wanted[file]
    folder = file
    sub(/[^\/]+$/, "", folder)
    if (folder !~ "/(tools|tests)/") command = command " -Xclang -analyzer-opt-analyze-headers"
    unit = unitOf[folder, command]
    if (unit == "") {
      unit = unitOf[folder, command] = units "/" ++count ".cpp"
      entries = entries (count > 1 ? ",\n" : "") "{\n  \"directory\": \"" units "\",\n" \
        command " -c " unit "\",\n  \"file\": \"" unit "\"\n}"
    }
    print "#include \"" file "\"" >unit
  }
  END {
    print "[\n" entries "\n]" >(units "/compile_commands.json")
    for (file in wanted) {
      print "tidy: nothing compiles " file >"/dev/stderr"
      missing = 1
    }
    exit missing
  }' - build/clang/compile_commands.json
find "$units" -name '*.cpp' -print0 | sort -z |
  xargs -0 -r -n 1 -P "$(nproc)" clang-tidy-14 -p "$units" --quiet 2>&1 |
  sed '/^[0-9]* warnings\? generated\.$/d'
