#pragma once

#include "platform/time_conversions.hpp"

namespace talutil::win32 {

class Win32TimeConversions final : public TimeConversions {
 public:
  void system_to_file(const SystemTime& time, FileTime& result) override;
  void file_to_system(FileTime time, SystemTime& result) override;
  void local_to_utc(FileTime local, FileTime& utc) override;
  void utc_to_local(FileTime utc, FileTime& local) override;
};

}  // namespace talutil::win32
