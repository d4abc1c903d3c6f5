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

/// Texts, numbers and Booleans as such, arrays as arrays, dates and currency as their texts; null for anything without
/// a value (Null, Empty, an object, an array that was never allocated).
[[nodiscard]] std::string value(const Variant& value, const Locale& locale);

}  // namespace talutil::cli::json
