#!/usr/bin/env bash
# Compares archives with zip and unzip: bench/archives.sh PATH_TO_TALUTIL [large]
# Packs and unpacks 200 MB of mixed files from this machine, three times each, alternating, and prints the ratios of the
# best times, the sizes and the peak memory. With "large", also does so for 70,000 files and for one of 5 GB.
set -euo pipefail
[ -x "${1:-}" ] || { echo "usage: bench/archives.sh PATH_TO_TALUTIL [large]" >&2; exit 2; }
talutil=$(realpath "$1")
work=$(mktemp -d)
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
subprocess.run(sys.argv[1:], check=True, stdout=subprocess.DEVNULL)
print(f"{time.monotonic() - begin:.2f} {resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss}")
P
}

least() { sort -n | head -1; }

compare() {  # WORD, ours, theirs: files of measurements
  local ours theirs
  ours=$(least <"$2")
  theirs=$(least <"$3")
  printf '%s: %s s, theirs %s s, ratio %s; peak memory %s KB\n' "$1" "${ours% *}" "${theirs% *}" \
    "$(awk "BEGIN { printf \"%.2f\", ${ours% *} / ${theirs% *} }")" "${ours#* }"
}

make_tree
printf 'tree: %s files, %s MB\n' "$(find tree -type f | wc -l)" "$(du -sm --apparent-size tree | cut -f1)"
for _ in 1 2 3; do
  rm -rf ours.zip theirs.zip ours theirs
  measure zip -6 -q -r theirs.zip tree >>zip.times
  measure "$talutil" zip ours.zip tree >>pack.times
  measure unzip -q theirs.zip -d theirs >>unzip.times
  measure "$talutil" unzip ours.zip --to ours >>unpack.times
done
compare "packing" pack.times zip.times
compare "unpacking" unpack.times unzip.times
printf 'size: %s bytes, theirs %s, ratio %s\n' "$(stat -c %s ours.zip)" "$(stat -c %s theirs.zip)" \
  "$(awk "BEGIN { printf \"%.3f\", $(stat -c %s ours.zip) / $(stat -c %s theirs.zip) }")"
diff -r tree ours/tree && echo "unpacked as it was"
[ "${2:-}" = large ] || exit 0

rm -rf tree ours theirs ./*.zip
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
