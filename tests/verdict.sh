# Counts what is as expected and prints what is not. Sourced by scripts whose last line is "N passed, N failed".

passed=0
failed=0

verdict() {  # name, expected, actual
  if [ "$2" == "$3" ]; then
    passed=$((passed + 1))
  else
    failed=$((failed + 1))
    printf 'FAILED: %s\n  expected: %q\n  actual:   %q\n' "$1" "$2" "$3"
  fi
}

close_counts() {
  printf '%d passed, %d failed\n' "$passed" "$failed"
  [ "$failed" = 0 ]
}
