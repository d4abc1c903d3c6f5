#include <algorithm>

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "text/characters.hpp"

namespace talutil {

namespace {

/// `count` characters from a position, counted from 1; fewer if the text ends.
Text middle(const Text& text, std::int32_t position, std::size_t count = Text::npos) {
  const auto start = static_cast<std::size_t>(position - 1);
  return start < text.size() ? text.substr(start, count) : Text();
}

constexpr bool is_number_code(std::uint32_t code) noexcept { return is_digit_code(code) || code == u'.'; }

constexpr bool is_password_code(std::uint32_t code) noexcept {
  return is_digit_code(code) || (code >= u'A' && code <= u'Z');
}

}  // namespace

Boolean ORVUtils::IsValueNumber(const Text& sText) {
  CodePage& page = library_.platform().code_page;
  return Boolean(!sText.empty() && std::ranges::all_of(sText, by_code(page, is_number_code)));
}

Boolean ORVUtils::IsValueDate(const Text& sText) {
  const Text s = StringReplace(sText, u"-", u"/");
  const std::int32_t p1 = MyPos(u"/", s, 1);
  const std::int32_t p2 = MyPos(u"/", s, 2);
  if (p1 < 2 || p1 > 3 || p2 < 4 || p2 > 6) return Boolean(false);
  // Takes two characters of the month whatever the day's length, unless the second slash is the fourth character:
  // "12/3/2024" yields "3/" and fails. Hosts have always rejected it.
  const std::size_t month_length = p2 == 4 ? 1 : 2;
  const Text day = middle(s, 1, static_cast<std::size_t>(p1 - 1));
  const Text month = middle(s, p1 + 1, month_length);
  const Text year = middle(s, p2 + 1);
  return Boolean(IsValueNumber(day) && IsValueNumber(month) && IsValueNumber(year));
}

Boolean ORVUtils::IsValueTime(const Text& sText) {
  const std::int32_t p = MyPos(u":", sText, 1);
  if (p < 2 || p > 3) return Boolean(false);
  const Text hours = middle(sText, 1, static_cast<std::size_t>(p - 1));
  const Text minutes = middle(sText, p + 1);
  return Boolean(IsValueNumber(hours) && IsValueNumber(minutes));
}

Boolean ORVUtils::VerifyEmail(const Text& sTemp) {
  return Boolean(sTemp.empty() || (MyPos(u"@", sTemp, 1) > 0 && MyPos(u".", sTemp, 1) > 0));
}

Boolean ORVUtils::VerifyPasswordText(const Text& sPassword) {
  return Boolean(std::ranges::all_of(sPassword, by_code(library_.platform().code_page, is_password_code)));
}

Boolean ORVUtils::NumbersInString(const Text& sSource) {
  return Boolean(std::ranges::any_of(sSource, by_code(library_.platform().code_page, is_digit_code)));
}

}  // namespace talutil
