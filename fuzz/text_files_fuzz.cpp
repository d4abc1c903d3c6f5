// Checks what is read of any bytes of a text file against a naive model: text_files_fuzz -max_len=512 -runs=1000000
#include <algorithm>
#include <string>
#include <vector>

#include "fuzz/host.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

using fuzz::require;

/// Splits lines by a naive implementation of the rule.
std::vector<Text> naive_lines(const std::string& bytes) {
  std::vector<Text> lines;
  for (std::size_t at = 0; at < bytes.size();) {
    const std::size_t end = std::min(bytes.find('\r', at), bytes.size());
    lines.push_back(from_ansi(bytes.substr(at, end - at)));
    at = end + 1;
    if (at < bytes.size() && bytes[at] == '\n') ++at;
  }
  return lines;
}

/// Some files reach across the end of a buffer, or of what counts as a short line, in the middle of a line or of its
/// end.
std::string bytes_of(fuzz::Input& input) {
  constexpr std::int32_t buffer = 1 << 16;
  constexpr std::int32_t short_line = 1024;
  const std::int32_t choice = input.whole(0, 31);
  std::string bytes;
  if (choice > 29) bytes.assign(static_cast<std::size_t>(input.whole(buffer - 5, buffer + 1)), 'x');
  if (choice == 29) bytes.assign(static_cast<std::size_t>(input.whole(short_line - 9, short_line + 1)), 'x');
  if (choice == 31) bytes += '\x1A';
  constexpr std::string_view common("ab\r\r\n\n\x1A\x80\xFC\0", 10);
  for (std::int32_t left = input.whole(0, 12); left > 0; --left) bytes += input.one_of(common);
  return bytes.append(input.rest());
}

void check(fuzz::Input input) {
  static fuzz::Host host;
  ORVUtils& utils = host.utils();
  const Text path = u"C:\\a.txt";
  const std::int32_t limit = input.whole(-1, 8);
  const std::string given = bytes_of(input);
  host.put_file(path, given);
  const std::string bytes = given.substr(0, given.find('\x1A'));
  require(utils.LoadTextBox(path) == from_ansi(bytes), "LoadTextBox");

  std::vector<Text> expected = naive_lines(bytes);
  if (limit > 0 && expected.size() > static_cast<std::size_t>(limit)) expected.resize(static_cast<std::size_t>(limit));
  const TextArray old{{u"o", u"l", u"d"}, 0, true};
  TextArray list = old;
  const auto count = static_cast<std::size_t>(utils.OpenFile(path, list, limit));
  require(count == expected.size() && list == (count == 0 ? old : TextArray{expected, 0, true}), "OpenFile");
  if (count == 0) return;
  utils.SaveBigFile(list, path);
  TextArray again;
  require(utils.OpenFile(path, again, 0) == static_cast<std::int32_t>(count) && again == list, "SaveBigFile");
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  talutil::check({data, size, u""});
  return 0;
}
