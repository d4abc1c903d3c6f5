#include <unistd.h>

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
#include "platform/posix/posix_platform.hpp"

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
};

struct UnzipOptions {
  std::string archive;
  std::vector<std::string> items;
  std::string destination = ".";
  std::string password_file;
  bool overwrite = false;
  bool no_folders = false;
  bool list = false;
};

using archives::Progress;

/// A progress bar on the terminal, which disappears when the work is done.
class ProgressBar {
 public:
  explicit ProgressBar(const char* word) : word_(word), is_shown_(isatty(STDERR_FILENO) != 0) {}
  ProgressBar(const ProgressBar&) = delete;
  ProgressBar& operator=(const ProgressBar&) = delete;
  ~ProgressBar() {
    if (percent_ != none) std::cerr << "\r\033[K" << std::flush;
  }

  [[nodiscard]] Progress progress() {
    return Progress([this](std::uint64_t done, std::uint64_t total, TextView name) { return show(done, total, name); });
  }

 private:
  static constexpr std::uint64_t none = 101;

  bool show(std::uint64_t done, std::uint64_t total, TextView name) {
    constexpr std::uint64_t whole = 100;
    constexpr std::uint64_t step = 4;
    const std::uint64_t percent = total == 0 ? whole : std::min(whole, done * whole / total);
    if (!is_shown_ || percent == percent_) return true;
    percent_ = percent;
    const std::string bar = std::string(percent / step, '#') + std::string((whole - percent) / step, '.');
    std::cerr << '\r' << word_ << " [" << bar << "] " << percent << " %  " << to_utf8(name.substr(0, 40)) << "\033[K"
              << std::flush;
    return true;
  }

  const char* word_;
  bool is_shown_;
  std::uint64_t percent_ = none;
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

/// Reports the entries that are unpacked under a name that is safe on every system, but not their own.
void report_changed_names(const archives::Archive& archive, const Text& items, bool keep_folders) {
  const archives::EntryFilter filter(items);
  for (std::uint64_t i = 0; i < archive.count(); ++i) {
    const Text stored = archive.entry(i).name;
    const auto parts = archives::safe_parts(stored);
    if (!parts || !filter.matches(archives::parts_of(stored))) continue;
    if (!keep_folders && stored.ends_with(u'/')) continue;
    Text meant = meant_name(stored);
    if (!keep_folders) meant.erase(0, meant.find_last_of(u'/') + 1);
    const Text made = keep_folders ? joined(*parts) : parts->back();
    if (made != meant) std::cerr << "talutil: " << json::text(stored) << " is unpacked as " << json::text(made) << '\n';
  }
}

void print_entries(const archives::Archive& archive) {
  constexpr std::int64_t seconds_a_day = 86400;
  constexpr double epoch = 25569;  // 1 January 1970 as an automation date
  for (std::uint64_t i = 0; i < archive.count(); ++i) {
    const archives::Archive::Entry entry = archive.entry(i);
    const Date time{epoch + static_cast<double>(entry.facts.modified) / seconds_a_day};
    std::cout << std::setw(12) << entry.facts.size << std::setw(12) << entry.packed_size << "  "
              << to_utf8(format_date(time, u"YYYY-MM-DD HH:MM:SS")) << (entry.is_encrypted ? " *" : "  ")
              << to_utf8(entry.name) << '\n';
  }
  if (const Text comment = archive.comment(); !comment.empty()) std::cout << to_utf8(comment) << '\n';
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
  std::cout << options.archive << ": " << archive.count() << " entries, all well\n";
}

void pack_archive(const ZipOptions& options) {
  posix::PosixPlatform platform;
  on_archive(options.archive, [&] {
    if (options.test) return test_archive(options, platform);
    if (options.items.empty()) throw usage_failure("zip: name what is to be packed: talutil zip ARCHIVE ITEM...");
    archives::PackingOptions packing;
    packing.keep_folders = !options.no_folders;
    packing.aes = options.aes;
    packing.level = options.level;
    packing.comment = text_of(options.comment);
    packing.password = read_password(options.password_file);
    if (options.encrypt) packing.password = ask_new_password(platform.input_boxes);
    if (options.aes && packing.password.empty()) {
      throw usage_failure("--aes wants a password: give --encrypt or --password-file");
    }
    if (options.volume_size != 0) packing.volume_size = options.volume_size;
    const Text name = text_of(options.archive);
    const auto report = [&] { report_changed_names(archives::Archive(name, platform.folders), {}, true); };
    try {
      ProgressBar bar("packing");
      Progress progress = bar.progress();
      archives::pack(name, item_list(options.items), packing, platform.folders, progress);
    } catch (const archives::Error& error) {
      if (error.code() == archives::Code::incomplete) report();
      throw;
    }
    report();
  });
}

void unpack_archive(const UnzipOptions& options) {
  posix::PosixPlatform platform;
  on_archive(options.archive, [&] {
    archives::Archive archive(text_of(options.archive), platform.folders);
    if (options.list) return print_entries(archive);
    archives::UnpackingOptions unpacking;
    unpacking.items = item_list(options.items);
    unpacking.password = read_password(options.password_file);
    unpacking.overwrite = options.overwrite;
    unpacking.keep_folders = !options.no_folders;
    report_changed_names(archive, unpacking.items, unpacking.keep_folders);
    ProgressBar bar("unpacking");
    Progress progress = bar.progress();
    archive.extract(text_of(options.destination), unpacking, platform.folders, platform.files,
                    question(platform.input_boxes), progress);
  });
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
  choose(*zip, work, packing, &pack_archive);

  const auto unpacking = std::make_shared<UnzipOptions>();
  auto* const unzip = app.add_subcommand("unzip", "Unpack an archive, or the last volume of a split set");
  unzip->add_option("ARCHIVE", unpacking->archive)->required();
  unzip->add_option("ITEM", unpacking->items, "Entries, folders or patterns; default: all");
  unzip->add_option("--to", unpacking->destination, "The folder to unpack to; created if missing")
      ->capture_default_str();
  unzip->add_option("--password-file", unpacking->password_file,
                    "Read the password from its first line; - is standard input");
  unzip->add_flag("--overwrite", unpacking->overwrite, "Replace existing files; by default they are kept");
  unzip->add_flag("--no-folders", unpacking->no_folders, "Write all files into one folder");
  unzip->add_flag("--list", unpacking->list, "List the entries instead: size, packed size, time (UTC), name");
  choose(*unzip, work, unpacking, &unpack_archive);
}

}  // namespace talutil::cli
