#include "archives/unpacking.hpp"

#include <limits>

#include "archives/archive_reader.hpp"
#include "archives/destination.hpp"
#include "archives/entry_names.hpp"
#include "archives/entry_password.hpp"
#include "archives/file_errors.hpp"
#include "archives/item_list.hpp"
#include "archives/passed_over.hpp"
#include "archives/split_set.hpp"

namespace talutil::archives {

namespace {

constexpr std::uint64_t always_allowed = 1U << 30U;

std::unique_ptr<StoredFile> open_path(const Text& path, Folders& folders) {
  return with_code(Code::missing, [&] {
    require_file_name(path);
    const TextView name = last_part(path);
    if (name.empty()) throw Error(Code::missing, "the path names no file");
    return open_archive(*folders.open(path.substr(0, path.size() - name.size())), Text(name));
  });
}

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
