# Compares what a client has printed with what stands in members.vbs: awk -v client=NAME -v status=ITS_STATUS -f
# compare.awk members.vbs OUTPUT. Prints a line for each difference, then the counts. A client stops at its line: what the
# compiled ones do ends at the double line, what JScript does at the line of dashes.

function name_of(line) { return substr(line, 1, index(line, "=") - 1) }

FNR == NR && /^'===/ { is_over = client ~ /pascal/ }
FNR == NR && /^'---/ { is_over = client !~ /vbscript|script_control/ }
FNR == NR && /^'[a-z_]+: / {
  if (index("'" client ":", substr($1, 1, length($1) - 1)) != 1) next
  $0 = substr($0, length($1) + 2)
  own[name_of($0)] = 1
  expected[name_of($0)] = $0
  next
}
FNR == NR {
  if (is_over) next
  value = match($0, / '= .*/) ? substr($0, RSTART + 4) : ""
  # What is expected of a statement of several lines stands behind the last of them.
  if (sub(/.*Say[A-Za-z]* "/, "")) name = substr($0, 1, index($0, "\"") - 1)
  if (value != "" && !(name in own)) expected[name] = name "=" value
  next
}
{
  sub(/\r$/, "")
  if (!index($0, "=")) next
  printed[name_of($0)] = $0
  if (!(name_of($0) in expected)) fail("nothing", $0)
}

END {
  for (name in expected) {
    wanted = expected[name] == name "=-" ? "nothing" : expected[name]
    got = name in printed ? printed[name] : "nothing"
    if (got != wanted) fail(wanted, got)
    else if (wanted != "nothing") ++passed
  }
  if (status != 0) fail("to end with status 0", "status " status)
  printf "%d passed, %d failed\n", passed, failed
}

function fail(wanted, got) {
  printf "FAILED %s: expected %s, got %s\n", client, wanted, got
  ++failed
}
