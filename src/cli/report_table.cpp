#include "cli/report_table.hpp"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>

#include "automation/numbers.hpp"
#include "cli/failure.hpp"
#include "documents/arabic_joining.hpp"
#include "documents/text_direction.hpp"

namespace talutil::cli {

namespace {

/// The index of a column by its heading or number.
std::size_t column_of(const std::vector<Text>& headings, const std::string& name, const std::string& option) {
  const Text text = utf8_text(name, option);
  for (std::size_t c = 0; c < headings.size(); ++c) {
    if (equals_without_case(trim_blanks(headings[c]), text)) return c;
  }
  std::size_t number = 0;
  const auto [end, status] = std::from_chars(name.data(), name.data() + name.size(), number);
  const bool is_number = status == std::errc() && end == name.data() + name.size();
  if (is_number && number >= 1 && number <= headings.size()) return number - 1;
  throw usage_failure(option + ": there is no column \"" + name +
                      "\"; name one by its heading or by its number, 1 to " + std::to_string(headings.size()));
}

/// How the numbers of a column are written, so that their total can be written alike.
struct NumberStyle {
  std::size_t decimals = 0;
  bool has_groups = false;

  void add(TextView written, const Locale& locale) {
    const std::size_t point = written.find(locale.decimal_separator);
    if (point != TextView::npos) decimals = std::max(decimals, written.size() - point - 1);
    has_groups = has_groups || written.substr(0, point).find(locale.thousands_separator) != TextView::npos;
  }

  [[nodiscard]] Text text_of(double number, const Locale& locale) const {
    constexpr std::size_t most_decimals = 15;
    std::array<char, 400> digits{};
    const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), std::abs(number),
                                   std::chars_format::fixed, static_cast<int>(std::min(decimals, most_decimals)))
                         .ptr;
    const std::string_view written(digits.data(), static_cast<std::size_t>(end - digits.data()));
    const std::size_t whole = std::min(written.find('.'), written.size());
    Text text = number < 0 ? u"-" : u"";
    for (std::size_t i = 0; i < whole; ++i) {
      if (has_groups && i > 0 && (whole - i) % 3 == 0) text += locale.thousands_separator;
      text += static_cast<char16_t>(written[i]);
    }
    if (whole < written.size()) text += locale.decimal_separator;
    for (std::size_t i = whole + 1; i < written.size(); ++i) text += static_cast<char16_t>(written[i]);
    return text;
  }
};

/// What the cells of a column say about it.
class ColumnFacts {
 public:
  void add_heading(TextView text, FontMetrics& metrics, const FontStyle& font) { add_lines(text, metrics, font); }

  void add(TextView text, FontMetrics& metrics, const FontStyle& font, const Locale& locale) {
    add_lines(text, metrics, font);
    if (are_numbers_ && !trim_blanks(text).empty()) {
      are_numbers_ = text_to_number(text, locale).has_value();
      has_number_ = true;
    }
    if (!is_seen_as_read(text) && is_right_to_left(trim_blanks(text))) ++right_to_left_;
  }

  [[nodiscard]] bool is_number_column() const noexcept { return are_numbers_ && has_number_; }

  /// How many of its texts run from right to left.
  [[nodiscard]] std::size_t right_to_left() const noexcept { return right_to_left_; }

  /// What the column needs, in twips: for its longest line, and for its longest word.
  [[nodiscard]] double line(const FontStyle& font) const noexcept { return to_twips(line_, font); }
  [[nodiscard]] double word(const FontStyle& font) const noexcept { return to_twips(word_, font); }

 private:
  void add_lines(TextView text, FontMetrics& metrics, const FontStyle& font) {
    if (std::ranges::any_of(text, is_joining)) return add_joined_lines(joined(text), metrics, font);
    add_joined_lines(text, metrics, font);
  }

  void add_joined_lines(TextView text, FontMetrics& metrics, const FontStyle& font) {
    double line = 0;
    double word = 0;
    for (const char16_t unit : text) {
      if (unit == u'\r' || unit == u'\n') {
        line = word = 0;
        continue;
      }
      const std::int32_t width = metrics.width(unit, font);
      line += width;
      word = unit == u' ' ? 0 : word + width;
      line_ = std::max(line_, line);
      word_ = std::max(word_, word);
    }
  }

  double line_ = 0;  ///< In thousandths of the font's size, like the next.
  double word_ = 0;
  bool are_numbers_ = true;
  bool has_number_ = false;
  std::size_t right_to_left_ = 0;
};

std::vector<ColumnFacts> facts_of(const Grid& grid, FontMetrics& metrics, const FontStyle& font, const Locale& locale) {
  std::vector<ColumnFacts> facts(static_cast<std::size_t>(grid.Cols()));
  for (std::int32_t r = 0; r < grid.Rows(); ++r) {
    for (std::size_t c = 0; c < facts.size(); ++c) {
      const TextView text = grid.cell_view(r, static_cast<std::int32_t>(c));
      if (r == 0)
        facts[c].add_heading(text, metrics, font);
      else
        facts[c].add(text, metrics, font, locale);
    }
  }
  return facts;
}

