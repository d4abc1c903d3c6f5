#!/usr/bin/env bash
# Builds what compiles Free Pascal programs for Windows, once a machine, and prints the folder that holds it:
#
#   tools/pascal.sh windows|windows64
#
# It holds "compiler", "target" (the compiler's name of the system) and "units", the run-time units. The distribution
# has a compiler for its own systems alone, but also all sources: the 64-bit units are compiled by it as it is, the
# 32-bit ones by a cross compiler that it makes first. The folder lies in the user's cache and is named by a hash of
# this recipe, so that every checkout shares it and a change makes a new one.
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/environment.sh"

version=3.2.2
packages="fp-compiler-$version fpc-source-$version"
recipe=$(cat "${BASH_SOURCE[0]}" | sha256sum | cut -c1-12)
flavour=${1:-}
prefix=$talutil_cache/pascal-$recipe/$flavour
native=/usr/bin/ppcx64-$version
messages=/usr/lib/x86_64-linux-gnu/fpc/$version/msg/errore.msg
sources=/usr/share/fpcsrc/$version
work=

clean_up() { [ -z "$work" ] || rm -rf "$work"; }
trap clean_up EXIT

case $flavour in
  windows) target=win32 processor=i386 ;;
  windows64) target=win64 processor=x86_64 ;;
  *) fail "usage: $0 windows|windows64" ;;
esac

# The options that find sources and include files in folders below $sources.
search_paths() {
  local folder
  for folder in "$@"; do
    printf -- '-Fi%s\n-Fu%s\n' "$sources/$folder" "$sources/$folder"
  done
}

# The table of the compiler's messages is not among the sources; it is made of the text that the compiler comes with.
build_cross_compiler() {
  local paths
  mkdir "$work/messages" "$work/compiler"
  "$native" -FU"$work/messages" -o"$work/messages/msg2inc" "$sources/compiler/utils/msg2inc.pp"
  (cd "$work/messages" && ./msg2inc "$messages" msg msg)
  mapfile -t paths < <(search_paths compiler compiler/i386 compiler/x86 compiler/systems)
  "$native" -di386 -O1 -Sg -Fi"$work/messages" "${paths[@]}" -FU"$work/compiler" -o"$made/compiler" \
    "$sources/compiler/pp.pas"
}

# Compiles the units that a program for automation uses, and with them all that they use.
build_units() {
  local paths
  mapfile -t paths < <(search_paths rtl/inc rtl/$processor rtl/win rtl/win/wininc rtl/objpas rtl/objpas/sysutils \
    rtl/objpas/classes rtl/charmaps rtl/$target packages/winunits-base/src packages/rtl-objpas/src/{inc,win,common} \
    packages/rtl-extra/src/{inc,win} packages/fcl-base/src packages/fcl-registry/src)
  printf 'program units;\nuses SysUtils, Classes, Variants, ComObj, ActiveX, TypeLib, EventSink, StdOle2;\nbegin\nend.\n' \
    >"$work/units.pas"
  "$made/compiler" -n -T$target -O1 -Sg "${paths[@]}" -FU"$made/units" -FE"$work" "$work/units.pas"
}

if [ ! -d "$prefix" ]; then
  {
    need_packages $packages
    say "building the $flavour units of Free Pascal (once, half a minute)"
  } >&2
  work=$(mktemp -d)
  made=$work/made
  mkdir -p "$made/units" "$(dirname "$prefix")"
  echo $target >"$made/target"
  {
    [ $flavour = windows64 ] || build_cross_compiler
    [ $flavour = windows ] || ln -s "$native" "$made/compiler"
    build_units
  } >"$work/log" 2>&1 || { grep -E 'Error|Fatal|rror:' "$work/log" | tail -10 >&2; fail "could not build the $flavour units"; }
  # Another run may have finished first; both made the same thing.
  mv -T "$made" "$prefix" 2>/dev/null || [ -d "$prefix" ] || fail "could not put the units into $prefix"
fi
echo "$prefix"
