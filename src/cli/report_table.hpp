#pragma once

#include <string>
#include <vector>

#include "cli/table.hpp"
#include "documents/font_metrics.hpp"

/// A table as a report shows it.
namespace talutil::cli {

/// Keeps the named columns, in the order of the names: headings in any case, or numbers from 1.
void choose_columns(TableRows& rows, const std::vector<std::string>& names);

/// Adds a row with the totals of the named columns. Values that are not numbers are counted and warned of.
void add_totals(TableRows& rows, const std::vector<std::string>& names, const Locale& locale);

/// Decides alignments and widths: columns of numbers are right-aligned, heading included; a column is as wide as its
/// longest line, or narrower, if all columns then fit beside each other.
/// @param room the width of the page between its margins, in twips
/// @returns whether all columns fit
bool lay_out(Grid& grid, const TableRows& rows, FontMetrics& metrics, const FontStyle& font, std::int32_t room,
             const Locale& locale);

}  // namespace talutil::cli
