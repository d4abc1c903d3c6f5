#pragma once

#include "automation/system_time.hpp"

namespace talutil {

/// The platform's conversions between time formats and to local time, which always use today's UTC offset, whatever
/// date is converted. Each leaves its output unchanged if the platform rejects the input, and reports nothing.
class TimeConversions {
 public:
  virtual ~TimeConversions() = default;

  virtual void system_to_file(const SystemTime& time, FileTime& result) = 0;
  virtual void file_to_system(FileTime time, SystemTime& result) = 0;
  virtual void local_to_utc(FileTime local, FileTime& utc) = 0;
  virtual void utc_to_local(FileTime utc, FileTime& local) = 0;
};

/// The conversions for a platform that only supplies its UTC offset.
class CalendarTimeConversions : public TimeConversions {
 public:
  void system_to_file(const SystemTime& time, FileTime& result) final {
    result = system_to_file_time(time).value_or(result);
  }
  void file_to_system(FileTime time, SystemTime& result) final { result = file_to_system_time(time).value_or(result); }
  void local_to_utc(FileTime local, FileTime& utc) final { utc = local - utc_offset_seconds() * file_time_second; }
  void utc_to_local(FileTime utc, FileTime& local) final { local = utc + utc_offset_seconds() * file_time_second; }

 protected:
  /// Seconds by which local time is ahead of UTC today, including daylight saving time.
  [[nodiscard]] virtual std::int64_t utc_offset_seconds() = 0;
};

}  // namespace talutil
