// Checks what must hold for any text that is read as a number: numbers_fuzz -max_len=40 -runs=10000000
#include <algorithm>
#include <cmath>
#include <limits>
#include <optional>

#include "automation/numbers.hpp"
#include "automation/run_time_error.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

using fuzz::require;

template <class T>
struct Outcome {
  std::optional<T> value;
  bool is_overflow = false;
  friend bool operator==(const Outcome&, const Outcome&) = default;
};

template <class Read>
auto outcome_of(Read read) {
  Outcome<typename decltype(read())::value_type> outcome;
  try {
    outcome.value = read();
  } catch (const RunTimeError& error) {
    require(error.number() == 6, "the one error");
    outcome.is_overflow = true;
  }
  return outcome;
}

template <class T>
void require_whole(TextView text, const Locale& locale, const Outcome<double>& number) {
  const auto whole = outcome_of([&] { return text_to_integer<T>(text, locale); });
  require(whole.is_overflow || whole.value.has_value() == (number.value || number.is_overflow), "a number is one");
  // Bits beyond the sign count for a whole number, so &HFFFF is -1.
  if (!whole.value || !number.value || text.find(u'&') != TextView::npos) return;
  require(std::abs(*whole.value - *number.value) <= 0.5, "a whole number is the nearest");
}

void check(TextView text) {
  constexpr Locale comma{.decimal_separator = u',', .thousands_separator = u'.', .currency_symbol = {u'k', u'r'}};
  const auto leading = outcome_of([&] { return std::optional(leading_number(text)); });
  require(!leading.value || std::isfinite(*leading.value), "a leading number is finite");
  for (const Locale& locale : {plain_numbers, comma}) {
    const auto number = outcome_of([&] { return text_to_number(text, locale); });
    require(outcome_of([&] { return text_to_number(u" " + Text(text) + u"\t", locale); }) == number, "blanks around");
    require_whole<std::int16_t>(text, locale, number);
    require_whole<std::int32_t>(text, locale, number);
    const auto money = outcome_of([&] { return text_to_currency(text, locale); });
    require(money.is_overflow || money.value.has_value() == (number.value || number.is_overflow), "money is a number");
    if (money.value) {
      require(text_to_currency(number_to_text(*money.value, locale), locale) == money.value, "money comes back");
      const double exact = static_cast<double>(money.value->ten_thousandths) / 10'000;
      require(!number.value || std::abs(exact - *number.value) <= 0.00005001 + std::abs(exact) * 1e-15, "near");
    }
    // Fifteen digits of the largest numbers can be beyond the range.
    constexpr double last_read = 1.79769313486231e308;
    if (!number.value || std::abs(*number.value) > last_read) continue;
    const Text again = number_to_text(*number.value, locale);
    require(number_to_text(text_to_number(again, locale).value(), locale) == again, "a number's text stays");
    const Text plain = number_to_text(*number.value);
    require(text_to_number(plain) == leading_number(plain), "the leading number of a number is itself");
  }
}

/// Maps most bytes to elements of numbers.
void check(const std::uint8_t* data, std::size_t size) {
  constexpr TextView pieces[] = {u"0", u"1",  u"5",   u"9",    u"25", u"007", u"99999999", u".", u",", u"-",
                                 u"+", u"(",  u")",   u"$",    u"kr", u"e",   u"E+",       u"d", u"&", u"&H",
                                 u"F", u"&O", u"308", u"-324", u" ",  u"\t",  u"\u00A0",   u"x"};
  Text text;
  for (const std::uint8_t* at = data; at != data + size; ++at) {
    if (*at < 240)
      text += pieces[*at % std::size(pieces)];
    else
      text += static_cast<char16_t>(*at << 8 | (at == data ? 0 : at[-1]));
  }
  check(text);
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  talutil::check(data, size);
  return 0;
}
