#include <algorithm>
#include <array>

#include "automation/date.hpp"

namespace talutil {

namespace {

constexpr TextView month_names[] = {u"January", u"February", u"March",     u"April",   u"May",      u"June",
                                    u"July",    u"August",   u"September", u"October", u"November", u"December"};

/// The number of a month from its name or the first three letters of that; 0 for any other word.
std::int32_t month_number(TextView word) {
  if (equals_without_case(word, u"Sept")) return 9;
  const auto* const found = std::ranges::find_if(month_names, [word](TextView name) {
    return equals_without_case(word, name) || equals_without_case(word, name.substr(0, 3));
  });
  return found == std::end(month_names) ? 0 : static_cast<std::int32_t>(found - month_names) + 1;
}

constexpr bool is_letter(char16_t unit) noexcept {
  return (unit >= u'A' && unit <= u'Z') || (unit >= u'a' && unit <= u'z');
}

/// Consumes a text from the left. A copy saves a position to return to.
class Reader {
 public:
  explicit Reader(TextView text) noexcept : rest_(text) {}

  [[nodiscard]] bool is_at_end() const noexcept { return rest_.empty(); }

  bool skip_blanks() noexcept { return !take_while(is_white_space).empty(); }

  bool take_if(char16_t wanted) noexcept {
    if (rest_.empty() || rest_.front() != wanted) return false;
    rest_.remove_prefix(1);
    return true;
  }

  /// Takes one of the given characters; returns 0 if none is next.
  char16_t take_any(TextView wanted) noexcept {
    if (rest_.empty() || wanted.find(rest_.front()) == TextView::npos) return 0;
    const char16_t unit = rest_.front();
    rest_.remove_prefix(1);
    return unit;
  }

  /// Takes a number of at most four digits. Longer ones are not taken, because they cannot be part of a date.
  std::optional<std::int32_t> take_number() noexcept {
    const Reader before = *this;
    const TextView digits = take_while(is_decimal_digit);
    if (digits.empty() || digits.size() > 4) {
      *this = before;
      return {};
    }
    std::int32_t value = 0;
    for (const char16_t digit : digits) value = value * 10 + (digit - u'0');
    return value;
  }

  TextView take_word() noexcept { return take_while(is_letter); }

 private:
  TextView take_while(bool (*belongs)(char16_t)) noexcept {
    const auto end = std::ranges::find_if_not(rest_, belongs);
    const TextView taken(rest_.begin(), end);
    rest_.remove_prefix(taken.size());
    return taken;
  }

  TextView rest_;
};

enum class HalfOfDay : std::uint8_t { not_said, morning, afternoon };

HalfOfDay read_half(Reader& reader) {
  const Reader before = reader;
  reader.skip_blanks();
  const TextView word = reader.take_word();
  if (equals_without_case(word, u"AM")) return HalfOfDay::morning;
  if (equals_without_case(word, u"PM")) return HalfOfDay::afternoon;
  reader = before;
  return HalfOfDay::not_said;
}

/// Reads ":" and a number; blanks around the colon are allowed.
std::optional<std::int32_t> read_sixtieths(Reader& reader) {
  const Reader before = reader;
  reader.skip_blanks();
  if (reader.take_if(u':')) {
    reader.skip_blanks();
    if (const auto number = reader.take_number()) return number;
  }
  reader = before;
  return {};
}

/// Reads "13:45", "1:45:30 PM" or "1 PM". Leaves the reader unchanged if there is no such time. The ranges of hours,
/// minutes and seconds are checked later, with the whole date.
bool read_time(Reader& reader, DateParts& parts) {
  const Reader before = reader;
  const auto hour = reader.take_number();
  const auto minute = hour ? read_sixtieths(reader) : std::nullopt;
  const auto second = minute ? read_sixtieths(reader) : std::nullopt;
  const HalfOfDay half = hour ? read_half(reader) : HalfOfDay::not_said;
  const bool is_time = minute || half != HalfOfDay::not_said;
  if (!is_time || (half == HalfOfDay::morning && *hour > 12)) {
    reader = before;
    return false;
  }
  parts.hour = *hour;
  if (half == HalfOfDay::morning && *hour == 12) parts.hour = 0;
  if (half == HalfOfDay::afternoon && *hour < 12) parts.hour = *hour + 12;
  parts.minute = minute.value_or(0);
  parts.second = second.value_or(0);
  return true;
}

bool is_time_next(Reader reader) {
  DateParts ignored;
  return read_time(reader, ignored);
}

/// The parts of a date in the order of the text.
struct Elements {
  std::array<std::int32_t, 3> numbers{};
  std::size_t number_count = 0;
  std::int32_t month = 0;       ///< From a name; 0 if all parts are numbers.
  std::size_t month_place = 0;  ///< The number of numbers before the name.
  bool has_comma = false;
  bool has_point = false;

