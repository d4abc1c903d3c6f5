#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

/// The subcommands. Each prints to standard output and throws Failure if it cannot do its work.
namespace CLI {
class App;
}

namespace talutil::cli {

struct ListOptions {
  bool json = false;
};
void list(const ListOptions& options);

/// Explains a class or a member.
void help(const std::string& name);

/// Prints the reference of all classes as a page in Markdown.
void reference();

/// Prints the same as JSON: an object with "families" and "classes".
void reference_json();

/// Prints the manual page of the command, in roff.
void man_page(const CLI::App& app);

struct CallOptions {
  std::string member;
  std::vector<std::string> arguments;
  std::vector<std::string> settings;  ///< NAME=VALUE, put in order before the call.
  std::optional<std::uint32_t> code_page;
  bool json = false;
};
void call(const CallOptions& options);

struct CleanOptions {
  std::string csv;
  std::string plan;
  std::string output;                      ///< If empty, the CSV file's name with .sql.
  std::vector<std::string> settings;       ///< NAME=VALUE, put in order before the first row.
  std::string table;                       ///< If empty, the CSV file's name without folder and extension.
  std::optional<std::uint32_t> code_page;  ///< Also used for the files.
};
void clean(const CleanOptions& options);

struct SecretOptions {
  bool exact = false;  ///< The text is read or printed exactly, without removing or adding a line break.
};
void encrypt(const SecretOptions& options);
void decrypt(const SecretOptions& options);

struct PasswordOptions {
  std::int16_t length = 16;
  std::string mix = "all";
  int count = 1;
};
void password(const PasswordOptions& options);

/// The location of settings: a profile file, or a group of the user's store.
struct ConfigOptions {
  std::string file;
  std::string group = "user";
  std::string database;
  std::string user;
  std::string section;
  std::string item;
  std::string value;
  std::string profile;  ///< The file that export writes and import reads.
  bool force = false;
};
void config_get(const ConfigOptions& options);
void config_set(const ConfigOptions& options);
void config_list(const ConfigOptions& options);
void config_export(const ConfigOptions& options);
void config_import(const ConfigOptions& options);

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
void zip(const ZipOptions& options);

struct UnzipOptions {
  std::string archive;
  std::vector<std::string> items;
  std::string destination = ".";
  std::string password_file;
  bool overwrite = false;
  bool no_folders = false;
  bool list = false;
};
void unzip(const UnzipOptions& options);

struct ExportOptions {
  std::string table;                ///< A comma-separated file; its first line is row 0.
  std::vector<std::string> hidden;  ///< Columns, counted from 1.
  std::string rows;                 ///< "3-7" or "3"; empty for all.
  std::string output;
};
void export_table(const ExportOptions& options);

struct ReportOptions {
  std::string file;  ///< A table (.csv), or a text.
  std::string title;
  std::string paper = "A4";
  bool landscape = false;
  std::string pdf;  ///< If empty, the file's name with .pdf.
};
void report(const ReportOptions& options);

struct SystemOptions {
  bool json = false;
  std::string item;  ///< A file or folder to show details of; empty for none.
};
void system_information(const SystemOptions& options);

struct LogTailOptions {
  std::string path;  ///< The event log, or its folder.
  std::int64_t lines = 10;
  bool follow = false;
};
void log_tail(const LogTailOptions& options);

}  // namespace talutil::cli
