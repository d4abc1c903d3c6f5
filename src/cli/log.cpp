#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <iostream>
#include <thread>

#include "cli/failure.hpp"
#include "cli/options.hpp"
#include "platform/posix/descriptor.hpp"
#include "platform/posix/posix_files.hpp"

namespace talutil::cli {

namespace {

struct LogTailOptions {
  std::string path;  ///< The event log, or its folder.
  std::int64_t lines = 10;
  bool follow = false;
};

/// Reads part of a file.
std::string read_part(const posix::Descriptor& file, std::int64_t begin, std::int64_t end) {
  std::string bytes(static_cast<std::size_t>(end - begin), '\0');
  std::size_t done = 0;
  while (done < bytes.size()) {
    const ssize_t count =
        pread(file.get(), bytes.data() + done, bytes.size() - done, begin + static_cast<std::int64_t>(done));
    if (count <= 0) break;  // The file was truncated.
    done += static_cast<std::size_t>(count);
  }
  bytes.resize(done);
  return bytes;
}

/// The position of a file's last lines, searched backwards from the end, so that long logs cost no more than short
/// ones.
std::int64_t begin_of_last_lines(const posix::Descriptor& file, std::int64_t size, std::int64_t lines) {
  constexpr std::int64_t piece_size = 65536;
  std::int64_t breaks = 0;
  for (std::int64_t end = size; end > 0; end -= std::min(end, piece_size)) {
    const std::int64_t begin = end - std::min(end, piece_size);
    const std::string piece = read_part(file, begin, end);
    for (std::size_t i = piece.size(); i-- > 0;) {
      const std::int64_t at = begin + static_cast<std::int64_t>(i);
      // A line break at the very end only ends the last line.
      if (piece[i] == '\n' && at + 1 < size && ++breaks == lines) return at + 1;
    }
  }
  return 0;
}

void print_lines(std::string bytes) {
  std::erase(bytes, '\r');
  if (!bytes.empty() && bytes.back() != '\n') bytes += '\n';
  std::cout << to_utf8(from_ansi(bytes)) << std::flush;
}

std::int64_t size_of(const posix::Descriptor& file) { return lseek(file.get(), 0, SEEK_END); }

/// Prints whatever is appended, in whole lines, until the program is interrupted.
[[noreturn]] void follow(const posix::Descriptor& file, std::int64_t printed) {
  using namespace std::chrono_literals;
  for (;; std::this_thread::sleep_for(200ms)) {
    const std::int64_t size = size_of(file);
    if (size < printed) printed = 0;  // The log was started afresh.
    const std::string added = read_part(file, printed, size);
    const std::size_t whole = added.rfind('\n') + 1;
    if (whole == 0) continue;
    print_lines(added.substr(0, whole));
    printed += static_cast<std::int64_t>(whole);
  }
}

Text log_path(const std::string& given) {
  Text path = from_utf8(given);
  const auto is_folder = [&] {
    try {
      return (posix::PosixFiles().attributes(path) & file_attribute::folder) != 0;
    } catch (const RunTimeError&) {
      return false;
    }
  };
  return is_folder() ? path + u"/EventLog.txt" : path;
}

void log_tail(const LogTailOptions& options) {
  if (options.lines < 1) throw usage_failure("--lines " + std::to_string(options.lines) + ": write 1 or more");
  const Text path = log_path(options.path);
  posix::Descriptor file;
  try {
    file = posix::open_file(posix::PosixFiles().native(path), O_RDONLY);
  } catch (const RunTimeError& error) {
    throw run_time_failure("cannot read the event log \"" + to_utf8(path) + "\": " + error_words(error));
  }
  const std::int64_t size = size_of(file);
  print_lines(read_part(file, begin_of_last_lines(file, size, options.lines), size));
  if (options.follow) follow(file, size);
}

}  // namespace

void add_log(CLI::App& app, Work& work) {
  const auto options = std::make_shared<LogTailOptions>();
  auto* const command = app.add_subcommand("log", "Show an event log");
  command->require_subcommand(1);
  auto* const tail = command->add_subcommand("tail", "Print the last events, oldest first");
  tail->add_option("PATH", options->path, "EventLog.txt, or its folder (C:\\TAL\\ORV3)")->required();
  tail->add_option("-n,--lines", options->lines, "How many lines; default: 10");
  tail->add_flag("-f,--follow", options->follow, "Continue with new events as they are added");
  choose(*tail, work, options, &log_tail);
}

}  // namespace talutil::cli
