# Compiles Free Pascal programs for Windows. Sourced; TALUTIL_WITHOUT_PASCAL=1 leaves them out.

# In a folder below that of the builds, makes the unit of the type library, by the importer that the compiler comes with:
# prepare_pascal PRESET FOLDER
prepare_pascal() {
  pascal=$("$talutil_top/tools/pascal.sh" "$1") || return 1
  pascal_folder=$talutil_build/$2
  mkdir -p "$pascal_folder"
  compile_pascal "$talutil_top/tests/guides/import_unit.pas" &&
    wine "Z:\\build\\$2\\import_unit.exe" "Z:\\build\\$1\\TALUtil.dll" "Z:\\build\\$2\\"
}

compile_pascal() {
  "$pascal/compiler" -n -ve -T"$(cat "$pascal/target")" -Fu"$pascal/units" -F{U,u,E}"$pascal_folder" "$1"
}
