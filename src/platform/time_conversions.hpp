#pragma once

#include "automation/system_time.hpp"

namespace talutil {

/// The platform's conversions of broken-down times and of local time, which goes by the offset of today whatever
/// date is converted. Each leaves its output as it was where the platform refuses, and reports nothing.
class TimeConversions {
 public:
  virtual ~TimeConversions() = default;

  virtual void system_to_file(const SystemTime& time, FileTime& result) = 0;
  virtual void file_to_system(FileTime time, SystemTime& result) = 0;
  virtual void local_to_utc(FileTime local, FileTime& utc) = 0;
  virtual void utc_to_local(FileTime utc, FileTime& local) = 0;
};

/// The same where a platform has no more to say than its offset.
class CalendarTimeConversions : public TimeConversions {
 public:
  void system_to_file(const SystemTime& time, FileTime& result) final {
    result = system_to_file_time(time).value_or(result);
  }
  void file_to_system(FileTime time, SystemTime& result) final { result = file_to_system_time(time).value_or(result); }
  void local_to_utc(FileTime local, FileTime& utc) final { utc = local - utc_offset_seconds() * file_time_second; }
  void utc_to_local(FileTime utc, FileTime& local) final { local = utc + utc_offset_seconds() * file_time_second; }

 protected:
  /// What local time is ahead of UTC today, daylight saving included.
  [[nodiscard]] virtual std::int64_t utc_offset_seconds() = 0;
};

}  // namespace talutil
