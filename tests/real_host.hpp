#pragma once

#include <cstdlib>
#include <filesystem>

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#ifdef _WIN32
#include "platform/win32/win32_platform.hpp"
#else
#include "platform/posix/posix_platform.hpp"
#endif

namespace talutil::testing {

struct NoControls final : ControlMakers {
  ObjectRef create(TextView /*class_name*/) override { return nullptr; }
};

/// The library on the real platform.
struct Host {
  explicit Host(const std::filesystem::path& native_folder) : native(prepared(native_folder)) {
#ifdef _WIN32
    folder = Text(native.u16string()) + u"\\";
#else
    folder = u"Z:" + from_utf8(native.string()) + u"/";
#endif
    utils.settings().EventLog = 1;
    utils.settings().sORVPath = folder.substr(0, folder.size() - 1);
  }

  std::filesystem::path native;
  Text folder;
#ifdef _WIN32
  NoControls controls;
  HRESULT apartment = CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
  win32::Win32Platform platform{controls};
#else
  posix::PosixPlatform platform;
#endif
  Library library{platform.platform()};
  ORVUtils utils{library};

 private:
  /// The platform looks for its settings when it is made.
  static std::filesystem::path prepared(const std::filesystem::path& folder) {
#ifndef _WIN32
    setenv("TALUTIL_HIVE", (folder / "hive.db").c_str(), 1);
#endif
    return folder;
  }
};

}  // namespace talutil::testing
