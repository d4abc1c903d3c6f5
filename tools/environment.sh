# Shared by ./test, ./demo and ./benchmark: the packages, the Wine root and functions to run programs in it. Sourced by
# bash scripts that have set -euo pipefail. Needs a Debian 12 machine and, only if something is missing, root rights and
# the machine's own package mirror.

talutil_top=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
talutil_build=${TALUTIL_BUILD:-$talutil_top/build}
talutil_cache=${XDG_CACHE_HOME:-$HOME/.cache}/talutil

# Where small files are made by the thousand.
memory_folder=/tmp
[ ! -w /dev/shm ] || memory_folder=/dev/shm

native_packages="build-essential python3 zlib1g-dev cmake ninja-build ccache libgtest-dev googletest libbenchmark-dev libcli11-dev libssl-dev libsqlite3-dev tzdata unicode-data"
exchange_packages="zip unzip p7zip-full libarchive-tools advancecomp python3 poppler-utils qpdf fonts-dejavu-core pkg-config fish zsh"
fuzz_packages="clang"
bench_packages="mawk libhowardhinnant-date-dev"
windows_packages="binutils libz-mingw-w64-dev debootstrap debian-archive-keyring g++-mingw-w64-i686-posix mingw-w64-tools xvfb xauth"
windows64_packages="libz-mingw-w64-dev g++-mingw-w64-x86-64-posix mingw-w64-tools wine64 xvfb xauth"

# All checkouts on the machine share the compiler cache: paths are relative to the checkout's folder.
export CCACHE_BASEDIR=$talutil_top CCACHE_NOHASHDIR=1

fail() {
  printf '%s: %s\n' "$(basename "$0")" "$*" >&2
  exit 1
}

say() { printf '== %s\n' "$*"; }

# Installs the named packages that are missing.
need_packages() {
  local missing=() package
  for package in "$@"; do
    [ "$(dpkg-query -W -f '${db:Status-Status}' "$package" 2>/dev/null)" = installed ] || missing+=("$package")
  done
  [ ${#missing[@]} -gt 0 ] || return 0
  [ "$(id -u)" = 0 ] || fail "missing packages: ${missing[*]}; install them or run as root"
  mkdir -p "$talutil_cache"
  say "installing ${missing[*]}"
  # One at a time: scripts that run side by side may both find something missing.
  flock "$talutil_cache/packages.lock" bash -c 'apt-get update -qq &&
    DEBIAN_FRONTEND=noninteractive apt-get install -y -qq --no-install-recommends "$@" >/dev/null' \
    install "${missing[@]}" || fail "could not install: ${missing[*]}"
}

# The variant of the third-party libraries that a preset uses.
flavour_of() { case $1 in windows* | fuzz) echo "$1" ;; *) echo native ;; esac; }

# Builds a preset, or targets of it, with its libraries; prints only what has failed: build PRESET [TARGET...]
build() {
  tools/third_party.sh "$(flavour_of "$1")" >/dev/null
  cmake --preset "$1" >"$talutil_build/$1-configure.log" 2>&1 || { cat "$talutil_build/$1-configure.log"; return 1; }
  cmake --build --preset "$1" ${2:+--target "${@:2}"} >"$talutil_build/$1-build.log" 2>&1 ||
    { grep -E -A8 'error|FAILED' "$talutil_build/$1-build.log" | head -60; return 1; }
}

# The Wine root is a small i386 Debian, because 32-bit Wine cannot be installed alongside the 64-bit packages. Its
# folder is named by a hash of the recipe, so that all checkouts on the machine share it and a changed recipe creates a
# new one. The folder gets its name only once it is complete.
wine_root_suite=bookworm
wine_root_include=wine32,libgnutls30,fonts-liberation,fonts-dejavu-core
wine_root_recipe="$wine_root_suite i386 minbase $wine_root_include 1"
wine_root=$talutil_cache/wine-$(printf %s "$wine_root_recipe" | sha256sum | cut -c1-12)

# The mirror from which the machine installs the given suite of Debian.
debian_mirror() {
  apt-get indextargets --format '$(REPO_URI) $(RELEASE)' 'Created-By: Packages' |
    awk -v suite="$1" '$2 == suite && !found { found = 1; print $1 }'
}

