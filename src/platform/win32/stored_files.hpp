#pragma once

#include <memory>

#include "platform/folders.hpp"
#include "platform/win32/windows.hpp"

/// The files of open folders, and what is kept of each beside its bytes.
namespace talutil::win32 {

/// The attributes that archives keep.
constexpr DWORD kept_attributes =
    FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM | FILE_ATTRIBUTE_ARCHIVE;

[[nodiscard]] constexpr std::uint64_t joined(DWORD high, DWORD low) noexcept {
  return static_cast<std::uint64_t>(high) << 32U | low;
}

/// Times as seconds from 1970 on.
[[nodiscard]] std::int64_t seconds_of(const FILETIME& time) noexcept;
[[nodiscard]] FILETIME file_time(std::int64_t seconds) noexcept;

/// @param path in the extended form
/// @param sharing what others may do with it meanwhile
/// Raises what opening raises.
[[nodiscard]] std::unique_ptr<StoredFile> open_stored_file(const Text& path, DWORD sharing);

/// @param folder in the extended form, with a separator at its end
/// Raises as Folder::create.
[[nodiscard]] std::unique_ptr<NewFile> create_new_file(const Text& folder, TextView name);

}  // namespace talutil::win32
