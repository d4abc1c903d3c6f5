#!/usr/bin/env bash
# Makes the packages for Windows and uses them: run.sh [64] [32], the kinds of Wine in which the setup is tested; both by
# default. In each, a new prefix is installed into, upgraded, broken, repaired and cleaned; the setup's own log of each
# step is build/package-KIND-STEP.log. The last line is "N passed, N failed".
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/../../tools/environment.sh"
cd "$talutil_top"
. tests/verdict.sh
. packaging/common.sh
. packaging/windows.sh

here=$talutil_top/tests/package
work=$talutil_build/package-test
small_drive=

close() {
  wine_server -k
  [ -z "$small_drive" ] || umount "$small_drive" || true
}
trap close EXIT

expect() { verdict "${bits:+$bits-bit: }$1" "$2" "$3"; }  # what, expected, got
expect_same() { same_files "${bits:+$bits-bit: }$1" "$2" "$3"; }

# The libraries themselves.

# An address that differs with each start, data that is never run as code, no section that is both written and run, and
# no library but those that the system always takes from its own folder.
known_libraries='ADVAPI32.dll|GDI32.dll|KERNEL32.dll|msvcrt.dll|ole32.dll|OLEAUT32.dll|USER32.dll'
check_library() {
  local file=$1 tool=$2 flags
  flags=$("$tool" -p "$file" | grep -oE 'HIGH_ENTROPY_VA|DYNAMIC_BASE|NX_COMPAT' | sort | xargs)
  expect "the flags of $file" "$3" "$flags"
  expect "sections of $file that are both written and run" "" \
    "$("$tool" -x "$file" | awk '/^ +[0-9]+ /{ name = $2 } /CONTENTS|ALLOC/ && /CODE/ && !/READONLY/ { print name }')"
  expect "libraries that $file does not take from the system" "" \
    "$("$tool" -p "$file" | sed -n 's/.*DLL Name: //p' | grep -vxE "$known_libraries" | xargs)"
  expect "the times in $file" "0" "$("$tool" -p "$file" | sed -n 's/^Time\/Date stamp[[:space:]]*//p' | sort -u)"
}

check_libraries() {
  local library
  for library in TALUtil printhelper; do
    check_library "$libraries/32/$library.dll" i686-w64-mingw32-objdump "DYNAMIC_BASE NX_COMPAT"
    check_library "$libraries/64/$library.dll" x86_64-w64-mingw32-objdump "DYNAMIC_BASE HIGH_ENTROPY_VA NX_COMPAT"
  done
}

# The archive: the examples compile with its header, without warnings.
check_archive() {
  local archive=$talutil_build/package/TALUtil-$version.zip top=$work/archive/TALUtil-$version compiler
  unzip -q "$archive" -d "$work/archive"
  expect_same "the libraries of archive and setup" "$libraries/64/TALUtil.dll" "$top/64/TALUtil.dll"
  for bits in 64 32; do
    compiler=i686-w64-mingw32-g++-posix
    [ $bits = 32 ] || compiler=x86_64-w64-mingw32-g++-posix
    expect "compiling the early-bound example" "" "$("$compiler" -std=c++11 -Wall -Wextra -Werror -static "-I$top/include" \
      -o "$work/early_bound_$bits.exe" "$top/examples/early_bound.cpp" -lole32 -loleaut32 2>&1 | head -5)"
    expect "compiling the host" "" "$("$compiler" -std=c++20 -Wall -Wextra -static -municode -mwindows "-I$top/include" \
      -o "$work/host_$bits.exe" "$top"/examples/host/*.cpp -lole32 -loleaut32 -luuid -lgdi32 -lcomctl32 2>&1 | head -5)"
  done
  bits=
}

# The hook is called for both libraries of each kind, the uninstaller and the setup; if it fails, nothing is made.
check_signing() {
  local log=$work/signed
  TALUTIL_SIGN="echo >>$log"
  stage_libraries "$work/signing"
  make_setup "$version" "$work/signing" "$work/signed.exe"
  unset TALUTIL_SIGN
  expect "signed files" "TALUtil.dll printhelper.dll TALUtil.dll printhelper.dll 2" \
    "$(head -4 "$log" | xargs -n1 basename | xargs) $(tail -n +5 "$log" | wc -l)"
  expect "a hook that fails" "1 no setup" "$(
    status=0
    (TALUTIL_SIGN=false make_setup "$version" "$libraries" "$work/unsigned.exe") >/dev/null 2>&1 || status=$?
    echo $status "$([ -e "$work/unsigned.exe" ] || echo no setup)"
  )"
}

