#!/usr/bin/env bash
# Builds the libraries that the distribution does not offer in the form we need, once a machine, and prints the folder
# that holds their headers and archives:
#
#   tools/third_party.sh native|windows|windows64|fuzz            builds them if they are not there
#   tools/third_party.sh --where native|windows|windows64|fuzz    builds nothing
#
# The sources are those of the distribution's source packages, checked by apt. The folder lies in the user's cache and
# is named by a hash of this recipe and its patches, so that every checkout shares it and a change makes a new one.
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/environment.sh"

suite=bookworm
recipe=$(cat "${BASH_SOURCE[0]}" "$talutil_top"/cmake/patches/*.patch | sha256sum | cut -c1-12)
is_asked_only=
[ "${1:-}" != --where ] || { is_asked_only=1; shift; }
flavour=${1:-}
prefix=$talutil_cache/third-party-$recipe/$flavour
work=

clean_up() { [ -z "$work" ] || rm -rf "$work"; }
trap clean_up EXIT

# The compiler and its flags; the Windows ones are those that our own files are built with. Besides its code, an object
# for Windows holds what TALUtil.dll is optimised from as a whole, which leaves out what it does not use.
whole="-flto -ffat-lto-objects"
case $flavour in
  native) cc=cc ar=ar flags="-O2 -fPIC" ;;
  windows)
    cc=i686-w64-mingw32-gcc-posix ar=i686-w64-mingw32-ar toolchain=mingw32
    flags="-O2 -msse2 -mfpmath=sse -mstackrealign -ffunction-sections -fdata-sections $whole"
    ;;
  windows64)
    cc=x86_64-w64-mingw32-gcc-posix ar=x86_64-w64-mingw32-ar toolchain=mingw64
    flags="-O2 -ffunction-sections -fdata-sections $whole"
    ;;
  fuzz) cc=clang ar=ar flags="-O1 -g1 -fPIC -fsanitize=address,fuzzer-no-link" ;;
  *) fail "usage: $0 [--where] native|windows|windows64|fuzz" ;;
esac

# For what takes little of the time: in the DLL, it is compiled for size.
small=$flags
[ "${flavour#windows}" = "$flavour" ] || small=${flags/-O2/-Os}

# Fetches the original archive of a source package and unpacks it below $work, under the package's name.
fetch() {
  local line
  line=$(apt-get "${options[@]}" source --print-uris --download-only "$1" | grep -F .orig.tar) ||
    fail "$suite has no source package $1"
  read -r url file _ digest <<<"$line"
  /usr/lib/apt/apt-helper "${options[@]}" download-file "${url//\'/}" "$work/$file" "$digest" >&2 ||
    fail "could not fetch $file"
  mkdir "$work/$1"
  tar -xf "$work/$file" -C "$work/$1" --strip-components=1
}

# What a licence asks to be handed on with the library.
keep_licence() { cp "$work/$1/$2" "$made/licences/$1"; }

apply() { patch --quiet --directory "$work/$1" --strip=1 --input "$talutil_top/cmake/patches/$2" >&2; }

# For reading entries that others have packed with it. Of its own build files, only what the library consists of.
build_bzip2() {
  local source sources=(blocksort huffman crctable randtable compress decompress bzlib)
  for source in "${sources[@]}"; do
    "$cc" $small -w -c "$work/bzip2/$source.c" -o "$work/bzip2/$source.o" >&2
  done
  "$ar" rcs "$made/lib/libbz2.a" "$work"/bzip2/*.o
  cp "$work/bzip2/bzlib.h" "$made/include/"
}

build_libzip() {
  local crypto=(-DENABLE_OPENSSL=ON -DENABLE_WINDOWS_CRYPTO=OFF) system=() extra=""
  if [ "$flavour" = windows ] || [ "$flavour" = windows64 ]; then
    crypto=(-DENABLE_OPENSSL=OFF -DENABLE_WINDOWS_CRYPTO=ON)
    system=(-DCMAKE_TOOLCHAIN_FILE="$talutil_top/cmake/$toolchain.cmake")
    # 64-bit times, so that a file dated 2040 can be packed.
    extra=" -D__MINGW_USE_VC2005_COMPAT"
  fi
  apply libzip libzip-ae2.patch
  cmake -S "$work/libzip" -B "$work/libzip/build" -G Ninja -DCMAKE_BUILD_TYPE=None -DCMAKE_C_COMPILER="$cc" \
    "${system[@]}" "${crypto[@]}" -DCMAKE_C_FLAGS="$small$extra" -DCMAKE_INSTALL_PREFIX="$made" \
    -DCMAKE_INSTALL_LIBDIR=lib -DBUILD_SHARED_LIBS=OFF -DENABLE_COMMONCRYPTO=OFF -DENABLE_GNUTLS=OFF \
    -DENABLE_MBEDTLS=OFF -DENABLE_LZMA=OFF -DENABLE_BZIP2=ON -DBZIP2_INCLUDE_DIR="$made/include" \
    -DBZIP2_LIBRARIES="$made/lib/libbz2.a" -DBUILD_TOOLS=OFF -DBUILD_REGRESS=OFF \
    -DBUILD_EXAMPLES=OFF -DBUILD_DOC=OFF >&2
  cmake --build "$work/libzip/build" --target install >&2
}

build_libdeflate() {
  local target=libdeflate.a
  [ "${flavour#windows}" = "$flavour" ] || target=libdeflatestatic.lib
  make -C "$work/libdeflate" CC="$cc" AR="$ar" CFLAGS="$flags" "$target" >&2
  cp "$work/libdeflate/$target" "$made/lib/libdeflate.a"
  cp "$work/libdeflate/libdeflate.h" "$made/include/"
}

# Its own build files miss a source, so they are compiled here.
build_libharu() {
  local source
  apply libharu libharu-memory-font.patch
  apply libharu libharu-nested-glyphs.patch
  apply libharu libharu-marks.patch
  apply libharu libharu-fewer-tables.patch
  printf '#define LIBHPDF_HAVE_LIBZ\n#define LIBHPDF_HAVE_NOPNGLIB\n' >"$work/libharu/include/hpdf_config.h"
  # Its errors leave through our handler, which throws.
  (cd "$work/libharu/src" && for source in *.c; do
    echo "$source"
  done | xargs -P2 -I{} "$cc" $small -fexceptions -w -I../include -c {}) >&2
  "$ar" rcs "$made/lib/libhpdf.a" "$work"/libharu/src/*.o
  cp "$work"/libharu/include/*.h "$made/include/"
}

if [ -z "$is_asked_only" ] && [ ! -d "$prefix" ]; then
  {
    need_packages $native_packages
    [ "$flavour" != windows ] || need_packages $windows_packages
    [ "$flavour" != windows64 ] || need_packages $windows64_packages
    [ "$flavour" != fuzz ] || need_packages $fuzz_packages
    say "building the $flavour libraries for archives and documents (once, half a minute)"
  } >&2
  work=$(mktemp -d)
  made=$work/made
  mkdir -p "$made/lib" "$made/include" "$made/licences" "$work/lists/partial" "$(dirname "$prefix")"
  echo "deb-src [signed-by=/usr/share/keyrings/debian-archive-keyring.gpg] $(debian_mirror $suite) $suite main" \
    >"$work/sources"
  options=(-qq -o "Dir::Etc::sourcelist=$work/sources" -o Dir::Etc::sourceparts=/dev/null
    -o "Dir::State::lists=$work/lists" -o "Dir::Cache::pkgcache=" -o "Dir::Cache::srcpkgcache="
    -o APT::Sandbox::User=root)
  apt-get "${options[@]}" update >&2
  for package in bzip2 libzip libdeflate libharu; do
    fetch "$package"
    "build_$package" >"$work/$package.log" 2>&1 || { tail -30 "$work/$package.log" >&2; fail "could not build $package"; }
  done
  keep_licence bzip2 LICENSE
  keep_licence libzip LICENSE
  keep_licence libdeflate COPYING
  # It has no file of its own for it.
  sed -n '/^The license of Haru/,/^[*]/p' "$work/libharu/README" | sed '$d' >"$made/licences/libharu"
  # Another run may have finished first; both made the same thing.
  mv -T "$made" "$prefix" 2>/dev/null || [ -d "$prefix" ] || fail "could not put the libraries into $prefix"
fi
echo "$prefix"
