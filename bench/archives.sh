#!/usr/bin/env bash
# Compares archives with other programs: bench/archives.sh PATH_TO_TALUTIL [large | lines]
# Packs and unpacks 200 MB of mixed files from this machine, three times each, alternating, and prints the ratios of the
# best times, the sizes and the peak memory: against zip and unzip, and against 7z with all processors. With "large", also
# does so for 70,000 files and for one of 5 GB. With "lines", prints instead, for archives of 10 to 100,000 entries, lines
# of NAME, SIZE and SECONDS with tabs between them, measured in memory if there is room: a disk that has to keep every
# file would be most of the time.
set -euo pipefail
[ -x "${1:-}" ] || { echo "usage: bench/archives.sh PATH_TO_TALUTIL [large | lines]" >&2; exit 2; }
talutil=$(realpath "$1")
place=${TMPDIR:-/tmp}
room=$(df --output=avail -BM /dev/shm 2>/dev/null | tr -dc 0-9 || true)
if [ "${2:-}" = lines ] && [ "${room:-0}" -gt 2000 ]; then place=/dev/shm; fi
work=$(mktemp -d -p "$place")
trap 'rm -rf "$work"' EXIT
cd "$work"

# Programs, texts and data, without names that differ only in case, which a Windows folder cannot contain.
make_tree() {
  find /usr/bin /usr/lib/gcc /usr/lib/python3 /usr/lib/python3.11 /usr/share -type f -size +0 -size -30M -printf '%s %p\n' |
    LC_ALL=C sort -k2 | awk '{ key = tolower($2) } !(key in seen) && NF == 2 { seen[key]; print }' |
    awk '{ total += $1; if (total > 210000000) exit; print $2 }' >list || true  # The last one stops listening.
  mkdir tree
  tar -cf - -T list 2>/dev/null | tar -xf - -C tree
}

# Runs a command; prints its seconds and peak kilobytes.
measure() { /usr/bin/env python3 - "$@" <<'P'
import os, resource, subprocess, sys, time
begin = time.monotonic()
subprocess.run(sys.argv[1:], check=True, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
print(f"{time.monotonic() - begin:.3f} {resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss}")
P
}

least() { sort -n | head -1; }

# Cost against size, the best of three times; the largest, whose cost varies least, once.
print_lines() {
  local count tries
  for count in 10 100 1000 10000 100000; do
    mkdir many
    (cd many && awk -v count="$count" 'BEGIN {
      for (i = 1; i <= count; ++i) {
        name = sprintf("f%06d", i)
        for (line = 0; line < 20; ++line) print "line", line, "of", name, i * line >name
        close(name)
      }
    }')
    tries="1 2 3"
    [ "$count" -lt 100000 ] || tries=1
    for _ in $tries; do
      rm -rf many.zip out
      measure "$talutil" zip many.zip many >>pack.times
      measure "$talutil" zip --test many.zip many >>test.times
      measure "$talutil" unzip many.zip --to out >>unpack.times
    done
    for name in pack test unpack; do
      printf '%s\t%s\t%s\n' "$name" "$count" "$(least <$name.times | cut -d' ' -f1)"
    done
    rm -rf many ./*.times
  done
}

if [ "${2:-}" = lines ]; then
  print_lines
  exit 0
fi

compare() {  # WHAT, GOAL, ours, theirs: files of measurements
  local ours theirs
  ours=$(least <"$3")
  theirs=$(least <"$4")
  printf '%s: %s s, theirs %s s, ratio %s (goal: at most %s); peak memory %s KB\n' "$1" "${ours% *}" "${theirs% *}" \
    "$(awk "BEGIN { printf \"%.2f\", ${ours% *} / ${theirs% *} }")" "$2" "${ours#* }"
}

compare_sizes() {  # WHAT, ours, theirs
  printf '%s: %s bytes, theirs %s, ratio %s\n' "$1" "$(stat -c %s "$2")" "$(stat -c %s "$3")" \
    "$(awk "BEGIN { printf \"%.3f\", $(stat -c %s "$2") / $(stat -c %s "$3") }")"
}

make_tree
printf 'tree: %s files, %s MB; %s processors\n' "$(find tree -type f | wc -l)" "$(du -sm --apparent-size tree | cut -f1)" \
  "$(nproc)"
for _ in 1 2 3; do
  rm -rf ./*.zip ours theirs seven
  measure zip -6 -q -r theirs.zip tree >>zip.times
  measure "$talutil" zip ours.zip tree >>pack.times
  measure 7z a -tzip -mx=1 seven.zip tree >>7z-a.times
  measure unzip -q theirs.zip -d theirs >>unzip.times
  measure "$talutil" unzip ours.zip --to ours >>unpack.times
  measure 7z x -oseven ours.zip >>7z-x.times
done
compare "packing, against zip -6" 1.0 pack.times zip.times
compare "packing, against 7z -mx=1" 1.0 pack.times 7z-a.times
compare "unpacking, against unzip" 0.35 unpack.times unzip.times
compare "unpacking, against 7z" 1.0 unpack.times 7z-x.times
compare_sizes "size, against zip -6" ours.zip theirs.zip
compare_sizes "size, against 7z -mx=1" ours.zip seven.zip
diff -r tree ours/tree && echo "unpacked as it was"
[ "${2:-}" = large ] || exit 0

rm -rf tree ours theirs seven ./*.zip
mkdir -p many
(cd many && seq -f 'f%06.0f' 1 70000 | xargs touch)
printf '70,000 files: packed in %s (seconds, KB)' "$(measure "$talutil" zip many.zip many)"
printf ', tested in %s\n' "$(measure "$talutil" zip --test many.zip)"
unzip -tq many.zip

# Half of it is compressible; nothing repeats within the window.
python3 - <<'P'
import os
block = os.urandom(1 << 19) + b"0123456789abcdef" * (1 << 15)
with open("huge.bin", "wb") as file:
    for i in range(5 * 1024):
        file.write(i.to_bytes(8, "little") + block[8:])
P
printf '5 GB: packed in %s (seconds, KB)' "$(measure "$talutil" zip huge.zip huge.bin --level 1)"
printf ', unpacked in %s\n' "$(measure "$talutil" unzip huge.zip --to out)"
cmp huge.bin out/huge.bin && echo "unpacked as it was"
unzip -tq huge.zip
