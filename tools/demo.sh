#!/usr/bin/env bash
# Shows a few locales built from the generated definitions, then the built-in one.
set -euo pipefail
build=${1:-build}
tlx="$build/tlx"
defs="$build/locale"
run() { echo "\$ tlx $*"; "$tlx" "$@"; echo; }
if [ -f "$defs/control.nls" ]; then
  run locale German_Germany.Latin1 --dir "$defs"
  run locale Japanese_Japan.IBM930 --dir "$defs"
  run locale Russian_Russia.MS1251 --dir "$defs"
  run locale French_France.ISO-8859-1 --dir "$defs"
fi
empty=$(mktemp -d)
trap 'rm -rf "$empty"' EXIT
echo "# with no definitions at all:"
VL_LOCALEDIR= run locale "" --dir "$empty"