# What is installed: versions that differ in a byte, and one whose library cannot be registered.
make_setups() {
  local target=x86-unicode compiler=i686-w64-mingw32-gcc-posix
  [ $bits = 32 ] || { target=amd64-unicode compiler=x86_64-w64-mingw32-gcc-posix; }
  rm -rf "$work/input"
  cp -r "$libraries" "$work/input"
  make_setup 1.0.0 "$work/input" "$work/setup-1.0.0.exe" $target
  printf 1 | tee -a "$work/input/32/TALUtil.dll" >>"$work/input/64/TALUtil.dll"
  make_setup 1.1.0 "$work/input" "$work/setup-1.1.0.exe" $target
  "$compiler" -shared -Wl,--kill-at -o "$work/input/$bits/TALUtil.dll" "$here/failing.c"
  make_setup 1.2.0 "$work/input" "$work/setup-1.2.0.exe" $target
}

# The prefix of this test.
wine_prefix() { echo "$talutil_build/package-prefix-$wine_bits"; }
drive() { echo "$(wine_prefix)/drive_c"; }

wait_until() {
  local tries=0
  until "$@" 2>/dev/null; do
    [ $((tries += 1)) -lt 400 ] || { note_failure "${bits:+$bits-bit: }waited in vain: $*"; return 0; }
    sleep 0.05
  done
}

# What the setup says of the last step, without its name.
last_line() { tr -d '\r' <"$1" | tail -1 | cut -d: -f2- | cut -c2-; }

forget_later_removals() {
  wine reg.exe delete 'HKLM\System\CurrentControlSet\Control\Session Manager' /v PendingFileRenameOperations /f \
    >/dev/null 2>&1 || true
}

# Runs a setup and checks its exit code and the log's last line: setup STEP VERSION CODE LINE [OPTION]...
setup() {
  local step=$1 file=setup-$2.exe code=$3 line=$4 status=0 log=package-$bits-$1.log
  shift 4
  rm -f "$talutil_build/$log"
  wine "Z:\\build\\package-test\\$file" /S "/log=Z:\\build\\$log" "$@" >/dev/null 2>&1 || status=$?
  expect "$step" "$code $line" "$status $(last_line "$talutil_build/$log")"
}

# Runs an uninstaller as the system does, which returns at once because it goes on in a copy of itself, and waits for the
# last line of the log: uninstall STEP FOLDER SCOPE
uninstall() {
  local log=package-$bits-$1.log path=$talutil_build/package-$bits-$1.log
  rm -f "$path"
  wine "$2\\uninstall.exe" "/$3" /S "/log=Z:\\build\\$log" >/dev/null 2>&1 || true
  wait_until grep -qE 'uninstalled|failed' "$path"
  expect "$1" "uninstalled from $2 ($3)" "$(last_line "$path")"
  # The system removes that copy later.
  wait_until rm -rf "$(drive)"/users/root/Temp/~nsu*.tmp
  forget_later_removals
}

# Everything that a setup could leave: the names of all files and folders, and the registry.
snapshot() {
  local folder=$work/snapshot-$1 key
  rm -rf "$folder"
  mkdir -p "$folder"
  (cd "$(drive)" && find . | sort) >"$folder/files"
  for key in 'HKLM\Software' 'HKCU\Software' 'HKLM\System\CurrentControlSet\Control\Session Manager'; do
    wine reg.exe export "$key" 'Z:\build\package-test\keys.reg' /y >/dev/null 2>&1
    iconv -f UTF-16 -t UTF-8 "$work/keys.reg" | tr -d '\r' >>"$folder/registry"
  done
}
unchanged() {  # what, the snapshot from before
  snapshot now
  expect_same "$1: what is there and what was there before" "$work/snapshot-$2" "$work/snapshot-now"
}

