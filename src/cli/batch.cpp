#include "cli/batch.hpp"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "calling/comparison.hpp"
#include "cli/failure.hpp"
#include "cli/line_source.hpp"
#include "cli/options.hpp"
#include "cli/session.hpp"

namespace talutil::cli {

namespace {

struct BatchOptions {
  std::string compared;  ///< The recording to repeat; empty to answer calls.
  std::optional<std::uint32_t> code_page;
};

/// Standard output, buffered. Whatever is still in the buffer when an error ends the command is lost.
class Output {
 public:
  [[nodiscard]] std::string& buffer() noexcept { return buffer_; }

  void flush_if_large() {
    constexpr std::size_t large = 1 << 18;
    if (buffer_.size() >= large) flush();
  }

  void flush() {
    for (std::string_view rest = buffer_; !rest.empty();) {
      const ssize_t count = ::write(STDOUT_FILENO, rest.data(), rest.size());
      if (count < 0 && errno == EINTR) continue;
      if (count < 0) throw run_time_failure(std::string("cannot write the output: ") + std::strerror(errno));
      rest.remove_prefix(static_cast<std::size_t>(count));
    }
    buffer_.clear();
  }

 private:
  std::string buffer_;
};

bool is_blank(std::string_view line) { return line.find_first_not_of(" \t\r") == std::string_view::npos; }

void answer_calls(const BatchOptions& options) {
  Session session(options.code_page);
  calling::Caller caller(session.library());
  Output output;
  LineSource lines(STDIN_FILENO, [&] { output.flush(); });
  std::size_t refused = 0;
  for (std::string_view line; lines.read(line);) {
    if (is_blank(line)) continue;
    if (!caller.answer(line, lines.number(), output.buffer())) ++refused;
    output.buffer() += '\n';
    output.flush_if_large();
  }
  output.flush();
  if (refused == 0) return;
  throw run_time_failure(
      "standard input: " + std::to_string(refused) +
      (refused == 1 ? " line was no call; its answer says" : " lines were no calls; their answers say") + " why");
}

/// The library of a recorded process, and the platform that it needs.
std::shared_ptr<Library> start_library(std::optional<std::uint32_t> code_page) {
  const auto session = std::make_shared<Session>(code_page);
  return {session, &session->library()};
}

/// Opens a file for reading; "-" is standard input.
class InputDescriptor {
 public:
  explicit InputDescriptor(const std::string& path)
      : is_ours_(path != "-"), value_(is_ours_ ? ::open(path.c_str(), O_RDONLY | O_CLOEXEC) : STDIN_FILENO) {
    if (value_ < 0) throw run_time_failure(path + ": " + std::strerror(errno));
  }
  InputDescriptor(const InputDescriptor&) = delete;
  InputDescriptor& operator=(const InputDescriptor&) = delete;
  ~InputDescriptor() {
    if (is_ours_) ::close(value_);
  }

  [[nodiscard]] int value() const noexcept { return value_; }

 private:
  bool is_ours_;
  int value_;
};

void print_summary(const calling::Comparison& comparison, std::string& out) {
  out += std::to_string(comparison.compared()) + " calls compared, " + std::to_string(comparison.different()) +
         " different\n";
  for (const auto& [reason, count] : comparison.skipped()) {
    out += std::to_string(count) + " skipped: " + reason + '\n';
  }
}

void compare_calls(const BatchOptions& options) {
  const InputDescriptor input(options.compared);
  calling::Comparison comparison([&] { return start_library(options.code_page); });
  Output output;
  LineSource lines(input.value(), [&] { output.flush(); });
  std::size_t damaged = 0;
  for (std::string_view line; lines.read(line);) {
    if (is_blank(line)) continue;
    std::string difference;
    try {
      difference = comparison.repeat(line);
    } catch (const calling::JsonError& error) {
      // A recording that ended because the disk was full may have half a line; the others are as good as ever.
      difference = std::string("no record: ") + error.what();
      ++damaged;
    }
    if (difference.empty()) continue;
    output.buffer() += "line " + std::to_string(lines.number()) + ": " + difference + '\n';
    output.flush_if_large();
  }
  print_summary(comparison, output.buffer());
  output.flush();
  if (comparison.different() != 0) throw run_time_failure(options.compared + ": there are differences");
  if (damaged != 0) throw run_time_failure(options.compared + ": " + std::to_string(damaged) + " lines are no records");
}

}  // namespace

void add_batch(CLI::App& app, Work& work) {
  auto* const command = app.add_subcommand("batch", "Answer calls on standard input, one JSON object per line");
  const auto options = std::make_shared<BatchOptions>();
  add_code_page(*command, options->code_page, "used to compare characters");
  command->add_option("--compare", options->compared, "Repeat the calls of a recording and print what differs")
      ->type_name("FILE");
  command->footer(
      "  {\"call\": \"GetData\", \"args\": [\"A,B,\", 0, 1], \"set\": {\"sUserName\": \"anne\"}, \"id\": 7}\n"
      "is answered by\n"
      "  {\"id\": 7, \"result\": \"A\"}\n"
      "in the same process, so that settings last. docs/batch.md describes values, objects and errors.");
  choose(*command, work, options,
         [](const BatchOptions& chosen) { chosen.compared.empty() ? answer_calls(chosen) : compare_calls(chosen); });
}

}  // namespace talutil::cli
