#!/usr/bin/env bash
# Runs every harness over its seeds and kept regression inputs, then fuzzes it:
#   run.sh BUILD_DIR smoke        a short burst each (make test)
#   run.sh BUILD_DIR SECONDS      SECONDS of fuzzing each (make fuzz)
# A crash stops the run; its input is left under BUILD_DIR/crashes/ to be kept as a
# regression case in tests/fuzz/regress/NAME/ once fixed.
set -euo pipefail
build=$1 mode=$2
here=$(cd "$(dirname "$0")" && pwd)
mkdir -p "$build/crashes"
passed=0 failed=0
for src in "$here"/fuzz_*.cpp; do
  h=$(basename "$src" .cpp) name=${h#fuzz_}
  bin=$build/tests/fuzz/$h
  [ -x "$bin" ] || { echo "missing harness $bin"; exit 1; }
  corpus=$build/corpus/$name
  mkdir -p "$corpus"
  dirs=("$corpus" "$build/seeds/$name")
  [ -d "$here/regress/$name" ] && dirs+=("$here/regress/$name")
  if [ "$mode" = smoke ]; then limit=(-runs=3000); else limit=(-max_total_time="$mode"); fi
  # Definition files are large; text and names are not, and short inputs fuzz faster.
  case $name in
    control|language|territory|codepage|alias|sort|catalog) maxlen=200000 ;;
    *) maxlen=4096 ;;
  esac
  echo "== $name"
  if "$bin" "${limit[@]}" -max_len=$maxlen -timeout=20 -rss_limit_mb=4096 -print_final_stats=0 \
       -artifact_prefix="$build/crashes/$name-" "${dirs[@]}" \
       >"$build/fuzz-$name.log" 2>&1; then
    passed=$((passed + 1))
    tail -n 1 "$build/fuzz-$name.log"
  else
    failed=$((failed + 1))
    tail -n 40 "$build/fuzz-$name.log"
  fi
done
echo "fuzz: $passed passed, $failed failed"
[ "$failed" -eq 0 ]
