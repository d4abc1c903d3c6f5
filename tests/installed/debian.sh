#!/usr/bin/env bash
# Makes the Debian package twice and uses it in a clean Debian, which debootstrap makes once in the build
# folder: tests/installed/debian.sh. Where that is not possible, the package is only unpacked. The last line is "N
# passed, N failed".
set -uo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/../../tools/environment.sh"
here=$talutil_top/tests/installed
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
. "$talutil_top/tests/verdict.sh"

clean_suite=$wine_root_suite
clean_root=$talutil_build/clean-$clean_suite

# Makes the clean Debian. Its package lists stay as they are, and what apt has fetched is kept beside it, so that later
# runs need no network.
make_clean_root() {
  local mirror unfinished=$clean_root.$$
  [ "$(id -u)" = 0 ] && unshare --mount true || { echo "it needs the rights of root, and to mount"; return 1; }
  [ ! -d "$clean_root" ] || return 0
  mirror=$(debian_mirror "$clean_suite")
  [ -n "$mirror" ] || { echo "apt has no mirror for $clean_suite"; return 1; }
  (need_packages debootstrap) && unshare --mount debootstrap --variant=minbase "$clean_suite" "$unfinished" "$mirror" &&
    chroot "$unfinished" apt-get -qq update && chroot "$unfinished" apt-get clean &&
    mkdir -p "$clean_root-archives/partial" && mv -T "$unfinished" "$clean_root" && return
  rm -rf "$unfinished"
  echo "debootstrap could not make it; see $clean_root.log"
  return 1
}

# Runs a command in the clean Debian, with the package and the tests in /mnt. Whatever it changes is in memory, and is
# gone afterwards.
in_clean_root() {
  unshare --mount bash -euc '
    root=$1 archives=$2 shown=$3 here=$4
    shift 4
    mount -t tmpfs tmpfs "$here"
    mkdir "$here/upper" "$here/work" "$here/root"
    mount -t overlay -o "lowerdir=$root,upperdir=$here/upper,workdir=$here/work" overlay "$here/root"
    here=$here/root
    mount --bind "$archives" "$here/var/cache/apt/archives"
    mount --bind "$shown" "$here/mnt"
    mount --rbind /dev "$here/dev"
    mount -t proc proc "$here/proc"
    exec chroot "$here" env -i PATH=/usr/sbin:/usr/bin:/sbin:/bin HOME=/root LC_ALL=C.UTF-8 "$@"
  ' in_clean_root "$clean_root" "$clean_root-archives" "$work/shown" "$work/memory" "$@"
}

package=$("$talutil_top/packaging/debian.sh" "$work/first" | tail -1)
again=$("$talutil_top/packaging/debian.sh" "$work/second" | tail -1)
verdict 'the same bytes twice' same "$(cmp "$package" "$again" && echo same)"
dpkg -x "$package" "$work/check"
dpkg -e "$package" "$work/check/DEBIAN"
verdict 'its checksums' 0 "$(cd "$work/check" && md5sum --quiet -c DEBIAN/md5sums >/dev/null; echo $?)"
verdict 'owned by root' "" "$(dpkg-deb -c "$package" | awk '$2 != "root/root"')"
mkdir "$work/shown" "$work/memory"
cp "$package" "$work/shown/talutil.deb"
cp "$talutil_top/tests/verdict.sh" "$here/debian_clean.sh" "$work/shown"
if make_clean_root >"$clean_root.log" 2>&1 && in_clean_root true >>"$clean_root.log" 2>&1; then
  counts 'the package in a clean Debian' "$talutil_build/debian-clean.log" in_clean_root bash /mnt/debian_clean.sh
else
  echo "left out: the package in a clean Debian, because: $(tail -1 "$clean_root.log")"
  verdict 'its command' B "$("$work/check/usr/bin/talutil" call GetData A,B,C, 1 2)"
  verdict 'its dependencies are installed here' "" "$(dpkg-deb -f "$package" Depends | tr ',' '\n' |
    sed 's/ *(.*//; s/^ *//' | while read -r name; do dpkg-query -W "$name" >/dev/null 2>&1 || echo "$name"; done)"
fi

close_counts
