#!/usr/bin/env bash
# Builds the site, build/site/index.html, which works without a server: the reference, a page for each member, and the
# guides. Installs what is missing.
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/environment.sh"
cd "$talutil_top"

need_packages $native_packages python3 python3-sphinx furo python3-myst-parser
mkdir -p "$talutil_build"
build native talutil || fail "the command, which prints the reference, could not be built"
"$talutil_build/native/talutil" reference --json >"$talutil_build/reference.json"
tools/site_source.py "$talutil_build/reference.json" "$talutil_build/site-source"
rm -rf "$talutil_build/site.new"
sphinx-build -q -W --keep-going -b html -d "$talutil_build/site-doctrees" "$talutil_build/site-source" \
  "$talutil_build/site.new" || fail "Sphinx found something wrong"
rm -rf "$talutil_build/site"
mv "$talutil_build/site.new" "$talutil_build/site"
say "open $talutil_build/site/index.html"
