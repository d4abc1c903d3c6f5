#!/usr/bin/env bash
# Runs the Windows benchmarks: run.sh [NAME OF THE FOLDER BELOW build]. Needs the windows preset, with the targets
# host_bench, dates_host_bench and preview_bench built.
set -euo pipefail
. "$(dirname "${BASH_SOURCE[0]}")/../../tools/environment.sh"
. "$talutil_top/tests/hosts/screen.sh"

folder=${1:-windows}
[ "$folder" != windows64 ] || use_wine64
start_wine
start_screen
wine regsvr32.exe /s "Z:\\build\\$folder\\TALUtil.dll" 2>/dev/null
wine cscript.exe //nologo 'Z:\checkout\bench\hosts\call.vbs' 2>/dev/null
wine "Z:\\build\\$folder\\bench\\hosts\\host_bench.exe" "Z:\\build\\$folder" 2>/dev/null
wine "Z:\\build\\$folder\\bench\\hosts\\dates_host_bench.exe" 2>/dev/null
WINE_TIMEOUT=300 wine "Z:\\build\\$folder\\bench\\hosts\\preview_bench.exe" 2>/dev/null
lines=$talutil_build/benchmark-lines.txt
awk 'BEGIN { for (i = 0; i < 967742; ++i) printf "A line of sixty characters, as they stand in lists and in logs\r\n" }' >"$lines"
WINE_TIMEOUT=600 wine cscript.exe //nologo 'Z:\checkout\bench\hosts\lines.vbs' 'Z:\build\benchmark-lines.txt' 2>/dev/null
rm -f "$lines"
wine regsvr32.exe /s /u "Z:\\build\\$folder\\TALUtil.dll" 2>/dev/null
