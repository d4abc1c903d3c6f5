#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <iostream>
#include <optional>

#include "cli/failure.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "platform/posix/descriptor.hpp"
#include "platform/posix/posix_files.hpp"

namespace talutil::cli {

namespace {

struct LogTailOptions {
  std::string path;  ///< The event log, or its folder.
  std::int64_t lines = 10;
  bool follow = false;
  bool json = false;
  bool raw = false;
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

/// An event as the log has it: "user:DDMMYYYYHHMMSS:text:form". The text may have colons.
struct Event {
  TextView user;
  Text time;
  TextView text;
  TextView form;
};

std::optional<Event> event_of(TextView line) {
  constexpr std::size_t stamp_length = 14;
  const std::size_t user_end = line.find(u':');
  const std::size_t form_start = line.rfind(u':');
  if (user_end == TextView::npos || form_start <= user_end + stamp_length + 1) return std::nullopt;
  const TextView stamp = line.substr(user_end + 1, stamp_length);
  if (!std::ranges::all_of(stamp, is_decimal_digit) || line[user_end + 1 + stamp_length] != u':') return std::nullopt;
  const auto part = [&](std::size_t at, std::size_t length) { return Text(stamp.substr(at, length)); };
  Event event;
  event.user = line.substr(0, user_end);
  event.time =
      part(4, 4) + u"-" + part(2, 2) + u"-" + part(0, 2) + u"T" + part(8, 2) + u":" + part(10, 2) + u":" + part(12, 2);
  event.text = line.substr(user_end + stamp_length + 2, form_start - user_end - stamp_length - 2);
  event.form = line.substr(form_start + 1);
  return event;
}

void print_line(TextView line, const LogTailOptions& options) {
  const auto event = options.raw ? std::nullopt : event_of(line);
  if (options.json) {
    std::vector<json::Field> fields{{"line", json::text(line)}};
    if (event) {
      fields = {{"time", json::text(event->time)},
                {"user", json::text(event->user)},
                {"text", json::text(event->text)},
                {"form", json::text(event->form)}};
    }
    std::cout << json::object(fields) << '\n';
  } else if (event) {
    Text time = event->time;
    std::ranges::replace(time, u'T', u' ');
    std::cout << to_utf8(time + u"  " + Text(event->user) + u"  " + Text(event->text) + u"  (" + Text(event->form) +
                         u")")
              << '\n';
  } else {
    std::cout << to_utf8(line) << '\n';
  }
}

void print_lines(std::string bytes, const LogTailOptions& options) {
  std::erase(bytes, '\r');
  const Text text = from_ansi(bytes);
  for (TextView rest = text; !rest.empty();) {
    const TextView line = rest.substr(0, rest.find(u'\n'));
    rest.remove_prefix(std::min(line.size() + 1, rest.size()));
    print_line(line, options);
  }
  std::cout << std::flush;
}

/// Waits a moment for more events; returns false if nobody reads the output any more.
bool wait_for_more() {
  constexpr int milliseconds = 200;
  pollfd output{STDOUT_FILENO, 0, 0};
  poll(&output, 1, milliseconds);
  return (output.revents & (POLLERR | POLLHUP | POLLNVAL)) == 0;
}

std::int64_t size_of(const posix::Descriptor& file) { return lseek(file.get(), 0, SEEK_END); }

/// Prints whatever is appended, in whole lines, until the command is interrupted or its output closed.
void follow(const posix::Descriptor& file, std::int64_t printed, const LogTailOptions& options) {
  while (wait_for_more()) {
    const std::int64_t size = size_of(file);
    if (size < printed) printed = 0;  // The log was started afresh.
    const std::string added = read_part(file, printed, size);
    const std::size_t whole = added.rfind('\n') + 1;
    if (whole == 0) continue;
    print_lines(added.substr(0, whole), options);
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
    throw run_time_failure("cannot read the event log \"" + to_utf8(path) + "\"", error);
  }
  const std::int64_t size = size_of(file);
  print_lines(read_part(file, begin_of_last_lines(file, size, options.lines), size), options);
  if (options.follow) follow(file, size, options);
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
  tail->add_flag("--raw", options->raw, "Print lines as the log has them: user:stamp:text:form");
  add_json(*tail, options->json, "Print one object per event");
  choose(*tail, work, options, &log_tail);
}

}  // namespace talutil::cli
