#pragma once

#include <libdeflate.h>

#include <atomic>
#include <deque>
#include <mutex>
#include <optional>
#include <vector>

#include "archives/archive_error.hpp"
#include "archives/progress.hpp"
#include "platform/folders.hpp"
#include "platform/tasks.hpp"

namespace talutil::archives {

/// The bytes of an entry as the archive has them.
struct Deflated {
  std::string bytes{};
  std::uint64_t size = 0;  ///< When inflated.
  std::optional<std::uint32_t> checksum{};
};

/// Inflates entries as a whole, on several threads at the same time.
class Inflaters {
 public:
  /// Passes the inflated bytes to a sink. Throws bad_structure if they are not the ones that were packed.
  void inflate(const Deflated& entry, const std::function<void(std::string_view bytes)>& sink);

 private:
  struct Free {
    void operator()(libdeflate_decompressor* decompressor) const noexcept {
      libdeflate_free_decompressor(decompressor);
    }
  };
  struct Inflater {
    std::unique_ptr<libdeflate_decompressor, Free> decompressor;
    std::vector<char> bytes;
  };

  [[nodiscard]] std::unique_ptr<Inflater> take();

  std::mutex mutex_;
  std::vector<std::unique_ptr<Inflater>> free_;
};

/// Files that are being unpacked. They are inflated and written by tasks, but get their names in the order in which
/// they were added, several together. Each is there in full or not at all.
class UnpackedFiles {
 public:
  struct File {
    Text entry;  ///< The entry's name.
    FileFacts facts;
    Text folder;  ///< Which folder the file is in.
    std::unique_ptr<NewFile> file{};
  };
  /// Is called for an entry that has failed, if that leaves hope for those after it.
  using PassOver = std::function<void(const Text& entry, const Error& error)>;

  UnpackedFiles(Tasks& tasks, Progress& progress, PassOver pass_over);
  UnpackedFiles(const UnpackedFiles&) = delete;
  UnpackedFiles& operator=(const UnpackedFiles&) = delete;
  ~UnpackedFiles();

  /// Adds a file with what is to be written to it. Fails for any of those before it for which there is no hope.
  void add(File file, Deflated entry);

  /// Adds a file that has been written.
  void add(File file);

  /// Gives all of them their names, or fails for the first for which there is no hope: those before it are named, and
  /// those after it are not.
  void settle() { settle(pending_.size()); }

 private:
  struct Pending {
    File file;
    Deflated entry{};
    std::uint64_t in_memory = 0;
    bool is_written = false;  ///< Not by a task.
    std::unique_ptr<StartedTask> task{};
  };

  void begin(std::unique_ptr<Pending> pending);
  void settle(std::size_t count);
  void write(Pending& pending);
  void take_names(std::vector<File>& files);
  template <class Work>
  bool done_for(const Text& entry, Work&& work);

  Tasks& tasks_;
  Progress& progress_;
  PassOver pass_over_;
  Inflaters inflaters_;
  std::deque<std::unique_ptr<Pending>> pending_;
  std::uint64_t in_memory_ = 0;
  std::atomic<bool> is_over_ = false;  ///< After a failure; tasks that have not run need not.
};

}  // namespace talutil::archives
