#!/usr/bin/env bash
# Creates a corpus for archives_fuzz: fuzz/archives_corpus.sh PATH_TO_TALUTIL FOLDER
# One small archive of each kind, and each of these cut off at every multiple of 64 bytes.
set -euo pipefail
[ $# = 2 ] || { echo "usage: $0 PATH_TO_TALUTIL FOLDER" >&2; exit 2; }
talutil=$(realpath "$1")
mkdir -p "$2"
cd "$2"
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
mkdir -p "$work/data/sub"
seq 1 200 >"$work/data/numbers.txt"
printf 'x' >"$work/data/sub/one.txt"
: >"$work/data/empty"
echo p >"$work/password"

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
