#pragma once

#include <functional>
#include <string>
#include <vector>

#include "cli/encoding.hpp"
#include "controls/grid.hpp"

namespace talutil::cli {

/// Says which cells of each row to keep, in which order, by the cells of the first row.
using ColumnChoice = std::function<std::vector<std::size_t>(const std::vector<Text>& headings)>;

/// Reads a comma-separated input into an empty grid. Fails for an input that is no text, and for more than a grid can
/// hold.
/// @param choose if null, all cells are kept
/// @returns how many cells the first row has, which may be fewer than the grid has columns
std::size_t read_table(const std::string& path, const InputEncoding& encoding, Grid& grid,
                       const ColumnChoice& choose = nullptr);

/// Fails if a text looks like a program or a picture.
void require_text(TextView text, const std::string& path);

}  // namespace talutil::cli
