#pragma once

#include <functional>
#include <optional>

#include "archives/progress.hpp"
#include "platform/folders.hpp"

namespace talutil::archives {

/// Asks for the password of an entry: the first time, or after one that was wrong. Nothing means the user gave up.
using PasswordQuestion = std::function<std::optional<Text>(const Text& entry, bool was_wrong)>;

struct UnpackingOptions {
  Text items{};  ///< Which entries; see EntryFilter.
  Text password{};
  bool overwrite = false;    ///< False keeps the files that are there.
  bool keep_folders = true;  ///< False drops the folders from the names of entries.
  /// What an archive may unpack to: so many bytes in all (0: no limit), and, once it is more than a gibibyte, so many
  /// times its own size.
  std::uint64_t largest_total = 0;
  std::uint32_t largest_ratio = 200;
};

/// An archive, or a split set by its last volume, open for reading. Throws Error.
class Archive {
 public:
  Archive(const Text& path, Folders& folders);
  explicit Archive(std::unique_ptr<StoredFile> file);
  Archive(const Archive&) = delete;
  Archive& operator=(const Archive&) = delete;
  ~Archive();

  struct Entry {
    Text name;  ///< As it stands in the archive, "/" between the parts, at the end for a folder.
    FileFacts facts;
    std::uint64_t packed_size = 0;
    bool is_encrypted = false;
  };

  [[nodiscard]] std::uint64_t count() const;
  [[nodiscard]] Entry entry(std::uint64_t index) const;
  [[nodiscard]] Text comment() const;

  /// Writes the entries asked for below a folder, which is made if it is missing. A file takes its name when its
  /// checksum is right. Entries whose names are refused (see entry_names.hpp), links, entries of a name that was
  /// written already but for its case, and methods we do not read are passed over; the end is then `incomplete`.
  void extract(const Text& destination, const UnpackingOptions& options, Folders& folders, Files& files,
               const PasswordQuestion& ask, Progress& progress);

  /// Reads the entries asked for and checks them; writes nothing. Damage is bad_test.
  void test(const UnpackingOptions& options, const PasswordQuestion& ask, Progress& progress);

 private:
  class Reader;
  std::unique_ptr<Reader> reader_;
};

}  // namespace talutil::archives
