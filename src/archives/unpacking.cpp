#include "archives/unpacking.hpp"

#include <algorithm>
#include <array>
#include <limits>

#include "archives/container.hpp"
#include "archives/destination.hpp"
#include "archives/directory.hpp"
#include "archives/entry_names.hpp"
#include "archives/file_errors.hpp"
#include "archives/item_list.hpp"
#include "archives/little_endian.hpp"
#include "archives/packed_files.hpp"
#include "archives/passed_over.hpp"
#include "archives/split_set.hpp"
#include "archives/unpacked_files.hpp"
#include "platform/file_names.hpp"

namespace talutil::archives {

namespace {

constexpr std::uint32_t posix_kind = 0170000;
constexpr std::uint32_t posix_link = 0120000;
constexpr std::uint32_t posix_writable = 0222;
constexpr std::size_t piece_size = 1U << 16U;
constexpr std::uint64_t always_allowed = 1U << 30U;
constexpr int most_questions = 3;

std::unique_ptr<StoredFile> open_path(const Text& path, Folders& folders) {
  return with_code(Code::missing, [&] {
    require_file_name(path);
    const TextView name = last_part(path);
    if (name.empty()) throw Error(Code::missing, "the path names no file");
    return open_archive(*folders.open(path.substr(0, path.size() - name.size())), Text(name));
  });
}

using Sink = std::function<void(std::string_view bytes)>;

struct CloseEntry {
  void operator()(zip_file_t* file) const noexcept { zip_fclose(file); }
};
/// Either the password was wrong or the entry is damaged: the traditional encryption cannot distinguish the two.
struct WrongPassword {};

}  // namespace

class Archive::Reader {
 public:
  explicit Reader(std::unique_ptr<StoredFile> file)
      : file_(with_readable_headers(without_prefix(std::move(file)))), container_(checked(*file_), fault_) {}

  [[nodiscard]] zip_t* get() const noexcept { return container_.get(); }
  [[nodiscard]] std::uint64_t size() const noexcept { return file_->size(); }
  [[nodiscard]] std::uint64_t count() const noexcept { return name_has_nul_.size(); }

