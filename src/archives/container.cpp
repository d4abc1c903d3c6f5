#include "archives/container.hpp"

#include <cerrno>

#include "archives/file_errors.hpp"

namespace talutil::archives {

namespace {

Code code_of(int library_code, Code other) noexcept {
  switch (library_code) {
    case ZIP_ER_MEMORY:
      return Code::out_of_memory;
    case ZIP_ER_EOF:
      return Code::unexpected_end;
    case ZIP_ER_MULTIDISK:
    case ZIP_ER_CRC:
    case ZIP_ER_ZLIB:
    case ZIP_ER_NOZIP:
    case ZIP_ER_INCONS:
    case ZIP_ER_COMPRESSED_DATA:
      return Code::bad_structure;
    case ZIP_ER_COMPNOTSUPP:
    case ZIP_ER_ENCRNOTSUPP:
      return Code::incomplete;
    case ZIP_ER_NOPASSWD:
    case ZIP_ER_WRONGPASSWD:
      return Code::bad_parameters;
    case ZIP_ER_CANCELLED:
      return Code::cancelled;
    case ZIP_ER_READ:
    case ZIP_ER_SEEK:
      return Code::cannot_read;
    case ZIP_ER_WRITE:
      return Code::cannot_write;
    default:
      return other;
  }
}

}  // namespace

void Fault::fail(zip_error_t* error) const {
  if (reason_) std::rethrow_exception(reason_);
  throw Error(code_of(zip_error_code_zip(error), other_), zip_error_strerror(error));
}

void Fault::fail(int library_code) const {
  zip_error_t error;
  zip_error_init_with_code(&error, library_code);
  fail(&error);
}

Container::Container(StoredFile& archive, Fault& fault) : reading_(&archive), fault_(fault) { open(ZIP_RDONLY); }

Container::Container(NewFile& archive, Fault& fault, Progress& progress)
    : reading_(archive.replaced()), writing_(&archive), fault_(fault), progress_(&progress) {
  // An empty file has no directory; treat it like a missing one.
  if (reading_ != nullptr && reading_->size() == 0) reading_ = nullptr;
  open(ZIP_CREATE);
}

Container::~Container() {
  if (archive_ != nullptr) zip_discard(archive_);
}

void Container::open(int flags) {
  zip_error_init(&error_);
  zip_error_t failure;
  zip_error_init(&failure);
  zip_source_t* const source = zip_source_function_create(&serve, this, &failure);
  if (source == nullptr) fault_.fail(&failure);
  archive_ = zip_open_from_source(source, flags, &failure);
  if (archive_ != nullptr) return;
  zip_source_free(source);
  fault_.fail(&failure);
}

void Container::write() {
  if (zip_close(archive_) != 0) fail();
  archive_ = nullptr;
}

zip_int64_t Container::serve(void* self, void* data, zip_uint64_t length, zip_source_cmd_t command) {
  auto* const container = static_cast<Container*>(self);
  return container->fault_.keep(container->error_, [&] { return container->read_or_write(data, length, command); });
}

zip_int64_t Container::read_or_write(void* data, zip_uint64_t length, zip_source_cmd_t command) {
  const auto seek = [&](std::uint64_t& place, std::uint64_t size) -> zip_int64_t {
    const zip_int64_t moved = zip_source_seek_compute_offset(place, size, data, length, &error_);
    if (moved < 0) return -1;
    place = static_cast<std::uint64_t>(moved);
    return 0;
  };
  switch (command) {
    case ZIP_SOURCE_OPEN:
      read_place_ = 0;
      return 0;
    case ZIP_SOURCE_READ: {
      const std::size_t count = with_code(Code::cannot_read, [&] {
        return reading_->read_at(read_place_, {static_cast<char*>(data), static_cast<std::size_t>(length)});
      });
      read_place_ += count;
      return static_cast<zip_int64_t>(count);
    }
    case ZIP_SOURCE_SEEK:
      return seek(read_place_, reading_->size());
    case ZIP_SOURCE_TELL:
      return static_cast<zip_int64_t>(read_place_);
    case ZIP_SOURCE_STAT: {
      if (reading_ == nullptr) {
        zip_error_set(&error_, ZIP_ER_READ, ENOENT);
        return -1;
      }
      auto* const status = static_cast<zip_stat_t*>(data);
      zip_stat_init(status);
      status->size = reading_->size();
      status->valid |= ZIP_STAT_SIZE;
      return sizeof *status;
    }
    case ZIP_SOURCE_BEGIN_WRITE:
      write_place_ = 0;
      return 0;
    case ZIP_SOURCE_WRITE:
      with_code(Code::cannot_write, [&] {
        writing_->write_at(write_place_, {static_cast<const char*>(data), static_cast<std::size_t>(length)});
      });
      write_place_ += length;
      // Report progress here as well: nothing else does while old entries are copied.
      progress_->advance(0, {});
      return static_cast<zip_int64_t>(length);
    case ZIP_SOURCE_SEEK_WRITE:
      return seek(write_place_, writing_->size());
    case ZIP_SOURCE_TELL_WRITE:
      return static_cast<zip_int64_t>(write_place_);
    case ZIP_SOURCE_ERROR:
      return zip_error_to_data(&error_, data, length);
    case ZIP_SOURCE_CLOSE:
    case ZIP_SOURCE_FREE:
    case ZIP_SOURCE_COMMIT_WRITE:
    case ZIP_SOURCE_ROLLBACK_WRITE:
    case ZIP_SOURCE_REMOVE:
      return 0;
    case ZIP_SOURCE_SUPPORTS:
      if (writing_ == nullptr) return ZIP_SOURCE_SUPPORTS_SEEKABLE;
      return ZIP_SOURCE_SUPPORTS_WRITABLE;
    default:
      zip_error_set(&error_, ZIP_ER_OPNOTSUPP, 0);
      return -1;
  }
}

}  // namespace talutil::archives
