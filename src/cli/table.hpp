#pragma once

#include <string>
#include <vector>

#include "cli/encoding.hpp"
#include "controls/grid.hpp"

namespace talutil::cli {

using TableRows = std::vector<std::vector<Text>>;

/// The rows of a comma-separated input. Fails for an input that is no text, and for more than a grid can hold.
[[nodiscard]] TableRows read_table(const std::string& path, const InputEncoding& encoding);

void fill_grid(Grid& grid, const TableRows& rows);

/// Fails if a text looks like a program or a picture.
void require_text(TextView text, const std::string& path);

}  // namespace talutil::cli
