#pragma once

#include <sys/types.h>

#include <string>

#include "platform/posix/descriptor.hpp"

namespace talutil::posix {

/// A new version of a file. It is written to a temporary file beside the old one and gets its name when it is complete
/// and flushed, so that after a fault, a kill or a power cut the name refers to the old or the new contents as a whole.
///
/// The temporary file's name depends only on the target's, and its lock is what several writers of one target take
/// turns by. A file that a killed process has left is therefore reused by the next writer.
class Replacement {
 public:
  /// Locks the target against other writers and creates the temporary file. Raises the same errors as Files; waits at
  /// most as long as `lock`.
  /// @param access O_WRONLY, or O_RDWR if the target is to be read as well; a link is not followed
  Replacement(Descriptor folder, std::string name, int access);
  Replacement(const Replacement&) = delete;
  Replacement& operator=(const Replacement&) = delete;
  ~Replacement();

  /// The new version, open for reading and writing.
  [[nodiscard]] const Descriptor& file() const noexcept { return file_; }

  /// The old version, locked; none if the target does not exist.
  [[nodiscard]] const Descriptor& target() const noexcept { return target_; }

  /// Sets the rights, the owner and the stored attributes of the old version, or the default rights.
  void keep_rights() const;

  /// Flushes the new version and gives it a name in the folder, the target's unless another is given. If the folder
  /// does not allow that, overwrites the target in place; if that fails too, the error names the file that has the new
  /// contents.
  void take_name(const std::string& name);
  void take_name() { take_name(name_); }

  /// Begins to write the new version to the disk, without waiting for it.
  void begin_flush() const noexcept;

  /// The three steps of take_name; see NewFile.
  void flush_contents() const;
  void take_name_unflushed() { rename(name_); }
  void flush_names() const noexcept;

  /// Removes the temporary file unless it has got its name.
  void discard() noexcept;

 private:
  [[nodiscard]] int open_temporary();
  void rename(const std::string& name);
  void open_target(int access);
  void overwrite_target();
  void copy_to_target() const;

  Descriptor folder_;
  std::string name_;
  std::string temporary_;      ///< Empty once it has got its name.
  bool is_elsewhere_ = false;  ///< Whether the temporary file is in another folder; its name is a full path then.
  bool is_renamed_ = false;
  Descriptor file_;
  Descriptor target_;
};

}  // namespace talutil::posix
