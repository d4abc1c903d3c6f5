# Turns the lines of members.vbs that both languages have into JScript, each in a block of its own: one that fails prints
# nothing. Statements of VBScript alone (declarations, blocks) are left out, and so is all below the line of dashes.

/^'---/ { exit }
/^(Option|On|Dim|Sub|End|Class|  |'|$)/ { next }
{
  code = ""
  in_text = 0
  for (i = 1; i <= length($0); ++i) {
    c = substr($0, i, 1)
    next_two = substr($0, i, 2)
    if (!in_text && c == "'") break
    if (in_text && next_two == "\"\"") { code = code "\\\""; ++i; continue }
    if (c == "\"") in_text = !in_text
    code = code (in_text && c == "\\" ? "\\\\" : !in_text && c == "&" ? "+" : c)
  }
  sub(/^(Call|Set) /, "", code)
  if (sub(/^Say /, "", code)) code = "Say(" code ")"
  failure = ""
  if (match(code, / : SayError .*/)) {
    failure = "SayError(" substr(code, RSTART + 12) ", e)"
    code = substr(code, 1, RSTART - 1)
  }
  print "try { " code "; } catch (e) { " failure " }"
}
