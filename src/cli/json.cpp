#include "cli/json.hpp"

#include <cmath>
#include <type_traits>

#include "calling/json_writer.hpp"

namespace talutil::cli::json {

namespace {

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
  std::string result;
  calling::append_number(result, value);
  return result;
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
  std::string result;
  calling::append_text(result, value);
  return result;
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
