# Counts what is as expected and prints what is not. Sourced by scripts whose last line is "N passed, N failed".

passed=0
failed=0

note_failure() {  # name, further lines
  failed=$((failed + 1))
  printf 'FAILED: %s\n' "$1"
  shift
  [ $# = 0 ] || printf '  %s\n' "$@"
}

verdict() {  # name, expected, actual
  if [ "$2" == "$3" ]; then
    passed=$((passed + 1))
  else
    note_failure "$1" "$(printf 'expected: %q' "$2")" "$(printf 'actual:   %q' "$3")"
  fi
}

same_files() {  # name, expected, actual: files or folders
  local difference
  if difference=$(diff -ru "$2" "$3" 2>&1); then
    passed=$((passed + 1))
  else
    note_failure "$1" "$(head -20 <<<"$difference")"
  fi
}

# Runs a command that needs nothing but to end well. What it prints goes to the file $log.
succeeds() {  # name, command
  local name=$1 status=0
  shift
  "$@" >"${log:-/dev/null}" 2>&1 || status=$?
  verdict "$name, its status" 0 "$status"
  [ "$status" = 0 ] || [ -z "${log:-}" ] || tail -5 "$log"
}

# Runs a command that ends with its counts, and adds these. One that ends without them, or has died after them, is one
# failure.
counts() {  # name, a file for what it prints, command
  local name=$1 file=$2 status=0 line
  shift 2
  "$@" >"$file" 2>&1 || status=$?
  tr -d '\r' <"$file" | grep -E '^FAILED|^  (expected|actual)' || true
  line=$(tr -d '\r' <"$file" | grep -E '^[0-9]+ passed, [0-9]+ failed$' | tail -1) || true
  if [[ $line =~ ([0-9]+)\ passed,\ ([0-9]+)\ failed ]] && { [ $status = 0 ] || [ "${BASH_REMATCH[2]}" != 0 ]; }; then
    passed=$((passed + BASH_REMATCH[1]))
    failed=$((failed + BASH_REMATCH[2]))
  else
    note_failure "$name: expected its counts and status 0 at the end, got status $status; see $file" "$(tail -5 "$file")"
  fi
}

close_counts() {
  printf '%d passed, %d failed\n' "$passed" "$failed"
  [ "$failed" = 0 ]
}
