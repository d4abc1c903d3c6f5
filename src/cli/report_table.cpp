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
std::size_t column_of(const TableRows& rows, const std::string& name, const std::string& option) {
  const std::vector<Text>& headings = rows.front();
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

bool is_number_column(const TableRows& rows, std::size_t column, const Locale& locale) {
  bool has_number = false;
  for (std::size_t r = 1; r < rows.size(); ++r) {
    if (column >= rows[r].size() || trim_blanks(rows[r][column]).empty()) continue;
    if (!text_to_number(rows[r][column], locale)) return false;
    has_number = true;
  }
  return has_number;
}

/// Whether most of a column's texts run from right to left.
bool is_right_to_left_column(const TableRows& rows, std::size_t column, const Locale& locale) {
  std::ptrdiff_t excess = 0;
  for (std::size_t r = 1; r < rows.size(); ++r) {
    if (column >= rows[r].size()) continue;
    const TextView value = trim_blanks(rows[r][column]);
    if (is_right_to_left(value))
      ++excess;
    else if (!value.empty() && !text_to_number(value, locale))
      --excess;
  }
  return excess > 0;
}

/// What a column needs: for its longest line, and for its longest word.
struct Need {
  double line = 0;
  double word = 0;

  void add(TextView shown, FontMetrics& metrics, const FontStyle& font) {
    const Text letters = joined(shown);
    for (TextView text = letters; !text.empty();) {
      const TextView one = text.substr(0, text.find_first_of(u"\r\n"));
      text.remove_prefix(std::min(one.size() + 1, text.size()));
      line = std::max(line, metrics.width(one, font));
      for (std::size_t at = 0; at < one.size();) {
        const std::size_t end = std::min(one.find(u' ', at), one.size());
        word = std::max(word, metrics.width(one.substr(at, end - at), font));
        at = end + 1;
      }
    }
  }
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

void choose_columns(TableRows& rows, const std::vector<std::string>& names) {
  if (names.empty() || rows.empty()) return;
  std::vector<std::size_t> chosen;
  for (const std::string& name : names) chosen.push_back(column_of(rows, name, "--columns"));
  for (std::vector<Text>& row : rows) {
    std::vector<Text> kept;
    for (const std::size_t c : chosen) kept.push_back(c < row.size() ? row[c] : Text());
    row = std::move(kept);
  }
}

void add_totals(TableRows& rows, const std::vector<std::string>& names, const Locale& locale) {
  if (names.empty() || rows.empty()) return;
  std::vector<Text> totals(rows.front().size());
  for (const std::string& name : names) {
    const std::size_t column = column_of(rows, name, "--total");
    double sum = 0;
    std::size_t others = 0;
    NumberStyle style;
    for (std::size_t r = 1; r < rows.size(); ++r) {
      const TextView written = column < rows[r].size() ? trim_blanks(rows[r][column]) : TextView();
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
  rows.push_back(std::move(totals));
}

bool lay_out(Grid& grid, const TableRows& rows, FontMetrics& metrics, const FontStyle& font, std::int32_t room,
             const Locale& locale) {
  constexpr std::int16_t left = 0;
  constexpr std::int16_t right = 6;
  constexpr std::int32_t padding = 160;
  constexpr std::int32_t least = 400;
  constexpr double widest = 5000;  // Of a column of a table that does not fit on a page.
  const auto count = static_cast<std::size_t>(grid.Cols());
  std::vector<Need> needs(count);
  for (const auto& row : rows) {
    for (std::size_t c = 0; c < row.size(); ++c) needs[c].add(row[c], metrics, font);
  }
  for (Need& need : needs) {
    need.line = std::max<double>(need.line + padding, least);
    need.word = std::min(std::max<double>(need.word + padding, least), widest);
  }
  const double limit = common_limit(needs, room);
  for (std::size_t c = 0; c < count; ++c) {
    const auto column = static_cast<std::int32_t>(c);
    const double width = std::min(needs[c].line, std::max(needs[c].word, limit == 0 ? widest : limit));
    grid.put_ColWidth(column, static_cast<std::int32_t>(width));
    const bool is_right = is_number_column(rows, c, locale) || is_right_to_left_column(rows, c, locale);
    grid.put_ColAlignment(column, is_right ? right : left);
  }
  return limit > 0;
}

}  // namespace talutil::cli
