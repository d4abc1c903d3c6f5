#!/usr/bin/env bash
# Makes the Debian package twice and uses it from a folder that it is unpacked into: tests/installed/debian.sh. The last
# line is "N passed, N failed".
set -uo pipefail
top=$(cd "$(dirname "${BASH_SOURCE[0]}")/../.." && pwd)
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
. "$top/tests/verdict.sh"

package=$("$top/packaging/debian.sh" "$work/first" | tail -1)
again=$("$top/packaging/debian.sh" "$work/second" | tail -1)
verdict 'the same bytes twice' same "$(cmp "$package" "$again" && echo same)"
dpkg -x "$package" "$work/root"
dpkg -e "$package" "$work/root/DEBIAN"
verdict 'its checksums' 0 "$(cd "$work/root" && md5sum --quiet -c DEBIAN/md5sums >/dev/null; echo $?)"
verdict 'owned by root' "" "$(dpkg-deb -c "$package" | awk '$2 != "root/root"')"
verdict 'its command' B "$("$work/root/usr/bin/talutil" call GetData A,B,C, 1 2)"
library=$(dirname "$(find "$work/root/usr" -name libtalutil.so.1)")
verdict 'its Python package' B "$(LD_LIBRARY_PATH=$library PYTHONPATH=$work/root/usr/lib/python3/dist-packages \
  python3 -c 'import talutil; print(talutil.ORVUtils().GetData("A,B,C,", 1, 2))')"
verdict 'its dependencies are installed here' "" "$(dpkg-deb -f "$package" Depends | tr ',' '\n' |
  sed 's/ *(.*//; s/^ *//' | while read -r name; do dpkg-query -W "$name" >/dev/null 2>&1 || echo "$name"; done)"

close_counts
