#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string_view>

#include "automation/text.hpp"
#include "platform/files.hpp"

/// Folders as archives need them: kept open, with exact entry names, and links recognised.
namespace talutil {

/// `unnameable` is an entry whose name a Text cannot hold, whatever it is.
enum class FileKind : std::uint8_t { file, folder, link, other, unnameable };

/// Files that are being written have names that begin with this until they are complete.
constexpr TextView temporary_prefix = u".talutil-";

/// What an archive records about a file besides its contents.
struct FileFacts {
  FileKind kind = FileKind::file;  ///< Links to files count as files; links to folders or to nothing, as links.
  std::uint64_t size = 0;
  std::int64_t modified = 0;     ///< Seconds since 1 January 1970, UTC.
  std::uint32_t attributes = 0;  ///< The bits of file_attribute.
  std::uint32_t mode = 0;        ///< Type and permission bits as in POSIX; 0 if the platform has none.
};

/// A file open for reading at any position. Reading raises the same errors as InputFile.
class StoredFile {
 public:
  virtual ~StoredFile() = default;

  /// The size in bytes when the file was opened.
  [[nodiscard]] virtual std::uint64_t size() const noexcept = 0;

  /// Reads until the buffer is full or the file ends; returns 0 at the end.
  [[nodiscard]] virtual std::size_t read_at(std::uint64_t offset, std::span<char> buffer) = 0;
};

/// A file being written, which can be read meanwhile. An existing file of its name stays until `take_name`; without
/// that call, the destructor discards the new file. Raises 61 if the disk is full, 57 for other failures.
class NewFile : public StoredFile {
 public:
  /// The existing file to be replaced, open and locked against other writers; null if there is none.
  [[nodiscard]] virtual StoredFile* replaced() noexcept = 0;

  /// May be called on another thread, but not at the same time as another function of the file.
  virtual void write_at(std::uint64_t offset, std::string_view bytes) = 0;

  /// Ends writing and reading. Sets the file's time, attributes and rights if facts are given.
  virtual void finish(const FileFacts* facts) = 0;

  /// Call after finish. Another name in the same folder may be given instead of the original one. Raises 70 or 75 if
  /// the existing file of that name cannot be replaced.
  virtual void take_name(TextView other_name) = 0;
  void take_name() { take_name({}); }

  /// `take_name` in steps, so that those of many files can be done together, which the disk has less work with:
  /// flushing the contents, taking the original name, and flushing the names of the folder. Until the last one, which
  /// holds for all files of the folder, a power cut may undo the one before. Flushing may begin early, on any thread,
  /// like writing.
  virtual void begin_flush() noexcept = 0;
  virtual void flush_contents() = 0;
  virtual void take_name_unflushed() = 0;
  virtual void flush_names() noexcept = 0;
};

/// An open folder. Names are exact and refer to direct entries of this folder only. Opening raises the same errors as
/// Files.
class Folder {
 public:
  virtual ~Folder() = default;

  /// The full path; only a root ends in a separator.
  [[nodiscard]] virtual Text path() const = 0;

  /// Lists every entry except the folder itself and its parent, in the system's order. A name that a Text cannot hold
  /// is listed as nearly as possible.
  virtual void list(const std::function<void(TextView name, const FileFacts& facts)>& found) = 0;

  [[nodiscard]] virtual std::optional<FileFacts> facts(TextView name) = 0;
  [[nodiscard]] virtual std::unique_ptr<StoredFile> open(TextView name) = 0;

  /// Raises 75 if the name belongs to a read-only file or a folder, 70 if another process has locked the file.
  [[nodiscard]] virtual std::unique_ptr<NewFile> create(TextView name) = 0;

  /// Opens a subfolder; creates it if it is missing and `make_missing` is set. Raises 75 for a link.
  [[nodiscard]] virtual std::unique_ptr<Folder> folder(TextView name, bool make_missing) = 0;

  /// Sets the time, attributes and rights of an entry as far as the platform allows.
  virtual void set_facts(TextView name, const FileFacts& facts) = 0;

  virtual void remove(TextView name) = 0;
};

class Folders {
 public:
  virtual ~Folders() = default;

  /// Opens the folder of a path as Files interprets it; an empty path is the current folder. Raises 76 if it is
  /// missing.
  [[nodiscard]] virtual std::unique_ptr<Folder> open(const Text& path) = 0;

  /// Whether names that differ only in case are one name.
  [[nodiscard]] virtual bool ignores_case() const noexcept = 0;
};

}  // namespace talutil
