#pragma once

#include <libdeflate.h>

#include <atomic>
#include <deque>
#include <mutex>

#include "archives/collection.hpp"
#include "archives/container.hpp"
#include "platform/tasks.hpp"

namespace talutil::archives {

/// Compressors of one level that are not in use. Each has megabytes of tables, so there are no more than tasks that run
/// at the same time.
class Compressors {
 public:
  explicit Compressors(std::int32_t level) noexcept : level_(level) {}

  /// Deflates bytes as a whole; returns the length, 0 if the output has no room for it.
  [[nodiscard]] std::size_t deflate(std::string_view bytes, std::span<char> output);

 private:
  struct Free {
    void operator()(libdeflate_compressor* compressor) const noexcept { libdeflate_free_compressor(compressor); }
  };
  using Compressor = std::unique_ptr<libdeflate_compressor, Free>;

  [[nodiscard]] Compressor take();

  std::int32_t level_;
  std::mutex mutex_;
  std::vector<Compressor> free_;
};

/// The files of a collection as sources for the container library, which reads them one at a time, in the order in
/// which they were added. Files up to `longest_in_memory` are read and compressed in one piece by tasks, some of them
/// ahead of the one that is being written; longer ones are passed on as they are, and the library compresses them as it
/// reads. Must outlive the container.
class PackedFiles {
 public:
  PackedFiles(Collection& collection, std::int32_t level, Tasks& tasks, Fault& fault, Progress& progress);
  PackedFiles(const PackedFiles&) = delete;
  PackedFiles& operator=(const PackedFiles&) = delete;
  ~PackedFiles();

  /// A source for an item; null if the library is out of memory.
  [[nodiscard]] zip_source_t* source_of(const Item& item, zip_t* archive);

  /// The nearest time that the directory of an archive can hold: it counts the years 1980 to 2107.
  [[nodiscard]] static time_t storable_time(std::int64_t modified) noexcept;

  /// A file of this size and its compressed form are in memory at the same time.
  static constexpr std::uint64_t longest_in_memory = 16U << 20U;

 private:
  /// A file that is read and compressed as a whole.
  struct Whole {
    std::unique_ptr<StoredFile> file;
    std::string bytes;
    std::string packed;  ///< What goes into the archive.
    std::uint64_t size = 0;
    std::uint32_t checksum = 0;
    bool is_packed = false;
    std::unique_ptr<StartedTask> task{};
  };
  struct Source {
    PackedFiles* files;
    const Item* item;
    std::size_t number;
    std::unique_ptr<Whole> whole{};  ///< From when it is begun until it is written.
    std::uint32_t checksum = 0;
    std::uint64_t size = 0;
    bool is_packed = false;
    bool was_read = false;
    zip_error_t error{};
  };

  static zip_int64_t serve(void* self, void* data, zip_uint64_t length, zip_source_cmd_t command);
  zip_int64_t serve(Source& source, void* data, zip_uint64_t length, zip_source_cmd_t command);
  void open(Source& source);
  void close(Source& source) noexcept;
  void begin(Source& source);
  void begin_next();
  void pack(Whole& whole, std::uint64_t size);
  [[nodiscard]] zip_int64_t read(Source& source, std::span<char> buffer);
  void tell(const Source& source, zip_stat_t& status) const;
  [[nodiscard]] bool fits(const Item& item) const noexcept;

  Collection& collection_;
  bool compresses_;
  Compressors compressors_;
  Tasks& tasks_;
  Fault& fault_;
  Progress& progress_;
  std::deque<Source> sources_;

  // Of the files that are begun and not yet written.
  std::size_t next_ = 0;  ///< The first source after them.
  std::size_t begun_ = 0;
  std::uint64_t begun_bytes_ = 0;
  std::atomic<bool> is_over_ = false;  ///< Tasks that have not run need not.

  // Of the file that is currently being read.
  std::unique_ptr<StoredFile> file_;
  std::uint64_t place_ = 0;
  Text entry_;
};

}  // namespace talutil::archives
