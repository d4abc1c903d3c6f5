#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <span>

#include "automation/text.hpp"

namespace talutil {

/// The attributes of a file that hosts know, as bits.
namespace file_attribute {
constexpr std::uint32_t read_only = 1;
constexpr std::uint32_t hidden = 2;
constexpr std::uint32_t system = 4;
constexpr std::uint32_t folder = 16;
}  // namespace file_attribute

/// A file open for reading, closed with the object.
class InputFile {
 public:
  virtual ~InputFile() = default;

  /// Bytes of the file when it was opened.
  [[nodiscard]] virtual std::uint64_t size() const noexcept = 0;

  /// Fills the buffer as far as the file goes; 0 at its end. Raises 57, or 70 for a part that another has locked.
  [[nodiscard]] virtual std::size_t read(std::span<char> buffer) = 0;
};

/// A file in the making. It takes its name with `close`; without that, whatever had the name stays.
class OutputFile {
 public:
  virtual ~OutputFile() = default;

  /// Raises 61 when the disk is full, 57 for other failures.
  virtual void write(std::string_view bytes) = 0;

  /// Puts the file in place. Raises as `write` does, and 70 or 75 when what had the name cannot be replaced.
  virtual void close() = 0;
};

/// Files and folders by Windows paths: "X:" before a drive's path, "\" (or "/") between the parts, names without
/// regard to case.
///
/// Opening raises 52 for a name that no file can have (see file_names.hpp), 53 for a missing file, 76 for a missing
/// folder or drive, 70 for a file that another process has locked, 75 for what may not be opened (read-only, a
/// folder, no rights), 67 when the process has too many open files.
class Files {
 public:
  virtual ~Files() = default;

  /// Gives each name that matches a pattern in its last part, in the order of the system, until `found` answers
  /// false. Files with an attribute that the mask lacks (hidden, system, folder) are passed over. A missing file,
  /// folder or drive is a search without names; a pattern that cannot be searched for raises 52.
  virtual void search(const Text& pattern, std::uint32_t mask, const std::function<bool(TextView name)>& found) = 0;

  /// The bits of file_attribute. Raises 53 or 76 for what does not exist.
  [[nodiscard]] virtual std::uint32_t attributes(const Text& path) = 0;

  /// Makes every folder of a path up to its last separator. Answers whether they all exist afterwards.
  virtual bool make_path(const Text& path) = 0;

  /// The current folder of a drive ("C"), or of the process for an empty one; empty for a missing drive.
  [[nodiscard]] virtual Text current_folder(TextView drive) = 0;

  /// Deletes the files that match, wildcards in the last part only, and nothing outside the folder before it.
  /// Folders stay; a read-only file ends it with 70, no match with 53, a missing folder with 76.
  virtual void delete_files(const Text& pattern) = 0;

  [[nodiscard]] virtual std::unique_ptr<InputFile> open_input(const Text& path) = 0;
  [[nodiscard]] virtual std::unique_ptr<OutputFile> open_output(const Text& path) = 0;

  /// Adds bytes to the end of a file in one piece, whatever other processes add to it; the file is created when
  /// missing. Raises what opening and writing raise, after which nothing was added.
  virtual void append(const Text& path, std::string_view bytes) = 0;
};

}  // namespace talutil
