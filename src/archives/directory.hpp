#pragma once

#include <span>
#include <string>
#include <vector>

#include "platform/folders.hpp"

/// The directory at the end of an archive (PKWARE's APPNOTE 6.3.9, sections 4.3.12 to 4.3.16), read for what the
/// container library does not tell: whether entries overlap, where volumes end, what is cut off.
namespace talutil::archives {

struct DirectoryEntry {
  std::string header;  ///< As it stands in the directory: 46 bytes, name, extra fields, comment.
  std::uint64_t packed_size = 0;
  std::uint64_t size = 0;
  std::uint64_t offset = 0;  ///< Of the local header, from the start of the archive or set.
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

/// Signatures.
constexpr std::uint32_t central_signature = 0x02014b50;
constexpr std::uint32_t local_signature = 0x04034b50;
constexpr std::uint32_t descriptor_signature = 0x08074b50;  ///< Marks the first volume of a set too.
constexpr std::uint32_t end_signature = 0x06054b50;
constexpr std::uint32_t zip64_end_signature = 0x06064b50;
constexpr std::uint32_t zip64_locator_signature = 0x07064b50;

/// How many volumes come before the one that the end record stands in; 0 for an archive that is whole. Fails with
/// unexpected_end for an archive that is cut off and bad_structure for what is none.
[[nodiscard]] std::uint32_t volumes_before(StoredFile& last_volume);

/// The directory of an archive, or of a set that is read as one file; `volume_starts` are the places in it where its
/// volumes begin, the first 0. Fails as above, and with bad_media for a set whose end record counts other volumes.
[[nodiscard]] Directory read_directory(StoredFile& archive, std::span<const std::uint64_t> volume_starts);

/// Fails with unexpected_end for an entry that reaches beyond the directory's start, bad_structure for entries that
/// share bytes: small archives that unpack to terabytes are made so.
void require_separate_entries(const Directory& directory);

/// Bytes of a file, all of them. Fails with unexpected_end when it is shorter.
[[nodiscard]] std::string read_exactly(StoredFile& file, std::uint64_t offset, std::uint64_t count);

}  // namespace talutil::archives
