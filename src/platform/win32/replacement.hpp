#pragma once

#include "platform/win32/handle.hpp"

namespace talutil::win32 {

/// A new version of a file. It is written to a hidden temporary file beside the old one and gets its name when it is
/// complete and flushed.
///
/// Virus scanners, indexers and synchronisation programs open new files for a moment, and some shares allow changing a
/// file but not its permissions. Taking the name is therefore tried for about a second, then the old file is
/// overwritten in place. If even that fails, nothing is deleted that could be the only copy.
class Replacement {
 public:
  /// What the new version keeps of the old one.
  enum class Keep : std::uint8_t { nothing, attributes_and_rights };

  /// Creates the temporary file. Raises the errors of opening.
  /// @param folder in the extended form, with a trailing separator
  explicit Replacement(Text folder);
  Replacement(const Replacement&) = delete;
  Replacement& operator=(const Replacement&) = delete;
  ~Replacement();

  /// The new version, open for reading and writing until it takes its name.
  [[nodiscard]] const Owned<kind::File>& file() const noexcept { return file_; }

  /// Flushes and closes the new version and names it.
  /// @param attributes the file's from then on, unless it keeps those of the old one
  /// @param replaces whether there is an old file of that name; if not, one that has appeared meanwhile raises 70
  void take_name(const Text& name, DWORD attributes, bool replaces, Keep keep);

 private:
  void remove_stale() const;
  void keep_properties(const Text& target) const;
  void overwrite(const Text& target);

  Text folder_;
  Text temporary_;  ///< Empty once it has got its name.
  Owned<kind::File> file_;
};

/// A short name for a longer one, which differs for others in all likelihood.
[[nodiscard]] Text short_name_of(TextView name);

/// Writes all bytes at the file's position. Raises 61 or 57.
void write_all(const Owned<kind::File>& file, std::string_view bytes);

/// Whether another program has a file open in a way that excludes this one.
[[nodiscard]] bool is_in_use(DWORD code) noexcept;

/// Whether a failure may be over in a moment, because another program has a file open. A right that is denied may be
/// one of these: it is reported, too, for a file that is about to be deleted.
[[nodiscard]] bool is_passing(DWORD code) noexcept;

/// Repeats an attempt for about a second while its failure may be over in a moment. Returns the last error code, 0 for
/// success.
template <class Attempt>
[[nodiscard]] DWORD retried(Attempt attempt, bool (*may_pass)(DWORD) noexcept = &is_passing) {
  constexpr DWORD pause = 50;  // Milliseconds.
  constexpr int most_attempts = 20;
  for (int attempts = 1;; ++attempts) {
    if (attempt() != FALSE) return 0;
    const DWORD code = GetLastError();
    if (!may_pass(code) || attempts == most_attempts) return code;
    Sleep(pause);
  }
}

}  // namespace talutil::win32
