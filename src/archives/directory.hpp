#pragma once

#include <memory>
#include <span>
#include <string>
#include <vector>

#include "platform/folders.hpp"

/// The directory at the end of an archive (PKWARE's APPNOTE 6.3.9, sections 4.3.12 to 4.3.16), read for what the
/// container library does not report: whether entries overlap, where volumes end, whether something is cut off.
namespace talutil::archives {

struct DirectoryEntry {
  std::string header;  ///< As stored in the directory: 46 bytes, name, extra fields, comment.
  std::uint64_t packed_size = 0;
  std::uint64_t size = 0;
  std::uint64_t offset = 0;  ///< Position of the local header, from the start of the archive or set.
  bool has_descriptor = false;

  [[nodiscard]] std::size_t name_length() const;
  [[nodiscard]] std::size_t extra_length() const;
};

struct Directory {
  std::vector<DirectoryEntry> entries;
  std::string comment;
  std::uint64_t start = 0;
  bool is_zip64 = false;
};

constexpr std::size_t central_header_size = 46;
constexpr std::size_t local_header_size = 30;
constexpr std::uint16_t zip64_extra = 1;

constexpr std::uint32_t central_signature = 0x02014b50;
constexpr std::uint32_t local_signature = 0x04034b50;
constexpr std::uint32_t descriptor_signature = 0x08074b50;  ///< Also marks the first volume of a set.
constexpr std::uint32_t end_signature = 0x06054b50;
constexpr std::uint32_t zip64_end_signature = 0x06064b50;
constexpr std::uint32_t zip64_locator_signature = 0x07064b50;

/// The number of volumes before the one with the end record; 0 for an archive in one piece. Fails with unexpected_end
/// for an archive that is cut off, and with bad_structure for anything that is not an archive.
[[nodiscard]] std::uint32_t volumes_before(StoredFile& last_volume);

/// The directory of an archive, or of a set that is read as one file. `volume_starts` are the positions at which its
/// volumes begin, the first being 0. Fails as above, and with bad_media if the end record gives another number of
/// volumes.
[[nodiscard]] Directory read_directory(StoredFile& archive, std::span<const std::uint64_t> volume_starts);

/// Fails with unexpected_end if an entry reaches beyond the start of the directory, and with bad_structure if entries
/// share bytes, which is how small archives that unpack to terabytes are made.
void require_separate_entries(const Directory& directory);

/// Fails with bad_structure if the local header of an entry contradicts the directory: in name, method or sizes.
void require_matching_headers(StoredFile& archive, const Directory& directory);

/// How many bytes stand before an archive whose positions do not count them, as before a program that unpacks itself.
[[nodiscard]] std::uint64_t prefix_length(StoredFile& archive);

/// The archive without such bytes.
[[nodiscard]] std::unique_ptr<StoredFile> without_prefix(std::unique_ptr<StoredFile> archive);

/// The archive as the container library accepts it. Where one entry has extra fields that do not fit into their place,
/// or a name that is said to be UTF-8 and is not, the library would refuse all others as well: such fields are given
/// the length of the rest, stray bytes after them are zero, and such names count as code page 437. An archive in
/// pieces, or one whose directory cannot be read, is returned as it is.
[[nodiscard]] std::unique_ptr<StoredFile> with_readable_headers(std::unique_ptr<StoredFile> archive);

/// Reads exactly `count` bytes. Fails with unexpected_end if the file is shorter.
[[nodiscard]] std::string read_exactly(StoredFile& file, std::uint64_t offset, std::uint64_t count);

}  // namespace talutil::archives
