#!/usr/bin/env bash
# Compares reports with other programs that create PDF: bench/documents.sh PATH_TO_TALUTIL [lines]
# Compares a table of 10,000 rows with LibreOffice, if that is installed, and a text of 100,000 lines with enscript and
# ps2pdf; then measures the cost of more pages, and of a large table, also against a program that does nothing but write
# the same cells (bare_pdf). The ratios are of the best of three times, alternating. With "lines", prints instead, for
# texts and tables of 10 to 10,000 pages, lines of NAME, PAGES and SECONDS with tabs between them.
set -euo pipefail
[ -x "${1:-}" ] || { echo "usage: bench/documents.sh PATH_TO_TALUTIL [lines]" >&2; exit 2; }
talutil=$(realpath "$1")
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work"

# Runs a command; prints its seconds and peak kilobytes.
measure() { /usr/bin/env python3 - "$@" <<'P'
import resource, subprocess, sys, time
begin = time.monotonic()
subprocess.run(sys.argv[1:], check=True, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
print(f"{time.monotonic() - begin:.3f} {resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss}")
P
}

least() { sort -n | head -1; }

# Cost against size, the best of three times.
print_lines() {
  local pages name
  for pages in 10 100 1000 10000; do
    # As many as fit on a page.
    awk -v lines=$((pages * 58)) 'BEGIN { for (i = 1; i <= lines; ++i) print "Line", i, "of a text with some words in it" }' >text.txt
    awk -v rows=$((pages * 57)) 'BEGIN { print "Number,Name,Amount"
      for (i = 1; i <= rows; ++i) printf "%d,Customer %d,%.2f\n", i, i * 7, i * 1.37 }' >table.csv
    for name in text.txt table.csv; do
      for _ in 1 2 3; do measure "$talutil" report $name --pdf out.pdf; done >times
      printf '%s\t%s\t%s\n' "${name%.*}" "$(pdfinfo out.pdf | sed -n 's/^Pages: *//p')" "$(least <times | cut -d' ' -f1)"
    done
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
  printf '%s: %s s, %s KB; theirs %s s, %s KB; ratio %s (goal: at most %s)\n' "$1" $ours $theirs \
    "$(awk "BEGIN { printf \"%.3f\", ${ours% *} / ${theirs% *} }")" "$2"
}

awk 'BEGIN { print "Number,Name,Date,Amount,Remark"
  for (i = 1; i <= 10000; ++i)
    printf "%d,Customer %d,%02d/%02d/2026,%.2f,\"delivered, signed for %d\"\n", i, i * 7, i % 28 + 1, i % 12 + 1, i * 1.37, i }' >table.csv
awk 'BEGIN { for (i = 1; i <= 100000; ++i) printf "Line %d of a text with some sixty characters, as in lists and logs\n", i }' >text.txt

if command -v soffice >/dev/null; then
  for _ in 1 2 3; do
    measure "$talutil" report table.csv --pdf ours.pdf >>table-ours
    measure soffice "-env:UserInstallation=file://$work/profile" --headless --convert-to pdf --outdir theirs table.csv >>table-theirs
  done
  compare "a table of 10,000 rows, against LibreOffice" 0.1 table-ours table-theirs
else
  echo "a table of 10,000 rows, against LibreOffice: not measured, soffice is not installed"
fi
if command -v enscript >/dev/null; then
  for _ in 1 2 3; do
    measure "$talutil" report text.txt --pdf ours.pdf >>text-ours
    measure sh -c 'enscript -q -p - text.txt | ps2pdf - theirs.pdf' >>text-theirs
  done
  compare "a text of 100,000 lines, against enscript and ps2pdf" 0.5 text-ours text-theirs
else
  echo "a text of 100,000 lines, against enscript and ps2pdf: not measured, enscript is not installed"
fi

for lines in 1000 10000 100000; do
  head -n "$lines" text.txt >part.txt
  figures=$(measure "$talutil" report part.txt --pdf part.pdf)
  pages=$(pdfinfo part.pdf | sed -n 's/^Pages: *//p')
  printf '%s pages (%s KB of text): %s s, %s pages a second, peak memory %s KB\n' "$pages" \
    "$(($(stat -c %s part.txt) / 1024))" "${figures% *}" "$(awk "BEGIN { printf \"%.0f\", $pages / (${figures% *} + 0.001) }")" "${figures#* }"
done
awk 'BEGIN { for (r = 0; r <= 10000; ++r) { for (c = 0; c < 200; ++c) printf c ? ",c%d.%d" : "r%d", r, c; print "" } }' >wide.csv
# As many pages as the report has.
bare=$(dirname "$talutil")/bench/bare_pdf
for _ in 1 2 3; do
  measure "$talutil" report wide.csv --pdf wide.pdf >>wide-ours
  [ ! -x "$bare" ] || measure "$bare" wide.csv bare.pdf 56 22 >>wide-bare
done
printf '10,000 x 200 cells, seconds: %s s, %s pages\n' "$(least <wide-ours | cut -d' ' -f1)" \
  "$(pdfinfo wide.pdf | sed -n 's/^Pages: *//p')"
printf '10,000 x 200 cells, memory: %s MB\n' "$(least <wide-ours | awk '{ printf "%.1f", $2 / 1024 }')"
if [ -x "$bare" ]; then
  compare "10,000 x 200 cells, against a bare writer" 2 wide-ours wide-bare
else
  echo "10,000 x 200 cells, against a bare writer: not measured, $bare is not built"
fi
