#include "controls/name_case.hpp"

#include <algorithm>
#include <array>
#include <vector>

#include "controls/name_case_table.hpp"

namespace talutil {

namespace {

using name_case_table::Place;
using name_case_table::Spelling;

constexpr char16_t fold(char16_t unit) noexcept {
  return unit >= u'a' && unit <= u'z' ? static_cast<char16_t>(unit - u'a' + u'A') : unit;
}

/// The sort order of the table's words, which are ASCII.
constexpr bool comes_before(TextView a, TextView b) noexcept {
  return std::ranges::lexicographical_compare(a, b, {}, fold, fold);
}

constexpr bool is_same_word(TextView a, TextView b) noexcept { return std::ranges::equal(a, b, {}, fold, fold); }

constexpr auto sorted_spellings = [] {
  auto rows = std::to_array(name_case_table::spellings);
  std::ranges::sort(rows, comes_before, &Spelling::word);
  return rows;
}();
static_assert(std::ranges::adjacent_find(sorted_spellings, is_same_word, &Spelling::word) == sorted_spellings.end(),
              "a word stands twice in the table");

/// The apostrophe, the character that database texts use instead, and those that word processors turn it into.
constexpr bool is_apostrophe(char16_t unit) noexcept {
  return unit == u'\'' || unit == u'\u00B4' || unit == u'`' || unit == u'\u2018' || unit == u'\u2019';
}

/// Words consist of letters of any script, digits and combining marks; everything else separates them.
bool is_in_word(char16_t unit) noexcept {
  if (unit < 0x80) return is_decimal_digit(unit) || (fold(unit) >= u'A' && fold(unit) <= u'Z');
  if (is_white_space(unit) || is_apostrophe(unit)) return false;
  if (unit <= 0xBF) return unit == u'\u00AA' || unit == u'\u00B5' || unit == u'\u00BA';
  const bool is_punctuation = (unit >= 0x2000 && unit <= 0x206F) || (unit >= 0x3000 && unit <= 0x3003);
  return !is_punctuation && unit != u'\u00D7' && unit != u'\u00F7';
}

/// A part of the text that gets a capital of its own: a word, or a piece between hyphens and apostrophes.
struct Part {
  std::size_t begin;
  std::size_t end;
};

Text capitalised(TextView word) {
  Text result = lower_case(word);
  // Digits before the first letter ("12A") do not count.
  const auto letter = std::ranges::find_if_not(result, is_decimal_digit);
  if (letter != result.end()) *letter = upper_case(*letter);
  constexpr char16_t sigma = u'\u03C3';
  constexpr char16_t final_sigma = u'\u03C2';
  if (result.size() > 1 && result.back() == sigma) result.back() = final_sigma;
  return result;
}

/// "1st", "22nd": digits and an ending that stays in lower case.
bool is_ordinal(TextView word) noexcept {
  constexpr TextView endings[] = {u"st", u"nd", u"rd", u"th"};
  if (word.size() < 3 || !std::ranges::all_of(word.substr(0, word.size() - 2), is_decimal_digit)) return false;
  return std::ranges::any_of(endings,
                             [&](TextView ending) { return is_same_word(word.substr(word.size() - 2), ending); });
}

Text with_prefixes(TextView word) {
  for (const auto& prefix : name_case_table::prefixes) {
    const std::size_t length = prefix.text.size();
    if (word.size() < length + prefix.shortest_rest || !is_same_word(word.substr(0, length), prefix.text)) continue;
    return Text(prefix.text) + capitalised(word.substr(length));
  }
  return capitalised(word);
}

/// One line of a text, processed word by word.
class Line {
 public:
  explicit Line(TextView text) : text_(text) {
    for (std::size_t at = 0; at < text.size(); ++at) {
      if (!is_in_word(text[at])) continue;
      const std::size_t begin = at;
      while (at < text.size() && is_in_word(text[at])) ++at;
      parts_.push_back({begin, at});
    }
    const auto first =
        std::ranges::find_if(parts_, [&](const Part& part) { return !is_decimal_digit(text[part.begin]); });
    first_ = static_cast<std::size_t>(first - parts_.begin());
  }

  void append_to(Text& result) const {
    std::size_t copied = 0;
    for (std::size_t i = 0; i < parts_.size(); ++i) {
      result.append(text_, copied, parts_[i].begin - copied).append(spelled(i));
      copied = parts_[i].end;
    }
    result.append(text_, copied);
  }

 private:
  [[nodiscard]] TextView word(std::size_t i) const {
    return text_.substr(parts_[i].begin, parts_[i].end - parts_[i].begin);
  }

  /// The character before a part; NUL at the start.
  [[nodiscard]] char16_t before(std::size_t i) const {
    return parts_[i].begin > 0 ? text_[parts_[i].begin - 1] : u'\0';
  }

  [[nodiscard]] bool holds(Place place, std::size_t i) const {
    const bool is_first = i <= first_;
    const bool is_last = i + 1 == parts_.size();
    switch (place) {
      case Place::anywhere:
        return true;
      case Place::after_first:
        return !is_first;
      case Place::before_last:
        return !is_last;
    }
    return false;
  }

  /// "Smith's", "Don't": what follows an apostrophe stays in lower case, unless an elision precedes it ("O'Neil").
  [[nodiscard]] bool is_small_after_apostrophe(std::size_t i) const {
    if (!is_apostrophe(before(i))) return false;
    if (is_same_word(word(i), u"s") || is_same_word(word(i), u"t")) return true;
    if (i == 0 || parts_[i - 1].end + 1 != parts_[i].begin) return false;
    const TextView start = word(i - 1);
    return start.size() > 1 && std::ranges::none_of(name_case_table::elisions,
                                                    [&](TextView elision) { return is_same_word(start, elision); });
  }

  [[nodiscard]] Text spelled(std::size_t i) const {
    const TextView given = word(i);
    if (is_small_after_apostrophe(i) || is_ordinal(given)) return lower_case(given);
    const auto found = std::ranges::lower_bound(sorted_spellings, given, comes_before, &Spelling::word);
    if (found != sorted_spellings.end() && is_same_word(found->word, given) && holds(found->place, i)) {
      return Text(found->word);
    }
    return with_prefixes(given);
  }

  TextView text_;
  std::vector<Part> parts_;
  std::size_t first_ = 0;
};

}  // namespace

Text name_case(TextView text) {
  constexpr TextView line_ends = u"\r\n";
  Text result;
  result.reserve(text.size());
  for (std::size_t begin = 0; begin < text.size();) {
    const std::size_t end = std::min(text.find_first_of(line_ends, begin), text.size() - 1) + 1;
    Line(text.substr(begin, end - begin)).append_to(result);
    begin = end;
  }
  return result;
}

}  // namespace talutil
