#include "archives/packed_files.hpp"

#include <algorithm>
#include <new>

#include "archives/file_errors.hpp"

namespace talutil::archives {

PackedFiles::PackedFiles(Collection& collection, std::int32_t level, Fault& fault, Progress& progress)
    : collection_(collection), fault_(fault), progress_(progress) {
  if (level == 0) return;
  compressor_.reset(libdeflate_alloc_compressor(level));
  if (!compressor_) throw std::bad_alloc();
}

time_t PackedFiles::storable_time(std::int64_t modified) noexcept {
  // A day from both ends, since the stored time is local.
  constexpr std::int64_t earliest = 315'619'200;
  constexpr std::int64_t latest = 4'354'732'800;
  return static_cast<time_t>(std::clamp(modified, earliest, latest));
}

zip_source_t* PackedFiles::source_of(const Item& item, zip_t* archive) {
  Source& source = sources_.emplace_back(Source{.files = this, .item = &item, .error = {}});
  zip_error_init(&source.error);
  return zip_source_function(archive, &serve, &source);
}

bool PackedFiles::fits(const Item& item) const noexcept {
  return compressor_ != nullptr && item.facts.size <= longest_in_memory;
}

zip_int64_t PackedFiles::serve(void* self, void* data, zip_uint64_t length, zip_source_cmd_t command) {
  auto* const source = static_cast<Source*>(self);
  return source->files->fault_.keep(source->error,
                                    [&] { return source->files->serve(*source, data, length, command); });
}

zip_int64_t PackedFiles::serve(Source& source, void* data, zip_uint64_t length, zip_source_cmd_t command) {
  switch (command) {
    case ZIP_SOURCE_OPEN:
      with_code(Code::cannot_read, from_utf8(source.item->entry), [&] { open(source); });
      return 0;
    case ZIP_SOURCE_READ:
      return with_code(Code::cannot_read, entry_, [&] {
        return read(source, {static_cast<char*>(data), static_cast<std::size_t>(length)});
      });
    case ZIP_SOURCE_CLOSE:
      close();
      return 0;
    case ZIP_SOURCE_STAT:
      tell(source, *static_cast<zip_stat_t*>(data));
      return sizeof(zip_stat_t);
    case ZIP_SOURCE_ERROR:
      return zip_error_to_data(&source.error, data, length);
    case ZIP_SOURCE_FREE:
      return 0;
    case ZIP_SOURCE_SUPPORTS:
      return ZIP_SOURCE_SUPPORTS_READABLE;
    default:
      zip_error_set(&source.error, ZIP_ER_OPNOTSUPP, 0);
      return -1;
  }
}

void PackedFiles::open(Source& source) {
  place_ = 0;
  entry_ = from_utf8(source.item->entry);
  file_ = collection_.folder_of(*source.item).open(source.item->name);
  if (!fits(*source.item)) return;
  // A file that is growing is packed up to the size it had when it was found.
  bytes_.resize(static_cast<std::size_t>(source.item->facts.size));
  bytes_.resize(file_->read_at(0, bytes_));
  file_.reset();
  source.was_read = true;
  source.size = bytes_.size();
  source.checksum = libdeflate_crc32(0, bytes_.data(), bytes_.size());
  packed_.resize(bytes_.size());
  const std::size_t length =
      libdeflate_deflate_compress(compressor_.get(), bytes_.data(), bytes_.size(), packed_.data(), packed_.size());
  // Data that does not get smaller is stored.
  source.is_packed = length > 0 && length < bytes_.size();
  if (source.is_packed)
    packed_.resize(length);
  else
    packed_.swap(bytes_);
}

void PackedFiles::close() noexcept {
  file_.reset();
  bytes_.clear();
  packed_.clear();
}

zip_int64_t PackedFiles::read(Source& source, std::span<char> buffer) {
  if (source.was_read) {
    const std::size_t count = packed_.copy(buffer.data(), buffer.size(), static_cast<std::size_t>(place_));
    place_ += count;
    if (count == 0) progress_.advance(source.size, entry_);
    return static_cast<zip_int64_t>(count);
  }
  // As above: not beyond the size found, so that the size in the archive's headers stays right.
  const std::uint64_t rest = source.item->facts.size - place_;
  const std::size_t count =
      file_->read_at(place_, buffer.first(static_cast<std::size_t>(std::min<std::uint64_t>(rest, buffer.size()))));
  place_ += count;
  progress_.advance(count, entry_);
  return static_cast<zip_int64_t>(count);
}

void PackedFiles::tell(const Source& source, zip_stat_t& status) const {
  zip_stat_init(&status);
  status.size = source.was_read ? source.size : source.item->facts.size;
  status.mtime = storable_time(source.item->facts.modified);
  // The traditional encryption derives its check byte from the time, so the time is always given.
  status.valid = ZIP_STAT_SIZE | ZIP_STAT_MTIME;
  if (!fits(*source.item)) return;
  status.comp_method = source.was_read && !source.is_packed ? ZIP_CM_STORE : ZIP_CM_DEFLATE;
  status.valid |= ZIP_STAT_COMP_METHOD;
  if (!source.was_read) return;
  status.crc = source.checksum;
  status.valid |= ZIP_STAT_CRC;
}

}  // namespace talutil::archives
