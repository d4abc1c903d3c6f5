#pragma once

#include <zip.h>

#include <exception>
#include <memory>

#include "archives/progress.hpp"
#include "platform/folders.hpp"

/// The container library over our files. Only the sources of this folder include this header: it brings the library's
/// own names with it.
namespace talutil::archives {

/// What a callback of the container library has thrown. Exceptions do not pass through C.
class Fault {
 public:
  /// `other` stands for what the library has no clear word for: damage while reading, our own fault while writing.
  explicit Fault(Code other) noexcept : other_(other) {}

  /// Does something inside a callback; what it throws is kept and answered by the library's word for failure.
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

  /// Throws what was kept, or else what the library says.
  [[noreturn]] void fail(zip_error_t* error) const;
  [[noreturn]] void fail(int library_code) const;

 private:
  Code other_;
  std::exception_ptr reason_;
};

/// An archive open in the container library. The files, the fault and what else it is given must outlive it.
class Container {
 public:
  /// For reading.
  Container(StoredFile& archive, Fault& fault);

  /// For changing: reads the file that the new one replaces, if there is one, and writes to the new one.
  Container(NewFile& archive, Fault& fault, Progress& progress);

  Container(const Container&) = delete;
  Container& operator=(const Container&) = delete;
  ~Container();

  [[nodiscard]] zip_t* get() const noexcept { return archive_; }
  /// Throws for the last failure of the library.
  [[noreturn]] void fail() const { fault_.fail(zip_get_error(archive_)); }

  /// Writes what was added. Throws what the progress callback threw, and then nothing counts as written.
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
