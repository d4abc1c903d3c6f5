#pragma once

#include <initializer_list>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "automation/variant.hpp"

/// Pieces of JSON, each a complete value in UTF-8.
namespace talutil::cli::json {

using Field = std::pair<std::string_view, std::string>;

/// Control characters and lone surrogates are escaped, so that a text is preserved completely.
[[nodiscard]] std::string text(TextView value);
[[nodiscard]] std::string text(std::string_view utf8);

[[nodiscard]] std::string array(const std::vector<std::string>& values);
[[nodiscard]] std::string object(const std::vector<Field>& fields);

/// A date in ISO form: "2009-03-31", "2009-03-31T13:45:00", or "13:45:00" for a time of day alone.
[[nodiscard]] Text iso(const Date& date);

/// Texts, numbers and Booleans as such, arrays of texts as arrays, dates in ISO form, currency as its text, Null as
/// null. Anything else is an object that says what it is: {"kind": "empty"} for Empty.
[[nodiscard]] std::string value(const Variant& value, const Locale& locale);

}  // namespace talutil::cli::json
