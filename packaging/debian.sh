#!/usr/bin/env bash
# Makes the Debian package of the command, the C library and the Python package, from the preset "native":
#   packaging/debian.sh [FOLDER]     by default build/package; ./package debian does the same
#
# The same sources make the same bytes: times are that of the last commit, or SOURCE_DATE_EPOCH. Prints the file's name.
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/../tools/environment.sh"
cd "$talutil_top"
folder=${1:-$talutil_build/package}
need_packages $native_packages python3 dpkg-dev
say "building the command and the libraries (minutes the first time)" >&2
build native >&2

version=$(sed -n 's/.*version_text = "\([0-9.]*\)".*/\1/p' src/library/version.hpp)
architecture=$(dpkg --print-architecture)
SOURCE_DATE_EPOCH=${SOURCE_DATE_EPOCH:-$(git log -1 --format=%ct)}
export SOURCE_DATE_EPOCH
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
root=$work/root
umask 022

DESTDIR=$root cmake --install "$talutil_build/native" --prefix /usr --strip >"$work/install.log" ||
  { cat "$work/install.log" >&2; fail "cmake --install failed"; }
# The notices stand where every package has them.
mv "$root/usr/share/doc/talutil/NOTICES.txt" "$root/usr/share/doc/talutil/copyright"
mkdir -p "$root/DEBIAN" "$work/debian"
find "$root/usr" -type d -exec chmod 755 {} +
find "$root/usr" -type f -exec chmod go-w {} +

# The packages whose libraries the programs are linked with, in the versions that have what they use.
touch "$work/debian/control"
depends=$(cd "$work" && dpkg-shlibdeps -O -l"$(dirname "$(find "$root/usr" -name libtalutil.so.1)")" \
  "$root/usr/bin/talutil" "$(find "$root/usr" -name 'libtalutil.so.*.*')" 2>/dev/null | sed -n 's/^shlibs:Depends=//p')
[ -n "$depends" ] || fail "dpkg-shlibdeps found no dependencies"
cat >"$root/DEBIAN/control" <<X
Package: talutil
Version: $version
Architecture: $architecture
Maintainer: TALUtil developers <talutil@localhost>
Installed-Size: $(find "$root/usr" -type f -printf '%s\n' | awk '{ sum += int(($1 + 1023) / 1024) } END { print sum }')
Depends: $depends
Recommends: python3, fonts-dejavu-core
Section: utils
Priority: optional
Description: common toolkit for booking and job scheduling
 Cleans text for databases, handles lists, day-first dates, settings, files,
 archives and reports: as a command, a library for C, and a Python package.
X
printf 'activate-noawait ldconfig\n' >"$root/DEBIAN/triggers"
# What Python compiles for root lies beside its package and would be left behind.
printf '%s\n' '#!/bin/sh' 'rm -rf /usr/lib/python3/dist-packages/talutil/__pycache__' >"$root/DEBIAN/prerm"
chmod 755 "$root/DEBIAN/prerm"
(cd "$root" && find usr -type f -printf '%P\n' | LC_ALL=C sort | sed 's|^|usr/|' | xargs -d '\n' md5sum) >"$root/DEBIAN/md5sums"
find "$root" -exec touch --no-dereference --date="@$SOURCE_DATE_EPOCH" {} +

mkdir -p "$folder"
package=$folder/talutil_${version}_$architecture.deb
dpkg-deb --root-owner-group --build "$root" "$work/package.deb" >/dev/null
mv "$work/package.deb" "$package.part.$$"
mv "$package.part.$$" "$package"
echo "$package"
