#pragma once

#include <string>
#include <string_view>

namespace talutil::cli {

/// The columns that COLUMNS names, or those of the terminal on standard output, between 40 and 100; 80 without either.
[[nodiscard]] std::size_t output_width();

/// Paragraphs broken between words. Each line begins with `indent` blanks, the first with `first` instead. Words that
/// are longer than a line stay whole.
[[nodiscard]] std::string wrapped(std::string_view paragraphs, std::size_t width, std::size_t indent,
                                  std::string_view first);
[[nodiscard]] std::string wrapped(std::string_view paragraphs, std::size_t width, std::size_t indent);

/// Lines of code as they are, each with `indent` blanks before it.
[[nodiscard]] std::string indented(std::string_view lines, std::size_t indent);

}  // namespace talutil::cli
