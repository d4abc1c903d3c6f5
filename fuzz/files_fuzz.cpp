// Checks what must hold for any bytes of a text file and any pattern. Build with clang and run:
//   files_fuzz -max_len=512 -max_total_time=60

#include <cstdint>
#include <cstdio>
#include <cstdlib>

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "platform/file_names.hpp"
#include "tests/fakes/fake_platform.hpp"

namespace talutil {
namespace {

void require(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "broken: %s\n", what);
  std::abort();
}

/// Splits lines by a naive implementation of the rule.
std::vector<Text> naive_lines(std::string bytes) {
  bytes = bytes.substr(0, bytes.find('\x1A'));
  std::vector<Text> lines;
  for (std::size_t at = 0; at < bytes.size();) {
    const std::size_t end = std::min(bytes.find('\r', at), bytes.size());
    lines.push_back(from_ansi(bytes.substr(at, end - at)));
    at = end + 1;
    if (at < bytes.size() && bytes[at] == '\n') ++at;
  }
  return lines;
}

/// Matches by trying everything, for patterns without the special rules for dots.
bool naive_match(TextView name, TextView pattern) {
  if (pattern.empty()) return name.empty();
  if (pattern[0] == u'*')
    return naive_match(name, pattern.substr(1)) || (!name.empty() && naive_match(name.substr(1), pattern));
  return !name.empty() && upper_case(name[0]) == upper_case(pattern[0]) &&
         naive_match(name.substr(1), pattern.substr(1));
}

void check_lines(const std::string& bytes) {
  testing::FakePlatform platform;
  Library library(platform.platform());
  ORVUtils utils(library);
  const Text path = u"C:\\a.txt";
  platform.files.put(path, bytes);
  TextArray list;
  const auto count = static_cast<std::size_t>(utils.OpenFile(path, list, 0));
  const std::vector<Text> expected = naive_lines(bytes);
  require(count == expected.size() && list.items == expected, "lines");
  require(utils.LoadTextBox(path) == from_ansi(bytes.substr(0, bytes.find('\x1A'))), "the whole text");
  if (count == 0) return;
  utils.SaveBigFile(list, path);
  TextArray again;
  require(utils.OpenFile(path, again, 0) == static_cast<std::int32_t>(count) && again == list, "lines come back");
}

void check_pattern(const std::string& bytes) {
  constexpr TextView letters = u"abA*";
  Text name;
  Text pattern;
  for (std::size_t i = 0; i < bytes.size() && i < 24; ++i) {
    const char16_t letter = letters[static_cast<std::uint8_t>(bytes[i]) % letters.size()];
    (i % 2 == 0 || letter == u'*' ? pattern : name) += letter;
  }
  require(name_matches(name, pattern) == naive_match(name, pattern), "patterns");
  const Text any = from_ansi(bytes);
  (void)name_matches(any, any);
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string bytes(reinterpret_cast<const char*>(data), size);
  talutil::check_lines(bytes);
  talutil::check_pattern(bytes);
  return 0;
}