# Some virtual machines refuse 32-bit programs. There the root runs under QEMU's user-mode emulator (version 10 from the
# backports, because version 7 hangs in Wine's services), which is registered with the kernel until the next boot.
# Everything still passes, at about a fifth of the speed.
runs_i386() {
  local probe status=0
  probe=$(mktemp -d)
  printf '.globl _start\n_start: mov $1, %%eax\n xor %%ebx, %%ebx\n int $0x80\n' >"$probe/a.s"
  { as --32 "$probe/a.s" -o "$probe/a.o" && ld -m elf_i386 "$probe/a.o" -o "$probe/a"; } || status=1
  [ $status != 0 ] || "$probe/a" 2>/dev/null || status=1
  rm -rf "$probe"
  return $status
}

emulator_suite=bookworm-backports
emulator=$talutil_cache/qemu-user-10/usr/bin/qemu-i386

fetch_emulator() {
  [ ! -x "$emulator" ] || return 0
  local mirror work
  mirror=$(debian_mirror "$wine_root_suite")
  work=$(mktemp -d)
  say "this machine cannot run 32-bit programs: fetching the emulator (once)"
  mkdir -p "$work/lists/partial" "$talutil_cache"
  echo "deb [signed-by=/usr/share/keyrings/debian-archive-keyring.gpg] $mirror $emulator_suite main" >"$work/sources"
  local options=(-qq -o "Dir::Etc::sourcelist=$work/sources" -o Dir::Etc::sourceparts=/dev/null
    -o "Dir::State::lists=$work/lists" -o "Dir::Cache::pkgcache=" -o "Dir::Cache::srcpkgcache="
    -o APT::Sandbox::User=root)
  apt-get "${options[@]}" update && (cd "$work" && apt-get "${options[@]}" download qemu-user) &&
    dpkg -x "$work"/qemu-user_*.deb "$work/unpacked" || fail "could not fetch qemu-user from $emulator_suite"
  mv -T "$work/unpacked" "$talutil_cache/qemu-user-10" 2>/dev/null || true
  rm -rf "$work"
  [ -x "$emulator" ] || fail "$emulator is missing after unpacking qemu-user"
}

ensure_i386() {
  runs_i386 && return 0
  [ "$(id -u)" = 0 ] || fail "this machine cannot run 32-bit programs, and registering the emulator requires root"
  fetch_emulator
  local registry=/proc/sys/fs/binfmt_misc
  [ -e $registry/register ] || mount -t binfmt_misc binfmt_misc $registry
  # The header of 32-bit executables and shared objects for the i386; F keeps the emulator open, so that it can also be
  # used inside the root.
  printf '%s' ':talutil-i386:M::\x7fELF\x01\x01\x01\x00\x00\x00\x00\x00\x00\x00\x00\x00\x02\x00\x03\x00:\xff\xff\xff\xff\xff\xfe\xfe\x00\xff\xff\xff\xff\xff\xff\xff\xff\xfe\xff\xff\xff:'"$emulator"':F' \
    >$registry/register
  runs_i386 || fail "the emulator is registered but 32-bit programs still do not run"
}

make_wine_root() {
  ensure_i386
  [ ! -d "$wine_root" ] || return 0
  [ "$(id -u)" = 0 ] || fail "no Wine root in $wine_root yet; creating it requires root"
  local mirror unfinished=$wine_root.$$
  mirror=$(debian_mirror "$wine_root_suite")
  [ -n "$mirror" ] || fail "apt has no mirror for $wine_root_suite; the Wine root cannot be created"
  say "creating the Wine root (once, one to four minutes)"
  mkdir -p "$talutil_cache"
  debootstrap --arch=i386 --variant=minbase --include="$wine_root_include" \
    "$wine_root_suite" "$unfinished" "$mirror" >"$unfinished.log" 2>&1 ||
    { tail -5 "$unfinished.log" >&2; fail "debootstrap failed; its log is $unfinished.log"; }
  mkdir -p "$unfinished/checkout" "$unfinished/build"
  rm -f "$unfinished.log"
  # Another run may have finished first; the results are the same.
  mv -T "$unfinished" "$wine_root" 2>/dev/null || rm -rf "$unfinished"
}

# Programs run in one of two Wines: the 32-bit one in the root, or the 64-bit one from the machine's own packages, which
# needs neither root nor emulator. In both, the checkout is Z:\checkout and the build folder Z:\build.
wine_bits=32

use_wine64() {
  wine_bits=64
  need_packages $windows64_packages
}

# The folder of the Wine prefix as the host sees it, and the build folder as Wine's own programs see it.
wine_prefix() { [ $wine_bits = 64 ] && echo "$talutil_build/wine64-prefix" || echo "$talutil_build/wine-prefix"; }
build_below_wine() { [ $wine_bits = 64 ] && echo "$talutil_build" || echo /build; }

