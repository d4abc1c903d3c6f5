#include "documents/grid_contents.hpp"

#include <algorithm>
#include <array>
#include <limits>

#include "automation/run_time_error.hpp"
#include "documents/arabic_joining.hpp"
#include "documents/visible_text.hpp"

namespace talutil {

namespace {

constexpr double boolean_type = 11;
constexpr std::int16_t check_box_setting = 5;
constexpr std::uint32_t usual_heading_colour = 0x00E8E8E8;
constexpr std::uint32_t usual_line_colour = 0x00C0C0C0;
constexpr std::uint32_t white = 0x00FFFFFF;
constexpr std::uint32_t black = 0;

/// Reads a property of the grid's appearance that it may not have. A grid that has it but fails does not have it
/// either: no report should be lost for the sake of its looks.
template <class T>
T answer_or(const Control& grid, TextView member, T otherwise, std::initializer_list<Variant> indexes = {}) {
  if (!grid.answers(member)) return otherwise;
  try {
    return grid.get<T>(member, indexes);
  } catch (const RunTimeError&) {
    return otherwise;
  }
}

std::uint32_t plain_colour(std::int32_t answer, std::uint32_t otherwise) noexcept {
  const auto colour = static_cast<std::uint32_t>(answer);
  constexpr std::uint32_t system_colour = 0x80000000;
  // A system colour depends on the user's screen, which has no place in a report.
  return (colour & system_colour) != 0 ? otherwise : colour & white;
}

std::uint32_t colour_or(const Control& grid, TextView member, std::uint32_t otherwise) {
  return plain_colour(answer_or(grid, member, static_cast<std::int32_t>(otherwise)), otherwise);
}

/// The paper is white already.
std::optional<std::uint32_t> fill_of(std::uint32_t colour) noexcept {
  return colour == white ? std::nullopt : std::optional(colour);
}

/// Grid alignments come in threes (top, middle, bottom): left, centred, right. 9 is right for numbers, left for texts.
Alignment alignment_of(std::int32_t code) noexcept {
  return code < 0 || code > 8 ? Alignment::general : static_cast<Alignment>(code / 3);
}

}  // namespace

/// The looks of single cells, as far as the grid has such settings: what it does not answer for the first cell is not
/// asked again.
class GridContents::CellLooks {
 public:
  explicit CellLooks(const Control& grid) : grid_(grid) {
    if (!grid.answers(u"Cell")) return;
    for (std::size_t i = 0; i < std::size(codes); ++i) uses_[i] = grid.repeated_get(u"Cell", {codes[i], 0, 0});
  }

  void apply(std::int32_t row, std::int32_t column, CellLook& look) {
    if (const auto code = ask(alignment, row, column); code > 0 && code <= 8) look.alignment = alignment_of(code);
    // 0 is a cell without a colour of its own.
    if (const auto colour = ask(background, row, column); colour != 0) {
      look.background = fill_of(plain_colour(colour, look.background.value_or(white)));
    }
    if (const auto colour = ask(letters, row, column); colour != 0) look.letters = plain_colour(colour, look.letters);
    look.is_bold = look.is_bold || ask(bold, row, column) != 0;
  }

 private:
  enum Setting : std::size_t { alignment, background, letters, bold };
  // In the order of Setting. No host relies on them, unlike on the code of check boxes; a grid that has none of them
  // answers an error, or 0, and is printed without looks of single cells.
  static constexpr std::int16_t codes[] = {2, 6, 7, 13};

  std::int32_t ask(Setting setting, std::int32_t row, std::int32_t column) {
    auto& use = uses_[setting];
    if (!use) return 0;
    try {
      use->set(1, row);
      use->set(2, column);
      return use->run().to_int32(grid_.locale());
    } catch (const RunTimeError&) {
      use.reset();
      return 0;
    }
  }

