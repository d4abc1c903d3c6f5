// Grids on pages.
#include <algorithm>
#include <cmath>

#include "preview/report_composer.hpp"

namespace talutil {

namespace {

constexpr std::int32_t cell_padding = 60;
constexpr std::int32_t hair_line = 10;
constexpr double boolean_type = 11;
constexpr std::int16_t check_box_setting = 5;
constexpr std::uint32_t usual_heading_colour = 0x00E8E8E8;
constexpr std::uint32_t usual_line_colour = 0x00C0C0C0;

/// A property that a grid may lack.
template <class T>
T answer_or(const Control& grid, TextView member, T otherwise) {
  return grid.answers(member) ? grid.get<T>(member) : otherwise;
}

std::uint32_t colour_or(const Control& grid, TextView member, std::uint32_t otherwise) {
  const auto colour = static_cast<std::uint32_t>(answer_or(grid, member, static_cast<std::int32_t>(otherwise)));
  constexpr std::uint32_t system_colour = 0x80000000;
  // What a system colour is on somebody's screen is none of a report's.
  return (colour & system_colour) != 0 ? otherwise : colour & 0xFFFFFF;
}

enum class Alignment : std::uint8_t { left, centre, right, general };

/// Grids count alignments by threes (top, middle, bottom): left, centred, right, and 9 for numbers right, texts left.
Alignment alignment_of(std::int32_t code) noexcept {
  return code < 0 || code > 8 ? Alignment::general : static_cast<Alignment>(code / 3);
}

}  // namespace

/// What a grid shows: read once, and complete before the first cell is laid out.
struct ReportComposer::GridLayout {
  struct Column {
    std::int32_t index = 0;
    std::int32_t width = 0;
    bool is_boolean = false;
    Alignment alignment = Alignment::general;
  };
  struct Cell {
    Text text;
    bool is_ticked = false;
  };

  FontStyle font;
  std::uint32_t heading_colour = usual_heading_colour;
  std::uint32_t line_colour = usual_line_colour;
  bool has_lines = true;
  std::vector<Column> columns;
  std::size_t heading_rows = 0;  ///< Of those shown.
  std::size_t rows = 0;
  std::vector<Cell> cells;  ///< Row by row.

  GridLayout(const Control& grid, const FontStyle& usual_font, std::int32_t room);