/// Whether most of a column's texts run from right to left.
/// @param right_to_left how many do
bool is_right_to_left_column(const Grid& grid, std::int32_t column, std::size_t right_to_left, const Locale& locale) {
  std::size_t others = 0;
  for (std::int32_t r = 1; r < grid.Rows() && others < right_to_left; ++r) {
    const TextView value = trim_blanks(grid.cell_view(r, column));
    if (!value.empty() && !is_right_to_left(value) && !text_to_number(value, locale)) ++others;
  }
  return others < right_to_left;
}

/// The room that a column is given: for its longest line, and at least for its longest word.
struct Need {
  double line = 0;
  double word = 0;
};

/// The widest that columns may be so that all fit into the room, none narrower than its longest word; the longest need
/// if they fit as they are, and 0 if they cannot fit.
double common_limit(const std::vector<Need>& needs, double room) {
  const auto total = [&](double limit) {
    double sum = 0;
    for (const Need& need : needs) sum += std::min(need.line, std::max(need.word, limit));
    return sum;
  };
  double most = 0;
  for (const Need& need : needs) most = std::max(most, need.line);
  if (total(most) <= room) return most;
  if (total(0) > room) return 0;
  double low = 0;
  for (double high = most; high - low > 1;) {
    const double middle = (low + high) / 2;
    (total(middle) <= room ? low : high) = middle;
  }
  return std::max(low, 1.0);
}

}  // namespace

std::vector<std::size_t> columns_of(const std::vector<Text>& headings, const std::vector<std::string>& names,
                                    const std::string& option) {
  std::vector<std::size_t> columns;
  for (const std::string& name : names) columns.push_back(column_of(headings, name, option));
  return columns;
}

void add_totals(Grid& grid, std::size_t headings, const std::vector<std::string>& names, const Locale& locale) {
  if (names.empty() || grid.Rows() == 0) return;
  std::vector<Text> names_of_columns;
  for (std::size_t c = 0; c < headings; ++c)
    names_of_columns.push_back(grid.TextMatrix(0, static_cast<std::int32_t>(c)));
  std::vector<Text> totals(headings);
  for (const std::string& name : names) {
    const std::size_t column = column_of(names_of_columns, name, "--total");
    double sum = 0;
    std::size_t others = 0;
    NumberStyle style;
    for (std::int32_t r = 1; r < grid.Rows(); ++r) {
      const TextView written = trim_blanks(grid.cell_view(r, static_cast<std::int32_t>(column)));
      const auto number = text_to_number(written, locale);
      if (number) {
        sum += *number;
        style.add(written, locale);
      } else if (!written.empty()) {
        ++others;
      }
    }
    totals[column] = style.text_of(sum, locale);
    if (others > 0) {
      warn("--total " + name + ": " + std::to_string(others) + " values are not numbers and are not in the total");
    }
  }
  const auto label = std::ranges::find(totals, Text());
  if (label != totals.end()) *label = u"Total";
  grid.put_Rows(grid.Rows() + 1);
  for (std::size_t c = 0; c < totals.size(); ++c) {
    grid.put_cell(grid.Rows() - 1, static_cast<std::int32_t>(c), totals[c]);
  }
}

bool lay_out(Grid& grid, FontMetrics& metrics, const FontStyle& font, std::int32_t room, const Locale& locale) {
  constexpr std::int16_t left = 0;
  constexpr std::int16_t right = 6;
  constexpr std::int32_t padding = 160;
  constexpr std::int32_t least = 400;
  constexpr double widest = 5000;  // Of a column of a table that does not fit on a page.
  const std::vector<ColumnFacts> facts = facts_of(grid, metrics, font, locale);
  std::vector<Need> needs;
  for (const ColumnFacts& column : facts) {
    needs.push_back({std::max<double>(column.line(font) + padding, least),
                     std::min(std::max<double>(column.word(font) + padding, least), widest)});
  }
  const double limit = common_limit(needs, room);
  for (std::size_t c = 0; c < facts.size(); ++c) {
    const auto column = static_cast<std::int32_t>(c);
    const double width = std::min(needs[c].line, std::max(needs[c].word, limit == 0 ? widest : limit));
    grid.put_ColWidth(column, static_cast<std::int32_t>(width));
    const bool is_right =
        facts[c].is_number_column() || is_right_to_left_column(grid, column, facts[c].right_to_left(), locale);
    grid.put_ColAlignment(column, is_right ? right : left);
  }
  return limit > 0;
}

}  // namespace talutil::cli
