#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace talutil::cli {

/// The names that were probably meant by what was typed, the most likely first; at most four.
[[nodiscard]] std::vector<std::string_view> nearest_names(const std::vector<std::string_view>& names,
                                                          std::string_view typed);

/// "did you mean A, B or C?"
[[nodiscard]] std::string did_you_mean(const std::vector<std::string_view>& names);

}  // namespace talutil::cli
