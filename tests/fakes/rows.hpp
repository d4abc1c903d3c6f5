#pragma once

#include <gtest/gtest.h>

#include <random>
#include <tuple>
#include <vector>

#include "automation/text.hpp"

namespace talutil::testing {

/// A table, of rows with a name and what its check takes.
template <class... Fields>
using Rows = std::vector<std::tuple<const char*, Fields...>>;

/// Gives the fields of each row to a check. What fails is reported with the name of its row.
template <class... Fields, class Check>
void check_rows(const Rows<Fields...>& rows, const Check& check) {
  for (const auto& row : rows) {
    SCOPED_TRACE(std::get<0>(row));
    std::apply([&](const char* /*name*/, const Fields&... fields) { check(fields...); }, row);
  }
}

/// Values to compare a member with its model over, the same in every run.
class Generator {
 public:
  std::int32_t whole(std::int32_t first, std::int32_t last) {
    return std::uniform_int_distribution<std::int32_t>(first, last)(engine_);
  }

  template <class Items>
  const auto& one_of(const Items& items) {
    return items[static_cast<std::size_t>(whole(0, static_cast<std::int32_t>(std::size(items)) - 1))];
  }

  /// Up to so many of the characters of an alphabet.
  Text text_of(TextView alphabet, std::int32_t longest) {
    Text text;
    for (std::int32_t left = whole(0, longest); left > 0; --left) text += one_of(alphabet);
    return text;
  }

 private:
  std::mt19937 engine_{20090305};
};

}  // namespace talutil::testing
