#pragma once

#include <cstdint>
#include <string>
#include <vector>

/// The subcommands. Each prints to standard output and ends with Failure when it cannot do its work.
namespace talutil::cli {

struct ListOptions {
  bool missing = false;
  bool json = false;
};
void list(const ListOptions& options);

void help(const std::string& member);

/// Prints the Markdown reference page.
void reference();

struct CallOptions {
  std::string member;
  std::vector<std::string> arguments;
  std::vector<std::string> settings;  ///< NAME=VALUE, put in this order before the call.
  bool json = false;
};
void call(const CallOptions& options);

struct CleanOptions {
  std::string csv;
  std::string plan;
  std::string output;  ///< Empty for the CSV file's name with .sql.
  std::string table;   ///< Empty for the CSV file's name without folder and extension.
};
void clean(const CleanOptions& options);

struct LogTailOptions {
  std::string path;  ///< The event log, or the folder it is in.
  std::int64_t lines = 10;
  bool follow = false;
};
void log_tail(const LogTailOptions& options);

}  // namespace talutil::cli
