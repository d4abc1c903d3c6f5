#pragma once

#include <memory>
#include <vector>

#include "controls/table_object.hpp"
#include "platform/table_source.hpp"

namespace talutil {

/// The texts of a row, stored compactly: one string, in which each cell knows its position. Cells after the last one
/// ever filled take no memory.
class RowText {
 public:
  [[nodiscard]] TextView cell(std::size_t column) const noexcept;

  /// @param columns the number of cells that the row will probably have
  void set(std::size_t column, TextView text, std::size_t columns);

  /// Discards the cells from `columns` on.
  void keep(std::size_t columns);

 private:
  struct Place {
    std::uint32_t start = 0;
    std::uint32_t length = 0;
  };

  /// Removes text that no cell refers to any more.
  void tidy();

  Text units_;
  std::vector<Place> cells_;
  std::uint32_t unused_ = 0;  ///< Code units that no cell refers to any more.
};

/// The grid control: a table of texts, with the properties of rows and columns that a visible grid has. Rows and
/// columns are counted from 0; an index outside the table always raises 9.
class Grid final : public TableObject<Grid>, public TableSource {
 public:
  static constexpr std::int16_t text_setting = 0;
  static constexpr std::int16_t check_box_setting = 5;
  static constexpr std::int16_t boolean_type = 11;
  static constexpr std::int16_t general_alignment = 9;

  // The check-box state of a cell.
  static constexpr std::int16_t no_check_box = 0;
  static constexpr std::int16_t ticked = 1;
  static constexpr std::int16_t not_ticked = 2;

  enum class Format : std::int16_t { comma_text = 3, tab_text = 4, fixed_text = 5 };

  static constexpr std::int32_t most_rows = 5'000'000;
  static constexpr std::int32_t most_columns = 32767;
  static constexpr std::int32_t default_width = 1000;  ///< In twips.

  explicit Grid(const Platform& platform)
      : TableObject(platform), files_(platform.files), code_page_(platform.code_page) {}

  /// The size of the table. Shrinking discards cells; new cells are empty. If fewer rows or columns remain than were
  /// fixed, all of them are fixed. Raise 5 for a negative number and 7 beyond the limits above.
  [[nodiscard]] std::int32_t Rows() const noexcept { return static_cast<std::int32_t>(rows_.size()); }
  void put_Rows(std::int32_t rows);
  [[nodiscard]] std::int32_t Cols() const noexcept { return static_cast<std::int32_t>(columns_.size()); }
  void put_Cols(std::int32_t columns);

  /// The number of leading rows and columns that are headings. Raise 5 for more than there are.
  [[nodiscard]] std::int32_t FixedRows() const noexcept { return fixed_rows_; }
  void put_FixedRows(std::int32_t rows);
  [[nodiscard]] std::int32_t FixedCols() const noexcept { return fixed_columns_; }
  void put_FixedCols(std::int32_t columns);

  /// The text of a cell. Values are stored as text.
  [[nodiscard]] Text TextMatrix(std::int32_t row, std::int32_t column) const;
  void put_TextMatrix(std::int32_t row, std::int32_t column, const Text& value) { put_cell(row, column, value); }
  void put_cell(std::int32_t row, std::int32_t column, TextView text);

  /// A setting of a cell: 0 is its text, 5 the state of the check box that cells in a column of type 11 have: 1 ticked
  /// (the text is "True" or a nonzero number), 2 not ticked, 0 no check box. Raises 5 for another setting or state.
  [[nodiscard]] Variant Cell(std::int16_t setting, std::int32_t row, std::int32_t column) const;
  void put_Cell(std::int16_t setting, std::int32_t row, std::int32_t column, const Variant& value);

  /// The width of a column in twips; a negative width means the default.
  [[nodiscard]] std::int32_t ColWidth(std::int32_t column) const { return at(column).width; }
  void put_ColWidth(std::int32_t column, std::int32_t width) { at(column).width = width < 0 ? default_width : width; }
  [[nodiscard]] Boolean ColHidden(std::int32_t column) const { return at(column).is_hidden; }
  void put_ColHidden(std::int32_t column, Boolean hidden) { at(column).is_hidden = Boolean(bool(hidden)); }
  [[nodiscard]] Boolean RowHidden(std::int32_t row) const { return Boolean(rows_[index_in(rows_, row)].is_hidden); }
  void put_RowHidden(std::int32_t row, Boolean hidden) { rows_[index_in(rows_, row)].is_hidden = bool(hidden); }

