#include "archives/packed_files.hpp"

#include <algorithm>
#include <new>

#include "archives/file_errors.hpp"

namespace talutil::archives {

std::size_t Compressors::deflate(std::string_view bytes, std::span<char> output) {
  Compressor compressor = take();
  const std::size_t length =
      libdeflate_deflate_compress(compressor.get(), bytes.data(), bytes.size(), output.data(), output.size());
  const std::lock_guard lock(mutex_);
  free_.push_back(std::move(compressor));
  return length;
}

Compressors::Compressor Compressors::take() {
  const std::lock_guard lock(mutex_);
  if (free_.empty()) {
    Compressor made(libdeflate_alloc_compressor(level_));
    if (!made) throw std::bad_alloc();
    return made;
  }
  Compressor compressor = std::move(free_.back());
  free_.pop_back();
  return compressor;
}

PackedFiles::PackedFiles(Collection& collection, std::int32_t level, Tasks& tasks, Fault& fault, Progress& progress)
    : collection_(collection),
      compresses_(level != 0),
      compressors_(level),
      tasks_(tasks),
      fault_(fault),
      progress_(progress) {}

PackedFiles::~PackedFiles() {
  is_over_ = true;
  for (const Source& source : sources_) {
    if (source.whole && source.whole->task) source.whole->task->wait();
  }
}

time_t PackedFiles::storable_time(std::int64_t modified) noexcept {
  // A day from both ends, since the stored time is local.
  constexpr std::int64_t earliest = 315'619'200;
  constexpr std::int64_t latest = 4'354'732'800;
  return static_cast<time_t>(std::clamp(modified, earliest, latest));
}

zip_source_t* PackedFiles::source_of(const Item& item, zip_t* archive) {
  Source& source = sources_.emplace_back(Source{.files = this, .item = &item, .number = sources_.size()});
  zip_error_init(&source.error);
  return zip_source_function(archive, &serve, &source);
}

bool PackedFiles::fits(const Item& item) const noexcept { return compresses_ && item.facts.size <= longest_in_memory; }

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
      close(source);
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
  if (!fits(*source.item)) {
    file_ = collection_.folder_of(*source.item).open(source.item->name);
    return;
  }
  next_ = std::max(next_, source.number);
  begin_next();
  if (!source.whole) begin(source);
  Whole& whole = *source.whole;
  whole.task->finish();
  source.was_read = true;
  source.size = whole.size;
  source.checksum = whole.checksum;
  source.is_packed = whole.is_packed;
}

void PackedFiles::close(Source& source) noexcept {
  file_.reset();
  if (!source.whole) return;
  source.whole.reset();
  --begun_;
  begun_bytes_ -= source.item->facts.size;
}

/// Begins as many of the next files as may be in memory and open at the same time.
void PackedFiles::begin_next() {
  constexpr std::size_t most_files = 64;
  constexpr std::uint64_t most_bytes = 2 * longest_in_memory;
  const std::size_t most = tasks_.at_once() == 1 ? 1 : std::min(most_files, 8 * tasks_.at_once());
  for (; next_ < sources_.size() && begun_ < most; ++next_) {
    Source& source = sources_[next_];
    if (!fits(*source.item)) continue;
    if (begun_ > 0 && begun_bytes_ + source.item->facts.size > most_bytes) return;
    begin(source);
  }
}

void PackedFiles::begin(Source& source) {
  source.whole = std::make_unique<Whole>();
  Whole& whole = *source.whole;
  ++begun_;
  begun_bytes_ += source.item->facts.size;
  // Not this file but an earlier one is being written: what fails is reported when it is this one's turn.
  try {
    whole.file = collection_.folder_of(*source.item).open(source.item->name);
    whole.task = tasks_.start([this, &whole, size = source.item->facts.size] { pack(whole, size); });
  } catch (...) {
    whole.task = std::make_unique<EndedTask>(std::current_exception());
  }
}

void PackedFiles::pack(Whole& whole, std::uint64_t size) {
  if (is_over_) return;
  // A file that is growing is packed up to the size it had when it was found.
  whole.bytes.resize(static_cast<std::size_t>(size));
  whole.bytes.resize(whole.file->read_at(0, whole.bytes));
  whole.file.reset();
  whole.size = whole.bytes.size();
  whole.checksum = libdeflate_crc32(0, whole.bytes.data(), whole.bytes.size());
  whole.packed.resize(whole.bytes.size());
  const std::size_t length = compressors_.deflate(whole.bytes, whole.packed);
  // Data that does not get smaller is stored.
  whole.is_packed = length > 0 && length < whole.bytes.size();
  if (whole.is_packed)
    whole.packed.resize(length);
  else
    whole.packed.swap(whole.bytes);
  whole.bytes = {};
}

zip_int64_t PackedFiles::read(Source& source, std::span<char> buffer) {
  if (source.was_read) {
    const std::size_t count = source.whole->packed.copy(buffer.data(), buffer.size(), static_cast<std::size_t>(place_));
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
