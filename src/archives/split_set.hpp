#pragma once

#include <memory>
#include <vector>

#include "archives/directory.hpp"
#include "archives/progress.hpp"

/// Split sets: name.z01, name.z02, ..., name.zip (APPNOTE section 8), and plainly cut archives, name.zip.001, ...
namespace talutil::archives {

constexpr std::uint64_t smallest_volume = 65'536;
constexpr std::uint64_t largest_volume = 2'147'483'647;

/// Fails with bad_volume_size for one that is too small or too large.
void require_volume_size(std::uint64_t bytes);

/// The name of a volume before the last, counted from 1.
[[nodiscard]] Text volume_name(TextView archive, std::uint32_t number);

/// Opens an archive, which may be the last volume of a set or the first piece (".001") of a cut one, as one file in
/// which the entries have their places. Fails with missing, cannot_open, bad_media and as the directory does.
[[nodiscard]] std::unique_ptr<StoredFile> open_archive(Folder& folder, const Text& name);

/// Cuts an archive into a set, unless it fits into one volume: then it takes its name as it is. The volumes take their
/// names when all are complete. Headers are never cut. Fails with bad_volume_size for a header that fits into no
/// volume, and with cannot_write or cannot_create for the volumes.
void split_archive(std::unique_ptr<NewFile> archive, Folder& folder, TextView name, std::uint64_t volume_size,
                   Progress& progress);

}  // namespace talutil::archives
