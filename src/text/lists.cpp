#include <algorithm>
#include <cstdint>
#include <utility>

#include "automation/checked.hpp"
#include "automation/text.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "text/characters.hpp"
#include "text/overriding.hpp"

namespace talutil {

namespace {

/// The characters from position `first` to position `last`, counted from 1, as far as they exist.
TextView between(TextView text, std::int64_t first, std::int64_t last) noexcept {
  first = std::max<std::int64_t>(first, 1);
  last = std::min(last, static_cast<std::int64_t>(text.size()));
  if (first > last) return {};
  return text.substr(static_cast<std::size_t>(first - 1), static_cast<std::size_t>(last - first + 1));
}

/// Calls `use` with each field that ends with a delimiter, until it returns false; the text after the last delimiter is
/// not a field. Only a delimiter of one character counts.
template <class Use>
void for_each_field(TextView list, TextView delimiter, Use use) {
  if (delimiter.size() != 1) return;
  for (std::size_t end = list.find(delimiter.front()); end != TextView::npos; end = list.find(delimiter.front())) {
    if (!use(list.substr(0, end))) return;
    list.remove_prefix(end + 1);
  }
}

}  // namespace

Text ORVUtils::GetData(const Text& sSrcStr, const std::int32_t& iSt, const std::int32_t& iEn) {
  if (sSrcStr.empty() || iSt < 0) return {};
  if (iSt == 0) return Text(between(sSrcStr, 1, std::int64_t{MyPos(u",", sSrcStr, iEn)} - 1));
  const std::int64_t start = MyPos(u",", sSrcStr, iSt);
  const std::int64_t end = MyPos(u",", sSrcStr, iEn);
  if (start < 1 || end < 1) return {};
  if (end < start + 1) raise(ErrorNumber::invalid_procedure_call);
  return Text(between(sSrcStr, start + 1, end - 1));
}

std::int32_t ORVUtils::IndexInList(const TextArray& sFList, const Text& sText) {
  const std::int32_t last = sFList.upper_bound();
  // Starts at 0 whatever the lower bound is: an array that starts at 1 has always been an error here.
  for (std::int32_t index = 0; index <= last; ++index) {
    if (equals_without_case(TextView(sFList.at(index)).substr(0, sText.size()), sText)) return index;
  }
  return -1;
}

std::int32_t ORVUtils::MyPos(const Text& s1, const Text& s2, const std::int32_t& iCount) {
  const bool can_match = s1.size() == 1;
  std::int32_t count = 0;
  for (std::size_t at = 0; at < s2.size(); ++at) {
    if (can_match && s2[at] == s1.front()) ++count;
    // Compared after every character, matching or not, so a count of 0 is met at the first.
    if (count == iCount) return checked_cast<std::int32_t>(at + 1);
  }
  return 0;
}

std::int32_t ORVUtils::SubStrCount(const Text& sSubStr, const Text& sSrcStr) {
  if (sSubStr.size() != 1) return 0;
  return checked_cast<std::int32_t>(std::ranges::count(sSrcStr, sSubStr.front()));
}

std::int32_t ORVUtils::ReadCommaDelimStrToList(const Text& sTemp, TextArray& sFList, const Text& sDelimiter) {
  TextArray fields{.items = {}, .lower_bound = 0, .allocated = true};
  for_each_field(sTemp, sDelimiter, [&](TextView field) {
    // A resize that preserves the contents cannot change the lower bound.
    if (sFList.allocated && sFList.lower_bound != 0) raise(ErrorNumber::subscript_out_of_range);
    fields.items.emplace_back(field);
    return true;
  });
  const auto count = checked_cast<std::int32_t>(fields.items.size());
  if (count > 0) sFList = std::move(fields);
  return count;
}

std::int16_t ORVUtils::StringPosition(const Text& sSource, const std::int16_t& iOption) {
  if (iOption != 1) return 0;
  const Text s = upper_case(TextView(sSource));
  const auto length = static_cast<std::int64_t>(s.size());
  const auto is_digit = by_code(library_.platform().code_page, is_digit_code);
  const std::int32_t blanks = SubStrCount(u" ", s);
  std::int64_t blank = 0;
  std::int64_t digit = 0;  // No digit is between the blank and this position, which is itself one if it exists.
  for (std::int32_t k = 1; k <= blanks; ++k) {
    if (may_see_calls(*this)) {
      blank = MyPos(u" ", s, k);
      digit = 0;
    } else {
      // The same without a search from the start, which would be too much work for a text of many blanks.
      blank = static_cast<std::int64_t>(s.find(u' ', static_cast<std::size_t>(blank))) + 1;
    }
    while (digit <= length && (digit <= blank || !is_digit(s[static_cast<std::size_t>(digit - 1)]))) ++digit;
    // The window ends at the length minus the blank's position, not at the length, because hosts have stored addresses
    // that were split that way.
    if (digit > length - blank) return checked_cast<std::int16_t>(blank);
  }
  return 0;
}

Boolean ORVUtils::MyInstrDelim(const Text& sSourceString, const Text& sDestString, const Text& sDelimiter) {
  require_16_bit_length(sDestString.size());
  bool found = false;
  for_each_field(sDestString, sDelimiter, [&](TextView field) {
    found = field == sSourceString;
    return !found;
  });
  return Boolean(found);
}

}  // namespace talutil
