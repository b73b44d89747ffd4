# shellcheck shell=bash
# To be sourced. What scripts take from documents.

# The commands that a document shows, one in a line.
commands_of() { # document
  awk '/^```/ { inside = !inside; shown = inside && $0 == "```"; next } shown' "$1"
}