  [[nodiscard]] Entry entry(std::uint64_t index) const {
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

  /// Fails with bad_structure if a local header contradicts the directory.
  void require_matching_headers() {
    constexpr std::array<std::uint64_t, 1> whole{0};
    archives::require_matching_headers(*file_, read_directory(*file_, whole));
  }

  /// Passes the bytes of an entry to a sink; throws if they are not the ones that were packed.
  void unpack(std::uint64_t index, const std::string& password, const Sink& sink) {
    const zip_stat_t status = status_of(index);
    require_known_methods(status);
    const bool in_memory = fits(status);
    const Opened file = open(index, in_memory ? ZIP_FL_COMPRESSED : 0, password);
    if (in_memory)
      inflaters_.inflate(read_whole(*file, status), sink);
    else
      unpack_by_pieces(*file, status, sink);
  }

  /// An entry that can be inflated as a whole and is not encrypted; nothing for another one.
  [[nodiscard]] std::optional<Deflated> deflated(std::uint64_t index) {
    const zip_stat_t status = status_of(index);
    if (status.encryption_method != ZIP_EM_NONE || !fits(status)) return std::nullopt;
    return read_whole(*open(index, ZIP_FL_COMPRESSED, {}), status);
  }

 private:
  using Opened = std::unique_ptr<zip_file_t, CloseEntry>;

  StoredFile& checked(StoredFile& file) {
    constexpr std::array<std::uint64_t, 1> whole{0};
    const Directory directory = read_directory(file, whole);
    require_separate_entries(directory);
    for (const DirectoryEntry& entry : directory.entries) {
      const auto name = std::string_view(entry.header).substr(central_header_size, entry.name_length());
      name_has_nul_.push_back(name.find('\0') != std::string_view::npos);
    }
    return file;
  }

  [[nodiscard]] zip_stat_t status_of(std::uint64_t index) const {
    zip_stat_t status;
    if (zip_stat_index(get(), index, 0, &status) != 0) container_.fail();
    return status;
  }

  [[nodiscard]] std::int64_t modified(std::uint64_t index, const zip_stat_t& status) const {
    constexpr zip_uint16_t extended_time = 0x5455;
    zip_uint16_t length = 0;
    const zip_uint8_t* const field =
        zip_file_extra_field_get_by_id(get(), index, extended_time, 0, &length, ZIP_FL_CENTRAL);
    constexpr zip_uint16_t least = 5;
    if (field == nullptr || length < least || (field[0] & 1U) == 0) return status.mtime;
    const std::string_view bytes(reinterpret_cast<const char*>(field), length);
    return static_cast<std::int32_t>(number_at<std::uint32_t>(bytes, 1));
  }

  void set_kind(std::uint64_t index, Entry& entry) const {
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

  [[nodiscard]] Opened open(std::uint64_t index, zip_flags_t flags, const std::string& password) {
    Opened file(zip_fopen_index_encrypted(get(), index, flags, password.empty() ? nullptr : password.c_str()));
    if (file) return file;
    const int code = zip_error_code_zip(zip_get_error(get()));
    if (code == ZIP_ER_WRONGPASSWD || code == ZIP_ER_NOPASSWD) throw WrongPassword();
    container_.fail();
  }

  [[nodiscard]] std::size_t read(zip_file_t& file, std::span<char> buffer) {
    const zip_int64_t count = zip_fread(&file, buffer.data(), buffer.size());
    if (count < 0) fault_.fail(zip_file_get_error(&file));
    return static_cast<std::size_t>(count);
  }

  static void require_known_methods(const zip_stat_t& status) {
    // Check this first: the container library leaks memory over an encryption that it does not know.
    if (zip_encryption_method_supported(status.encryption_method, 0) == 0 ||
        zip_compression_method_supported(status.comp_method, 0) == 0) {
      throw Error(Code::incomplete, "its method of compression or encryption is not supported");
    }
  }

  [[nodiscard]] static bool fits(const zip_stat_t& status) noexcept {
    return status.size <= PackedFiles::longest_in_memory && status.comp_size <= PackedFiles::longest_in_memory &&
           status.comp_method == ZIP_CM_DEFLATE && status.size > 0;
  }

  [[nodiscard]] Deflated read_whole(zip_file_t& file, const zip_stat_t& status) {
    Deflated entry{.size = status.size};
    if ((status.valid & ZIP_STAT_CRC) != 0) entry.checksum = status.crc;
    // One byte more, to notice the end of the entry.
    entry.bytes.resize(static_cast<std::size_t>(status.comp_size) + 1);
    std::size_t length = 0;
    while (const std::size_t count = read(file, std::span(entry.bytes).subspan(length))) length += count;
    entry.bytes.resize(length);
    return entry;
  }

  void unpack_by_pieces(zip_file_t& file, const zip_stat_t& status, const Sink& sink) {
    bytes_.resize(piece_size);
    std::uint64_t total = 0;
    while (const std::size_t count = read(file, bytes_)) {
      total += count;
      if (total > status.size) throw Error(Code::bad_structure, "an entry is longer than it says");
      sink(std::string_view(bytes_).substr(0, count));
    }
    if (total != status.size) throw Error(Code::unexpected_end, "an entry is shorter than it says");
  }

  std::unique_ptr<StoredFile> file_;
  std::vector<bool> name_has_nul_;
  Fault fault_{Code::bad_structure};
  Container container_;
  Inflaters inflaters_;
  std::string bytes_;
};

namespace {

/// The password of the entries; asks again while it is wrong.
class Password {
 public:
  Password(const Text& given, const PasswordQuestion& ask) : bytes_(to_utf8(given)), ask_(ask) {}

  /// Repeats an attempt on an entry until the password is right.
  template <class Attempt>
  void with(const Archive::Entry& entry, Attempt&& attempt) {
    if (!entry.is_encrypted) return attempt(std::string());
    if (bytes_.empty()) ask(entry.name, false);
    for (;;) {
      try {
        attempt(bytes_);
        is_proved_ = true;
        return;
      } catch (const WrongPassword&) {
      } catch (const Error& error) {
        const bool is_garbage = error.code() == Code::bad_structure || error.code() == Code::unexpected_end;
        if (is_proved_ || !is_garbage) throw;
      }
      ask(entry.name, true);
    }
  }

 private:
  void ask(const Text& entry, bool was_wrong) {
    if (!ask_ || questions_ == most_questions)
      throw Error(Code::bad_parameters, to_utf8(entry) + ": the password is missing or wrong");
    ++questions_;
    const std::optional<Text> answer = ask_(entry, was_wrong);
    if (!answer) {
      throw Error(Code::cancelled,
                  to_utf8(entry) + (was_wrong ? ": the password is wrong" : ": no password was given"));
    }
    bytes_ = to_utf8(*answer);
  }

  std::string bytes_;
  const PasswordQuestion& ask_;
  int questions_ = 0;
  bool is_proved_ = false;
};

void require_modest_size(std::uint64_t total, std::uint64_t archive_size, const UnpackingOptions& options) {
  const bool is_too_large = options.largest_total != 0 && total > options.largest_total;
  const bool is_bomb = total > always_allowed && total / options.largest_ratio > archive_size;
  if (is_too_large || is_bomb) throw Error(Code::incomplete, "the archive would unpack to more than is allowed");
}

/// Visits the selected entries, after checking that their total size is acceptable.
template <class Visit>
void for_each_entry(const Archive& archive, std::uint64_t archive_size, const UnpackingOptions& options,
                    Progress& progress, Visit&& visit) {
  const EntryFilter filter(options.items);
  std::vector<std::uint64_t> chosen;
  std::uint64_t total = 0;
  for (std::uint64_t i = 0; i < archive.count(); ++i) {
    const Archive::Entry entry = archive.entry(i);
    if (!filter.matches(parts_of(entry.name))) continue;
    chosen.push_back(i);
    total = entry.facts.size > std::numeric_limits<std::uint64_t>::max() - total
                ? std::numeric_limits<std::uint64_t>::max()
                : total + entry.facts.size;
  }
  // An empty archive is unpacked in full.
  if (chosen.empty() && archive.count() > 0) throw Error(Code::nothing_to_do, "no entry matches");
  require_modest_size(total, archive_size, options);
  progress.start(total);
  for (const std::uint64_t index : chosen) visit(index, archive.entry(index));
}

}  // namespace

Archive::Archive(const Text& path, Folders& folders) : Archive(open_path(path, folders)) {}
Archive::Archive(std::unique_ptr<StoredFile> file) : reader_(std::make_unique<Reader>(std::move(file))) {}
Archive::~Archive() = default;

std::uint64_t Archive::count() const { return reader_->count(); }

Archive::Entry Archive::entry(std::uint64_t index) const { return reader_->entry(index); }

Text Archive::comment() const {
  int length = 0;
  const char* const comment = zip_get_archive_comment(reader_->get(), &length, 0);
  return comment == nullptr ? Text() : from_utf8(std::string_view(comment, static_cast<std::size_t>(length)));
}

/// One run of `extract`.
class Archive::Extraction {
 public:
  Extraction(Archive& archive, const Text& destination, const UnpackingOptions& options, Folders& folders, Files& files,
             const PasswordQuestion& ask, Progress& progress)
      : archive_(archive),
        reader_(*archive.reader_),
        options_(options),
        progress_(progress),
        target_(folders, files, destination),
        password_(options.password, ask),
        written_(options.tasks == nullptr ? serial_ : *options.tasks, progress,
                 [this](const Text& entry, const Error& error) { pass_over(entry, error.what(), error.code()); }) {}

  void run() {
    try {
      for_each_entry(archive_, reader_.size(), options_, progress_,
                     [this](std::uint64_t index, const Entry& entry) { unpack(index, entry); });
    } catch (...) {
      written_.settle();
      throw;
    }
    written_.settle();
    target_.finish_folders();
    passed_over_.throw_if_any();
  }

 private:
  void unpack(std::uint64_t index, const Entry& entry) {
    if (is_destination(entry.name)) return;
    auto parts = options_.own_names ? own_parts(entry.name) : safe_parts(entry.name);
    if (!parts) return pass_over_now(entry.name, "no file here can have this name");
    if (entry.facts.kind == FileKind::link) return pass_over_now(entry.name, "links are not unpacked");
    // One bad entry is no reason to lose the others.
    try {
      if (entry.facts.kind == FileKind::folder) {
        if (options_.keep_folders && !target_.make_folder(*parts, entry.facts)) {
          pass_over_now(entry.name, "a file or a link is in its place");
        }
        return;
      }
      if (!options_.keep_folders) parts->erase(parts->begin(), parts->end() - 1);
      unpack_file(index, entry, *parts);
    } catch (const Error& error) {
      if (!concerns_one_entry(error.code())) throw;
      pass_over_now(entry.name, error.what(), error.code());
    }
  }

  void unpack_file(std::uint64_t index, const Entry& entry, const std::vector<Text>& parts) {
    if (target_.has_written(parts)) written_.settle();
    UnpackedFiles::File file{.entry = entry.name, .facts = entry.facts, .folder = target_.folder_of(parts)};
    const auto answer = target_.create(parts, options_.overwrite, file.file);
    if (answer == Destination::Answer::refused) pass_over_now(entry.name, "something else is in its place");
    if (answer == Destination::Answer::kept && options_.notice) options_.notice(entry.name, Fate::kept, {});
    if (answer != Destination::Answer::made) return;
    if (auto deflated = reader_.deflated(index)) return written_.add(std::move(file), std::move(*deflated));
    password_.with(entry, [&](const std::string& bytes) {
      std::uint64_t place = 0;
      reader_.unpack(index, bytes, [&](std::string_view piece) {
        with_code(Code::cannot_write, [&] { file.file->write_at(place, piece); });
        place += piece.size();
        progress_.advance(piece.size(), entry.name);
      });
    });
    written_.add(std::move(file));
  }

  void pass_over(const Text& name, const char* reason, Code code) {
    passed_over_.add(name, code, reason);
    if (options_.notice) options_.notice(name, Fate::left_out, reason);
  }

  /// Reports an entry after those before it.
  void pass_over_now(const Text& name, const char* reason, Code code = Code::incomplete) {
    written_.settle();
    pass_over(name, reason, code);
  }

  Archive& archive_;
  Reader& reader_;
  const UnpackingOptions& options_;
  Progress& progress_;
  Destination target_;
  Password password_;
  PassedOver passed_over_;
  SerialTasks serial_;
  UnpackedFiles written_;
};

void Archive::extract(const Text& destination, const UnpackingOptions& options, Folders& folders, Files& files,
                      const PasswordQuestion& ask, Progress& progress) {
  if (destination.empty()) throw Error(Code::bad_parameters, "there is no folder to unpack below");
  Extraction(*this, destination, options, folders, files, ask, progress).run();
}

void Archive::test(const UnpackingOptions& options, const PasswordQuestion& ask, Progress& progress) {
  Password password(options.password, ask);
  try {
    reader_->require_matching_headers();
  } catch (const Error& error) {
    throw Error(Code::bad_test, error.what());
  }
  for_each_entry(*this, reader_->size(), options, progress, [&](std::uint64_t index, const Entry& entry) {
    try {
      password.with(entry, [&](const std::string& bytes) {
        reader_->unpack(index, bytes, [&](std::string_view piece) { progress.advance(piece.size(), entry.name); });
      });
    } catch (const Error& error) {
      const bool is_damage = error.code() == Code::bad_structure || error.code() == Code::unexpected_end;
      // The question about the password names the entry already.
      const std::string name = to_utf8(entry.name) + ": ";
      const std::string_view reason = error.what();
      throw Error(is_damage ? Code::bad_test : error.code(),
                  (reason.starts_with(name) ? "" : name) + std::string(reason));
    }
  });
}

}  // namespace talutil::archives