# The environment of programs in Wine. A test may choose another locale for them.
wine_environment() {
  printf '%s\n' PATH=/usr/bin:/bin:/usr/sbin:/sbin USER=root "LANG=${WINE_LANG:-C.UTF-8}" \
    ${WINE_LANG:+"LC_ALL=$WINE_LANG"} ${WINE_LOCPATH:+"LOCPATH=$WINE_LOCPATH"} ${TALUTIL_WHOLE:+"TALUTIL_WHOLE=1"} ${TALUTIL_RECORD:+"TALUTIL_RECORD=$TALUTIL_RECORD"} ${DISPLAY:+"DISPLAY=$DISPLAY"} \
    "WINEDEBUG=${WINEDEBUG:--all}" 'WINEDLLOVERRIDES=winedbg.exe=d;mscoree=d;mshtml=d'
}

# Runs a command inside the Wine root, with the checkout as /checkout (Z:\checkout) and the build folder as /build
# (Z:\build). The mounts are in a separate namespace and end with the command.
in_wine_root() {
  mkdir -p "$talutil_build"
  local limit=${WINE_TIMEOUT:-300} variables
  mapfile -t variables < <(wine_environment)
  # shellcheck disable=SC2016
  timeout --kill-after=5 "$limit" unshare --mount bash -euc '
    root=$1 top=$2 build=$3
    shift 3
    mount --bind "$top" "$root/checkout"
    mount --bind "$build" "$root/build"
    mount --rbind /dev "$root/dev"
    mount -t proc proc "$root/proc"
    exec chroot "$root" env -i HOME=/root WINEARCH=win32 "$@"
  ' in_wine_root "$wine_root" "$talutil_top" "$talutil_build" "WINEPREFIX=/build/$(basename "$(wine_prefix)")" \
    "${variables[@]}" "$@"
}

# The current folder must be on a drive, because programs look for it there.
in_wine64() (
  local limit=${WINE_TIMEOUT:-300} variables
  mapfile -t variables < <(wine_environment)
  mkdir -p "$talutil_build/wine64-drive"
  cd "$talutil_build/wine64-drive" && timeout --kill-after=5 "$limit" env -i HOME="$talutil_build" WINEARCH=win64 WINEPREFIX="$(wine_prefix)" \
    "${variables[@]}" "$@"
)

wine() { if [ $wine_bits = 64 ]; then in_wine64 /usr/lib/wine/wine64 "$@"; else in_wine_root /usr/lib/wine/wine "$@"; fi; }

# A persistent server would keep the caller's standard output open.
wine_server() {
  if [ $wine_bits = 64 ]; then in_wine64 /usr/lib/wine/wineserver64 "$@"; else in_wine_root /usr/lib/wine/wineserver32 "$@"; fi \
    >/dev/null 2>&1 || true
}

# Creates the prefix if it is missing. During that, its drive Z: is the whole machine, because Wine finds the
# description of new prefixes there.
make_wine_prefix() {
  local prefix drive
  prefix=$(wine_prefix)
  [ ! -f "$prefix/made" ] || return 0
  say "creating the $wine_bits-bit Wine prefix (once per build folder)"
  WINE_TIMEOUT=180 wine wineboot --init >/dev/null 2>&1 || fail "wineboot failed for $prefix"
  wine_server -w
  if [ $wine_bits = 64 ]; then
    drive=$talutil_build/wine64-drive
    ln -sfn "$talutil_top" "$drive/checkout"
    ln -sfn "$talutil_build" "$drive/build"
    ln -sfn "$drive" "$prefix/dosdevices/z:"
  fi
  # There is no window manager on the tests' screen, and windows would wait two seconds for its answers.
  wine reg.exe add 'HKCU\Software\Wine\X11 Driver' /v Managed /d N /f >/dev/null 2>&1 || true  # Slower, no worse.
  touch "$prefix/made"
}

# Creates what is missing and keeps the Wine server for a minute after the last program, so that a script host starts in
# a fraction of a second.
start_wine() {
  [ $wine_bits = 64 ] || make_wine_root
  make_wine_prefix
  wine_server -p60
}

# Where the cross builds find the platform's standard type library.
export TALUTIL_STDOLE_DIR=$wine_root/usr/lib/i386-linux-gnu/wine/i386-windows
export TALUTIL_STDOLE64_DIR=/usr/lib/x86_64-linux-gnu/wine/x86_64-windows
