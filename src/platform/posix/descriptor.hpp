#pragma once

#include <dirent.h>

#include <memory>
#include <string>
#include <string_view>
#include <utility>

#include "automation/run_time_error.hpp"

namespace talutil::posix {

/// An open file descriptor; the destructor closes it.
class Descriptor {
 public:
  explicit Descriptor(int number = -1) noexcept : number_(number) {}
  Descriptor(Descriptor&& other) noexcept : number_(std::exchange(other.number_, -1)) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    std::swap(number_, other.number_);
    return *this;
  }
  ~Descriptor();

  [[nodiscard]] int get() const noexcept { return number_; }

 private:
  int number_;
};

/// Opens a regular file. Raises the same errors as Files; a folder is 75, a device or a pipe 52.
[[nodiscard]] Descriptor open_file(const std::string& path, int flags);

/// The extended attribute in which other programs store the attributes of files from Windows.
constexpr const char* dos_attributes = "user.DOSATTRIB";

/// Raises 75 for a folder, 52 for a device or a pipe, and 75 for a read-only file that is opened for writing.
void require_regular(const Descriptor& file, int flags);

/// Takes a lock (LOCK_SH, LOCK_EX), waiting briefly for another holder; raises 70 if it is not released.
void lock(const Descriptor& file, int operation);

/// Writes all bytes. Raises 61 or 57.
void write_all(const Descriptor& file, std::string_view bytes);

/// Flushes the names in a folder, as far as its file system can.
void flush_folder(const Descriptor& folder) noexcept;

struct CloseListing {
  void operator()(DIR* listing) const noexcept { closedir(listing); }
};

/// A folder open for listing; the destructor closes it.
using FolderListing = std::unique_ptr<DIR, CloseListing>;

/// The next entry, null at the end. Raises 57 if the folder cannot be read on, since its end would hide entries.
[[nodiscard]] const dirent* next_entry(const FolderListing& listing);

/// Raises the run-time error for a system error code concerning a path.
[[noreturn]] void raise_for(int code, const std::string& path);

}  // namespace talutil::posix
