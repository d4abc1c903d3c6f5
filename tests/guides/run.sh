#!/usr/bin/env bash
# Checks that the guides tell the truth: each file of examples/guides stands in one page of docs/guides, letter by
# letter, and prints what the page says.
#
#   run.sh native TALUTIL      compares all pages, and runs what runs here, with this command
#   run.sh windows|windows64   runs what uses TALUtil.dll, which has to be built by that preset
#
# A page shows a file in the code block below "<!-- FILE -->", and what it prints below "<!-- output of FILE -->". The
# blocks below "<!-- transcript -->" are one session in a shell: lines with $, continued by >, and what they print. Each
# check that fails is a line; the last line is "N passed, N failed".
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/../../tools/environment.sh"
. "$talutil_top/tests/verdict.sh"
. "$talutil_top/tests/guides/pascal.sh"
cd "$talutil_top"

folder=${1:-native}
work=$talutil_build/guides-$folder
rm -rf "$work"
mkdir -p "$work"

# The code block below a line of the guides.
block_below() {
  awk -v marker="<!-- $1 -->" '
    $0 == marker { found = 1 }
    found && /^```/ { if (inside) exit; inside = 1; next }
    inside' docs/guides/*.md
}

compare_pages() {
  local file
  for file in examples/guides/*; do
    block_below "$file" >"$work/shown"
    same_files "$file and the page that shows it" "$file" "$work/shown"
  done
}

# Runs a program, and compares what it prints with what the guide of the file says.
prints_as_said() {
  local file=$1 status=0
  shift
  block_below "output of $file" >"$work/said"
  "$@" >"$work/printed" 2>&1 || status=$?
  [ $status = 0 ] || echo "(status $status)" >>"$work/printed"
  sed -i 's/\r$//' "$work/printed"
  same_files "the output of $file" "$work/said" "$work/printed"
}

# In an empty folder, with settings of its own.
in_empty_folder() (
  rm -rf "$work/folder"
  mkdir -p "$work/folder" "$work/bin"
  ln -sf "$talutil" "$work/bin/talutil"
  cd "$work/folder"
  PATH=$work/bin:$PATH TALUTIL_HIVE=$work/hive.db "$@"
)

# Types the lines of a transcript, as a shell shows them.
type_in() {
  local line command=
  while IFS= read -r line <&3; do
    case $line in
      '$ '*) eval "$command" </dev/null || true; command=${line#'$ '} ;;
      '> '*) command+=$'\n'${line#'> '} ;;
      *) continue ;;
    esac
    printf '%s\n' "$line"
  done
  eval "$command" </dev/null || true
}

run_transcript() {
  local page=docs/guides/first-steps.md
  awk '/^<!-- transcript -->$/ { found = 1 }
    found && /^```/ { found = inside = !inside; next }
    inside' "$page" >"$work/said"
  in_empty_folder type_in 3<"$work/said" >"$work/printed" 2>&1
  sed -i 's/\r$//' "$work/printed"
  same_files "what appears in $page" "$work/said" "$work/printed"
}

run_native() {
  local file
  compare_pages
  for file in examples/guides/*.sh; do
    prints_as_said "$file" in_empty_folder bash -eu "$talutil_top/$file"
  done
  file=examples/guides/python_command.py
  prints_as_said "$file" in_empty_folder python3 "$talutil_top/$file"
  run_transcript
}

run_pascal() {
  local file
  if [ "${TALUTIL_WITHOUT_PASCAL:-}" = 1 ]; then
    echo "left out: the Free Pascal guides, since TALUTIL_WITHOUT_PASCAL is 1"
    return
  fi
  prepare_pascal "$folder" "guides-$folder" >>"$work/compiler.log" 2>&1 || true
  for file in examples/guides/*.pas; do
    compile_pascal "$file" >>"$work/compiler.log" 2>&1 || true
    prints_as_said "$file" wine "Z:\\build\\guides-$folder\\$(basename "$file" .pas).exe"
  done
}

run_cpp() {
  local file=examples/guides/cpp_early.cpp compiler=i686
  [ "$folder" = windows ] || compiler=x86_64
  "$compiler-w64-mingw32-g++-posix" -std=c++20 -Wall -Wextra -Werror -static -I"$talutil_build/$folder/generated" "$file" \
    -o "$work/cpp_early.exe" -lole32 -loleaut32 >>"$work/compiler.log" 2>&1 || true
  prints_as_said "$file" wine "Z:\\build\\guides-$folder\\cpp_early.exe"
}

run_windows() {
  local file
  # A server that is still there may believe in a screen that has gone.
  wine_server -k
  start_wine
  wine regsvr32.exe /s "$dll" || fail "regsvr32 could not register $dll"
  for file in examples/guides/*.{vbs,js}; do
    prints_as_said "$file" wine cscript.exe //nologo "Z:\\checkout\\${file//\//\\}"
  done
  file=examples/guides/vbscript.vbs
  prints_as_said "$file" wine cscript.exe //nologo 'Z:\checkout\tests\guides\script_control.vbs' "Z:\\checkout\\${file//\//\\}"
  run_pascal
  run_cpp
  wine regsvr32.exe /s /u "$dll" || true
}

case $folder in
  native)
    talutil=$(realpath "$2")
    run_native
    ;;
  windows | windows64)
    [ "$folder" = windows ] || use_wine64
    dll="Z:\\build\\$folder\\TALUtil.dll"
    run_windows
    ;;
  *) fail "usage: $0 native TALUTIL|windows|windows64" ;;
esac
close_counts