script_host() { wine cscript.exe //nologo 'Z:\checkout\tests\package\use.vbs' "$@" 2>/dev/null | tr -d '\r'; }
library_works() {  # when, the version whose bytes the library has
  expect "a script, $1" "3 green" "$(script_host)"
  expect "an early-bound program, $1" $'O\xb4Brien an|3 green|error 5: Invalid procedure call or argument|' \
    "$(wine "Z:\\build\\package-test\\early_bound_$bits.exe" 2>&1 | tr -d '\r' | tr '\n' '|')"
  local grown=0
  [ "$2" = 1.0.0 ] || grown=1
  expect "the size of the library, $1" $(($(stat -c %s "$libraries/$bits/TALUtil.dll") + grown)) \
    "$(stat -c %s "$installed/$bits/TALUtil.dll")"
  expect "the version in the list of programs, $1" "$2" "$(wine reg.exe query "$root\\$uninstall_key" /v DisplayVersion 2>/dev/null |
    tr -d '\r' | awk '/DisplayVersion/ { print $3 }')"
}
uninstall_key='Software\Microsoft\Windows\CurrentVersion\Uninstall\TALUtil'

# A host that holds the library while a function runs: holding FUNCTION
holding() {
  rm -rf "$work/host"
  mkdir "$work/host"
  script_host 'Z:\build\package-test\host' >"$work/host.txt" &
  local host=$!
  wait_until test -e "$work/host/holding"
  "$1"
  touch "$work/host/release"
  wait $host || true
  expect "the host that has held the library" "3 green" "$(cat "$work/host.txt")"
  # What it has held was put aside, where the system removes it later.
  expect "files that were put aside" 1 "$(find "$(drive)"/users/*/ -name 'ns*.tmp' -size +1M | wc -l)"
  find "$(drive)"/users/*/ -name 'ns*.tmp' -size +1M -delete
  forget_later_removals
}

upgrade() { setup upgrade 1.1.0 0 "installed over 1.0.0 in $folder (AllUsers)"; }
remove() { uninstall uninstall "$folder" AllUsers; }

installing() {
  setup install 1.0.0 0 "installed in $folder (AllUsers)" /AllUsers
  library_works "installed" 1.0.0
  expect "the other kind of library" "" "$(find "$installed" -path "*/$((96 - bits))/*")"
  # Neither is ours to touch.
  wine reg.exe add 'HKCU\Software\TALUtil\Settings\Kept' /v Item /d value /f >/dev/null 2>&1
  echo mine >"$installed/notes.txt"
}

repairing() {
  : >"$installed/$bits/TALUtil.dll"
  wine reg.exe delete 'HKLM\Software\Classes\TALUtil.ORVUtils' /f >/dev/null 2>&1
  setup repair 1.0.0 0 "repaired in $folder (AllUsers)"
  library_works "repaired" 1.0.0
}

upgrading() {
  holding upgrade
  library_works "upgraded while in use" 1.1.0
  snapshot upgraded
  setup downgrade 1.0.0 3 "refused: TALUtil 1.1.0 is installed, which is newer than 1.0.0. Uninstall it first, or start the \
setup with /force."
  unchanged "a refused downgrade" upgraded
  setup forced_downgrade 1.0.0 0 "installed over 1.1.0 in $folder (AllUsers)" /force
  library_works "downgraded" 1.0.0
}

failing_upgrade() {
  snapshot before
  setup failing_upgrade 1.2.0 2 "failed; 1.0.0 stays installed: $unregistered"
  unchanged "a failed upgrade" before
  library_works "after a failed upgrade" 1.0.0
}

removing() {
  holding remove
  expect "the user's file" "mine" "$(cat "$installed/notes.txt")"
  expect "the user's setting" "value" "$(wine reg.exe query 'HKCU\Software\TALUtil\Settings\Kept' /v Item | tr -d '\r' | awk '/Item/ { print $3 }')"
  rm -r "$installed"
  wine reg.exe delete 'HKCU\Software\TALUtil' /f >/dev/null 2>&1
  unchanged "after uninstalling while in use" clean
}

failing_installations() {
  setup failing_install 1.2.0 2 "failed and taken back: $unregistered"
  unchanged "a failed installation" clean
  mkdir -p "$installed"
  echo "in the way" >"$installed/$bits"
  setup blocked_folder 1.0.0 2 "failed and taken back: $folder\\$bits\\TALUtil.dll.new could not be written. Check the \
rights to the folder and the room on the drive, or choose another folder."
  rm -r "$installed"
  unchanged "a blocked installation" clean
}

# Room for one version, and for a part of the next.
full_drive() {
  small_drive=$(drive)/small
  mkdir "$small_drive"
  if ! mount -t tmpfs -o "size=$(($(du -s -k "$libraries/$bits" | cut -f1) * 3 / 2))k" tmpfs "$small_drive" 2>/dev/null; then
    echo "left out: a full drive, because this machine mounts none"
    rmdir "$small_drive"
    small_drive=
    return
  fi
  setup small_drive 1.0.0 0 'installed in C:\small\TALUtil (AllUsers)' '/D=C:\small\TALUtil'
  installed=$small_drive/TALUtil
  snapshot before
  setup full_drive 1.1.0 2 'failed; 1.0.0 stays installed: A file could not be written to C:\small\TALUtil. Make room on the drive, or choose another folder.'
  unchanged "an upgrade on a full drive" before
  library_works "after an upgrade on a full drive" 1.0.0
  uninstall uninstall_small 'C:\small\TALUtil' AllUsers
  umount "$small_drive"
  rmdir "$small_drive"
  small_drive=
  unchanged "after uninstalling from the small drive" clean
}

# Wine does not look for classes in the user's part of the registry: only the keys can be checked.
for_the_user() {
  local local_programs='C:\users\root\AppData\Local\Programs\TALUtil'
  setup user_install 1.0.0 0 "installed in $local_programs (CurrentUser)" /CurrentUser
  expect "the user's registration" "$local_programs\\$bits\\TALUtil.dll" "$(wine reg.exe query \
    'HKCU\Software\Classes\CLSID\{13223AC3-C9F1-4A82-A6C4-951E12542E20}\InprocServer32' /ve | tr -d '\r' | sed -n 's/.*REG_SZ *//p')"
  setup user_upgrade 1.1.0 0 "installed over 1.0.0 in $local_programs (CurrentUser)" /CurrentUser
  uninstall user_uninstall "$local_programs" CurrentUser
  unchanged "after uninstalling for the user" clean
}

