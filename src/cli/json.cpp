#include "cli/json.hpp"

#include <array>
#include <charconv>
#include <cmath>
#include <type_traits>

namespace talutil::cli::json {

namespace {

std::string unit_escape(char16_t unit) {
  constexpr std::string_view digits = "0123456789abcdef";
  std::string result = "\\u";
  for (int shift = 12; shift >= 0; shift -= 4) result += digits[(unit >> shift) & 0xF];
  return result;
}

std::string escape(char16_t unit) {
  switch (unit) {
    case u'"':
      return "\\\"";
    case u'\\':
      return "\\\\";
    case u'\n':
      return "\\n";
    case u'\r':
      return "\\r";
    case u'\t':
      return "\\t";
    default:
      return unit_escape(unit);
  }
}

constexpr bool is_high_surrogate(char16_t unit) noexcept { return (unit & 0xFC00) == 0xD800; }
constexpr bool is_low_surrogate(char16_t unit) noexcept { return (unit & 0xFC00) == 0xDC00; }

/// The number of units at the start of a text that need no escape; 0 if the first one does.
std::size_t plain_units(TextView text) {
  const char16_t unit = text.front();
  if (is_high_surrogate(unit)) return text.size() > 1 && is_low_surrogate(text[1]) ? 2 : 0;
  return unit < u' ' || unit == u'\x7F' || unit == u'"' || unit == u'\\' || is_low_surrogate(unit) ? 0 : 1;
}

/// What a value without a JSON form is.
std::string_view kind_word(Variant::Kind kind) noexcept {
  switch (kind) {
    case Variant::Kind::empty:
      return "empty";
    case Variant::Kind::error:
      return "error";
    case Variant::Kind::object:
      return "object";
    case Variant::Kind::system_time:
      return "SYSTEMTIME";
    default:
      return "array";
  }
}

template <class Number>
std::string number(Number value) {
  std::array<char, 32> digits{};
  const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), value);
  return {digits.data(), end.ptr};
}

std::string texts(const TextArray& texts) {
  if (!texts.allocated) return "null";
  std::vector<std::string> values;
  for (const Text& item : texts.items) values.push_back(text(item));
  return array(values);
}

template <class Range, class Write>
std::string joined(char open, const Range& range, char close, Write write) {
  std::string result(1, open);
  std::string_view separator;
  for (const auto& item : range) {
    result += separator;
    result += write(item);
    separator = ", ";
  }
  return result + close;
}

}  // namespace

std::string text(TextView value) {
  std::string result = "\"";
  while (!value.empty()) {
    const std::size_t plain = plain_units(value);
    result += plain == 0 ? escape(value.front()) : to_utf8(value.substr(0, plain));
    value.remove_prefix(plain == 0 ? 1 : plain);
  }
  return result + '"';
}

std::string text(std::string_view utf8) { return text(from_utf8(utf8)); }

Text iso(const Date& date) {
  const double day = std::trunc(date.days);
  const bool has_time = date.days != day;
  if (day == 0) return format_date(date, u"HH:MM:SS");
  const Text words = format_date(date, u"YYYY-MM-DD");
  return has_time ? words + u"T" + format_date(date, u"HH:MM:SS") : words;
}

std::string array(const std::vector<std::string>& values) {
  return joined('[', values, ']', [](const std::string& item) { return item; });
}

std::string object(const std::vector<Field>& fields) {
  return joined('{', fields, '}', [](const Field& field) { return text(field.first) + ": " + field.second; });
}

std::string value(const Variant& value, const Locale& locale) {
  return value.visit([&]<class T>(const T& held) -> std::string {
    if constexpr (std::is_same_v<T, Text>)
      return text(held);
    else if constexpr (std::is_same_v<T, Boolean>)
      return held ? "true" : "false";
    else if constexpr (std::is_arithmetic_v<T>)
      return number(held);
    else if constexpr (std::is_same_v<T, Date>)
      return text(iso(held));
    else if constexpr (std::is_same_v<T, Currency>)
      return text(value.to_text(locale));
    else if constexpr (std::is_same_v<T, TextArray>)
      return texts(held);
    else if constexpr (std::is_same_v<T, Null>)
      return "null";
    else
      return object({{"kind", text(kind_word(value.kind()))}});
  });
}

}  // namespace talutil::cli::json
