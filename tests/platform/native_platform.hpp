#pragma once

#ifdef _WIN32
#include "platform/win32/win32_platform.hpp"
#else
#include "platform/posix/posix_platform.hpp"
#endif

namespace talutil::testing {

/// The platform of this machine, with the same parts everywhere. There are no third-party controls.
#ifdef _WIN32
struct Apartment : ControlMakers {
  HRESULT result = CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);  ///< Deleting is done by an automation object.
  ObjectRef create(TextView /*class_name*/) override { return nullptr; }
};
struct NativePlatform : Apartment, win32::Win32Platform {
  NativePlatform() : Win32Platform(static_cast<ControlMakers&>(*this)) {}
};
#else
using NativePlatform = posix::PosixPlatform;
#endif

}  // namespace talutil::testing
