#!/usr/bin/env bash
# Creates a corpus for each fuzzer that finds more with one: fuzz/corpus.sh PATH_TO_TALUTIL FOLDER
# For archives_fuzz, that is one small archive of each kind, and each of these cut off at every multiple of 64 bytes.
set -euo pipefail
[ $# = 2 ] || { echo "usage: $0 PATH_TO_TALUTIL FOLDER" >&2; exit 2; }
talutil=$(realpath "$1")
mkdir -p "$2"
cd "$2"
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

# seed FUZZER NAME FORMAT: what stands before a text is the lengths, 0, of those that are put into it.
seed() {
  mkdir -p "$1"
  # shellcheck disable=SC2059
  printf "$3" >"$1/$2"
}
seed plans_fuzz steps '\0\0Name VerifyTextData 40 0 | ConvertCase 1 *\nList list AddZeros * 3 -1\n# comment\n'
seed plans_fuzz forms '\0\0A GetData "a ""b"" c" @int:5 @num:1.5\nB IncDay @date:31/03/2009 @empty\n'
seed profiles_fuzz ansi '\0\0\0; head\r\n[a]\r\nx = 1 \r\ny="2"\r\n\r\n[ b ]\r\nx\r\n[A]\nx=3'
seed profiles_fuzz utf8 '\0\0\0\xEF\xBB\xBFt=0\r\n[\xC5\x82]\r\nx=\xC3\xA9\r\n'
seed profiles_fuzz utf16 '\0\0\0\xFF\xFE[\0a\0]\0\n\0x\0=\0B\x01'
seed json_fuzz value '{"list": ["a\\u0000\\ud800", {"date": "2009-03-31T10:20:30"}, 1.5e300], "from": 1}'
seed json_fuzz request '{"create": "Grid", "set": {"Rows": 2}, "id": [true, null]}'
seed tables_fuzz utf8 '\0\0\0\xEF\xBB\xBFa,"b ""c""",\xC5\x82\r\n'
seed code_pages_fuzz utf8 '\0a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80\xED\xA0\x80\xC0\x80'
seed code_pages_fuzz double '\0\x82\xA0\x81\x40\xC4\xE3\xB0\xA1\xFF'
seed text_files_fuzz lines '\x03\x02\0a\r\nb\rc\n\r\n\x1Ad'
seed files_fuzz names '..\\CON.txt'

mkdir -p "$work/data/sub" archives_fuzz
seq 1 200 >"$work/data/numbers.txt"
printf 'x' >"$work/data/sub/one.txt"
: >"$work/data/empty"
echo p >"$work/password"
cd archives_fuzz
rm -f ./*.zip
pack() { "$talutil" zip "$1.zip" "$work/data" "${@:2}"; }
pack plain
pack stored --level 0
pack comment --comment "a comment"
pack traditional --password-file "$work/password"
pack aes --aes --password-file "$work/password"
for archive in *.zip; do
  size=$(stat -c %s "$archive")
  for ((length = 64; length < size; length += 64)); do
    head -c "$length" "$archive" >"${archive%.zip}-$length.cut"
  done
done