  /// The alignment of a column's texts, in threes (top, middle, bottom): 0 to 2 left, 3 to 5 centred, 6 to 8 right; 9
  /// is right for numbers and left for texts.
  [[nodiscard]] std::int16_t ColAlignment(std::int32_t column) const { return at(column).alignment; }
  void put_ColAlignment(std::int32_t column, std::int16_t alignment) { at(column).alignment = alignment; }

  /// The height of a row in twips; 0 or less for a row as high as its text.
  [[nodiscard]] std::int32_t RowHeight(std::int32_t row) const { return rows_[index_in(rows_, row)].height; }
  void put_RowHeight(std::int32_t row, std::int32_t height) { rows_[index_in(rows_, row)].height = height; }

  // The grid's appearance on a window or on pages. Colours are 0x00BBGGRR.
  Text FontName;               ///< Empty, like a size of 0, for the default.
  float FontSize = 0;          ///< In points.
  Boolean WordWrap;            ///< Wraps long texts within their cells; otherwise they are cut off.
  std::int16_t GridLines = 1;  ///< 0 for none.
  std::int32_t GridColor = 0xC0C0C0;
  Boolean FontBold;
  std::int32_t ForeColor = 0;
  std::int32_t BackColor = 0xFFFFFF;
  std::int32_t ForeColorFixed = 0;         ///< The letters of fixed rows and columns.
  std::int32_t BackColorFixed = 0xE8E8E8;  ///< Behind them.

  /// The type of a column's values as an automation type: 11 is Boolean. 0 until it is set.
  [[nodiscard]] std::int16_t ColDataType(std::int32_t column) const { return at(column).data_type; }
  void put_ColDataType(std::int32_t column, std::int16_t type) { at(column).data_type = type; }

  /// The first and last row of the selection. Setting the first also sets the last. -1 means no row.
  [[nodiscard]] std::int32_t Row() const noexcept { return row_; }
  void put_Row(std::int32_t row);
  [[nodiscard]] std::int32_t RowSel() const noexcept { return row_end_; }
  void put_RowSel(std::int32_t row);

  /// The grid's window, which report builders ask for; 0 if the table is not shown.
  [[nodiscard]] std::int32_t hwnd() const noexcept { return window_; }

  // As a table on a window: if the first row is fixed, it is the heading, and the others follow below.
  [[nodiscard]] std::int32_t row_count() const override { return Rows() - FixedRows(); }
  [[nodiscard]] std::int32_t column_count() const override { return Cols(); }
  [[nodiscard]] Text heading(std::int32_t column) const override {
    return FixedRows() > 0 ? TextMatrix(0, column) : Text();
  }
  [[nodiscard]] std::int32_t column_width(std::int32_t column) const override { return ColWidth(column); }
  [[nodiscard]] bool is_right_aligned(std::int32_t column) const override {
    return at(column).alignment >= 6 && at(column).alignment <= 8;
  }
  [[nodiscard]] Text cell_text(std::int32_t row, std::int32_t column) const override {
    return TextMatrix(row + FixedRows(), column);
  }
  void set_window(std::int32_t window) override { window_ = window; }

  /// Clears every cell.
  void Clear();

  /// Inserts a row before another one, or (-1) at the end, with the tab-separated cells of a text. Cells beyond the
  /// last column are dropped. A row inserted before a fixed row is fixed too; the selection stays on its rows.
  void AddItem(const Text& item, std::int32_t index);

  /// Removes a row. The other fixed rows stay fixed, and the selection stays on its rows; if a selected row is removed,
  /// the next one takes its place.
  void RemoveItem(std::int32_t index);

  /// Writes the table to a file. Formats: 3 comma-separated and 4 tab-separated text, with cells quoted that contain a
  /// separator, quote or line break; 5 columns of fixed width, two blanks apart, with line breaks as blanks. Code page
  /// 1252, or UTF-8 with a byte order mark if the page lacks a character. Raises 5 for another format, and the errors
  /// of writing a file; an existing file then stays as it was.
  void SaveGrid(const Text& file, std::int16_t format, Boolean fixed_cells) const;

  /// Reads such a file into the table, which takes the file's size. The numbers of fixed rows and columns stay the same
  /// if the table is large enough. Without `fixed_cells`, fixed cells stay and the file's cells follow them. Widths,
  /// types and hidden columns stay. Raises the same errors as SaveGrid, and then changes nothing.
  void LoadGrid(const Text& file, std::int16_t format, Boolean fixed_cells);

 private:
  struct Column {
    std::int32_t width = default_width;
    std::int16_t data_type = 0;
    std::int16_t alignment = general_alignment;
    Boolean is_hidden;
  };

  struct TableRow {
    RowText text;
    std::int32_t height = 0;
    bool is_hidden = false;
  };

