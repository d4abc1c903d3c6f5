#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <span>

#include "automation/text.hpp"

namespace talutil {

/// The attributes of a file that hosts use, as bits.
namespace file_attribute {
constexpr std::uint32_t read_only = 1;
constexpr std::uint32_t hidden = 2;
constexpr std::uint32_t system = 4;
constexpr std::uint32_t folder = 16;
}  // namespace file_attribute

/// A file open for reading; the destructor closes it.
class InputFile {
 public:
  virtual ~InputFile() = default;

  /// The size in bytes when the file was opened.
  [[nodiscard]] virtual std::uint64_t size() const noexcept = 0;

  /// Reads until the buffer is full or the file ends; returns 0 at the end. Raises 57, or 70 for a part that is locked.
  [[nodiscard]] virtual std::size_t read(std::span<char> buffer) = 0;
};

/// A file being written. `close` gives it its name; until then, an existing file of that name stays.
class OutputFile {
 public:
  virtual ~OutputFile() = default;

  /// Raises 61 if the disk is full, 57 for other failures.
  virtual void write(std::string_view bytes) = 0;

  /// Puts the file in place. Raises the same errors as `write`, and 70 or 75 if an existing file cannot be replaced.
  virtual void close() = 0;
};

/// Files and folders by Windows paths: "X:" before a drive's path, "\" (or "/") between the parts, case ignored in
/// names.
///
/// Opening raises 52 for an invalid file name (see file_names.hpp), 53 for a missing file, 76 for a missing folder or
/// drive, 70 for a file that another process has locked, 75 if access is denied (read-only file, folder, no rights), 67
/// if the process has too many open files.
class Files {
 public:
  virtual ~Files() = default;

  /// Passes each name that matches the pattern in its last part to `found`, in the system's order, until that returns
  /// false. Skips files that have an attribute (hidden, system, folder) missing from the mask. A missing file, folder
  /// or drive yields no names; an invalid pattern raises 52.
  virtual void search(const Text& pattern, std::uint32_t mask, const std::function<bool(TextView name)>& found) = 0;

  /// The bits of file_attribute. Raises 53 or 76 if the path does not exist.
  [[nodiscard]] virtual std::uint32_t attributes(const Text& path) = 0;

  /// Creates every folder of a path up to its last separator. Returns whether they all exist afterwards.
  virtual bool make_path(const Text& path) = 0;

  /// The current folder of a drive ("C"), or of the process if `drive` is empty; empty if the drive is missing.
  [[nodiscard]] virtual Text current_folder(TextView drive) = 0;

  /// Deletes the files that match, with wildcards in the last part only, and never anything outside the folder before
  /// it. Folders stay. A read-only file stops the deletion with 70; no match raises 53, a missing folder 76.
  virtual void delete_files(const Text& pattern) = 0;

  [[nodiscard]] virtual std::unique_ptr<InputFile> open_input(const Text& path) = 0;
  [[nodiscard]] virtual std::unique_ptr<OutputFile> open_output(const Text& path) = 0;

  /// Appends bytes to a file in one piece, even if other processes append to it too; creates the file if it is missing.
  /// Raises the same errors as opening and writing; nothing was appended then.
  virtual void append(const Text& path, std::string_view bytes) = 0;
};

}  // namespace talutil
