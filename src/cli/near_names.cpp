#include "cli/near_names.hpp"

#include <algorithm>
#include <numeric>
#include <utility>

#include "automation/member_table.hpp"

namespace talutil::cli {

namespace {

/// The number of letters to insert, remove, change or swap with the next to turn one name into the other, ignoring
/// case.
std::size_t edit_distance(std::string_view a, std::string_view b) {
  const auto same = [&](std::size_t i, std::size_t j) { return fold_case(a[i]) == fold_case(b[j]); };
  std::vector<std::size_t> before;  // The row before the last.
  std::vector<std::size_t> last(b.size() + 1);
  std::iota(last.begin(), last.end(), std::size_t{0});
  for (std::size_t i = 0; i < a.size(); ++i) {
    std::vector<std::size_t> row{i + 1};
    for (std::size_t j = 0; j < b.size(); ++j) {
      std::size_t least = std::min({last[j] + (same(i, j) ? 0 : 1), last[j + 1] + 1, row[j] + 1});
      const bool is_swapped = i > 0 && j > 0 && same(i, j - 1) && same(i - 1, j);
      if (is_swapped) least = std::min(least, before[j - 1] + 1);
      row.push_back(least);
    }
    before = std::exchange(last, std::move(row));
  }
  return last.back();
}

bool contains_without_case(std::string_view text, std::string_view part) {
  const auto same = [](char a, char b) { return fold_case(a) == fold_case(b); };
  return std::search(text.begin(), text.end(), part.begin(), part.end(), same) != text.end();
}

}  // namespace

std::vector<std::string_view> nearest_names(const std::vector<std::string_view>& names, std::string_view typed) {
  constexpr std::size_t most_names = 4;
  constexpr std::size_t shortest_part = 3;
  const std::size_t most_edits = 1 + typed.size() / 6;
  std::vector<std::pair<std::size_t, std::string_view>> near;
  for (const std::string_view name : names) {
    std::size_t distance = edit_distance(typed, name);
    // Part of a name also counts as near, but after every real typing error.
    const bool is_part = typed.size() >= shortest_part && contains_without_case(name, typed);
    if (distance > most_edits && !is_part) continue;
    if (distance > most_edits) distance += typed.size();
    near.emplace_back(distance, name);
  }
  std::ranges::stable_sort(near, {}, &std::pair<std::size_t, std::string_view>::first);
  if (near.size() > most_names) near.resize(most_names);
  std::vector<std::string_view> nearest;
  std::ranges::transform(near, std::back_inserter(nearest), &std::pair<std::size_t, std::string_view>::second);
  return nearest;
}

std::string did_you_mean(const std::vector<std::string_view>& names) {
  std::string words = "did you mean ";
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (i > 0) words += i + 1 == names.size() ? " or " : ", ";
    words += names[i];
  }
  return words + "?";
}

}  // namespace talutil::cli