  const Control& grid_;
  std::array<std::unique_ptr<RepeatedUse>, std::size(codes)> uses_;
};

GridContents::GridContents(const Control& grid, const FontStyle& usual_font) : font(usual_font) {
  if (const Text name = answer_or<Text>(grid, u"FontName", {}); !name.empty()) font.family = family_of(name);
  if (const auto size = answer_or<float>(grid, u"FontSize", font.points); size >= 4 && size <= 72) font.points = size;
  font.is_bold = bool(answer_or<Boolean>(grid, u"FontBold", Boolean(false)));
  wraps = bool(answer_or<Boolean>(grid, u"WordWrap", Boolean(false)));
  const auto lines_of = [&](TextView kind, TextView colour, const Lines& otherwise) -> Lines {
    if (answer_or<std::int32_t>(grid, kind, otherwise ? 1 : 0) == 0) return std::nullopt;
    return colour_or(grid, colour, otherwise.value_or(usual_line_colour));
  };
  lines = lines_of(u"GridLines", u"GridColor", usual_line_colour);
  heading_lines = lines_of(u"GridLinesFixed", u"GridColorFixed", lines);
  read_columns(grid);
  read_rows(grid);
}

void GridContents::read_columns(const Control& grid) {
  constexpr std::int32_t usual_width = 1000;
  const auto count = grid.get<std::int32_t>(u"Cols");
  const auto fixed = answer_or<std::int32_t>(grid, u"FixedCols", 0);
  const bool hides = grid.answers(u"ColHidden");
  const bool has_widths = grid.answers(u"ColWidth");
  const bool has_types = grid.answers(u"ColDataType");
  const bool merges = answer_or<std::int32_t>(grid, u"MergeCells", 0) != 0;
  for (std::int32_t c = 0; c < count; ++c) {
    if (hides && grid.get<Boolean>(u"ColHidden", {c})) continue;
    const auto width = has_widths ? grid.get<std::int32_t>(u"ColWidth", {c}) : usual_width;
    if (width == 0) continue;
    Column& column = columns.emplace_back(Column{.index = c, .width = width});
    column.is_boolean = has_types && grid.get(u"ColDataType", {c}).equals_number(boolean_type, grid.locale());
    column.alignment = alignment_of(answer_or<std::int32_t>(grid, u"ColAlignment", -1, {c}));
    column.merges = merges && bool(answer_or<Boolean>(grid, u"MergeCol", Boolean(false), {c}));
    if (c < fixed) ++heading_columns;
  }
}

GridContents::Cell GridContents::cell(std::size_t row, std::size_t column) const {
  const StoredRow& stored = stored_rows_[row];
  const std::size_t place = row * columns.size() + column;
  const std::uint32_t start = column == 0 ? 0 : ends_[place - 1];
  const TextView kept(stored.units + start, ends_[place] - start);
  const bool has_box = is_check_box(row, column);
  return {has_box ? TextView() : kept, has_box && !kept.empty(),
          stored.looks == usual_looks ? usual_look(row, column) : looks_[row_looks_[stored.looks + column]]};
}

void GridContents::set_usual_looks(const Control& grid) {
  const CellLook body{
      font.is_bold, colour_or(grid, u"ForeColor", black), fill_of(colour_or(grid, u"BackColor", white)), {}};
  const CellLook heading{font.is_bold,
                         colour_or(grid, u"ForeColorFixed", black),
                         colour_or(grid, u"BackColorFixed", usual_heading_colour),
                         {}};
  for (const Column& column : columns) {
    for (const CellLook& look : {body, heading}) usual_looks_.emplace_back(look).alignment = column.alignment;
  }
}

/// Keeps the looks of the cells of the last row.
void GridContents::keep_looks(const std::vector<CellLook>& looks) {
  stored_rows_.back().looks = row_looks_.size();
  for (const CellLook& look : looks) {
    const auto [known, is_new] = known_looks_.try_emplace(look, static_cast<std::uint32_t>(looks_.size()));
    if (is_new) looks_.push_back(look);
    row_looks_.push_back(known->second);
  }
}

/// Reads the cells of the last row.
/// @param row in the grid
void GridContents::read_cells(const Control& grid, RepeatedUse& text, std::int32_t row, CellLooks& looks) {
  Text units;
  std::vector<CellLook> shown;
  bool has_own_looks = false;
  text.set(0, row);
  for (std::size_t c = 0; c < columns.size(); ++c) {
    const Column& column = columns[c];
    if (is_check_box(rows.size() - 1, c)) {
      const bool is_ticked = grid.get(u"Cell", {check_box_setting, row, column.index}).equals_number(1, grid.locale());
      if (is_ticked) units += u'x';
    } else {
      text.set(1, column.index);
      const TextView answer = text.run_text(grid.locale());
      units += joined(wraps ? visible_text(answer) : visible_line(answer));
    }
    if (units.size() > std::numeric_limits<std::uint32_t>::max()) raise(ErrorNumber::out_of_memory);
    ends_.push_back(static_cast<std::uint32_t>(units.size()));
    CellLook& look = shown.emplace_back(usual_look(rows.size() - 1, c));
    looks.apply(row, column.index, look);
    has_own_looks = has_own_looks || look != usual_look(rows.size() - 1, c);
  }
  stored_rows_.back().units = texts_.keep(units).data();
  if (has_own_looks) keep_looks(shown);
}

void GridContents::read_rows(const Control& grid) {
  const auto count = grid.get<std::int32_t>(u"Rows");
  const auto fixed = answer_or<std::int32_t>(grid, u"FixedRows", 0);
  const bool hides = grid.answers(u"RowHidden");
  const bool has_heights = grid.answers(u"RowHeight");
  const bool merges = answer_or<std::int32_t>(grid, u"MergeCells", 0) != 0;
  set_usual_looks(grid);
  const auto text = grid.repeated_get(u"TextMatrix", {0, 0});
  CellLooks looks(grid);
  for (std::int32_t r = 0; r < count; ++r) {
    if (hides && grid.get<Boolean>(u"RowHidden", {r})) continue;
    const bool is_heading_row = r < fixed;
    if (is_heading_row) ++heading_rows;
    Row& row = rows.emplace_back();
    stored_rows_.emplace_back();
    if (has_heights) row.height = std::max(0, grid.get<std::int32_t>(u"RowHeight", {r}));
    row.merges = merges && is_heading_row && bool(answer_or<Boolean>(grid, u"MergeRow", Boolean(false), {r}));
    read_cells(grid, *text, r, looks);
  }
  known_looks_.clear();
}

}  // namespace talutil
