#pragma once

#include <zip.h>

#include <exception>
#include <memory>

#include "archives/progress.hpp"
#include "platform/folders.hpp"

/// The container library on top of the platform's files. Only source files of this folder include this header, because
/// it brings the library's own names with it.
namespace talutil::archives {

/// Keeps an exception that was thrown in a callback of the container library, since exceptions must not pass through C.
class Fault {
 public:
  /// `other` is used for errors that the library does not report precisely: damage while reading, our own fault while
  /// writing.
  explicit Fault(Code other) noexcept : other_(other) {}

  /// Runs the body of a callback; if it throws, keeps the exception and returns the library's failure value.
  template <class Work>
  [[nodiscard]] zip_int64_t keep(zip_error_t& error, Work&& work) noexcept {
    try {
      return work();
    } catch (...) {
      if (!reason_) reason_ = std::current_exception();
      zip_error_set(&error, ZIP_ER_READ, 0);
      return -1;
    }
  }

  /// Throws the kept exception or, if there is none, the library's error.
  [[noreturn]] void fail(zip_error_t* error) const;
  [[noreturn]] void fail(int library_code) const;

 private:
  Code other_;
  std::exception_ptr reason_;
};

/// An archive that is open in the container library. The files, the fault and the progress must outlive it.
class Container {
 public:
  /// Opens an archive for reading.
  Container(StoredFile& archive, Fault& fault);

  /// Opens an archive for changes: reads the file that is being replaced, if any, and writes the new one.
  Container(NewFile& archive, Fault& fault, Progress& progress);

  Container(const Container&) = delete;
  Container& operator=(const Container&) = delete;
  ~Container();

  [[nodiscard]] zip_t* get() const noexcept { return archive_; }
  /// Throws the library's most recent error.
  [[noreturn]] void fail() const { fault_.fail(zip_get_error(archive_)); }

  /// Writes what was added. If the progress callback throws, rethrows that, and nothing counts as written.
  void write();

 private:
  static zip_int64_t serve(void* self, void* data, zip_uint64_t length, zip_source_cmd_t command);
  zip_int64_t read_or_write(void* data, zip_uint64_t length, zip_source_cmd_t command);
  void open(int flags);

  StoredFile* reading_ = nullptr;
  NewFile* writing_ = nullptr;
  Fault& fault_;
  Progress* progress_ = nullptr;
  std::uint64_t read_place_ = 0;
  std::uint64_t write_place_ = 0;
  zip_error_t error_{};
  zip_t* archive_ = nullptr;
};

}  // namespace talutil::archives
