# What all packages have in common. Sourced after tools/environment.sh, with the checkout as the current folder.

version=$(sed -n 's/.*version_text = "\(.*\)".*/\1/p' src/library/version.hpp)
output=$talutil_build/package
# Files lie here as they will in the packages.
stage=$talutil_build/package-stage

# The time of everything in the packages.
if [ -z "${SOURCE_DATE_EPOCH:-}" ]; then
  SOURCE_DATE_EPOCH=$(git log -1 --format=%ct) ||
    fail "this folder is not a checkout: set SOURCE_DATE_EPOCH to the seconds since 1970 of the packages' files"
  [ -z "$(git status --porcelain)" ] || say "note: there are changes that are not committed; the packages have them"
fi
export SOURCE_DATE_EPOCH
umask 022

# Gives files below a folder the time of the release and the same rights on every machine.
settle() {
  find "$1" -type d -exec chmod 755 {} +
  find "$1" -type f -not -perm -u+x -exec chmod 644 {} +
  find "$1" -type f -perm -u+x -exec chmod 755 {} +
  find "$1" -exec touch --no-dereference --date="@$SOURCE_DATE_EPOCH" {} +
}

# Signs a program or library.
sign() {
  [ -n "${TALUTIL_SIGN:-}" ] || return 0
  bash -c "$TALUTIL_SIGN \"\$1\"" sign "$1" || fail "TALUTIL_SIGN ($TALUTIL_SIGN) could not sign $1"
}
