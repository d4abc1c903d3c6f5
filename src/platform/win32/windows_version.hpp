#pragma once

#include <cstdint>

#include "automation/text.hpp"

namespace talutil::win32 {

/// What the registry says about the system, in HKEY_LOCAL_MACHINE\SOFTWARE\Microsoft\Windows NT\CurrentVersion.
struct RegisteredVersion {
  Text product;               ///< ProductName, such as "Windows 10 Pro".
  Text version;               ///< CurrentVersion: "6.3" from Windows 8.1 on.
  std::int32_t major = 0;     ///< CurrentMajorVersionNumber and
  std::int32_t minor = 0;     ///< CurrentMinorVersionNumber, from Windows 10 on.
  Text build;                 ///< CurrentBuildNumber
  std::int32_t revision = 0;  ///< UBR, which counts updates.
  Text release;               ///< DisplayVersion, such as "23H2".
  Text service_pack;          ///< CSDVersion
};

/// The name as users know it. Windows 11 still calls itself Windows 10 there; its first build is 22000.
[[nodiscard]] Text windows_name(const RegisteredVersion& registered);

/// "10.0, build 22631.3155, version 23H2"; "6.1, build 7601, Service Pack 1".
[[nodiscard]] Text windows_version(const RegisteredVersion& registered);

}  // namespace talutil::win32
