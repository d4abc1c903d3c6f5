# Compares what a Windows build writes with what the native one writes. Sourced by tests/hosts/run.sh: compare_artifacts
# FOLDER, the Windows build's folder.

# The inputs, with a fixed time, in a new folder.
prepare_artifacts() {
  rm -rf "$1"
  mkdir -p "$1/in/deep"
  cp "$talutil_top"/examples/data/*.csv "$1/in"
  seq 3000 >"$1/in/deep/numbers.txt"
  : >"$1/in/empty"
  find "$1/in" -exec touch --date='2009-03-14 15:09:26' {} +
}

# The entries of an archive in the order of their names, with everything but the system and its rights, and with the
# packed bytes: folders are read in the system's order, and an archive keeps the rights of the files in it.
entries() {
  python3 - "$1" <<'X'
import sys, zipfile

with open(sys.argv[1], "rb") as file, zipfile.ZipFile(file) as archive:
    print(archive.comment)
    for entry in sorted(archive.infolist(), key=lambda entry: entry.filename):
        file.seek(entry.header_offset)
        header = file.read(30)
        name, extra = (int.from_bytes(header[i : i + 2], "little") for i in (26, 28))
        file.seek(name + extra, 1)
        print(entry.filename, header, entry.flag_bits, entry.extract_version, entry.extra, file.read(entry.compress_size))
X
}

have_equal_entries() {
  entries "$1" >"$1.entries" && entries "$2" | cmp - "$1.entries"
}

without_dates() { LC_ALL=C sed -E 's/\(D:[0-9]{14}[^)]*\)/(D:)/g' "$1"; }

compare_artifacts() {
  local top=$talutil_build/equality/$1 program=$talutil_build/asan/tests/artifacts file
  need_packages python3
  local windows_program="Z:\\build\\$1\\tests\\artifacts.exe"
  mkdir -p "$top"
  prepare_artifacts "$top/native"
  prepare_artifacts "$top/$1"
  succeeds "the native artifacts" "$program" write "$top/native"
  succeeds "the artifacts of $1" wine "$windows_program" write "Z:\\build\\equality\\$1"
  succeeds "native settings.ini and that of $1 are equal" cmp "$top/native/settings.ini" "$top/$1/settings.ini"
  succeeds "native plain.zip and that of $1 have equal entries" \
    have_equal_entries "$top/native/plain.zip" "$top/$1/plain.zip"
  succeeds "native report.pdf and that of $1 are equal but for dates" \
    cmp <(without_dates "$top/native/report.pdf") <(without_dates "$top/$1/report.pdf")
  # What is random by design: each reads the other's.
  for file in cipher.txt locked.zip; do
    mv "$top/native/$file" "$top/$file"
    mv "$top/windows/$file" "$top/native/$file"
    mv "$top/$file" "$top/windows/$file"
  done
  succeeds "reading natively what $1 has made" "$program" read "$top/native"
  succeeds "reading in $1 what was made natively" wine "$windows_program" read "Z:\\build\\equality\\$1"
  for file in native "$1"; do
    succeeds "the text that was opened in $file" test "$(cat "$top/$file/opened.txt")" = "O´Neil, 5 €, Ольга"
    succeeds "the files that were unpacked in $file" diff -r "$top/$file/in" "$top/$file/unpacked/in"
  done
}
