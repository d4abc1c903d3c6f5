#include "platform/posix/posix_time_conversions.hpp"

#include <time.h>

namespace talutil::posix {

std::int64_t PosixTimeConversions::utc_offset_seconds() {
  const time_t seconds = time(nullptr);
  struct tm now {};
  // Without this, localtime_r may keep the time zone of its first call.
  tzset();
  localtime_r(&seconds, &now);
  return now.tm_gmtoff;
}

}  // namespace talutil::posix
