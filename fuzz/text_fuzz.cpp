// Checks what must hold for any text, compared with naive references. Build with clang and run:
//   text_fuzz -max_len=512 -max_total_time=60

#include <algorithm>
#include <cstdint>
#include <vector>

#include "automation/run_time_error.hpp"
#include "fuzz/host.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

using fuzz::require;

Text naive_replace_word(const Text& text, const Text& from, const Text& to) {
  Text result;
  for (std::size_t at = 0; at < text.size();) {
    const bool here = !from.empty() && text.compare(at, from.size(), from) == 0;
    result += here ? to : text.substr(at, 1);
    at += here ? from.size() : 1;
  }
  return result;
}

Text naive_replace(const Text& text, char16_t from, const Text& to) {
  Text result;
  for (const char16_t unit : text) result += ansi_code(unit) == ansi_code(from) ? to : Text(1, unit);
  return result;
}

void check_verified_text(ORVUtils& utils, const Text& text, std::int16_t width, std::int16_t extras) {
  const Text verified = utils.VerifyTextData(width, extras, text);
  constexpr TextView forbidden = u"\"'\t#><?&";
  const auto is_forbidden = [&](char16_t unit) { return forbidden.find(ansi_code(unit)) != TextView::npos; };
  require(std::ranges::none_of(verified, is_forbidden), "nothing forbidden is left");
  require(verified.find(u'\0') == Text::npos, "no NUL is left");
  require(width <= 0 || verified.size() <= static_cast<std::size_t>(width), "the width is kept");
  if (extras == 4 || extras == 5) return;
  // Removing a character can leave a blank at an end, which only a second call trims.
  require(utils.VerifyTextData(width, extras, verified) == trim_blanks(verified), "a second call only trims");
}

void check_line_handling(ORVUtils& utils, const Text& text) {
  for (const std::int16_t extras : {std::int16_t{4}, std::int16_t{5}}) {
    const Text verified = utils.VerifyTextData(0, extras, text);
    require(verified.empty() || verified.ends_with(u"\r\n"), "every line kept ends with a line break");
    require(verified.find(u"$*$") == Text::npos, "no marked line is left");
    const auto breaks = naive_replace_word(verified, u"\r\n", u"").size();
    require(extras == 5 || verified.size() - breaks <= 6, "at most three lines are left");
  }
}

void check_line_break_markers(ORVUtils& utils, const Text& text, char16_t marker) {
  // Only whole line breaks and no marker, as in texts that hosts store.
  Text lines = naive_replace(naive_replace(text, u'\r', u""), marker, u"");
  lines = naive_replace(lines, u'\n', u"\r\n");
  if (ansi_code(marker) == u'\r' || ansi_code(marker) == u'\n') return;
  const Text stored = utils.CRLFStringReplace(lines, Text(1, marker));
  require(utils.StringRestoreCRLF(stored, Text(1, marker)) == lines, "line breaks come back");
}

void check_list(ORVUtils& utils, const Text& text) {
  TextArray list;
  const std::int32_t count = utils.ReadCommaDelimStrToList(text, list, u",");
  require(list.allocated == (count > 0), "an array is made for elements only");
  require(list.items.size() == static_cast<std::size_t>(count), "the count is the array's");
  require(utils.SubStrCount(u",", text) == count, "a delimiter an element");
  Text joined;
  for (std::int32_t i = 0; i < count; ++i) {
    joined.append(list.at(i)).append(u",");
    require(utils.GetData(text, i, i + 1) == list.at(i), "GetData agrees");
    require(bool(utils.MyInstrDelim(list.at(i), text, u",")), "MyInstrDelim finds every element");
  }
  require(text.starts_with(joined) && text.find(u',', joined.size()) == Text::npos, "joined again, it is the text");
}

void check(fuzz::Input input) {
  static fuzz::Host host;
  ORVUtils& utils = host.utils();

  const auto extras = static_cast<std::int16_t>(input.byte() % 6);
  const auto width = static_cast<std::int16_t>(input.byte() % 64 - 16);
  const auto marker = static_cast<char16_t>(input.byte());
  const auto repeats = static_cast<std::size_t>(input.byte());
  const Text from = input.text(8);
  const Text to = input.text(8);
  Text text = input.text(255);

  check_verified_text(utils, text, width, extras);
  check_line_handling(utils, text);
  check_line_break_markers(utils, text, marker);
  check_list(utils, text);
  require(utils.ReverseString(utils.ReverseString(text)) == text, "twice reversed is not reversed");

  // Long texts take other code paths than short ones.
  for (std::size_t i = 0, once = text.size(); i < repeats && i < 16; ++i) text.append(text, 0, once);
  require(utils.StringReplaceWord(text, from, to) == naive_replace_word(text, from, to), "StringReplaceWord");
  if (!from.empty()) require(utils.StringReplace(text, from, to) == naive_replace(text, from[0], to), "StringReplace");
  (void)utils.VerifyMemField(text);
  (void)utils.StringPosition(text, 1);
  try {
    (void)utils.VerifyIntData(0, text);
  } catch (const RunTimeError& error) {
    require(error.number() == 6, "a text with a number too large is an overflow");
  }
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace std::string_view_literals;
  talutil::check({data, size, u"aab ,&\"'\t#><?\r\n$*|\0\u2032\u0416\u00B4"sv});
  return 0;
}
