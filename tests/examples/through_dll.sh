# Runs the examples in the members' texts through TALUtil.dll, which must be registered. Sourced by tests/hosts/run.sh.

# All those without windows are one script; each of the others has a user. Their settings begin empty.
run_examples() {  # the preset, the command
  local made=$talutil_build/$1-examples name keys
  rm -rf "$made"
  mkdir -p "$made"
  # Which the test of printing has put beside the library.
  rm -f "$talutil_build/$1/printhelper.dll"
  wine reg.exe delete 'HKCU\Software\TALUtil\Settings' /f >/dev/null 2>&1 || true
  "$talutil_top/tests/examples/run.py" scripts "$2" "$made" >"$made/windows.txt"
  WINE_TIMEOUT=300 wine cscript.exe //nologo "Z:\\build\\$1-examples\\all.vbs" >"$made/all.out"
  while read -r name keys; do
    read -ra keys <<<"$keys"
    wine "Z:\\build\\$1\\tests\\hosts\\user_client.exe" "Z:\\build\\$1-examples\\$name" "${keys[@]}" \
      >"$made/${name%.vbs}.out" </dev/null || echo "FAILED $name: its user could not end it"
  done <"$made/windows.txt"
  "$talutil_top/tests/examples/run.py" compare "$2" "$made"/*.out
}
