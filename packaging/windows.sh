# The packages for Windows. Sourced by ./package and by their tests, after tools/environment.sh.

windows_folders="32 64"
preset_of() { [ "$1" = 64 ] && echo windows64 || echo windows; }

build_windows() {
  local bits
  need_packages $native_packages $windows_packages $windows64_packages nsis zip
  make_wine_root
  for bits in $windows_folders; do
    say "building TALUtil.dll, $bits bits"
    build "$(preset_of "$bits")" TALUtil printhelper || fail "the $bits-bit build failed"
  done
}

# A heading and text as in NOTICES.txt.
notice() { printf '%s\n%s\n\n%s\n\n' "$1" "$(printf -- '-%.0s' {1..78})" "$(cat "$2")"; }

with_windows_line_ends() { sed 's/$/\r/'; }

# What the setup installs: the folders 32 and 64, and the notices.
stage_libraries() {
  local folder=$1 bits preset
  for bits in $windows_folders; do
    preset=$talutil_build/$(preset_of "$bits")
    mkdir -p "$folder/$bits"
    cp "$preset/TALUtil.dll" "$preset/TALUtil.manifest" "$preset/printhelper/printhelper.dll" "$folder/$bits"
    sign "$folder/$bits/TALUtil.dll"
    sign "$folder/$bits/printhelper.dll"
  done
  # The libraries of both kinds are linked with the same others.
  cmp "$talutil_build/windows/NOTICES.txt" "$talutil_build/windows64/NOTICES.txt" ||
    fail "NOTICES.txt of the two Windows builds differ: build both with the same libraries"
  { cat "$talutil_build/windows/NOTICES.txt" && notice "NSIS (the setup)" /usr/share/doc/nsis-common/copyright; } |
    with_windows_line_ends >"$folder/NOTICES.txt"
  settle "$folder"
}

# Makes a setup from such a folder: make_setup VERSION FOLDER FILE [TARGET]
make_setup() {
  local log=$talutil_build/makensis.log
  makensis -V2 -WX "-DVERSION=$1" "-DINPUT=$2" "-DOUTPUT=$3.new" "-DTARGET=${4:-x86-unicode}" \
    ${TALUTIL_SIGN:+"-DSIGN=$TALUTIL_SIGN"} "$talutil_top/packaging/talutil.nsi" >"$log" 2>&1 ||
    { cat "$log" >&2; fail "the setup could not be made"; }
  sign "$3.new"
  mv "$3.new" "$3"
}

# The archive: the same libraries, and what developers need.
stage_archive() {
  local folder=$1 bits
  mkdir -p "$folder/include" "$folder/examples/host" "$folder/examples/data" "$folder/docs"
  cp -r "$stage/libraries/." "$folder"
  for bits in $windows_folders; do
    cp "$talutil_build/$(preset_of "$bits")/generated/TALUtil.tlb" "$folder/$bits"
  done
  cp "$talutil_build/windows64/generated/talutil.h" docs/TALUtil.idl "$folder/include"
  cp examples/*.vbs examples/*.cpp examples/*.plan "$folder/examples"
  cp examples/data/* "$folder/examples/data"
  cp examples/host/*.cpp examples/host/*.hpp "$folder/examples/host"
  cp docs/reference.md "$folder/docs"
  sed "s/@VERSION@/$version/" packaging/README.txt | with_windows_line_ends >"$folder/README.txt"
  settle "$folder"
}

package_windows() {
  local name=TALUtil-$version
  build_windows
  rm -rf "$stage/libraries" "${stage:?}/$name" "$output"/TALUtil-*
  stage_libraries "$stage/libraries"
  say "packing $name-setup.exe and $name.zip"
  make_setup "$version" "$stage/libraries" "$output/$name-setup.exe"
  stage_archive "$stage/$name"
  # In the same order and time zone everywhere, and without the times and owners that -X leaves out.
  (cd "$stage" && rm -f "$name.zip" && find "$name" -type f | LC_ALL=C sort | TZ=UTC zip -q -X -9 "$name.zip" -@ &&
    mv "$name.zip" "$output")
}