  [[nodiscard]] std::int32_t row_height() const noexcept { return line_height(font) + cell_padding; }
};

ReportComposer::GridLayout::GridLayout(const Control& grid, const FontStyle& usual_font, std::int32_t room)
    : font(usual_font),
      heading_colour(colour_or(grid, u"BackColorFixed", usual_heading_colour)),
      line_colour(colour_or(grid, u"GridColor", usual_line_colour)),
      has_lines(answer_or<std::int32_t>(grid, u"GridLines", 1) != 0) {
  if (grid.answers(u"FontName")) font.family = family_of(grid.get<Text>(u"FontName"));
  if (const auto size = answer_or<float>(grid, u"FontSize", font.points); size >= 4 && size <= 72) font.points = size;
  const auto column_count = grid.get<std::int32_t>(u"Cols");
  for (std::int32_t c = 0; c < column_count; ++c) {
    if (grid.answers(u"ColHidden") && grid.get<Boolean>(u"ColHidden", {c})) continue;
    const auto width = grid.answers(u"ColWidth") ? grid.get<std::int32_t>(u"ColWidth", {c}) : 1000;
    if (width == 0) continue;
    Column column{c, std::clamp(width, 2 * cell_padding, room), false, Alignment::general};
    column.is_boolean = grid.answers(u"ColDataType") && grid.get(u"ColDataType", {c}).equals_number(boolean_type);
    if (grid.answers(u"ColAlignment")) column.alignment = alignment_of(grid.get<std::int32_t>(u"ColAlignment", {c}));
    columns.push_back(column);
  }

  const auto row_count = grid.get<std::int32_t>(u"Rows");
  const auto fixed_rows = answer_or<std::int32_t>(grid, u"FixedRows", 0);
  const auto text = grid.repeated_get(u"TextMatrix", {0, 0});
  for (std::int32_t r = 0; r < row_count; ++r) {
    if (grid.answers(u"RowHidden") && grid.get<Boolean>(u"RowHidden", {r})) continue;
    if (r < fixed_rows) ++heading_rows;
    ++rows;
    text->set(0, r);
    for (const Column& column : columns) {
      Cell& cell = cells.emplace_back();
      if (column.is_boolean && r >= fixed_rows) {
        cell.is_ticked = grid.get(u"Cell", {check_box_setting, r, column.index}).equals_number(1);
        continue;
      }
      text->set(1, column.index);
      cell.text = text->run_text();
    }
  }
}

void ReportComposer::add_row(const GridLayout& layout, std::size_t row, std::size_t first, std::size_t end) {
  const bool is_heading = row < layout.heading_rows;
  const std::int32_t height = layout.row_height();
  std::int32_t left = setup_.margin_left;
  for (std::size_t c = first; c < end; ++c) {
    const GridLayout::Column& column = layout.columns[c];
    const GridLayout::Cell& cell = layout.cells[row * layout.columns.size() + c];
    const Rectangle place{left, y_, column.width, height};
    if (is_heading || layout.has_lines) {
      page().items.emplace_back(Box{.place = place,
                                    .fill = is_heading ? std::optional(layout.heading_colour) : std::nullopt,
                                    .line_width = layout.has_lines ? hair_line : 0,
                                    .line_colour = layout.line_colour});
    }
    if (column.is_boolean && !is_heading) {
      const std::int32_t size = line_height(layout.font) * 3 / 5;
      const Rectangle box{left + (column.width - size) / 2, y_ + (height - size) / 2, size, size};
      page().items.emplace_back(Box{.place = box, .fill = {}, .line_width = hair_line, .line_colour = 0});
      if (cell.is_ticked) {
        const std::int32_t inset = size / 4;
        page().items.emplace_back(
            Box{.place = {box.left + inset, box.top + inset, size - 2 * inset, size - 2 * inset}, .fill = 0U});
      }
    } else if (!cell.text.empty()) {
      const std::int32_t room = column.width - 2 * cell_padding;
      const std::size_t line_end = std::min(cell.text.find_first_of(u"\r\n"), cell.text.size());
      const TextView shown = fitting(TextView(cell.text).substr(0, line_end), room, layout.font);
      Alignment alignment = column.alignment;
      if (alignment == Alignment::general) {
        const bool is_number = !is_heading && text_to_number(cell.text).has_value();
        alignment = is_number ? Alignment::right : Alignment::left;
      }
      std::int32_t x = left + cell_padding;
      const auto spare = static_cast<std::int32_t>(std::max(0.0, room - metrics_.width(shown, layout.font)));
      if (alignment == Alignment::centre) x += spare / 2;
      if (alignment == Alignment::right) x += spare;
      add_runs(shown, x, y_ + cell_padding / 2, layout.font);
    }
    left += column.width;
  }
  y_ += height;
}

void ReportComposer::add_columns(const GridLayout& layout, std::size_t first, std::size_t end) {
  const auto add_headings = [&] {
    for (std::size_t row = 0; row < layout.heading_rows; ++row) add_row(layout, row, first, end);
  };
  add_headings();
  for (std::size_t row = layout.heading_rows; row < layout.rows; ++row) {
    if (y_ + layout.row_height() > setup_.bottom() && y_ > setup_.margin_top) {
      begin_page();
      add_headings();
    }
    add_row(layout, row, first, end);
  }
}

void ReportComposer::add_grid(const Control& grid, const FontStyle& font) {
  const GridLayout layout(grid, font, setup_.room());
  for (std::size_t first = 0; first < layout.columns.size();) {
    std::size_t end = first;
    std::int32_t width = 0;
    while (end < layout.columns.size() && (end == first || width + layout.columns[end].width <= setup_.room())) {
      width += layout.columns[end++].width;
    }
    if (first > 0) begin_page();
    add_columns(layout, first, end);
    first = end;
  }
}

}  // namespace talutil
