#include <cstdint>
#include <utility>
#include <vector>

#include "automation/checked.hpp"
#include "automation/text.hpp"
#include "library/orv_utils.hpp"
#include "text/characters.hpp"

namespace talutil {

namespace {

constexpr TextView drop_mark = u"$*$";  ///< The hosts' mark for lines that are not to be stored.

// Limits for compressing lines: lengths in characters, all exclusive.
constexpr std::size_t most_lines = 3;
constexpr std::size_t joinable_length = 40;
constexpr std::size_t joined_length = 73;

struct Replacement {
  TextView from;
  TextView to;
};

/// Characters that would end a quoted database text, or that hosts use as separators. The order matters: each step
/// works on the result of the previous one.
constexpr Replacement forbidden[] = {
    {u"&", u"and"}, {u"\"", u""}, {u"'", u"\u00B4"}, {u"\t", u""}, {u"#", u""}, {u">", u""}, {u"<", u""}, {u"?", u""},
};

/// Single passes, not repeated: four blanks end up as two, five as one. Line feeds have already been replaced, so the
/// rows with line breaks find nothing; they are kept because hosts that override a member see these calls.
constexpr Replacement memo_runs[] = {
    {u"  ", u" "},    {u"   ", u" "},     {u"    ", u" "},      {u"\r\n\r\n", u"\r\n"}, {u"\r\n\r\n\r\n", u"\r\n"},
    {u"\r\r", u"\r"}, {u"\r\r\r", u"\r"}, {u"\r\r\r\r", u"\r"},
};

/// A text without a line break is one line; a text that ends with one has an empty last line.
std::vector<TextView> split_lines(TextView text) {
  std::vector<TextView> lines;
  std::size_t start = 0;
  for (std::size_t end = text.find(line_break); end != TextView::npos; end = text.find(line_break, start)) {
    lines.push_back(text.substr(start, end - start));
    start = end + line_break.size();
  }
  lines.push_back(text.substr(start));
  return lines;
}

bool is_marked(TextView line) noexcept { return line.find(drop_mark) != TextView::npos; }

Text drop_marked_lines(TextView text) {
  Text result;
  for (const TextView line : split_lines(text)) {
    if (!is_marked(line)) result.append(trim_blanks(line)).append(line_break);
  }
  return result;
}

/// Joins line `last` with the one before it if both are short enough, and empties the latter.
Text join_short_lines(std::vector<TextView>& lines, std::size_t last) {
  const TextView line = lines[last];
  if (last == 0 || line.size() >= joinable_length) return Text(line);
  TextView& before = lines[last - 1];
  if (before.empty() || line.size() + before.size() >= joined_length) return Text(line);
  Text joined = Text(before).append(u" - ").append(line);
  before = {};
  return joined;
}

/// Keeps the last three non-empty lines, after joining short neighbours, starting at the end.
Text compress_lines(TextView text) {
  std::vector<TextView> lines = split_lines(text);
  for (TextView& line : lines) line = is_marked(line) ? TextView() : trim_blanks(line);

  std::vector<Text> kept_from_last;
  for (std::size_t i = lines.size(); i-- > 0 && kept_from_last.size() < most_lines;) {
    if (!lines[i].empty()) kept_from_last.push_back(join_short_lines(lines, i));
  }

  Text result;
  for (auto line = kept_from_last.rbegin(); line != kept_from_last.rend(); ++line) {
    result.append(*line).append(line_break);
  }
  return result;
}

/// A value as text, trimmed. Avoids another copy of a text, which can be long.
Text trimmed_text(Variant value, const Locale& locale) {
  Text* const held = value.get_if<Text>();
  Text text = held != nullptr ? std::move(*held) : value.to_text(locale);
  const TextView trimmed = trim_blanks(text);
  return trimmed.size() == text.size() ? text : Text(trimmed);
}

/// The additional cleaning that a field asks for.
Text clean_extras(ORVUtils& utils, Text s, std::int16_t extras) {
  if (extras == 1 || extras == 3) s = utils.StringReplace(s, u",", u"");
  if (extras == 2 || extras == 3) s = utils.StringReplace(s, u" ", u"");
  if (extras == 4) return compress_lines(s);
  if (extras == 5) return drop_marked_lines(s);
  return s;
}

}  // namespace

Text ORVUtils::VerifyTextData(const std::int16_t& iMaxTextLength, const std::int16_t& iExtras, const Variant& vData) {
  settings().CounterVerifyText = checked_add(settings().CounterVerifyText, 1);
  Variant value = vData.value();
  const Locale here = locale();
  if (value.is_null() || value.equals_text(u"", here)) return {};

  Text s = StripNulls(trimmed_text(std::move(value), here));
  for (const Replacement& step : forbidden) s = StringReplace(s, Text(step.from), Text(step.to));
  s = clean_extras(*this, std::move(s), iExtras);

  // This may cut a line break or a joined line in half; fields have always been cut this way.
  if (iMaxTextLength > 0 && s.size() > static_cast<std::size_t>(iMaxTextLength)) {
    s.resize(static_cast<std::size_t>(iMaxTextLength));
  }
  return s;
}

Text ORVUtils::VerifyIntData(const std::int16_t& iFlag, const Variant& vData) {
  settings().CounterVerifyInt = checked_add(settings().CounterVerifyInt, 1);
  const Variant value = vData.value();
  if (value.is_null()) return iFlag == 1 ? u"0" : u"";
  const Locale here = locale();
  return number_to_text(leading_number(value.to_text(here)), here);
}

Text ORVUtils::VerifyMemField(const Text& sMemData) {
  Text s = StringReplace(sMemData, u"\n", u" ");
  for (const Replacement& run : memo_runs) s = StringReplaceWord(s, Text(run.from), Text(run.to));
  return s;
}

}  // namespace talutil
