#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "automation/text.hpp"
#include "library/library.hpp"

namespace talutil {

/// The first and last days of the weeks of a year, as texts "DD/MM/YYYY". Weeks are counted from 1 January in steps of
/// seven days; the last one ends with the year. Both tables hold the year that was last passed to WeekYearToDate.
class WeekTables final : public LibraryPart {
 public:
  static constexpr std::int32_t last_week = 52;

  /// Fills a table for a year, using the calendar of a common or a leap year regardless of what the year really is.
  void fill_starts(std::int16_t year, bool is_leap_calendar);
  void fill_ends(std::int16_t year, bool is_leap_calendar);

  /// For weeks 1 to 52; an empty text for week 53, which no year has.
  [[nodiscard]] const Text& start(std::int16_t week) const { return starts_.at(static_cast<std::size_t>(week - 1)); }
  [[nodiscard]] const Text& end(std::int16_t week) const { return ends_.at(static_cast<std::size_t>(week - 1)); }

 private:
  using Table = std::array<Text, last_week + 1>;

  Table starts_;
  Table ends_;
};

}  // namespace talutil
