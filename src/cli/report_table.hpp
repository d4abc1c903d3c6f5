#pragma once

#include <string>
#include <vector>

#include "cli/table.hpp"
#include "documents/font_metrics.hpp"

/// A table as a report shows it.
namespace talutil::cli {

/// The indexes of the named columns, in the order of the names: headings in any case, or numbers from 1.
[[nodiscard]] std::vector<std::size_t> columns_of(const std::vector<Text>& headings,
                                                  const std::vector<std::string>& names, const std::string& option);

/// Adds a row with the totals of the named columns. Values that are not numbers are counted and warned of.
/// @param headings how many cells the first row has
void add_totals(Grid& grid, std::size_t headings, const std::vector<std::string>& names, const Locale& locale);

/// Decides alignments and widths: columns of numbers are right-aligned, heading included; a column is as wide as its
/// longest line, or narrower, if all columns then fit beside each other.
/// @param room the width of the page between its margins, in twips
/// @returns whether all columns fit
bool lay_out(Grid& grid, FontMetrics& metrics, const FontStyle& font, std::int32_t room, const Locale& locale);

}  // namespace talutil::cli
