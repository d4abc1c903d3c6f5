#!/usr/bin/env bash
# Compares the cleaning of a million rows with a copy of their fields by mawk: bench/cleaning.sh PATH_TO_TALUTIL
# Prints the ratio of the least processor times of three runs, alternating, and the peak memory.
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/../tools/environment.sh"
[ -x "${1:-}" ] || { echo "usage: bench/cleaning.sh PATH_TO_TALUTIL" >&2; exit 2; }
talutil=$(realpath "$1")
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

# Runs a command; prints its seconds of both processors, and its peak megabytes.
measure() { python3 - "$@" <<'P'
import resource, subprocess, sys
subprocess.run(sys.argv[1:], check=True, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
usage = resource.getrusage(resource.RUSAGE_CHILDREN)
print(f"{usage.ru_utime + usage.ru_stime:.2f} {usage.ru_maxrss / 1024:.1f}")
P
}

data=$talutil_top/examples/data/customers.csv  # 2,000 rows.
tail -n +2 "$data" >"$work/body"
{ head -n 1 "$data" && for _ in {1..500}; do cat "$work/body"; done; } >"$work/rows.csv"
for _ in 1 2 3; do
  measure "$talutil" clean "$work/rows.csv" --plan "$talutil_top/examples/customers.plan" --format csv \
    --output "$work/cleaned.csv" >>"$work/ours"
  measure mawk -F, '{ $1 = $1; print >"'"$work/copied.csv"'" }' OFS=, "$work/rows.csv" >>"$work/theirs"
done
read -r ours memory <<<"$(sort -n "$work/ours" | head -1)"
read -r theirs _ <<<"$(sort -n "$work/theirs" | head -1)"
printf 'cleaning a million rows: %s s, mawk %s s, ratio %s\n' "$ours" "$theirs" "$(awk "BEGIN { print $ours / $theirs }")"
printf 'cleaning a million rows, memory: %s MB\n' "$memory"
