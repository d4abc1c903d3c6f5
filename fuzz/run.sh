#!/usr/bin/env bash
# Runs each fuzzer for some seconds, two at a time: fuzz/run.sh FOLDER_OF_FUZZERS PATH_TO_TALUTIL SECONDS
#
# What a fuzzer has found interesting stays in FOLDER_OF_FUZZERS/corpus for the next run, and the input that broke it in
# FOLDER_OF_FUZZERS/broken. The last line is "N passed, N failed".
set -uo pipefail
[ $# = 3 ] && [ -x "$2" ] || { echo "usage: $0 FOLDER_OF_FUZZERS PATH_TO_TALUTIL SECONDS" >&2; exit 2; }
top=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)
fuzzers=$(realpath "$1")
seconds=$3
mkdir -p "$fuzzers/corpus" "$fuzzers/broken"
"$top/corpus.sh" "$2" "$fuzzers/corpus" >"$fuzzers/corpus.log" 2>&1 || { tail -5 "$fuzzers/corpus.log"; exit 1; }
export UBSAN_OPTIONS=print_stacktrace=1
cd "$fuzzers" || exit 1  # Some write files into the current folder.

run() {
  local name=$1 longest=512
  case $name in
    dates_fuzz | numbers_fuzz) longest=64 ;;
    archives_fuzz) longest=4096 ;;
  esac
  mkdir -p "$fuzzers/corpus/$name"
  # Leaks are looked for once, at the end. The limits allow for a machine that is busy with something else.
  timeout $((seconds + 300)) "$fuzzers/$name" -seed=1 -max_total_time="$seconds" -max_len=$longest -timeout=60 \
    -detect_leaks=0 -print_final_stats=1 -artifact_prefix="$fuzzers/broken/$name-" "$fuzzers/corpus/$name" \
    >"$fuzzers/$name.log" 2>&1
}
export -f run
export fuzzers seconds

names=()
for fuzzer in "$fuzzers"/*_fuzz; do names+=("$(basename "$fuzzer")"); done
rm -f "$fuzzers"/*.status
printf '%s\n' "${names[@]}" | xargs -P2 -I{} bash -c 'run {}; echo $? >"$fuzzers/{}.status"'

passed=0
failed=0
for name in "${names[@]}"; do
  runs=$(sed -n 's/^stat::number_of_executed_units: *//p' "$fuzzers/$name.log")
  # One that has not run a single input has not checked anything.
  if [ "$(cat "$fuzzers/$name.status")" = 0 ] && [ "${runs:-0}" -gt 0 ]; then
    passed=$((passed + 1))
    [ "$seconds" -lt 60 ] || printf '%s: %d executions\n' "$name" "$runs"
  else
    failed=$((failed + 1))
    printf 'FAILED: %s\n' "$name"
    grep -E -A12 'broken|ERROR|runtime error' "$fuzzers/$name.log" | head -20 || tail -5 "$fuzzers/$name.log"
  fi
done
printf '%d passed, %d failed\n' $passed $failed
[ $failed = 0 ]
