#pragma once

#include <optional>

#include "archives/progress.hpp"
#include "platform/folders.hpp"

namespace talutil::archives {

struct PackingOptions {
  bool recurse = true;                         ///< Folders are packed with their trees; false packs files alone.
  bool keep_folders = true;                    ///< False drops the folders from the names of entries.
  bool aes = false;                            ///< With a password: AES-256 in the place of the traditional encryption.
  std::int32_t level = 6;                      ///< 0 stores, 1 is fast, 9 small.
  Text password{};                             ///< Empty for none. Programs are given its UTF-8 bytes.
  Text comment{};                              ///< Of the archive; UTF-8.
  std::optional<std::uint64_t> volume_size{};  ///< Makes a split set.
};

/// Packs the items of a list into an archive, which is made or added to: entries of the same name (without regard to
/// case) are replaced, others kept. Until the new archive is complete the old one stays as it is.
///
/// Throws Error; see Code for what leads to which.
void pack(const Text& archive, TextView items, const PackingOptions& options, Folders& folders, Progress& progress);

}  // namespace talutil::archives
