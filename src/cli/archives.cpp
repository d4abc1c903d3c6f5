#include <iomanip>
#include <iostream>

#include "archives/archive_error.hpp"
#include "archives/entry_names.hpp"
#include "archives/item_list.hpp"
#include "archives/packing.hpp"
#include "archives/unpacking.hpp"
#include "automation/date.hpp"
#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "cli/progress.hpp"
#include "platform/posix/posix_platform.hpp"
#include "platform/posix/thread_tasks.hpp"

namespace talutil::cli {

namespace {

struct ZipOptions {
  std::string archive;
  std::vector<std::string> items;
  std::string password_file;  ///< "-" for standard input; empty for none.
  bool encrypt = false;       ///< Asks for the password at the terminal.
  bool aes = false;
  bool no_folders = false;
  std::int32_t level = 6;
  std::uint64_t volume_size = 0;  ///< 0 for a single archive.
  std::string comment;
  bool test = false;
  bool json = false;
};

struct UnzipOptions {
  std::string archive;
  std::vector<std::string> items;
  std::string destination = ".";
  std::string password_file;
  bool overwrite = false;
  bool keep = false;  ///< Keeping existing files is what is wanted.
  bool no_folders = false;
  bool own_names = false;
  bool list = false;
  bool json = false;
};

using archives::Progress;

/// Shows how far packing, testing or unpacking is.
class ProgressBar {
 public:
  explicit ProgressBar(const char* word) : line_(word) {}

  [[nodiscard]] Progress progress() {
    return Progress([this](std::uint64_t done, std::uint64_t total, TextView name) {
      line_.show(done, total, to_utf8(name));
      return true;
    });
  }

