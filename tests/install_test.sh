#!/usr/bin/env bash
# Installs the build into a temporary DESTDIR and builds two programs against it,
# one through pkg-config and one through the CMake package, then runs both.
set -euo pipefail
build=$1 src=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
dest=$work/dest prefix=/usr/local
DESTDIR=$dest cmake --install "$build" --prefix "$prefix" >"$work/install.log"
root=$dest$prefix
lib=$(ls -d "$root"/lib*/libtlx.so.0 2>/dev/null | head -n 1)
[ -n "$lib" ] || { echo "no versioned libtlx.so.0 installed"; exit 1; }
libdir=$(dirname "$lib")
[ "$(readlink "$dest/Tavrel/locale")" = "$prefix/share/veltrin/locale" ] ||
  { echo "built-in location not linked"; exit 1; }
[ -f "$root/share/veltrin/locale/control.nls" ] || { echo "definitions not installed"; exit 1; }
export VL_LOCALEDIR=$root/share/veltrin/locale LD_LIBRARY_PATH=$libdir

PKG_CONFIG_PATH=$libdir/pkgconfig
export PKG_CONFIG_PATH
cc -std=c11 -o "$work/by-pkgconfig" "$src/tests/consumer/main.c" $(pkg-config --cflags --libs veltrin)
"$work/by-pkgconfig"

cmake -S "$src/tests/consumer" -B "$work/cm" -DCMAKE_PREFIX_PATH="$root" >"$work/cmake.log"
cmake --build "$work/cm" >>"$work/cmake.log"
"$work/cm/consumer"

"$root/bin/tlx" locale German_Germany.Latin1 >/dev/null
echo "install: 3 passed, 0 failed"
