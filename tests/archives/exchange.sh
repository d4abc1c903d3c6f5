#!/usr/bin/env bash
# Exchanges archives with other programs: tests/archives/exchange.sh PATH_TO_TALUTIL
# Split sets of both sides, times and rights, and what we add to an archive of theirs; peers.py has all other archives.
# Needs zip, unzip and 7z. The last line is "N passed, N failed".
set -uo pipefail
[ -x "${1:-}" ] || { echo "usage: tests/archives/exchange.sh PATH_TO_TALUTIL" >&2; exit 2; }
. "$(dirname "${BASH_SOURCE[0]}")/../verdict.sh"
talutil=$(realpath "$1")
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work" || exit 2
export LC_ALL=C.UTF-8
log=$work/log

mkdir -p data/sub/deep data/empty
seq 1 20000 >data/numbers.txt
head -c 200000 /dev/urandom >data/sub/noise.bin
printf 'wide' >"data/sub/deep/Żółw é.txt"
: >data/nothing
chmod 640 data/numbers.txt
touch -d '2009-03-31 12:00:01' data/numbers.txt
printf 'secret\n' >password

same_files() { diff -r data "$1/data"; }
same() { same_files "$1" && [ "$(stat -c '%a %Y' data/numbers.txt)" = "$(stat -c '%a %Y' "$1/data/numbers.txt")" ]; }

pack() { "$talutil" zip "$@"; }
succeeds "packed" pack plain.zip data
succeeds "unpacked by unzip" unzip -q plain.zip -d unzipped
succeeds "with times and rights" same unzipped
for options in "65536" "65537" "100000" "150001" "70000 --aes --password-file password"; do
  rm -f set.z*
  succeeds "pack volumes of $options" pack set.zip data --volumes $options
  succeeds "7z reads our volumes of $options" 7z t -psecret set.zip
done

# Packs by another program, reads that and checks what comes out: read_theirs CHECK ARCHIVE COMMAND...
read_theirs() {
  local check=$1 archive=$2
  shift 2
  succeeds "$*: made" "$@"
  succeeds "$*: tested" "$talutil" zip --test "$archive" --password-file password
  succeeds "$*: unpacked" "$talutil" unzip "$archive" --to out --password-file password
  succeeds "$*: the same" "$check" out
  rm -rf out
}
read_theirs same zip-s.zip zip -qr -s 70k zip-s.zip data
read_theirs same_files 7z-v.zip.001 7z a -tzip -v100k 7z-v.zip data

# What is added to another's archive leaves the rest of it as it was.
printf 'changed' >data/sub/deep/new.txt
succeeds "made by 7z" 7z a -tzip -mem=AES256 -psecret 7z-aes.zip data/numbers.txt
succeeds "added to 7z's" pack 7z-aes.zip data/sub/deep --password-file password
succeeds "7z reads what was added to" 7z t -psecret 7z-aes.zip

# A full disk, as a limit on the size of files. What stays then is shown by tests/faults.
refused() { ! (trap '' XFSZ && ulimit -f 10 && pack full.zip data 2>refusal); }
succeeds "a full disk is reported" refused
succeeds "with its code" grep -q 'full.zip: Disk full (code 14)' refusal

close_counts
