#!/usr/bin/env bash
# Runs the programs and scripts of this folder against TALUtil.dll: run.sh windows|windows64, the preset it was built by.
# Each check that fails is a line; the last line is "N passed, N failed". Needs that preset to be built.
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/../../tools/environment.sh"
. "$talutil_top/tests/hosts/screen.sh"
. "$talutil_top/tests/hosts/pascal.sh"
. "$talutil_top/tests/equality/compare.sh"
. "$talutil_top/tests/examples/through_dll.sh"

folder=${1:-windows}
[ "$folder" != windows64 ] || use_wine64
dll="Z:\\build\\$folder\\TALUtil.dll"
pictures=$talutil_build/$folder/screenshots
passed=0
failed=0

need_packages python3 xvfb imagemagick ghostscript locales
mkdir -p "$pictures"
rm -f "$pictures"/*.wanted

start_screen

# Runs one command; its own last line is its counts. Without them, or after them, it has died, which is one failure more.
run() {
  local name=$1 log=$talutil_build/$folder-$1.log counts status=0
  shift
  WINE_TIMEOUT=120 "$@" >"$log" 2>&1 || status=$?
  tr -d '\r' <"$log" | grep '^FAILED' || true
  counts=$(tr -d '\r' <"$log" | tail -1 | grep -oE '^[0-9]+ passed, [0-9]+ failed$') || counts=
  if [ -z "$counts" ]; then
    tail -5 "$log"
    printf 'FAILED %s: expected to end with its counts, ended with status %s; see %s\n' "$name" "$status" "$log"
    counts="0 passed, 1 failed"
  elif [ "$status" != 0 ] && [ "${counts#*, }" = "0 failed" ]; then
    printf 'FAILED %s: expected status 0 after its counts, got %s; see %s\n' "$name" "$status" "$log"
    counts="${counts%%,*}, 1 failed"
  fi
  passed=$((passed + ${counts%% passed*}))
  counts=${counts#*, }
  failed=$((failed + ${counts%% failed*}))
}

# A command that needs nothing but to end well.
expect_success() {
  local what=$1 status=0
  shift
  WINE_TIMEOUT=60 "$@" >/dev/null 2>&1 || status=$?
  if [ "$status" = 0 ]; then
    passed=$((passed + 1))
  else
    printf 'FAILED %s: expected status 0, got %s\n' "$what" "$status"
    failed=$((failed + 1))
  fi
}

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

client() { run "$1" wine "Z:\\build\\$folder\\tests\\hosts\\${1}_client.exe" "Z:\\build\\$folder" "${@:2}"; }

# The server lends its screen, or that it has none, to later programs: for those with another, one is begun anew.
restart_wine() {
  wine_server -k
  start_wine
}
restart_wine
client registration
expect_success "regsvr32, for the machine and for the user" wine regsvr32.exe /s /i:user "$dll"
client type_library
client start
client early
client late
client objects
client agreement
if [ "$folder" = windows64 ]; then
  # What the DLL has answered, the native command answers as well; not for 32 bits, whose emulator may be slow.
  recording=$talutil_build/recorded.jsonl
  rm -f "$recording"
  TALUTIL_RECORD='Z:\build\recorded.jsonl' \
    run recorded wine "Z:\\build\\$folder\\tests\\hosts\\agreement_client.exe" "Z:\\build\\$folder" 1000 7
  expect_success "recorded calls, and their answers here" "$talutil_build/asan/talutil" batch --compare "$recording"
  expect_success "thousands of calls were recorded" test "$(wc -l <"$recording")" -gt 10000
fi
rm -f "$pictures"/*.png
take_pictures &
pictures_pid=$!
client boxes
client forms
client modality
# The same windows on a screen with larger dots, for the looks.
dots() { wine reg.exe add 'HKCU\Control Panel\Desktop' /v LogPixels /t REG_DWORD /d "$1" /f >/dev/null 2>&1; }
dots 144
run forms-144 wine "Z:\\build\\$folder\\tests\\hosts\\forms_client.exe" "Z:\\build\\$folder" 0 144-
dots 96
run examples run_examples "$folder" "$talutil_build/asan/talutil"
rm -f "$talutil_build/$folder"/printed_*.ps
client printing "$(build_below_wine)/$folder"
printed() {  # what, the pattern of its words
  local words
  words=$(gs -q -sDEVICE=txtwrite -o - "$talutil_build/$folder/printed_$1.ps" 2>&1 | sed 's/\xc2\xa0/ /g' | tr -s '[:space:]' ' ')
  expect_success "the words of the printed $1, which begin: ${words:0:100}" test "${words#$2}" != "$words"
}
printed report '*Notes The first page*Page 1 of 2*Notes The second page*Page 2 of 2'
printed keys '*GENERAL Copy Text CTRL+C*Page 1 of 6*ORV Help PDF = F1*Telephone Contact = CTRL+T'
expect_success "a printed window is a page" test "$(gs -q -sDEVICE=bbox -o - "$talutil_build/$folder/printed_window.ps" 2>&1 | grep -c %%BoundingBox)" = 1
kill $pictures_pid || true
restart_wine
# A script's one line of answers.
elsewhere() {
  local expected=$1 answers
  shift
  answers=$(wine cscript.exe //nologo 'Z:\checkout\tests\hosts\elsewhere.vbs' "$@" 2>/dev/null | tr -d '\r')
  expect_success "elsewhere.vbs $1, which answered: $answers" test "$answers" = "$expected"
}
no_screen='445 There is no screen to show the window on. '
DISPLAY='' elsewhere "$no_screen$no_screen$no_screen" no_screen
restart_wine

# Third-party clients: script hosts, and a compiler with an importer of type libraries of its own.
# Nothing that an earlier run has left may look like this one's work.
rm -rf "$(wine_prefix)/drive_c/clients"
wine reg.exe delete 'HKCU\Software\TALUtil\Settings' /f >/dev/null 2>&1 || true
hosts='Z:\checkout\tests\hosts'
run vbscript wine cscript.exe //nologo "$hosts\\members.vbs"
run script_control wine cscript.exe //nologo "$hosts\\clients\\script_control.vbs" "$hosts\\members.vbs"
run jscript wine cscript.exe //nologo "$hosts\\clients\\client.js"
if [ "${TALUTIL_WITHOUT_PASCAL:-}" = 1 ]; then
  echo "left out: the Free Pascal client, since TALUTIL_WITHOUT_PASCAL is 1"
else
  rm -rf "$talutil_build/$folder-pascal"
  { prepare_pascal "$folder" "$folder-pascal" && compile_pascal "$talutil_top/tests/hosts/clients/client.pas"; } \
    >"$talutil_build/$folder-pascal.log" 2>&1 || tail -5 "$talutil_build/$folder-pascal.log"
  run pascal wine "Z:\\build\\$folder-pascal\\client.exe"
fi

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

# A cipher text made on one side opens on the other.
talutil=$talutil_build/asan/talutil
secret="O´Neil, 5 €"
rm -f "$talutil_build/$folder/cipher.txt"
elsewhere -1 cipher "$("$talutil" encrypt <<<"$secret")" "Z:\\build\\$folder\\cipher.txt"
expect_success "the command opens what the script host has encrypted" \
  test "$(tr -d '\r' <"$talutil_build/$folder/cipher.txt" | "$talutil" decrypt)" = "$secret"
compare_artifacts "$folder"
expect_success "regsvr32 /u, for the machine and for the user" wine regsvr32.exe /s /u /i:user "$dll"

printf '%d passed, %d failed\n' "$passed" "$failed"
[ "$failed" = 0 ]
