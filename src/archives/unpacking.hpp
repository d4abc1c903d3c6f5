#pragma once

#include <functional>
#include <optional>

#include "archives/progress.hpp"
#include "platform/folders.hpp"
#include "platform/tasks.hpp"

namespace talutil::archives {

/// Asks for the password of an entry, either for the first time or because the last one was wrong. Returns nothing if
/// the user cancelled.
using PasswordQuestion = std::function<std::optional<Text>(const Text& entry, bool was_wrong)>;

/// What became of an entry that was not unpacked.
enum class Fate : std::uint8_t { kept, left_out };

/// Called for each entry that is not unpacked: because a file of its name is kept, or for the given reason.
using UnpackingNotice = std::function<void(const Text& entry, Fate fate, std::string_view reason)>;

struct UnpackingOptions {
  Text items{};  ///< Selects entries; see EntryFilter.
  Text password{};
  bool overwrite = false;    ///< False keeps existing files.
  bool keep_folders = true;  ///< False removes the folders from the names of entries.
  bool own_names = false;    ///< Keeps names that only Windows does not allow; see entry_names.hpp.
  /// Limits on the unpacked size: a total in bytes (0 for no limit) and, above one gibibyte, a multiple of the
  /// archive's own size. Deflate cannot exceed the usual multiple, so that only claims that are not true do.
  std::uint64_t largest_total = 0;
  std::uint32_t largest_ratio = 1100;
  UnpackingNotice notice{};
  Tasks* tasks = nullptr;  ///< Unpacks files; null for one after another, on this thread.
};

/// An archive, or a split set (given by its last volume), open for reading. Throws Error.
class Archive {
 public:
  Archive(const Text& path, Folders& folders);
  explicit Archive(std::unique_ptr<StoredFile> file);
  Archive(const Archive&) = delete;
  Archive& operator=(const Archive&) = delete;
  ~Archive();

  struct Entry {
    Text name;  ///< As stored in the archive: "/" between the parts and at the end of a folder's name.
    FileFacts facts;
    std::uint64_t packed_size = 0;
    bool is_encrypted = false;
  };

  [[nodiscard]] std::uint64_t count() const;
  [[nodiscard]] Entry entry(std::uint64_t index) const;
  [[nodiscard]] Text comment() const;

  /// Unpacks the selected entries into a folder, which is created if it is missing. A file gets its name only once its
  /// checksum has proved right. Goes on after entries that cannot be unpacked: refused names (see entry_names.hpp),
  /// links, unsupported methods, damage, files that cannot be replaced; the outcome is then `incomplete`, or the code
  /// of the first that has one of its own.
  void extract(const Text& destination, const UnpackingOptions& options, Folders& folders, Files& files,
               const PasswordQuestion& ask, Progress& progress);

  /// Reads and checks the selected entries, and every entry's headers, without writing anything. Damage is reported as
  /// bad_test.
  void test(const UnpackingOptions& options, const PasswordQuestion& ask, Progress& progress);

 private:
  class Reader;
  class Extraction;
  std::unique_ptr<Reader> reader_;
};

}  // namespace talutil::archives