test_setup() {
  bits=$1
  wine_bits=$bits
  [ $bits = 32 ] || use_wine64
  folder='C:\Program Files\TALUtil'
  root=HKLM
  unregistered="$folder\\$bits\\TALUtil.dll could not be registered: C:\\windows\\system32\\regsvr32.exe ended with code 5. \
Run it on a copy of the file to see its message, or install for the user alone (/CurrentUser)."
  wine_server -k
  rm -rf "$(wine_prefix)"
  start_wine
  installed="$(drive)/Program Files/TALUtil"
  make_setups
  # Whatever Wine itself makes on first use, and keys that every user of Windows has.
  wine reg.exe add 'HKCU\Software\Classes\CLSID' /f >/dev/null 2>&1
  wine cscript.exe //nologo 'Z:\checkout\tests\package\use.vbs' >/dev/null 2>&1 || true
  wine 'Z:\build\package-test\setup-1.0.0.exe' /S '/?' >/dev/null 2>&1 || true
  snapshot clean
  installing
  repairing
  upgrading
  failing_upgrade
  removing
  failing_installations
  [ $bits = 32 ] || full_drive
  for_the_user
  wine_server -k
}

[ $# -gt 0 ] || set -- 64 32
need_packages $native_packages $windows_packages $windows64_packages nsis zip unzip
rm -rf "$work"
mkdir -p "$work"
./package windows >"$talutil_build/package-windows.log" 2>&1 || { tail -20 "$talutil_build/package-windows.log"; fail "./package windows failed"; }
libraries=$stage/libraries
check_libraries
check_archive
check_signing
for kind in "$@"; do test_setup "$kind"; done

close_counts