 private:
  ProgressLine line_;
};

Text text_of(const std::string& word) { return utf8_text(word, word); }

/// Converts command-line words to a list of items; each is quoted so that blanks have no meaning.
Text item_list(const std::vector<std::string>& words) {
  Text list;
  for (const std::string& word : words) {
    if (word.find('"') != std::string::npos) throw usage_failure(word + ": an item cannot have a quote in it");
    list += u'"' + text_of(word) + u"\" ";
  }
  return list;
}

Text read_password(const std::string& file) {
  if (file.empty()) return {};
  std::string bytes = read_bytes(file);
  bytes.resize(std::min(bytes.find_first_of("\r\n"), bytes.size()));
  if (bytes.empty()) throw usage_failure("--password-file " + file + ": its first line is empty");
  return utf8_text(bytes, file);
}

/// Asks for a new password twice.
Text ask_new_password(InputBoxes& boxes) {
  const auto first = boxes.ask(u"New password:", {}, Entry::masked);
  const auto second = first ? boxes.ask(u"Once more:", {}, Entry::masked) : std::nullopt;
  if (!second || first->empty())
    throw run_time_failure("no password was given; there must be a terminal to type it at");
  if (*first != *second) throw run_time_failure("the two passwords differ");
  return *first;
}

archives::PasswordQuestion question(InputBoxes& boxes) {
  return [&boxes](const Text& entry, bool was_wrong) {
    return boxes.ask((was_wrong ? u"That is not the password of " : u"Password of ") + entry + u":", {}, Entry::masked);
  };
}

/// Does the work of a subcommand; reports a failure with the archive's name and the code that hosts know.
template <class Work>
void on_archive(const std::string& archive, Work work) {
  try {
    work();
  } catch (const archives::Error& error) {
    throw run_time_failure(archive + ": " + error.what() + " (code " + std::to_string(static_cast<int>(error.code())) +
                           ")");
  }
}

Text joined(const std::vector<Text>& parts) {
  Text name;
  for (const Text& part : parts) name += (name.empty() ? u"" : u"/") + part;
  return name;
}

/// The name of an entry without the separators and dots that have no meaning.
Text meant_name(TextView stored) {
  Text name(stored.substr(0, stored.starts_with(u'/') ? 1 : 0));
  while (!stored.empty()) {
    const TextView part = stored.substr(0, stored.find(u'/'));
    stored.remove_prefix(std::min(part.size() + 1, stored.size()));
    if (part.empty() || part == u".") continue;
    if (!name.empty() && name.back() != u'/') name += u'/';
    name += part;
  }
  return name;
}

/// Warns of each entry that is unpacked under another name than its own; returns how many.
std::uint64_t report_changed_names(const archives::Archive& archive, const Text& items, bool keep_folders,
                                   bool own_names = false) {
  const archives::EntryFilter filter(items);
  std::uint64_t changed = 0;
  for (std::uint64_t i = 0; i < archive.count(); ++i) {
    const Text stored = archive.entry(i).name;
    const auto parts = own_names ? archives::own_parts(stored) : archives::safe_parts(stored);
    if (!parts || !filter.matches(archives::parts_of(stored))) continue;
    if (!keep_folders && stored.ends_with(u'/')) continue;
    Text meant = meant_name(stored);
    if (!keep_folders) meant.erase(0, meant.find_last_of(u'/') + 1);
    const Text made = keep_folders ? joined(*parts) : parts->back();
    if (made == meant) continue;
    ++changed;
    warn(json::text(stored) + " is unpacked as " + json::text(made));
  }
  return changed;
}

std::string time_words(const archives::Archive::Entry& entry, TextView pattern) {
  constexpr std::int64_t seconds_a_day = 86400;
  constexpr double epoch = 25569;  // 1 January 1970 as an automation date
  return to_utf8(format_date({epoch + static_cast<double>(entry.facts.modified) / seconds_a_day}, pattern));
}

void print_entries_json(const archives::Archive& archive) {
  for (std::uint64_t i = 0; i < archive.count(); ++i) {
    const archives::Archive::Entry entry = archive.entry(i);
    std::cout << json::object({{"name", json::text(entry.name)},
                               {"size", std::to_string(entry.facts.size)},
                               {"packed_size", std::to_string(entry.packed_size)},
                               {"modified", json::text(time_words(entry, u"YYYY-MM-DDTHH:MM:SSZ"))},
                               {"encrypted", entry.is_encrypted ? "true" : "false"}})
              << '\n';
  }
}

void print_entries(const archives::Archive& archive) {
  for (std::uint64_t i = 0; i < archive.count(); ++i) {
    const archives::Archive::Entry entry = archive.entry(i);
    std::cout << std::setw(12) << entry.facts.size << std::setw(12) << entry.packed_size << "  "
              << time_words(entry, u"YYYY-MM-DD HH:MM:SS") << (entry.is_encrypted ? " *" : "  ") << to_utf8(entry.name)
              << '\n';
  }
  if (const Text comment = archive.comment(); !comment.empty()) std::cout << to_utf8(comment) << '\n';
}

/// What was done, in numbers: a sentence on standard error, or an object on standard output.
void print_summary(bool as_json, const std::string& archive,
                   const std::vector<std::pair<std::string_view, std::uint64_t>>& numbers, const std::string& words) {
  if (!as_json) return warn(archive + ": " + std::to_string(numbers.front().second) + " " + words);
  std::vector<json::Field> fields{{"archive", json::text(std::string_view(archive))}};
  for (const auto& [name, number] : numbers) fields.emplace_back(name, std::to_string(number));
  std::cout << json::object(fields) << '\n';
}

void test_archive(const ZipOptions& options, posix::PosixPlatform& platform) {
  archives::UnpackingOptions unpacking;
  unpacking.items = item_list(options.items);
  unpacking.password = read_password(options.password_file);
  archives::Archive archive(text_of(options.archive), platform.folders);
  {
    ProgressBar bar("testing");
    Progress progress = bar.progress();
    archive.test(unpacking, question(platform.input_boxes), progress);
  }
  print_summary(options.json, options.archive, {{"entries", archive.count()}}, "entries tested, no damage");
}

int pack_archive(const ZipOptions& options) {
  posix::PosixPlatform platform;
  std::uint64_t changed = 0;
  on_archive(options.archive, [&] {
    if (options.test) return test_archive(options, platform);
    if (options.items.empty()) throw usage_failure("zip: name what is to be packed: talutil zip ARCHIVE ITEM...");
    archives::PackingOptions packing;
    packing.keep_folders = !options.no_folders;
    packing.aes = options.aes;
    packing.level = options.level;
    packing.comment = text_of(options.comment);
    packing.needs_every_item = true;
    packing.password = read_password(options.password_file);
    if (options.encrypt && packing.password.empty()) packing.password = ask_new_password(platform.input_boxes);
    if (options.aes && packing.password.empty()) {
      throw usage_failure("--aes wants a password: give --encrypt or --password-file");
    }
    if (options.volume_size != 0) packing.volume_size = options.volume_size;
    const Text name = text_of(options.archive);
    std::uint64_t entries = 0;
    const auto report = [&] {
      const archives::Archive archive(name, platform.folders);
      entries = archive.count();
      changed = report_changed_names(archive, {}, true);
    };
    posix::ThreadTasks tasks;
    packing.tasks = &tasks;
    try {
      ProgressBar bar("packing");
      Progress progress = bar.progress();
      archives::pack(name, item_list(options.items), packing, platform.folders, progress);
    } catch (const archives::Error& error) {
      if (error.code() == archives::Code::incomplete) report();
      throw;
    }
    report();
    print_summary(options.json, options.archive, {{"entries", entries}, {"renamed", changed}}, "entries");
  });
  return changed == 0 ? 0 : partial_status;
}

/// How much of an unpacking was not done as stored.
struct Remainder {
  std::uint64_t chosen = 0;  ///< The entries that were to be unpacked.
  std::uint64_t kept = 0;
  std::uint64_t renamed = 0;
};

void extract(const UnzipOptions& options, archives::Archive& archive, posix::PosixPlatform& platform,
             Remainder& remainder) {
  archives::UnpackingOptions unpacking;
  unpacking.items = item_list(options.items);
  unpacking.password = read_password(options.password_file);
  unpacking.overwrite = options.overwrite;
  unpacking.keep_folders = !options.no_folders;
  unpacking.own_names = options.own_names;
  unpacking.notice = [&](const Text& entry, archives::Fate fate, std::string_view reason) {
    if (fate == archives::Fate::kept) {
      ++remainder.kept;
      return;
    }
    warn(options.archive + ": " + json::text(entry) + " was left out: " + std::string(reason));
  };
  const archives::EntryFilter filter(unpacking.items);
  for (std::uint64_t i = 0; i < archive.count(); ++i) {
    if (filter.matches(archives::parts_of(archive.entry(i).name))) ++remainder.chosen;
  }
  remainder.renamed = report_changed_names(archive, unpacking.items, unpacking.keep_folders, unpacking.own_names);
  posix::ThreadTasks tasks;
  unpacking.tasks = &tasks;
  ProgressBar bar("unpacking");
  Progress progress = bar.progress();
  archive.extract(text_of(options.destination), unpacking, platform.folders, platform.files,
                  question(platform.input_boxes), progress);
}

int unpack_archive(const UnzipOptions& options) {
  posix::PosixPlatform platform;
  Remainder remainder;
  on_archive(options.archive, [&] {
    archives::Archive archive(text_of(options.archive), platform.folders);
    if (options.list) return options.json ? print_entries_json(archive) : print_entries(archive);
    const auto say_kept = [&] {
      if (remainder.kept == 0 || options.keep) return;
      warn(options.archive + ": " + std::to_string(remainder.kept) +
           " existing files were kept; --overwrite replaces them, --keep keeps them silently");
    };
    try {
      extract(options, archive, platform, remainder);
    } catch (const archives::Error&) {
      say_kept();
      throw;
    }
    say_kept();
    print_summary(
        options.json, options.archive,
        {{"unpacked", remainder.chosen - remainder.kept}, {"kept", remainder.kept}, {"renamed", remainder.renamed}},
        "entries unpacked");
  });
  const bool is_whole = remainder.renamed == 0 && (remainder.kept == 0 || options.keep);
  return is_whole ? 0 : partial_status;
}

}  // namespace

void add_archives(CLI::App& app, Work& work) {
  const auto packing = std::make_shared<ZipOptions>();
  auto* const zip = app.add_subcommand("zip", "Pack files into an archive, add to an archive, or test it");
  zip->add_option("ARCHIVE", packing->archive)->required();
  zip->add_option("ITEM", packing->items, "Files, folders with all their contents, or patterns (\"C:\\DATA\\*.*\")");
  zip->add_flag("--test", packing->test, "Read the archive, or the given entries, and check every byte; write nothing");
  zip->add_flag("--encrypt", packing->encrypt, "Ask for a password and encrypt with it");
  zip->add_option("--password-file", packing->password_file,
                  "Read the password from the first line of this file; - is input");
  zip->add_flag("--aes", packing->aes, "Encrypt with AES-256, which not every program can read");
  zip->add_flag("--no-folders", packing->no_folders, "Store names without their folders");
  zip->add_option("--level", packing->level, "0 stores, 1 is fast, 9 small")
      ->check(CLI::Range(0, 9))
      ->capture_default_str();
  zip->add_option("--volumes", packing->volume_size, "Create a split set with volumes of this size (100000000, 650MB)")
      ->transform(CLI::AsSizeValue(true));
  zip->add_option("--comment", packing->comment, "The archive's comment");
  zip->footer("  talutil password | tee key | talutil zip backup.zip DATA --password-file -");
  add_json(*zip, packing->json, "Print what was done as JSON");
  choose(*zip, work, packing, &pack_archive);

  const auto unpacking = std::make_shared<UnzipOptions>();
  auto* const unzip = app.add_subcommand("unzip", "Unpack an archive, or the last volume of a split set");
  unzip->add_option("ARCHIVE", unpacking->archive)->required();
  unzip->add_option("ITEM", unpacking->items, "Entries, folders or patterns; default: all");
  unzip->add_option("--to", unpacking->destination, "The folder to unpack to; created if missing")
      ->capture_default_str();
  unzip->add_option("--password-file", unpacking->password_file,
                    "Read the password from its first line; - is standard input");
  auto* const overwrite = unzip->add_flag("--overwrite", unpacking->overwrite, "Replace existing files");
  unzip->add_flag("--keep", unpacking->keep, "Keep existing files without a warning and with exit code 0")
      ->excludes(overwrite);
  unzip->add_flag("--no-folders", unpacking->no_folders, "Write all files into one folder");
  unzip->add_flag("--own-names", unpacking->own_names,
                  "Keep names that Windows does not allow (\"aux.c\", \"a:b\") instead of changing them");
  unzip->add_flag("--list", unpacking->list, "List the entries instead: size, packed size, time (UTC), name");
  add_json(*unzip, unpacking->json, "Print what was done, or with --list one object per entry, as JSON");
  choose(*unzip, work, unpacking, &unpack_archive);
}

}  // namespace talutil::cli
