#pragma once

#include <string>
#include <string_view>

#include "automation/member_table.hpp"

namespace talutil::cli {

/// Reads an argument as typed: a text, or a written form for what a text cannot express.
[[nodiscard]] Variant read_argument(std::string_view typed, const Locale& locale);

/// The written forms, for help: one per line, indented.
[[nodiscard]] std::string written_forms_help();

/// The range or form in which to write an argument of a type; empty if it takes anything.
[[nodiscard]] std::string_view how_to_write(ValueType type) noexcept;

/// Reads an argument as typed and converts it to a parameter's type. If that fails, the message gives the value and
/// what to write instead.
[[nodiscard]] Variant argument_for(const Parameter& parameter, std::string_view typed, const Locale& locale);

}  // namespace talutil::cli
