#include "archives/archive_reader.hpp"

#include <array>

#include "archives/directory.hpp"
#include "archives/little_endian.hpp"
#include "archives/split_set.hpp"
#include "platform/file_names.hpp"

namespace talutil::archives {

namespace {

constexpr std::uint32_t posix_kind = 0170000;
constexpr std::uint32_t posix_link = 0120000;
constexpr std::uint32_t posix_writable = 0222;
constexpr std::size_t piece_size = 1U << 16U;

void require_known_methods(const zip_stat_t& status) {
  // Check this first: the container library leaks memory over an encryption that it does not know.
  if (zip_encryption_method_supported(status.encryption_method, 0) == 0 ||
      zip_compression_method_supported(status.comp_method, 0) == 0) {
    throw Error(Code::incomplete, "its method of compression or encryption is not supported");
  }
}

bool fits(const zip_stat_t& status) noexcept {
  return status.size <= PackedFiles::longest_in_memory && status.comp_size <= PackedFiles::longest_in_memory &&
         status.comp_method == ZIP_CM_DEFLATE && status.size > 0;
}

}  // namespace

Archive::Reader::Reader(std::unique_ptr<StoredFile> file)
    : file_(with_readable_headers(without_prefix(std::move(file)))), container_(checked(*file_), fault_) {}

Archive::Entry Archive::Reader::entry(std::uint64_t index) const {
  const zip_stat_t status = status_of(index);
  Entry entry;
  const char* const name = zip_get_name(get(), index, 0);
  if (name != nullptr) entry.name = from_utf8(name);
  // The container library ends names at a NUL.
  if (name_has_nul_[static_cast<std::size_t>(index)]) entry.name += u'\0';
  entry.packed_size = status.comp_size;
  entry.is_encrypted = status.encryption_method != ZIP_EM_NONE;
  entry.facts.size = status.size;
  entry.facts.modified = modified(index, status);
  set_kind(index, entry);
  return entry;
}

void Archive::Reader::require_matching_headers() {
  constexpr std::array<std::uint64_t, 1> whole{0};
  archives::require_matching_headers(*file_, read_directory(*file_, whole));
}

void Archive::Reader::unpack(std::uint64_t index, const std::string& password, const Sink& sink) {
  const zip_stat_t status = status_of(index);
  require_known_methods(status);
  const bool in_memory = fits(status);
  const Opened file = open(index, in_memory ? ZIP_FL_COMPRESSED : 0, password);
  if (in_memory)
    inflaters_.inflate(read_whole(*file, status), sink);
  else
    unpack_by_pieces(*file, status, sink);
}

std::optional<Deflated> Archive::Reader::deflated(std::uint64_t index) {
  const zip_stat_t status = status_of(index);
  if (status.encryption_method != ZIP_EM_NONE || !fits(status)) return std::nullopt;
  return read_whole(*open(index, ZIP_FL_COMPRESSED, {}), status);
}

StoredFile& Archive::Reader::checked(StoredFile& file) {
  constexpr std::array<std::uint64_t, 1> whole{0};
  const Directory directory = read_directory(file, whole);
  require_separate_entries(directory);
  for (const DirectoryEntry& entry : directory.entries) {
    const auto name = std::string_view(entry.header).substr(central_header_size, entry.name_length());
    name_has_nul_.push_back(name.find('\0') != std::string_view::npos);
  }
  return file;
}

zip_stat_t Archive::Reader::status_of(std::uint64_t index) const {
  zip_stat_t status;
  if (zip_stat_index(get(), index, 0, &status) != 0) container_.fail();
  return status;
}

std::int64_t Archive::Reader::modified(std::uint64_t index, const zip_stat_t& status) const {
  constexpr zip_uint16_t extended_time = 0x5455;
  zip_uint16_t length = 0;
  const zip_uint8_t* const field =
      zip_file_extra_field_get_by_id(get(), index, extended_time, 0, &length, ZIP_FL_CENTRAL);
  constexpr zip_uint16_t least = 5;
  if (field == nullptr || length < least || (field[0] & 1U) == 0) return status.mtime;
  const std::string_view bytes(reinterpret_cast<const char*>(field), length);
  return static_cast<std::int32_t>(number_at<std::uint32_t>(bytes, 1));
}

void Archive::Reader::set_kind(std::uint64_t index, Entry& entry) const {
  zip_uint8_t system = ZIP_OPSYS_DOS;
  zip_uint32_t attributes = 0;
  if (zip_file_get_external_attributes(get(), index, 0, &system, &attributes) != 0) attributes = 0;
  FileFacts& facts = entry.facts;
  constexpr std::uint32_t dos_attributes = 0x27;
  facts.attributes = attributes & dos_attributes;
  if (system == ZIP_OPSYS_UNIX || system == ZIP_OPSYS_OS_X) {
    facts.mode = attributes >> 16U;
    if (facts.mode != 0 && (facts.mode & posix_writable) == 0) facts.attributes |= file_attribute::read_only;
  }
  const bool is_marked = (attributes & file_attribute::folder) != 0 && facts.size == 0 && system != ZIP_OPSYS_UNIX;
  const bool ends_as_folder = !entry.name.empty() && separators.find(entry.name.back()) != TextView::npos;
  if (ends_as_folder || is_marked) {
    facts.kind = FileKind::folder;
    facts.attributes &= ~file_attribute::read_only;
  } else if ((facts.mode & posix_kind) == posix_link) {
    facts.kind = FileKind::link;
  }
}

Archive::Reader::Opened Archive::Reader::open(std::uint64_t index, zip_flags_t flags, const std::string& password) {
  Opened file(zip_fopen_index_encrypted(get(), index, flags, password.empty() ? nullptr : password.c_str()));
  if (file) return file;
  const int code = zip_error_code_zip(zip_get_error(get()));
  if (code == ZIP_ER_WRONGPASSWD || code == ZIP_ER_NOPASSWD) throw WrongPassword();
  container_.fail();
}

std::size_t Archive::Reader::read(zip_file_t& file, std::span<char> buffer) {
  const zip_int64_t count = zip_fread(&file, buffer.data(), buffer.size());
  if (count < 0) fault_.fail(zip_file_get_error(&file));
  return static_cast<std::size_t>(count);
}

Deflated Archive::Reader::read_whole(zip_file_t& file, const zip_stat_t& status) {
  Deflated entry{.size = status.size};
  if ((status.valid & ZIP_STAT_CRC) != 0) entry.checksum = status.crc;
  // One byte more, to notice the end of the entry.
  entry.bytes.resize(static_cast<std::size_t>(status.comp_size) + 1);
  std::size_t length = 0;
  while (const std::size_t count = read(file, std::span(entry.bytes).subspan(length))) length += count;
  entry.bytes.resize(length);
  return entry;
}

void Archive::Reader::unpack_by_pieces(zip_file_t& file, const zip_stat_t& status, const Sink& sink) {
  bytes_.resize(piece_size);
  std::uint64_t total = 0;
  while (const std::size_t count = read(file, bytes_)) {
    total += count;
    if (total > status.size) throw Error(Code::bad_structure, "an entry is longer than it says");
    sink(std::string_view(bytes_).substr(0, count));
  }
  if (total != status.size) throw Error(Code::unexpected_end, "an entry is shorter than it says");
}

}  // namespace talutil::archives
