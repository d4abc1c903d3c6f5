#!/usr/bin/env bash
# Exchanges archives with other programs: tests/archives/exchange.sh PATH_TO_TALUTIL
# They read ours, and we read their split sets and add to their archives; peers.py has the other archives of theirs.
# Needs zip, unzip, 7z and python3. The last line is "N passed, N failed".
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

same() { diff -r data "$1/data" && [ "$(stat -c '%a %Y' data/numbers.txt)" = "$(stat -c '%a %Y' "$1/data/numbers.txt")" ]; }

read_by_python() {
  python3 - "$1" <<'P'
import sys, zipfile
archive = zipfile.ZipFile(sys.argv[1])
archive.setpassword(b"secret")
sys.exit(archive.testzip() is not None or archive.read("data/sub/deep/Żółw é.txt") != b"wide")
P
}

unpack_by_unzip() { unzip -q "$@" -d unzipped && same unzipped && rm -r unzipped; }

pack() { "$talutil" zip "$@"; }
for kind in plain "old --password-file password" "aes --aes --password-file password"; do
  read -r name options <<<"$kind"
  succeeds "pack $name" pack $name.zip data $options
  succeeds "7z reads our $name" 7z t -psecret $name.zip
  [ $name != aes ] || continue
  succeeds "unzip reads our $name" unpack_by_unzip -P secret $name.zip
  succeeds "Python reads our $name" read_by_python $name.zip
done
for options in "65536" "65537" "100000" "150001" "70000 --aes --password-file password"; do
  rm -f set.z*
  succeeds "pack volumes of $options" pack set.zip data --volumes $options
  succeeds "7z reads our volumes of $options" 7z t -psecret set.zip
done

# Packs by another program and reads that: read_theirs NAME ARCHIVE COMMAND...
read_theirs() {
  local name=$1 archive=$2
  shift 2
  succeeds "$name: made" "$@"
  succeeds "$name: tested" "$talutil" zip --test "$archive" --password-file password
  succeeds "$name: unpacked" "$talutil" unzip "$archive" --to out --password-file password
  succeeds "$name: the same" diff -r data out/data
  rm -rf out
}
read_theirs "zip" zip.zip zip -qr zip.zip data
"$talutil" unzip zip.zip --to kept
succeeds "times and rights of zip's" same kept
read_theirs "zip -s" zip-s.zip zip -qr -s 70k zip-s.zip data
read_theirs "7z, AES" 7z-aes.zip 7z a -tzip -mem=AES256 -psecret 7z-aes.zip data
read_theirs "7z, pieces" 7z-v.zip.001 7z a -tzip -v100k 7z-v.zip data

# What is added to another's archive leaves the rest of it as it was.
printf 'changed' >data/sub/deep/new.txt
succeeds "add to 7z's" pack 7z-aes.zip data/sub/deep --password-file password
succeeds "7z reads what was added to" 7z t -psecret 7z-aes.zip

# A full disk, as a limit on the size of files: the old archive stays, and nothing else.
cp plain.zip before.zip
head -c 3000000 /dev/urandom >data/large.bin
refused() { ! (trap '' XFSZ && ulimit -f 1000 && pack plain.zip data 2>refusal); }
succeeds "a full disk is told" refused
succeeds "and with its code" grep -q 'plain.zip: Disk full (code 14)' refusal
succeeds "and leaves the archive" cmp plain.zip before.zip
succeeds "and nothing else" sh -c '! ls -a | grep -q talutil-'

close_counts
