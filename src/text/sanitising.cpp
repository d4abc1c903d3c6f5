#include <algorithm>
#include <cstdint>
#include <optional>
#include <vector>

#include "automation/checked.hpp"
#include "automation/text.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "text/characters.hpp"
#include "text/forbidden_characters.hpp"
#include "text/overriding.hpp"

namespace talutil {

namespace {

constexpr TextView drop_mark = u"$*$";  ///< The hosts' mark for lines that are not to be stored.

// Limits for compressing lines: lengths in characters, all exclusive.
constexpr std::size_t most_lines = 3;
constexpr std::size_t joinable_length = 40;
constexpr std::size_t joined_length = 73;

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

/// The lines of a text from the last to the first, trimmed; marked ones are empty.
class LinesFromEnd {
 public:
  explicit LinesFromEnd(TextView text) noexcept : rest_(text) {}

  /// Nothing if there are no more.
  std::optional<TextView> next() noexcept {
    if (is_over_) return std::nullopt;
    const std::size_t end = rest_.rfind(line_break);
    is_over_ = end == TextView::npos;
    const TextView line = is_over_ ? rest_ : rest_.substr(end + line_break.size());
    if (!is_over_) rest_ = rest_.substr(0, end);
    return is_marked(line) ? TextView() : trim_blanks(line);
  }

 private:
  TextView rest_;
  bool is_over_ = false;
};

constexpr bool can_join(TextView before, TextView line) noexcept {
  return !before.empty() && line.size() < joinable_length && line.size() + before.size() < joined_length;
}

/// Keeps the last three non-empty lines, after joining short neighbours, starting at the end.
Text compress_lines(TextView text) {
  LinesFromEnd lines(text);
  Text result;
  std::size_t kept = 0;
  for (auto line = lines.next(); line && kept < most_lines;) {
    auto before = lines.next();
    if (!line->empty()) {
      Text whole = Text(*line).append(line_break);
      if (before && can_join(*before, *line)) {
        whole = Text(*before).append(u" - ").append(whole);
        before = TextView();
      }
      result.insert(0, whole);
      ++kept;
    }
    line = before;
  }
  return result;
}

/// A value to be cleaned, or that of an object's default member. Refers to a text, which can be long, where it is.
class GivenValue {
 public:
  explicit GivenValue(const Variant& given) : is_object_(given.is(Variant::Kind::object)), given_(given) {
    if (is_object_) value_ = given.value();
  }

  [[nodiscard]] bool is_null() const { return held().is(Variant::Kind::null); }

  /// Raises 13 if the value has no text form.
  [[nodiscard]] const Text& text(const ORVUtils& utils) {
    if (const Text* const text = held().get_if<Text>()) return *text;
    text_ = held().to_text(utils.locale());
    return text_;
  }

 private:
  [[nodiscard]] const Variant& held() const { return is_object_ ? value_ : given_; }

  bool is_object_;
  const Variant& given_;
  Variant value_;
  Text text_;
};

constexpr bool drops_commas(std::int16_t extras) noexcept { return extras == 1 || extras == 3; }
constexpr bool drops_blanks(std::int16_t extras) noexcept { return extras == 2 || extras == 3; }

/// The same as `without_forbidden`, by calling other members.
Text replaced_by_members(ORVUtils& utils, TextView text, std::int16_t extras) {
  Text s = utils.StripNulls(Text(text));
  const auto apply = [&](const Replacement& step) { s = utils.StringReplace(s, Text(step.from), Text(step.to)); };
  for (const Replacement& step : forbidden) apply(step);
  if (drops_commas(extras)) apply(comma_removal);
  if (drops_blanks(extras)) apply(blank_removal);
  return s;
}

/// Two blanks or two carriage returns: what every run begins with in a text without line feeds.
bool has_run(TextView text) noexcept {
  const auto is_start = [](char16_t a, char16_t b) { return a == b && (a == u' ' || a == u'\r'); };
  return std::ranges::adjacent_find(text, is_start) != text.end();
}

}  // namespace

Text ORVUtils::VerifyTextData(const std::int16_t& iMaxTextLength, const std::int16_t& iExtras, const Variant& vData) {
  settings().CounterVerifyText = checked_add(settings().CounterVerifyText, 1);
  GivenValue value(vData);
  if (value.is_null()) return {};
  const Text& given = value.text(*this);
  if (given.empty()) return {};

  const TextView trimmed = trim_blanks(given);
  Text s = may_see_calls(*this) ? replaced_by_members(*this, trimmed, iExtras)
                                : without_forbidden(library_.platform().code_page, up_to_nul(trimmed),
                                                    drops_commas(iExtras), drops_blanks(iExtras));
  if (iExtras == 4) s = compress_lines(s);
  if (iExtras == 5) s = drop_marked_lines(s);

  // This may cut a line break or a joined line in half; fields have always been cut this way.
  if (iMaxTextLength > 0 && s.size() > static_cast<std::size_t>(iMaxTextLength)) {
    s.resize(static_cast<std::size_t>(iMaxTextLength));
  }
  return s;
}

Text ORVUtils::VerifyIntData(const std::int16_t& iFlag, const Variant& vData) {
  settings().CounterVerifyInt = checked_add(settings().CounterVerifyInt, 1);
  GivenValue value(vData);
  if (value.is_null()) return iFlag == 1 ? u"0" : u"";
  // Only the separators count, not the date, which would have to be asked for.
  return number_to_text(leading_number(value.text(*this)), library_.platform().computer.locale());
}

Text ORVUtils::VerifyMemField(const Text& sMemData) {
  Text s = StringReplace(sMemData, u"\n", u" ");
  if (!may_see_calls(*this) && !has_run(s)) return s;
  for (const Replacement& run : memo_runs) s = StringReplaceWord(s, Text(run.from), Text(run.to));
  return s;
}

}  // namespace talutil
