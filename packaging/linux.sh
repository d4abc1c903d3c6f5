# The packages for Linux. Sourced by ./package, after tools/environment.sh.

package_linux() {
  local name=talutil-$version log=$talutil_build/package-linux.log
  need_packages $native_packages
  say "building the command"
  build native || fail "the native build failed"
  rm -rf "${stage:?}/$name" "$output"/talutil-*-linux-*
  cmake --install "$talutil_build/native" --prefix "$stage/$name" --strip >"$log" || { cat "$log" >&2; fail "cmake --install failed"; }
  mkdir -p "$stage/$name/share/doc/talutil/examples"
  cp docs/reference.md "$stage/$name/share/doc/talutil"
  cp -r examples/*.sh examples/*.plan examples/data "$stage/$name/share/doc/talutil/examples"
  settle "$stage/$name"
  say "packing $name-linux-$(uname -m).tar.gz"
  tar --create --sort=name --format=ustar --owner=0 --group=0 --numeric-owner --directory="$stage" "$name" |
    gzip -n -9 >"$stage/$name.tar.gz"
  mv "$stage/$name.tar.gz" "$output/$name-linux-$(uname -m).tar.gz"
}

package_debian() {
  rm -f "$output"/talutil_*.deb
  packaging/debian.sh "$output"
}
