// Checks what must hold on every code page for any text and any bytes: code_pages_fuzz -max_len=256 -runs=1000000
#include <algorithm>
#include <map>

#include "fuzz/input.hpp"
#include "platform/posix/posix_code_page.hpp"

namespace talutil {
namespace {

using fuzz::require;

constexpr std::uint32_t utf8_page = 65001;

bool is_surrogate(char16_t unit) { return (unit & 0xF800) == 0xD800; }
bool is_double_byte(std::uint32_t number) { return number >= 932 && number <= 950; }

void check_page(std::uint32_t number, CodePage& page, const Text& text, const std::string& bytes) {
  const Text read = page.text_of(bytes);
  const bool is_whole = read.find(u'\uFFFD') == Text::npos;
  if (number != utf8_page && !is_double_byte(number)) {
    require(read.size() == bytes.size(), "a byte is a character");
    require(!is_whole || page.bytes_of(read) == bytes, "bytes that are characters come back");
  }
  Text appended = u"x";
  page.append_text(appended, bytes);
  require(appended == u"x" + read, "texts are appended as they are read");

  const std::string written = page.bytes_of(text);
  require(page.bytes_of(page.text_of(written)) == written || !page.holds(text), "what the page holds stays");
  require(page.holds(text) == (page.text_of(written) == text), "what the page holds comes back");
  std::string pieces;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (is_surrogate(text[i])) return;
    const std::string piece = page.bytes_of(text.substr(i, 1));
    std::uint32_t code = 0;
    for (const char byte : piece) code = code << 8 | static_cast<std::uint8_t>(byte);
    require(page.code(text[i]) == code, "a character has the code of its bytes");
    require(text[i] >= 128 || code == text[i], "ASCII is the same everywhere");
    pieces += piece;
  }
  require(pieces == written, "characters are converted one by one");
  if (number == utf8_page) require(written == to_utf8(text) && from_utf8(written) == text, "UTF-8 is UTF-8");
}

void check(fuzz::Input input) {
  static std::map<std::uint32_t, std::unique_ptr<CodePage>> pages;
  if (pages.empty()) {
    for (const std::uint32_t number : posix::code_page_numbers()) pages[number] = posix::make_code_page(number);
  }
  const Text text = input.text(16);
  const std::string bytes(input.rest());
  require(from_utf16_bytes(to_utf16_bytes(text)) == text, "code units come back");
  require(from_utf8(to_utf8(from_utf8(bytes))) == from_utf8(bytes), "what UTF-8 can say comes back");
  for (const auto& [number, page] : pages) check_page(number, *page, text, bytes);
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  talutil::check({data, size, u"a?\u007F\u00E9\u0142\u0416\u05D0\u20AC\u2019\u3042\u4E00\uAC00\u1EA0\u0301"});
  return 0;
}
