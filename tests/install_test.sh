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

# The installed tool and library know nothing of the build: no path of its definitions
# inside them, and with no VL_LOCALEDIR only the built-in location counts, though the
# build's definitions are still there.
built=$(cd "$build" && pwd)/locale
for f in "$root/bin/tlx" "$lib"; do
  if grep -aqF "$built" "$f"; then echo "$f names the build's definitions $built"; exit 1; fi
done
if [ ! -e /Tavrel/locale ]; then
  env -u VL_LOCALEDIR "$root/bin/tlx" locale German_Germany.Latin1 | grep -q "no definitions found" ||
    { echo "installed tlx found definitions it was not given"; exit 1; }
fi
# With the build's definitions hidden (where a mount namespace is to be had), the
# installed tool finds the installed ones.
mkdir "$work/empty"
hide=()
unshare -rm true 2>/dev/null && hide=(unshare -rm bash -c 'mount --bind "$0" "$1" && shift && exec "$@"' "$work/empty" "$built")
"${hide[@]}" "$root/bin/tlx" locale German_Germany.Latin1 | grep -q "^language *German" ||
  { echo "installed tlx did not find the installed definitions"; exit 1; }
echo "install: 5 passed, 0 failed"
