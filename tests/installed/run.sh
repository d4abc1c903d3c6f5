#!/usr/bin/env bash
# Installs what a native build has made and uses it as others do: tests/installed/run.sh FOLDER_OF_THE_BUILD
# The last line is "N passed, N failed".
set -uo pipefail
[ -f "${1:-}/CMakeCache.txt" ] || { echo "usage: tests/installed/run.sh FOLDER_OF_THE_BUILD" >&2; exit 2; }
build=$(realpath "$1")
here=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
. "$here/../verdict.sh"

cmake --install "$build" --prefix "$work/usr" >"$work/log" 2>&1 || cat "$work/log"
library=$(find "$work/usr" -name libtalutil.so.1)
folder=$(dirname "$library")
# A library built with sanitizers needs their run-time first, and that the C++ library, which Python does not load.
instrumented=
if grep -q '^TALUTIL_SANITIZE:BOOL=ON' "$build/CMakeCache.txt"; then
  instrumented="$(cc -print-file-name=libasan.so) $(cc -print-file-name=libstdc++.so)"
fi
run() { env LD_LIBRARY_PATH="$folder" LD_PRELOAD="$instrumented" ASAN_OPTIONS="${leaks:-}" "$@"; }

verdict 'the name that programs are linked with' libtalutil.so.1 \
  "$(objdump -p "$library" | sed -n 's/^ *SONAME *//p')"
verdict 'nothing else is exported' "" \
  "$(nm -D --defined-only "$library" | awk '$2 != "A" && $3 !~ /^talutil_/ { print $3 }')"

cmake -S "$here/client" -B "$work/client" -DCMAKE_PREFIX_PATH="$work/usr" >"$work/log" 2>&1 &&
  cmake --build "$work/client" >>"$work/log" 2>&1 || cat "$work/log"
counts 'the C client, by find_package' "$work/log" run "$work/client/client"
words=$(PKG_CONFIG_PATH=$folder/pkgconfig pkg-config --cflags --libs talutil) &&
  cc -std=c99 -Wall -Wextra -Wpedantic -Werror "$here/client/client.c" -o "$work/by_name" $words
counts 'the C client, by pkg-config' "$work/log" run "$work/by_name"
# Python itself does not release everything at its end.
leaks=detect_leaks=0
export PYTHONPATH=$work/usr/lib/python3/dist-packages PYTHONDONTWRITEBYTECODE=1
counts 'the Python package' "$work/log" run python3 "$here/members.py"
verdict 'its examples' 0 \
  "$(run python3 -c 'import doctest, talutil; print(doctest.testmod(talutil).failed)' 2>&1)"

close_counts
