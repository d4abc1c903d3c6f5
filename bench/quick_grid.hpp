#pragma once

#include <algorithm>
#include <iterator>

#include "automation/variant.hpp"

namespace talutil {

/// A grid of 20 columns that responds at once: every cell has the same text and is ticked.
class QuickGrid final : public Object {
 public:
  static constexpr std::int32_t columns = 20;
  static constexpr std::int32_t row_hidden = 4;
  static constexpr std::int32_t column_hidden = 5;
  static constexpr std::int32_t text_matrix = 6;

  explicit QuickGrid(std::int32_t rows) : rows_(rows) {}

  std::int32_t ticks = 0;

  std::int32_t member_id(TextView name) override {
    constexpr TextView names[] = {u"Rows",      u"Cols",      u"FixedRows",  u"ColDataType",
                                  u"RowHidden", u"ColHidden", u"TextMatrix", u"Cell"};
    return static_cast<std::int32_t>(std::ranges::find(names, name) - std::begin(names));
  }

  Variant invoke(std::int32_t member, Access access, std::span<const Variant> /*arguments*/) override {
    if (access == Access::put) return ++ticks, Variant();
    const Variant answers[] = {rows_, columns, 0, 11, Boolean(false), Boolean(false)};
    if (member == text_matrix) return u"cell 1234 12";
    return member < text_matrix ? answers[member] : Variant(std::int16_t{1});
  }

 private:
  std::int32_t rows_;
};

}  // namespace talutil
