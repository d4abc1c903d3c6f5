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

  /// Makes room for so many more code units: no more than that for the last cell of a row.
  void make_room(std::size_t length, bool is_last);

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

  /// The number of rows, fixed ones included; more rows are empty, fewer discard the last ones. If fewer rows remain
  /// than were fixed, all of them are fixed. A new grid has none.
  /// @raises 5 if the number is negative
  /// @raises 7 if it is above 5,000,000
  /// @family grids
  /// @see Cols, FixedRows, AddItem
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.Rows = 3
  ///     g.TextMatrix(2, 1) = "last"
  ///     Print g.Rows & " " & g.TextMatrix(2, 1)
  ///     ' 3 last
  [[nodiscard]] std::int32_t Rows() const noexcept { return static_cast<std::int32_t>(rows_.size()); }
  void put_Rows(std::int32_t rows);

  /// The number of columns, fixed ones included; more columns are empty, fewer discard the last ones. If fewer columns
  /// remain than were fixed, all of them are fixed. A new grid has none, so set it before AddItem.
  /// @raises 5 if the number is negative
  /// @raises 7 if it is above 32,767
  /// @family grids
  /// @see Rows, FixedCols
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 4
  ///     Print g.Cols
  ///     ' 4
  [[nodiscard]] std::int32_t Cols() const noexcept { return static_cast<std::int32_t>(columns_.size()); }
  void put_Cols(std::int32_t columns);

  /// The number of rows at the top that are headings. Reports repeat them on each page; SelectGridRows and
  /// CountGridSelectedRows leave them out.
  /// @raises 5 if the number is negative or above Rows
  /// @family grids
  /// @see FixedCols, Rows, GridPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.AddItem "Name" & vbTab & "Amount"
  ///     g.AddItem "Smith" & vbTab & "120"
  ///     g.FixedRows = 1
  ///     Print g.FixedRows
  ///     ' 1
  [[nodiscard]] std::int32_t FixedRows() const noexcept { return fixed_rows_; }
  void put_FixedRows(std::int32_t rows);

  /// The number of columns on the left that are headings. Reports repeat them before the columns that continue on
  /// further pages.
  /// @raises 5 if the number is negative or above Cols
  /// @family grids
  /// @see FixedRows, Cols
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 3
  ///     g.FixedCols = 1
  ///     Print g.FixedCols
  ///     ' 1
  [[nodiscard]] std::int32_t FixedCols() const noexcept { return fixed_columns_; }
  void put_FixedCols(std::int32_t columns);

  /// The text of a cell; a value that is put is stored as text.
  /// @param Row the row, counted from 0
  /// @param Col the column, counted from 0
  /// @raises 9 if there is no such row or column
  /// @family grids
  /// @see Cell
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Rows = 1
  ///     g.Cols = 1
  ///     g.TextMatrix(0, 0) = 1.5
  ///     Print g.TextMatrix(0, 0) & " " & TypeName(g.TextMatrix(0, 0))
  ///     ' 1.5 String
  [[nodiscard]] Text TextMatrix(std::int32_t row, std::int32_t column) const;
  void put_TextMatrix(std::int32_t row, std::int32_t column, const Text& value) { put_cell(row, column, value); }
  void put_cell(std::int32_t row, std::int32_t column, TextView text);

  /// The text of a cell until the grid changes. Raises 9 if there is no such cell.
  [[nodiscard]] TextView cell_view(std::int32_t row, std::int32_t column) const;

  /// A setting of a cell: 0 its text, 5 the state of its check box. A cell has a check box if its column has the type
  /// 11 (ColDataType). Putting a state stores the text "True" or "False".
  /// @param Setting 0 the text; 5 the check box: 1 ticked (the text is "True" or a number other than 0), 2 not ticked,
  ///   0 no check box
  /// @param Row the row, counted from 0
  /// @param Col the column, counted from 0
  /// @raises 5 for another setting, and if the state that is put is neither 1 nor 2
  /// @raises 9 if there is no such row or column
  /// @family grids
  /// @see TextMatrix, ColDataType, SelectGridRows
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Rows = 1
  ///     g.Cols = 1
  ///     g.ColDataType(0) = 11
  ///     g.Cell(5, 0, 0) = 1
  ///     Print g.Cell(5, 0, 0) & " " & g.Cell(0, 0, 0)
  ///     ' 1 True
  [[nodiscard]] Variant Cell(std::int16_t setting, std::int32_t row, std::int32_t column) const;
  void put_Cell(std::int16_t setting, std::int32_t row, std::int32_t column, const Variant& value);

  /// The width of a column, in twips: 1000 at first, and again if a negative width is put.
  /// @param Col the column, counted from 0
  /// @raises 9 if there is no such column
  /// @family grids
  /// @see ColHidden, LoadGridWidths, SaveGridWidths
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 1
  ///     Print g.ColWidth(0)
  ///     ' 1000
  ///     g.ColWidth(0) = 2400
  ///     Print g.ColWidth(0)
  ///     ' 2400
  [[nodiscard]] std::int32_t ColWidth(std::int32_t column) const { return at(column).width; }
  void put_ColWidth(std::int32_t column, std::int32_t width) { at(column).width = width < 0 ? default_width : width; }

  /// Whether a column is hidden: reports and exports leave it out.
  /// @param Col the column, counted from 0
  /// @raises 9 if there is no such column
  /// @family grids
  /// @see RowHidden, ExportGridData
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.ColHidden(1) = True
  ///     Print g.ColHidden(0) & " " & g.ColHidden(1)
  ///     ' False True
  [[nodiscard]] Boolean ColHidden(std::int32_t column) const { return at(column).is_hidden; }
  void put_ColHidden(std::int32_t column, Boolean hidden) { at(column).is_hidden = Boolean(bool(hidden)); }

  /// Whether a row is hidden: reports and exports leave it out, but ticking and counting include it.
  /// @param Row the row, counted from 0
  /// @raises 9 if there is no such row
  /// @family grids
  /// @see ColHidden, CountGridSelectedRows
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Rows = 2
  ///     g.RowHidden(1) = True
  ///     Print g.RowHidden(0) & " " & g.RowHidden(1)
  ///     ' False True
  [[nodiscard]] Boolean RowHidden(std::int32_t row) const { return Boolean(rows_[index_in(rows_, row)].is_hidden); }
  void put_RowHidden(std::int32_t row, Boolean hidden) { rows_[index_in(rows_, row)].is_hidden = bool(hidden); }

  /// The alignment of a column's texts in reports: 0 left, 3 centred, 6 right; 9, at first, numbers right and texts
  /// left. The numbers go in threes, the second and third being the middle and the bottom of the cell: 0 to 2 left, 3
  /// to 5 centred, 6 to 8 right.
  /// @param Col the column, counted from 0
  /// @raises 9 if there is no such column
  /// @family grids
  /// @see GridPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 1
  ///     Print g.ColAlignment(0)
  ///     ' 9
  ///     g.ColAlignment(0) = 6
  ///     Print g.ColAlignment(0)
  ///     ' 6
  [[nodiscard]] std::int16_t ColAlignment(std::int32_t column) const { return at(column).alignment; }
  void put_ColAlignment(std::int32_t column, std::int16_t alignment) { at(column).alignment = alignment; }

  /// The height of a row, in twips; 0, as at first, or less for a row as high as its text. With WordWrap, a report
  /// shows as many lines of a text as the height has room for.
  /// @param Row the row, counted from 0
  /// @raises 9 if there is no such row
  /// @family grids
  /// @see WordWrap
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Rows = 1
  ///     g.RowHeight(0) = 600
  ///     Print g.RowHeight(0)
  ///     ' 600
  [[nodiscard]] std::int32_t RowHeight(std::int32_t row) const { return rows_[index_in(rows_, row)].height; }
  void put_RowHeight(std::int32_t row, std::int32_t height) { rows_[index_in(rows_, row)].height = height; }

  // The grid's appearance on a window or on pages. Colours are 0x00BBGGRR: &HFF is red.

  /// The font of the texts in reports; empty, as at first, for the default, a fixed-width font.
  /// @family grids
  /// @see FontSize, GridPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.FontName = "Arial"
  ///     Print g.FontName
  ///     ' Arial
  Text FontName;

  /// The size of the texts in reports, in points; 0, as at first, for the default of 8.
  /// @family grids
  /// @see FontName, GridPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.FontSize = 10.5
  ///     Print g.FontSize
  ///     ' 10.5
  float FontSize = 0;

  /// Whether long texts continue on the next line of their cell in reports; otherwise they are cut off.
  /// @family grids
  /// @see RowHeight, GridPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.WordWrap = True
  ///     Print g.WordWrap
  ///     ' True
  Boolean WordWrap;

  /// Whether reports have lines between the cells: 0 for none, 1, as at first, for lines.
  /// @family grids
  /// @see GridColor, GridPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.GridLines = 0
  ///     Print g.GridLines
  ///     ' 0
  std::int16_t GridLines = 1;

  /// The colour of the lines, as 0x00BBGGRR; a light grey (12632256) at first.
  /// @family grids
  /// @see GridLines, GridPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.GridColor = 255
  ///     Print g.GridColor
  ///     ' 255
  std::int32_t GridColor = 0xC0C0C0;

  /// Whether the texts are bold in reports.
  /// @family grids
  /// @see FontName, GridPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.FontBold = True
  ///     Print g.FontBold
  ///     ' True
  Boolean FontBold;

  /// The colour of the texts, as 0x00BBGGRR; black (0) at first.
  /// @family grids
  /// @see BackColor, ForeColorFixed
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.ForeColor = 255
  ///     Print g.ForeColor
  ///     ' 255
  std::int32_t ForeColor = 0;

  /// The colour behind the texts, as 0x00BBGGRR; white (16777215) at first.
  /// @family grids
  /// @see ForeColor, BackColorFixed
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.BackColor = 65535
  ///     Print g.BackColor
  ///     ' 65535
  std::int32_t BackColor = 0xFFFFFF;

  /// The colour of the texts of fixed rows and columns, as 0x00BBGGRR; black (0) at first.
  /// @family grids
  /// @see ForeColor, BackColorFixed
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.ForeColorFixed = 16777215
  ///     Print g.ForeColorFixed
  ///     ' 16777215
  std::int32_t ForeColorFixed = 0;

  /// The colour behind fixed rows and columns, as 0x00BBGGRR; a pale grey (15263976) at first.
  /// @family grids
  /// @see BackColor, ForeColorFixed
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.BackColorFixed = 8388608
  ///     Print g.BackColorFixed
  ///     ' 8388608
  std::int32_t BackColorFixed = 0xE8E8E8;

  /// The type of a column's values, as an automation type: 11 is Boolean, which gives its cells check boxes; 0 at
  /// first. Other types are kept for the host.
  /// @param Col the column, counted from 0
  /// @raises 9 if there is no such column
  /// @family grids
  /// @see Cell, SelectGridRows, CountGridSelectedRows
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Rows = 3
  ///     g.Cols = 1
  ///     g.ColDataType(0) = 11
  ///     u.SelectGridRows 0, g, 1
  ///     Print u.CountGridSelectedRows(0, g)
  ///     ' 3
  [[nodiscard]] std::int16_t ColDataType(std::int32_t column) const { return at(column).data_type; }
  void put_ColDataType(std::int32_t column, std::int16_t type) { at(column).data_type = type; }

  /// The row where the selection begins, counted from 0; -1, as at first, for no selection. Putting it also sets RowSel
  /// to the same row.
  /// @raises 9 if there is no such row
  /// @family grids
  /// @see RowSel, ExportGridData
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Rows = 5
  ///     g.Row = 1
  ///     g.RowSel = 3
  ///     Print g.Row & " to " & g.RowSel
  ///     ' 1 to 3
  [[nodiscard]] std::int32_t Row() const noexcept { return row_; }
  void put_Row(std::int32_t row);

  /// The row where the selection ends, counted from 0; it may be above Row. -1 for no selection.
  /// @raises 9 if there is no such row
  /// @family grids
  /// @see Row, ExportGridData
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Rows = 5
  ///     g.Row = 3
  ///     g.RowSel = 1
  ///     Print g.Row & " to " & g.RowSel
  ///     ' 3 to 1
  [[nodiscard]] std::int32_t RowSel() const noexcept { return row_end_; }
  void put_RowSel(std::int32_t row);

  /// The handle of the grid's window; 0 while it is not shown, as is every grid that a host creates. Report builders
  /// ask for it, as they ask every grid.
  /// @family grids
  /// @see GridPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     Print g.hwnd
  ///     ' 0
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

  /// Empties every cell; rows, columns and their settings stay.
  /// @family grids
  /// @see RemoveItem
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 1
  ///     g.AddItem "Smith"
  ///     g.Clear
  ///     Print g.Rows & " [" & g.TextMatrix(0, 0) & "]"
  ///     ' 1 []
  void Clear();

  /// Adds a row, whose cells are separated by tabs in the text, at the end or before another row. Cells beyond the last
  /// column are dropped, so set Cols first. A row added before a fixed one is fixed, too; the selection stays on its
  /// rows.
  /// @param Item the texts of the cells, separated by tabs
  /// @param Index the row before which it is inserted; -1, or left out, for the end
  /// @raises 9 if Index is neither -1 nor 0 to Rows
  /// @raises 7 if the grid has 5,000,000 rows
  /// @family grids
  /// @see RemoveItem, Cols
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.AddItem "Smith" & vbTab & "120"
  ///     g.AddItem "Jones" & vbTab & "80", 0
  ///     Print g.TextMatrix(0, 0) & " " & g.TextMatrix(1, 1)
  ///     ' Jones 120
  void AddItem(const Text& item, std::int32_t index);

  /// Removes a row; the others move up. The other fixed rows stay fixed, and the selection stays on its rows; if a
  /// selected row is removed, the next one takes its place.
  /// @param Index the row, counted from 0
  /// @raises 9 if there is no such row
  /// @family grids
  /// @see AddItem, Clear
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 1
  ///     g.AddItem "Smith"
  ///     g.AddItem "Jones"
  ///     g.RemoveItem 0
  ///     Print g.Rows & " " & g.TextMatrix(0, 0)
  ///     ' 1 Jones
  void RemoveItem(std::int32_t index);

  /// Writes the table to a file: 3 as comma-separated text, 4 as tab-separated text, 5 in columns of fixed width. Cells
  /// that contain a separator, a quote or a line break are quoted. The columns of format 5 are two blanks apart, with
  /// line breaks as blanks. The file is in the ANSI code page, or in UTF-8 with a byte order mark if that lacks a
  /// character. Hidden rows and columns are written, too. If it fails, an existing file stays as it was.
  /// @param FileName the path of the file
  /// @param Format 3 comma-separated, 4 tab-separated, 5 fixed width
  /// @param FixedCells True, or left out, writes the fixed rows and columns, too; False leaves them out
  /// @raises 5 for another format
  /// @raises 76 if the folder is missing
  /// @raises 61 if the disk is full
  /// @raises 70 if the file is locked
  /// @raises 75 if the file may not be written
  /// @family grids
  /// @see LoadGrid, ExportGridData
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.AddItem "Smith, John" & vbTab & "120"
  ///     g.SaveGrid folder & "\customers.csv", 3
  ///     Print Len(u.LoadTextBox(folder & "\customers.csv"))
  ///     ' 19
  void SaveGrid(const Text& file, std::int16_t format, Boolean fixed_cells) const;

  /// Reads a file that SaveGrid or another program wrote; the table takes the file's size. The numbers of fixed rows
  /// and columns stay the same if the table is large enough. Widths, types and hidden columns stay; heights and hidden
  /// rows do not. Without FixedCells, fixed cells stay and the file's cells follow them. If it fails, nothing changes.
  /// @param FileName the path of the file
  /// @param Format 3 comma-separated, 4 tab-separated, 5 fixed width
  /// @param FixedCells True, or left out, if the file has the fixed rows and columns, too
  /// @raises 5 for another format
  /// @raises 53 if the file is missing
  /// @raises 76 if the folder is missing
  /// @raises 70 if the file is locked
  /// @raises 75 if the file may not be read
  /// @family grids
  /// @see SaveGrid
  /// @example
  ///     u.SaveTextBox "Name,Amount" & vbCrLf & """Smith, John"",120", folder & "\customers.csv"
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.LoadGrid folder & "\customers.csv", 3
  ///     g.FixedRows = 1
  ///     Print g.Rows & " rows, " & g.Cols & " columns: " & g.TextMatrix(1, 0)
  ///     ' 2 rows, 2 columns: Smith, John
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
      P::template get_only<&G::hwnd>("hwnd"), P::template accessors<&G::Rows, &G::put_Rows>("Rows"),
      P::template accessors<&G::Cols, &G::put_Cols>("Cols"),
      P::template accessors<&G::FixedRows, &G::put_FixedRows>("FixedRows"),
      P::template accessors<&G::FixedCols, &G::put_FixedCols>("FixedCols"),
      P::template accessors<&G::TextMatrix, &G::put_TextMatrix>("TextMatrix", "Row", "Col"),
      P::template accessors<&G::Cell, &G::put_Cell>("Cell", "Setting", "Row", "Col"),
      P::template accessors<&G::ColWidth, &G::put_ColWidth>("ColWidth", "Col"),
      P::template accessors<&G::ColHidden, &G::put_ColHidden>("ColHidden", "Col"),
      P::template accessors<&G::RowHidden, &G::put_RowHidden>("RowHidden", "Row"),
      P::template accessors<&G::ColDataType, &G::put_ColDataType>("ColDataType", "Col"),
      P::template accessors<&G::ColAlignment, &G::put_ColAlignment>("ColAlignment", "Col"),
      P::template accessors<&G::RowHeight, &G::put_RowHeight>("RowHeight", "Row"),
      P::template property<&G::FontName>("FontName"), P::template property<&G::FontSize>("FontSize"),
      P::template property<&G::WordWrap>("WordWrap"), P::template property<&G::GridLines>("GridLines"),
      P::template property<&G::GridColor>("GridColor"), P::template property<&G::BackColorFixed>("BackColorFixed"),
      P::template accessors<&G::Row, &G::put_Row>("Row"), P::template accessors<&G::RowSel, &G::put_RowSel>("RowSel"),
      P::template method<&G::Clear>("Clear"), P::template method<&G::AddItem>("AddItem", "Item", optional("Index", -1)),
      P::template method<&G::RemoveItem>("RemoveItem", "Index"),
      P::template method<&G::SaveGrid>("SaveGrid", "FileName", "Format", optional("FixedCells", -1)),
      P::template method<&G::LoadGrid>("LoadGrid", "FileName", "Format", optional("FixedCells", -1)),
      P::template property<&G::FontBold>("FontBold"), P::template property<&G::ForeColor>("ForeColor"),
      P::template property<&G::BackColor>("BackColor"), P::template property<&G::ForeColorFixed>("ForeColorFixed"));
}

}  // namespace talutil
