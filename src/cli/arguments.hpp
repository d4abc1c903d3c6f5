#pragma once

#include <string>
#include <string_view>

#include "automation/member_table.hpp"

namespace talutil::cli {

/// An argument as typed: a text, or a written form for what a text cannot say.
[[nodiscard]] Variant read_argument(std::string_view typed, const Locale& locale);

/// The written forms, for help: one line each, indented.
[[nodiscard]] std::string written_forms_help();

/// The range or form that an argument of a type is written in; empty for one that takes anything.
[[nodiscard]] std::string_view how_to_write(ValueType type) noexcept;

/// An argument as typed, read and converted to a parameter's type. What does not convert fails with
/// the value and what to write instead.
[[nodiscard]] Variant argument_for(const Parameter& parameter, std::string_view typed, const Locale& locale);

}  // namespace talutil::cli
