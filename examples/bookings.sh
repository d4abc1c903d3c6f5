#!/usr/bin/env bash
# Books the jobs of bookings.vbs with the native command and prints the same lines: bookings.sh PATH_TO_TALUTIL JOBS
set -euo pipefail
[ $# = 2 ] || { echo "usage: bookings.sh PATH_TO_TALUTIL JOBS" >&2; exit 2; }
talutil=$1

# Prints the result of a member, without the arguments that are written back.
use() { "$talutil" call --result "$@"; }

minutes=0
while IFS=, read -r name visit step count hours; do
  visit=$(use VerifyNullDate 0 "$visit")
  month=$(use GetMonth "$visit")
  while [ "$(use GetMonth "$visit")" = "$month" ]; do
    stored=$(use DurToTime "$hours")
    printf '%s  week %s  %s  %s (%s h)\n' "$visit" "$(use GetWeekNumber "$visit")" "$name" \
      "$(use DateTimeToDuration "$stored")" "$(use ConvertDatabaseDurationToNumber "$stored")"
    minutes=$((minutes + $(use ConvertDatabaseDurationToMinutes "$stored")))
    visit=$(use GetNextDate "$visit" "$step" "$count")
  done
done <"$2"
printf 'March 2009, financial year %s: %s hours in %s days\n' "$(use GetFinancialYearStr 1/3/2009)" \
  $((minutes / 60)):$((minutes % 60)) $(($(use GetDaysInPeriod 1/3/2009 31/3/2009) + 1))
printf 'the quarter ends in %s months\n' "$(use GetMonthsInPeriod 31/3/2009 30/6/2009)"
