#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

/// Converts a date to a point in time, moves it, and converts it back. A step that the platform rejects leaves the
/// previous value, with which the next step continues: a time before 1601 becomes the start of that year, moved, or
/// stays as it is if the result is before that start.
Date moved(ORVUtils& utils, Date date, void (TimeConversions::*move)(FileTime from, FileTime& to)) {
  TimeConversions& conversions = utils.library().platform().time_conversions;
  SystemTime time;
  FileTime given = 0;
  FileTime result = 0;
  utils.DateToSystemTime(date, time);
  conversions.system_to_file(time, given);
  (conversions.*move)(given, result);
  conversions.file_to_system(result, time);
  utils.SystemTimeToDate(time, date);
  return date;
}

}  // namespace

void ORVUtils::DateToSystemTime(Date the_date, SystemTime& system_time) {
  const DateParts parts = parts_of(the_date);
  system_time.wYear = static_cast<std::int16_t>(parts.year);
  system_time.wMonth = static_cast<std::int16_t>(parts.month);
  system_time.wDay = static_cast<std::int16_t>(parts.day);
  system_time.wHour = static_cast<std::int16_t>(parts.hour);
  system_time.wMinute = static_cast<std::int16_t>(parts.minute);
  system_time.wSecond = static_cast<std::int16_t>(parts.second);
}

void ORVUtils::SystemTimeToDate(const SystemTime& system_time, Date& the_date) {
  const std::int32_t minutes = std::int32_t{system_time.wHour} * 60 + system_time.wMinute;
  the_date =
      date_from_serial(system_time.wYear, system_time.wMonth, system_time.wDay, minutes * 60 + system_time.wSecond);
}

Date ORVUtils::LocalTimeToUTC(Date the_date) { return moved(*this, the_date, &TimeConversions::local_to_utc); }

Date ORVUtils::UTCToLocalTime(Date the_date) { return moved(*this, the_date, &TimeConversions::utc_to_local); }

}  // namespace talutil