  /// A checked index.
  template <class Item>
  [[nodiscard]] static std::size_t index_in(const std::vector<Item>& list, std::int32_t index) {
    if (index < 0 || static_cast<std::size_t>(index) >= list.size()) raise(ErrorNumber::subscript_out_of_range);
    return static_cast<std::size_t>(index);
  }
  [[nodiscard]] Column& at(std::int32_t column) { return columns_[index_in(columns_, column)]; }
  [[nodiscard]] const Column& at(std::int32_t column) const { return columns_[index_in(columns_, column)]; }
  void keep_selection_inside() noexcept;

  Files& files_;
  CodePage& code_page_;
  std::vector<TableRow> rows_;
  std::vector<Column> columns_;
  std::int32_t fixed_rows_ = 0;
  std::int32_t fixed_columns_ = 0;
  std::int32_t row_ = -1;
  std::int32_t row_end_ = -1;
  std::int32_t window_ = 0;
};

template <class P>
constexpr auto members_of(std::type_identity<Grid>) {
  using G = Grid;
  return P::rows(
      P::template get_only<&G::hwnd>("hwnd", "Its window; 0 while it is not shown."),
      P::template accessors<&G::Rows, &G::put_Rows>("Rows", "The number of rows."),
      P::template accessors<&G::Cols, &G::put_Cols>("Cols", "The number of columns."),
      P::template accessors<&G::FixedRows, &G::put_FixedRows>("FixedRows", "The rows that are headings."),
      P::template accessors<&G::FixedCols, &G::put_FixedCols>("FixedCols", "The columns that are headings."),
      P::template accessors<&G::TextMatrix, &G::put_TextMatrix>("TextMatrix", "The text of a cell.", "Row", "Col"),
      P::template accessors<&G::Cell, &G::put_Cell>("Cell", "A setting of a cell: 0 text, 5 check box.", "Setting",
                                                    "Row", "Col"),
      P::template accessors<&G::ColWidth, &G::put_ColWidth>("ColWidth", "The width of a column, in twips.", "Col"),
      P::template accessors<&G::ColHidden, &G::put_ColHidden>("ColHidden", "Whether a column is hidden.", "Col"),
      P::template accessors<&G::RowHidden, &G::put_RowHidden>("RowHidden", "Whether a row is hidden.", "Row"),
      P::template accessors<&G::ColDataType, &G::put_ColDataType>("ColDataType", "The type of a column; 11 Boolean.",
                                                                  "Col"),
      P::template accessors<&G::ColAlignment, &G::put_ColAlignment>(
          "ColAlignment", "0 left, 3 centred, 6 right, 9 numbers right.", "Col"),
      P::template accessors<&G::RowHeight, &G::put_RowHeight>("RowHeight",
                                                              "The height of a row, in twips; 0 its text's.", "Row"),
      P::template property<&G::FontName>("FontName", "The font of its texts."),
      P::template property<&G::FontSize>("FontSize", "Its size, in points."),
      P::template property<&G::WordWrap>("WordWrap", "Long texts go on in the next line of their cell."),
      P::template property<&G::GridLines>("GridLines", "0 for no lines between the cells."),
      P::template property<&G::GridColor>("GridColor", "The colour of the lines."),
      P::template property<&G::BackColorFixed>("BackColorFixed", "The colour behind fixed rows and columns."),
      P::template accessors<&G::Row, &G::put_Row>("Row", "The row where the selection begins."),
      P::template accessors<&G::RowSel, &G::put_RowSel>("RowSel", "The row where the selection ends."),
      P::template method<&G::Clear>("Clear", "Empties every cell."),
      P::template method<&G::AddItem>("AddItem", "Adds a row.", "Item", optional("Index", -1)),
      P::template method<&G::RemoveItem>("RemoveItem", "Takes a row out.", "Index"),
      P::template method<&G::SaveGrid>("SaveGrid", "Writes a file: 3 comma text, 4 tab text, 5 fixed text.", "FileName",
                                       "Format", optional("FixedCells", -1)),
      P::template method<&G::LoadGrid>("LoadGrid", "Reads such a file.", "FileName", "Format",
                                       optional("FixedCells", -1)),
      P::template property<&G::FontBold>("FontBold", "Its texts are bold."),
      P::template property<&G::ForeColor>("ForeColor", "The colour of its texts."),
      P::template property<&G::BackColor>("BackColor", "The colour behind them."),
      P::template property<&G::ForeColorFixed>("ForeColorFixed", "The colour of the texts of fixed rows and columns."));
}

}  // namespace talutil
