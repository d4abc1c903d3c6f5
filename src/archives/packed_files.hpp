#pragma once

#include <libdeflate.h>

#include <deque>

#include "archives/collection.hpp"
#include "archives/container.hpp"

namespace talutil::archives {

/// The files of a collection as sources for the container library, which reads them one at a time. Files up to
/// `longest_in_memory` are compressed in one piece here; longer ones are passed on as they are, and the library
/// compresses them as it reads. Must outlive the container.
class PackedFiles {
 public:
  PackedFiles(Collection& collection, std::int32_t level, Fault& fault, Progress& progress);

  /// A source for an item; null if the library is out of memory.
  [[nodiscard]] zip_source_t* source_of(const Item& item, zip_t* archive);

  /// The nearest time that the directory of an archive can hold: it counts the years 1980 to 2107.
  [[nodiscard]] static time_t storable_time(std::int64_t modified) noexcept;

  /// A file of this size and its compressed form are in memory at the same time.
  static constexpr std::uint64_t longest_in_memory = 16U << 20U;

 private:
  struct Source {
    PackedFiles* files;
    const Item* item;
    std::uint32_t checksum = 0;
    std::uint64_t size = 0;
    bool is_packed = false;
    bool was_read = false;
    zip_error_t error;
  };
  struct FreeCompressor {
    void operator()(libdeflate_compressor* compressor) const noexcept { libdeflate_free_compressor(compressor); }
  };

  static zip_int64_t serve(void* self, void* data, zip_uint64_t length, zip_source_cmd_t command);
  zip_int64_t serve(Source& source, void* data, zip_uint64_t length, zip_source_cmd_t command);
  void open(Source& source);
  void close() noexcept;
  [[nodiscard]] zip_int64_t read(Source& source, std::span<char> buffer);
  void tell(const Source& source, zip_stat_t& status) const;
  [[nodiscard]] bool fits(const Item& item) const noexcept;

  Collection& collection_;
  Fault& fault_;
  Progress& progress_;
  std::unique_ptr<libdeflate_compressor, FreeCompressor> compressor_;
  std::deque<Source> sources_;

  // Of the file that is currently being read.
  std::unique_ptr<StoredFile> file_;
  std::string bytes_;
  std::string packed_;
  std::uint64_t place_ = 0;
  Text entry_;
};

}  // namespace talutil::archives
