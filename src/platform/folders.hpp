#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string_view>

#include "automation/text.hpp"
#include "platform/files.hpp"

/// Folders as archives need them: held open, their entries used by exact name, links recognised.
namespace talutil {

enum class FileKind : std::uint8_t { file, folder, link, other };

/// What an archive keeps of a file beside its bytes.
struct FileFacts {
  FileKind kind = FileKind::file;  ///< A link to a file is that file; one to a folder, or to nothing, is a link.
  std::uint64_t size = 0;
  std::int64_t modified = 0;     ///< Seconds since 1 January 1970, UTC.
  std::uint32_t attributes = 0;  ///< The bits of file_attribute.
  std::uint32_t mode = 0;        ///< Kind and rights as POSIX counts them; 0 where the platform has none.
};

/// A file open for reading at any place. Reading raises as InputFile does.
class StoredFile {
 public:
  virtual ~StoredFile() = default;

  /// Bytes of the file when it was opened.
  [[nodiscard]] virtual std::uint64_t size() const noexcept = 0;

  /// Fills the buffer as far as the file goes; 0 at its end.
  [[nodiscard]] virtual std::size_t read_at(std::uint64_t offset, std::span<char> buffer) = 0;
};

/// A file in the making, readable meanwhile. Until it takes its name, whatever had the name stays; without that the
/// new one is gone with the object. Raises 61 when the disk is full, 57 for other failures.
class NewFile : public StoredFile {
 public:
  /// The file whose name is to be taken, open and kept from other writers; null where there is none.
  [[nodiscard]] virtual StoredFile* replaced() noexcept = 0;

  virtual void write_at(std::uint64_t offset, std::string_view bytes) = 0;

  /// Ends writing and reading, and gives the file time, attributes and rights where facts are given.
  virtual void finish(const FileFacts* facts) = 0;

  /// After finish; another name of the same folder may be given in the place of the first. Raises 70 or 75 when what
  /// has the name cannot be replaced.
  virtual void take_name(TextView other_name) = 0;
  void take_name() { take_name({}); }
};

/// An open folder. Names are exact and name entries of this folder alone. Opening raises as Files does.
class Folder {
 public:
  virtual ~Folder() = default;

  /// The full path, without a separator at its end but for a root.
  [[nodiscard]] virtual Text path() const = 0;

  /// Every entry but the folder itself and the one above, in the order of the system.
  virtual void list(const std::function<void(TextView name, const FileFacts& facts)>& found) = 0;

  [[nodiscard]] virtual std::optional<FileFacts> facts(TextView name) = 0;
  [[nodiscard]] virtual std::unique_ptr<StoredFile> open(TextView name) = 0;

  /// Raises 75 for a name that a read-only file or a folder has, 70 for one that another process has locked.
  [[nodiscard]] virtual std::unique_ptr<NewFile> create(TextView name) = 0;

  /// A folder in this one; made first where it is missing and is to be. Raises 75 for a link.
  [[nodiscard]] virtual std::unique_ptr<Folder> folder(TextView name, bool make_missing) = 0;

  /// Gives an entry its time, attributes and rights, as far as the platform lets it.
  virtual void set_facts(TextView name, const FileFacts& facts) = 0;

  virtual void remove(TextView name) = 0;
};

class Folders {
 public:
  virtual ~Folders() = default;

  /// The folder of a path as Files understands it; an empty one is the current folder. Raises 76 when it is missing.
  [[nodiscard]] virtual std::unique_ptr<Folder> open(const Text& path) = 0;
};

}  // namespace talutil
