#pragma once

#include <optional>

#include "archives/progress.hpp"
#include "platform/folders.hpp"
#include "platform/tasks.hpp"

namespace talutil::archives {

struct PackingOptions {
  bool recurse = true;                         ///< Packs folders with their trees; false packs only files.
  bool keep_folders = true;                    ///< False removes the folders from the names of entries.
  bool aes = false;                            ///< With a password: AES-256, not the traditional encryption.
  std::int32_t level = 6;                      ///< 0 stores, 1 is fastest, 9 smallest.
  Text password{};                             ///< Empty for none. Its UTF-8 bytes are what other programs need.
  Text comment{};                              ///< The archive's comment, as UTF-8.
  bool needs_every_item = false;               ///< Packs nothing if an item matches nothing.
  std::optional<std::uint64_t> volume_size{};  ///< Makes a split set.
  Tasks* tasks = nullptr;                      ///< Compresses files; null for one after another, on this thread.
};

/// Packs the items of a list into an archive, creating it or adding to it: entries of the same name (ignoring case) are
/// replaced, others kept. The old archive stays as it is until the new one is complete.
///
/// Throws Error; Code lists the causes. Files whose names no archive could restore are left out; the outcome is then
/// `incomplete`.
void pack(const Text& archive, TextView items, const PackingOptions& options, Folders& folders, Progress& progress);

}  // namespace talutil::archives
