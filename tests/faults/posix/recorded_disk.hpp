#pragma once

#include <sys/types.h>

#include <cstddef>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "tests/faults/machine.hpp"

namespace talutil::testing {

/// A file system as its disk has it: what was flushed is there; of everything else, any part may be.
class RecordedDisk {
 public:
  /// Records from now on what happens below a folder, whose contents count as flushed.
  explicit RecordedDisk(std::string root);
  RecordedDisk(const RecordedDisk&) = delete;
  RecordedDisk& operator=(const RecordedDisk&) = delete;
  ~RecordedDisk();

  void stop();
  [[nodiscard]] std::size_t steps() const noexcept { return steps_.size(); }

  /// What is found after a power cut before a step. Of the changes that were not flushed, the disk has none (0), those
  /// of contents (1), those of names (2), all (3), or some by chance, others for each higher number.
  [[nodiscard]] Contents after_cut(std::size_t step, unsigned kept) const;

  struct Step {
    enum class Kind { create, make_folder, rename, remove, write, truncate, flush_file, flush_folder };
    Kind kind;
    std::string path;
    std::size_t file = 0;
    std::string to = {};     ///< The new path in rename.
    std::size_t offset = 0;  ///< In write; the new length in truncate.
    std::string bytes = {};
  };
  void record(Step step);
  [[nodiscard]] bool covers(std::string_view path) const { return path.starts_with(root_); }

  /// The numbers that steps call files by, since the system gives those of removed files to others.
  [[nodiscard]] std::size_t number_of(ino_t inode);
  void forget(ino_t inode) { numbers_.erase(inode); }

 private:
  [[nodiscard]] bool is_flushed(std::size_t step, std::size_t end) const;

  std::string root_;
  Contents before_;
  std::map<ino_t, std::size_t> numbers_;
  std::map<std::string, std::size_t> named_before_;
  std::size_t next_ = 1;
  std::vector<Step> steps_;
};

}  // namespace talutil::testing