  [[nodiscard]] std::size_t count() const noexcept { return number_count + (month != 0 ? 1 : 0); }
};

bool read_element(Reader& reader, Elements& elements) {
  if (const auto number = reader.take_number()) {
    if (elements.number_count == elements.numbers.size()) return false;
    elements.numbers[elements.number_count++] = *number;
    return true;
  }
  if (elements.month != 0) return false;
  elements.month = month_number(reader.take_word());
  elements.month_place = elements.number_count;
  return elements.month != 0;
}

/// Reads two or three elements, separated by one mark (with optional blanks) or by blanks alone.
bool read_elements(Reader& reader, Elements& elements) {
  if (!read_element(reader, elements)) return false;
  while (elements.count() < 3) {
    const Reader before = reader;
    reader.skip_blanks();
    const char16_t mark = reader.take_any(u"/-.,");
    if (mark != 0) reader.skip_blanks();
    const bool is_over = mark == 0 && is_time_next(reader);
    if (is_over || !read_element(reader, elements)) {
      reader = before;
      return elements.count() == 2;
    }
    elements.has_comma = elements.has_comma || mark == u',';
    elements.has_point = elements.has_point || mark == u'.';
  }
  return true;
}

struct Day {
  std::int32_t day;
  std::int32_t month;
  std::int32_t year;
};

constexpr std::int32_t longest_month = 31;
constexpr std::int32_t first_full_year = 100;  ///< From here on, a number can only be a year.

/// The possible readings of a date that has only numbers, the preferred one first.
std::array<Day, 2> readings_of_numbers(const Elements& elements, std::int32_t current_year) {
  const auto [a, b, c] = elements.numbers;
  if (elements.number_count == 3 && a > longest_month) return {{{c, b, a}, {b, c, a}}};
  if (elements.number_count == 3) return {{{a, b, c}, {b, a, c}}};
  if (a >= first_full_year) return {{{1, b, a}, {1, b, a}}};
  if (b >= first_full_year) return {{{1, a, b}, {1, a, b}}};
  return {{{a, b, current_year}, {b, a, current_year}}};
}

Day reading_with_month(const Elements& elements, std::int32_t current_year) {
  const auto [a, b, unused] = elements.numbers;
  const std::int32_t month = elements.month;
  if (elements.number_count == 1 && a >= first_full_year) return {1, month, a};
  if (elements.number_count == 1) return {a, month, current_year};
  const bool is_year_first = a > longest_month && elements.month_place == 1;
  return is_year_first ? Day{b, month, a} : Day{a, month, b};
}

bool is_day(const Day& day) {
  return date_from_parts({.year = full_year(day.year), .month = day.month, .day = day.day}).has_value();
}

/// Leaves the reader after the date, before any blanks.
bool read_date(Reader& reader, std::int32_t current_year, DateParts& parts) {
  Elements elements;
  if (!read_elements(reader, elements)) return false;
  Day chosen{};
  if (elements.month != 0) {
    if (elements.month_place == 2) return false;
    chosen = reading_with_month(elements, current_year);
  } else {
    // "5,3" and "5.3" are numbers; full stops make a date only if it has all three parts.
    if (elements.has_comma || (elements.has_point && elements.number_count == 2)) return false;
    const auto readings = readings_of_numbers(elements, current_year);
    chosen = is_day(readings[0]) ? readings[0] : readings[1];
  }
  parts.day = chosen.day;
  parts.month = chosen.month;
  parts.year = full_year(chosen.year);
  return is_day(chosen);
}

/// Appends at least the given number of a number's last digits; with 1, all digits of a number below 100.
void append_number(Text& text, std::int32_t number, std::size_t digits) {
  std::int32_t place = digits >= 3 ? 1000 : 10;
  if (digits == 1 && number < 10) place = 1;
  for (; place > 0; place /= 10) text += static_cast<char16_t>(u'0' + number / place % 10);
}

/// The part that a letter of a pattern stands for; nothing for other characters.
std::optional<std::int32_t> part_for(char16_t letter, const DateParts& parts, bool is_after_hour) {
  switch (letter) {
    case u'd':
      return parts.day;
    case u'm':
      return is_after_hour ? parts.minute : parts.month;
    case u'y':
      return parts.year;
    case u'h':
      return parts.hour;
    case u'n':
      return parts.minute;
    case u's':
      return parts.second;
    default:
      return {};
  }
}

constexpr char16_t lower(char16_t unit) noexcept {
  return unit >= u'A' && unit <= u'Z' ? static_cast<char16_t>(unit + 0x20) : unit;
}

Text format_parts(const DateParts& parts, TextView pattern) {
  Text text;
  bool is_after_hour = false;
  while (!pattern.empty()) {
    const char16_t letter = lower(pattern.front());
    const auto run_end = std::ranges::find_if(pattern, [letter](char16_t unit) { return lower(unit) != letter; });
    const auto count = static_cast<std::size_t>(run_end - pattern.begin());
    if (const auto part = part_for(letter, parts, is_after_hour)) {
      append_number(text, *part, count);
      is_after_hour = letter == u'h';
    } else {
      text += pattern.substr(0, count);
    }
    pattern.remove_prefix(count);
  }
  return text;
}

}  // namespace

std::optional<Date> text_to_date(TextView text, std::int32_t current_year) {
  while (!text.empty() && is_white_space(text.back())) text.remove_suffix(1);
  Reader reader(text);
  reader.skip_blanks();
  DateParts parts;
  if (read_time(reader, parts)) {
    if (reader.skip_blanks() && !read_date(reader, current_year, parts)) return {};
  } else {
    if (!read_date(reader, current_year, parts)) return {};
    if (reader.skip_blanks() && !read_time(reader, parts)) return {};
  }
  if (!reader.is_at_end()) return {};
  return date_from_parts(parts);
}

Text date_to_text(Date date) {
  const DateParts parts = parts_of(date);
  const DateParts day_zero;
  const bool is_day_zero = parts.year == day_zero.year && parts.month == day_zero.month && parts.day == day_zero.day;
  const bool is_midnight = parts.hour == 0 && parts.minute == 0 && parts.second == 0;
  if (is_midnight && !is_day_zero) return format_parts(parts, u"DD/MM/YYYY");
  Text text = format_parts(parts, is_day_zero ? u"HH:MM" : u"DD/MM/YYYY HH:MM");
  if (parts.second != 0) text += format_parts(parts, u":SS");
  return text;
}

Text format_date(Date date, TextView pattern) { return format_parts(parts_of(date), pattern); }

}  // namespace talutil
