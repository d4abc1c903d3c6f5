#pragma once

#include <memory>
#include <vector>

#include "archives/directory.hpp"
#include "archives/progress.hpp"

/// Split sets: name.z01, name.z02, ..., name.zip (APPNOTE section 8), and plainly cut archives, name.zip.001, ...
namespace talutil::archives {

constexpr std::uint64_t smallest_volume = 65'536;
constexpr std::uint64_t largest_volume = 2'147'483'647;

/// Fails with bad_volume_size if the size is too small or too large.
void require_volume_size(std::uint64_t bytes);

/// The name of a volume other than the last; numbers start at 1.
[[nodiscard]] Text volume_name(TextView archive, std::uint32_t number);

/// Opens an archive, the last volume of a set, or the first piece (".001") of a cut archive, as one file in which all
/// entries can be found. Fails with missing, cannot_open, bad_media, and as reading the directory does.
[[nodiscard]] std::unique_ptr<StoredFile> open_archive(Folder& folder, const Text& name);

/// Splits an archive into a set, or just names it if it fits into one volume. The volumes are named once all are
/// complete. Headers are never split. Fails with bad_volume_size if a header does not fit into a volume, and with
/// cannot_write or cannot_create if a volume cannot be written or named.
void split_archive(std::unique_ptr<NewFile> archive, Folder& folder, TextView name, std::uint64_t volume_size,
                   Progress& progress);

}  // namespace talutil::archives
