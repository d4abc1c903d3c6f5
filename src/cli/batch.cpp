#include "cli/batch.hpp"

#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "calling/caller.hpp"
#include "cli/failure.hpp"
#include "cli/line_source.hpp"
#include "cli/options.hpp"
#include "cli/session.hpp"

namespace talutil::cli {

namespace {

struct BatchOptions {
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

}  // namespace

void add_batch(CLI::App& app, Work& work) {
  auto* const command = app.add_subcommand("batch", "Answer calls on standard input, one JSON object per line");
  const auto options = std::make_shared<BatchOptions>();
  add_code_page(*command, options->code_page, "used to compare characters");
  command->footer(
      "  {\"call\": \"GetData\", \"args\": [\"A,B,\", 0, 1], \"set\": {\"sUserName\": \"anne\"}, \"id\": 7}\n"
      "is answered by\n"
      "  {\"id\": 7, \"result\": \"A\"}\n"
      "in the same process, so that settings last. docs/batch.md describes values, objects and errors.");
  choose(*command, work, options, &answer_calls);
}

}  // namespace talutil::cli
