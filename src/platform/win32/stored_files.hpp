#pragma once

#include <memory>

#include "platform/folders.hpp"
#include "platform/win32/handle.hpp"

/// The files in open folders, and what is recorded about them besides their contents.
namespace talutil::win32 {

/// The attributes that archives record.
constexpr DWORD kept_attributes =
    FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM | FILE_ATTRIBUTE_ARCHIVE;

[[nodiscard]] constexpr std::uint64_t joined(DWORD high, DWORD low) noexcept {
  return static_cast<std::uint64_t>(high) << 32U | low;
}

/// The next entry of a search; false at the end. Raises an error if the folder cannot be read on, since its end would
/// hide entries.
[[nodiscard]] bool find_next(const Owned<kind::FileSearch>& search, WIN32_FIND_DATAW& entry);

/// Conversion to and from seconds since 1970.
[[nodiscard]] std::int64_t seconds_of(const FILETIME& time) noexcept;
[[nodiscard]] FILETIME file_time(std::int64_t seconds) noexcept;

/// Opens a file for reading. `path` is in the extended form (\\?\), `sharing` is what others may do with the file
/// meanwhile. Raises the same errors as opening.
[[nodiscard]] std::unique_ptr<StoredFile> open_stored_file(const Text& path, DWORD sharing);

/// Creates a file. `folder` is in the extended form (\\?\), with a trailing separator. Raises the same errors as
/// Folder::create.
[[nodiscard]] std::unique_ptr<NewFile> create_new_file(const Text& folder, TextView name);

}  // namespace talutil::win32
