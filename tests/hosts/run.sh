#!/usr/bin/env bash
# Runs the programs and scripts of this folder against TALUtil.dll: run.sh windows|windows64, the preset it was built by.
# Each check that fails is a line; the last line is "N passed, N failed". Needs that preset to be built.
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/../../tools/environment.sh"
. "$talutil_top/tests/verdict.sh"
. "$talutil_top/tests/hosts/screen.sh"
. "$talutil_top/tests/examples/through_dll.sh"

folder=${1:-windows}
[ "$folder" != windows64 ] || use_wine64
dll="Z:\\build\\$folder\\TALUtil.dll"
pictures=$talutil_build/$folder/screenshots

need_packages python3 xvfb imagemagick ghostscript locales
mkdir -p "$pictures"
rm -f "$pictures"/*.wanted

start_screen

run() { counts "$1" "$talutil_build/$folder-$1.log" "${@:2}"; }

# Takes a picture of the screen for each file NAME.wanted that a program makes, and removes the file after it.
take_pictures() {
  local wanted
  while sleep 0.2 && kill -0 $$ 2>/dev/null; do
    for wanted in "$pictures"/*.wanted; do
      [ -e "$wanted" ] || continue
      import -window root "${wanted%.wanted}.png" && rm -f "$wanted"
    done
  done
}

# In Wine, reg.exe has failed once for no known reason: only a second failure counts.
set_value() {  # key, name, type, data
  wine reg.exe add "$1" /v "$2" /t "$3" /d "$4" /f >/dev/null 2>&1 ||
    succeeds "setting $2" wine reg.exe add "$1" /v "$2" /t "$3" /d "$4" /f
}

client() { run "$1" wine "Z:\\build\\$folder\\tests\\hosts\\${1}_client.exe" "Z:\\build\\$folder" "${@:2}"; }

# The server lends its screen, or that it has none, to later programs: for those with another, one is begun anew.
restart_wine() {
  wine_server -k
  start_wine
}
restart_wine
client registration
succeeds "regsvr32, for the machine and for the user" wine regsvr32.exe /s /i:user "$dll"
client type_library
client start
# Recorded into a file that cannot grow, which a host must not notice; a debugger would.
ln -sfn /dev/full "$talutil_build/$folder/full"
TALUTIL_RECORD="Z:\\build\\$folder\\full" WINEDEBUG=warn+seh client early
succeeds "the recording ended because the disk was full" \
  grep -q 'cannot record any more calls: writing the file failed' "$talutil_build/$folder-early.log"
client late
client objects
client agreement
if [ "$folder" = windows64 ]; then
  # What the DLL has answered, the native command answers as well; not for 32 bits, whose emulator may be slow.
  recording=$talutil_build/recorded.jsonl
  rm -f "$recording"
  TALUTIL_RECORD='Z:\build\recorded.jsonl' \
    run recorded wine "Z:\\build\\$folder\\tests\\hosts\\agreement_client.exe" "Z:\\build\\$folder" 1000 7
  succeeds "recorded calls, and their answers here" "$talutil_build/asan/talutil" batch --compare "$recording"
  succeeds "thousands of calls were recorded" test "$(wc -l <"$recording")" -gt 10000
fi
rm -f "$pictures"/*.png
take_pictures &
pictures_pid=$!
client boxes
client forms
client modality
# The same windows on a screen with larger dots, for the looks.
dots() { set_value 'HKCU\Control Panel\Desktop' LogPixels REG_DWORD "$1"; }
dots 144
run forms-144 wine "Z:\\build\\$folder\\tests\\hosts\\forms_client.exe" "Z:\\build\\$folder" 144-
dots 96
run examples run_examples "$folder" "$talutil_build/asan/talutil"
rm -f "$talutil_build/$folder"/printed_*.ps
# The fonts that the native command has too, with Hebrew and Arabic letters.
replacements='HKCU\Software\Wine\Fonts\Replacements'
for names in "Arial:DejaVu Sans" "Courier New:DejaVu Sans Mono"; do
  set_value "$replacements" "${names%:*}" REG_SZ "${names#*:}"
done
client printing "$(build_below_wine)/$folder"
printed() {  # what, the pattern of its words
  local words
  words=$(gs -q -sDEVICE=txtwrite -o - "$talutil_build/$folder/printed_$1.ps" 2>&1 | sed 's/\xc2\xa0/ /g' | tr -s '[:space:]' ' ')
  succeeds "the words of the printed $1, which begin: ${words:0:100}" test "${words#$2}" != "$words"
}
# The page has the letters from left to right.
printed report '*Notes The first page 12.50 (abc) םולש *Page 1 of 2*Notes The second page*Page 2 of 2'
succeeds "a printed window is a page" test "$(gs -q -sDEVICE=bbox -o - "$talutil_build/$folder/printed_window.ps" 2>&1 | grep -c %%BoundingBox)" = 1
kill $pictures_pid || true
restart_wine
windows=$(cd "$talutil_build/$folder-examples" && grep -lE 'u\.(ShowSysInfo|ShowShortCutKeys|MyInputBox)' example_*.vbs)
answers=$(for name in $windows; do
  DISPLAY='' wine cscript.exe //nologo "Z:\\build\\$folder-examples\\$name" 2>/dev/null
done | tr -d '\r' | grep error | sort | uniq -c | xargs) || true
verdict "examples with windows, without a screen" "3 error 445: There is no screen to show the window on" "$answers"
restart_wine

# The system's code page is that of the locale in which Wine's server begins; a manifest makes it UTF-8.
mkdir -p "$talutil_build/$folder/locales"
WINE_LOCPATH=$(build_below_wine)/$folder/locales
for page in ru_RU:1251 ja_JP:932; do
  localedef -i "${page%:*}" -f UTF-8 "$talutil_build/$folder/locales/${page%:*}.UTF-8" 2>/dev/null
  export WINE_LANG=${page%:*}.UTF-8 WINE_LOCPATH
  restart_wine
  client code_page "${page#*:}"
done
unset WINE_LANG WINE_LOCPATH
restart_wine
programs_folder=$talutil_build/$folder/tests/hosts
cp "$programs_folder/code_page_client.exe" "$programs_folder/utf8_client.exe"
cat >"$programs_folder/utf8_client.exe.manifest" <<'X'
<assembly xmlns="urn:schemas-microsoft-com:asm.v1" manifestVersion="1.0"><application><windowsSettings>
<activeCodePage xmlns="http://schemas.microsoft.com/SMI/2019/WindowsSettings">UTF-8</activeCodePage>
</windowsSettings></application></assembly>
X
client utf8 65001

# What it writes is what the same calls write natively.
talutil=$talutil_build/asan/talutil
artifacts() { "$talutil_top/tests/equality/compare.py" "$1" "$talutil" "$talutil_build/equality-$folder" "$(wine_prefix)/drive_c"; }
rm -rf "$talutil_build/equality-$folder"
succeeds "writing natively" artifacts write
succeeds "writing by $dll" wine cscript.exe //nologo "Z:\\build\\equality-$folder\\script.vbs"
run equality artifacts compare
succeeds "the fonts are as before" wine reg.exe delete "$replacements" /f
succeeds "regsvr32 /u, for the machine and for the user" wine regsvr32.exe /s /u /i:user "$dll"

close_counts
