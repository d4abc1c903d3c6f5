#include "controls/grid.hpp"

#include "automation/control.hpp"
#include "controls/delimited_text.hpp"
#include "infoforms/frm_components.hpp"
#include "tests/fakes/recording_control.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil {
namespace {

using testing::check_rows;
using testing::error_of;
using testing::RecordingControl;
using Table = std::vector<std::vector<Text>>;

struct Grids : testing::UtilsTest {
  std::shared_ptr<Grid> grid = std::make_shared<Grid>(library.platform());
  Control control{grid, library.locale()};

  /// A table of texts "r,c".
  void fill(std::int32_t rows, std::int32_t columns) {
    grid->put_Rows(rows);
    grid->put_Cols(columns);
    for (std::int32_t r = 0; r < rows; ++r) {
      for (std::int32_t c = 0; c < columns; ++c) {
        grid->put_TextMatrix(r, c, number_to_text(r) + u'/' + number_to_text(c));
      }
    }
  }

  [[nodiscard]] Table cells() const {
    Table result(static_cast<std::size_t>(grid->Rows()));
    for (std::int32_t r = 0; r < grid->Rows(); ++r) {
      for (std::int32_t c = 0; c < grid->Cols(); ++c) result[r].push_back(grid->TextMatrix(r, c));
    }
    return result;
  }

  [[nodiscard]] std::string file(const Text& path) const { return platform.files.bytes(path); }
};

TEST_F(Grids, AreDrivenLateBound) {
  control.put(u"rows", 3.4);
  control.put(u"Cols", u"2");
  control.put(u"TextMatrix", {std::int16_t{1}, u"1"}, Boolean(true));
  EXPECT_EQ(control.get(u"Cell", {5, 1, 1}), Variant(Grid::no_check_box));
  control.put(u"ColDataType", {1}, 11);
  EXPECT_EQ(control.get(u"Cell", {5, 1, 1}), Variant(Grid::ticked));
  utils.SelectGridRows(1, ObjectRef(grid), 0);
  control.put(u"Row", 2);
  control.put(u"Rows", 1);
  EXPECT_EQ(control.get(u"RowSel"), Variant(0)) << "the selection stays inside";
  control.call(u"AddItem", {u"a\tb\tc", 0});
  control.call(u"AddItem", {u"d"});
  EXPECT_EQ(control.get(u"Row"), Variant(1)) << "and on its rows";
  EXPECT_EQ(cells(), (Table{{u"a", u"b"}, {u"", u"False"}, {u"d", u""}}));
  control.call(u"RemoveItem", {1});
  control.put(u"FixedRows", 1);
  control.call(u"AddItem", {u"heading", 0});
  EXPECT_EQ(control.get(u"FixedRows"), Variant(2));
  control.call(u"RemoveItem", {0});
  EXPECT_EQ(control.get(u"FixedRows"), Variant(1)) << "no data row becomes a heading";
  control.put(u"Cols", 1);
  control.put(u"Cols", 2);
  EXPECT_EQ(cells(), (Table{{u"a", u""}, {u"d", u""}})) << "lost cells stay lost";

  using enum Access;
  const testing::Rows<TextView, Access, std::vector<Variant>, std::int32_t> bad = {
      {"a row that is not there", u"TextMatrix", get, {2, 0}, 9},
      {"a column before the first", u"TextMatrix", get, {0, -1}, 9},
      {"fewer rows than none", u"Rows", put, {-1}, 5},
      {"more rows than memory", u"Rows", put, {2147483647}, 7},
      {"more columns than there can be", u"Cols", put, {32768}, 7},
      {"more fixed rows than rows", u"FixedRows", put, {3}, 5},
      {"an unknown property of a cell", u"Cell", get, {1, 0, 0}, 5},
      {"an unknown state of a tick", u"Cell", put, {5, 0, 0, 3}, 5},
      {"a new row behind the end", u"AddItem", call, {u"", 3}, 9},
      {"no row to remove", u"RemoveItem", call, {2}, 9},
      {"an unknown format", u"SaveGrid", call, {u"C:\\x.txt", 6}, 5},
  };
  check_rows(bad, [&](TextView member, Access access, const std::vector<Variant>& arguments, std::int32_t error) {
    EXPECT_EQ(error_of([&] { (void)grid->invoke(grid->member_id(member), access, arguments); }), error);
  });
}

TEST_F(Grids, AreReadAndWrittenBack) {
  const testing::Rows<std::int16_t, std::string, Table> rows = {
      {"commas",
       3,
       "5 \x80,\"a,b\"\r\n\"say \"\"x\"\"\",\"two\r\nlines\"\r\n plain,tab\there\r\n",
       {{u"5 \u20AC", u"a,b"}, {u"say \"x\"", u"two\r\nlines"}, {u" plain", u"tab\there"}}},
      {"tabs", 4, "a,b\t\"tab\there\"\r\n", {{u"a,b", u"tab\there"}}},
      {"columns", 5, "long name  x\r\n           y z\r\n", {{u"long name", u"x"}, {u"", u"y z"}}},
  };
  check_rows(rows, [&](std::int16_t format, const std::string& bytes, const Table& table) {
    platform.files.put(u"C:\\a.txt", bytes);
    grid->LoadGrid(u"C:\\a.txt", format, Boolean(true));
    EXPECT_EQ(cells(), table);
    grid->SaveGrid(u"C:\\b.txt", format, Boolean(true));
    EXPECT_EQ(file(u"C:\\b.txt"), bytes);
  });
  grid->put_TextMatrix(1, 1, u"y\nz");
  grid->SaveGrid(u"C:\\b.txt", 5, Boolean(true));
  EXPECT_EQ(file(u"C:\\b.txt"), file(u"C:\\a.txt"));

  grid->put_FixedRows(1);
  grid->put_FixedCols(1);
  grid->put_TextMatrix(1, 0, u"fixed");
  platform.files.put(u"C:\\a.txt", "1,2\r\n3,4\r\n");
  grid->LoadGrid(u"C:\\a.txt", 3, Boolean(false));
  EXPECT_EQ(cells(), (Table{{u"long name", u"x", u""}, {u"fixed", u"1", u"2"}, {u"", u"3", u"4"}}));
  grid->SaveGrid(u"C:\\b.txt", 3, Boolean(false));
  EXPECT_EQ(file(u"C:\\b.txt"), "1,2\r\n3,4\r\n");
  EXPECT_EQ(std::pair(grid->FixedRows(), grid->FixedCols()), std::pair(1, 1)) << "they stay fixed";

  EXPECT_EQ(read_delimited(u"\"a\"b,c\n\n\"open,\r\n", u','), (Table{{u"ab", u"c"}, {u""}, {u"open,\r\n"}}));
  EXPECT_EQ(error_of([&] { grid->LoadGrid(u"C:\\missing.txt", 3, Boolean(true)); }), 53);
  EXPECT_EQ(grid->Rows(), 3) << "nothing is lost";
}

// Longer than what is written at once; a character without a place in the code page makes the file UTF-8.
TEST_F(Grids, LongTablesAreWrittenWhole) {
  for (const TextView first : {u"\u20AC", u"\u0416"}) {
    fill(5000, 6);
    grid->put_TextMatrix(0, 0, Text(first));
    const Table written = cells();
    Text expected;
    for (const auto& row : written) {
      for (const Text& cell : row) expected += cell + u',';
      expected.replace(expected.size() - 1, 1, u"\r\n");
    }
    grid->SaveGrid(u"C:\\long.txt", 3, Boolean(true));
    EXPECT_TRUE(file(u"C:\\long.txt") == (first == u"\u0416" ? "\xEF\xBB\xBF" + to_utf8(expected) : to_ansi(expected)));
    grid->put_Cols(0);
    grid->LoadGrid(u"C:\\long.txt", 3, Boolean(true));
    EXPECT_TRUE(cells() == written) << to_utf8(first);
  }
}

TEST_F(Grids, VisibleCellsAreExported) {
  fill(6, 4);
  grid->put_ColHidden(1, Boolean(true));
  grid->put_RowHidden(3, Boolean(true));
  grid->put_Row(4);
  grid->put_RowSel(2);
  const auto export_to = [&](const Text& answer, std::int16_t header, Boolean all) {
    platform.chosen_files = {answer};
    utils.ExportGridData(ObjectRef(grid), header, all, u"Sales");
    return file(answer);
  };
  const std::string last = "4/0,4/2,4/3\r\n";
  EXPECT_EQ(export_to(u"C:\\a.txt", 0, Boolean(false)), "2/0,2/2,2/3\r\n" + last);
  EXPECT_EQ(export_to(u"C:\\b.csv", 4, Boolean(true)), last + "5/0,5/2,5/3\r\n");
  EXPECT_EQ(export_to(u"C:\\c.csv", 5, Boolean::from_bits(1)), "2/0,2/2,2/3\r\n" + last) << "only exactly True";
  EXPECT_EQ(export_to(u"C:\\d.csv", 9, Boolean(true)), "") << "an empty file";
  EXPECT_EQ(platform.file_dialogs.back().filter, u"Comma Delim Text File *.txt|*.txt|TAB Delim CSV|*.csv");

  // Silent, and the old file whole: a full disk, an error of the grid.
  platform.files.put(u"C:\\old.txt", "old");
  platform.files.failures = {{u"write", ErrorNumber::disk_full}};
  EXPECT_EQ(export_to(u"C:\\old.txt", 0, Boolean(true)), "old");
  platform.files.failures.clear();
  grid->put_Row(-1);
  EXPECT_EQ(export_to(u"C:\\old.txt", 0, Boolean(false)), "old") << "row -1 is no row";
  EXPECT_TRUE(platform.messages.empty());
}

TEST_F(Grids, ExportsReadTheGridInOrder) {
  const auto source = std::make_shared<RecordingControl>();
  source->values = {{"Cols", 2}, {"Rows", 3}, {"Row", 2}, {"RowSel", 1}, {"TextMatrix(2&, 1&)", 7}};
  source->values.insert({{"ColHidden(0&)", Boolean(true)}, {"ColHidden(1&)", Boolean(false)}});
  source->values.insert({{"RowHidden(1&)", Boolean(true)}, {"RowHidden(2&)", Boolean(false)}});
  platform.chosen_files = {u"C:\\a.txt"};
  utils.ExportGridData(ObjectRef(source), 1, Boolean(true), u"Sales");
  EXPECT_EQ(source->taken_uses(),
            "Cols|ColHidden(0&)|ColHidden(1&)|Rows|RowHidden(1&)|RowHidden(2&)|Cols|ColHidden(0&)|ColHidden(1&)|"
            "TextMatrix(2&, 1&)");
  EXPECT_EQ(file(u"C:\\a.txt"), "7\r\n");
  EXPECT_EQ(source->look_ups.size(), 5) << "one a member";

  // While a cell is asked for, the host exports this grid; then it has no memory left for the cell.
  fill(3, 1);
  platform.chosen_files = {u"C:\\outer.txt", u"C:\\inner.txt", u"C:\\none.txt"};
  const Control scratch(library.components().control(u"Grid1"), plain_numbers);
  source->before = [&](const std::string& use) {
    if (!use.starts_with("TextMatrix")) return;
    EXPECT_EQ(scratch.get<std::int32_t>(u"Rows"), 1) << "the outer export fills the window's grid";
    if (platform.chosen_files.size() == 2) utils.ExportGridData(ObjectRef(grid), 0, Boolean(true), u"Sales");
    if (platform.chosen_files.empty()) throw std::bad_alloc();
  };
  utils.ExportGridData(ObjectRef(source), 1, Boolean(true), u"Sales");
  EXPECT_EQ(file(u"C:\\inner.txt"), "0/0\r\n1/0\r\n2/0\r\n");
  EXPECT_EQ(file(u"C:\\outer.txt"), "7\r\n");
  EXPECT_EQ(scratch.get<std::int32_t>(u"Rows"), 0) << "and leaves it empty";
  utils.ExportGridData(ObjectRef(source), 1, Boolean(true), u"Sales");
  EXPECT_FALSE(platform.files.files.contains(u"C:\\none.txt")) << "and fails silently";
}

TEST_F(Grids, ConvertByTheUsersSeparators) {
  platform.separators = {.decimal_separator = u',', .thousands_separator = u'.'};
  library.start();
  const Control theirs(std::make_shared<Grid>(library.platform()), library.locale());
  theirs.put(u"Rows", 1);
  theirs.put(u"Cols", 1);
  theirs.put(u"ColWidth", {0}, u"1000,4");
  EXPECT_EQ(theirs.get(u"ColWidth", {0}), Variant(1000));
  theirs.put(u"TextMatrix", {0, 0}, 1.5);
  EXPECT_EQ(theirs.get(u"TextMatrix", {0, 0}), Variant(u"1,5"));
  EXPECT_EQ(theirs.get<float>(u"TextMatrix", {0, 0}), 1.5F);

  const auto host = std::make_shared<RecordingControl>();
  host->values = {{"Cols", 1}, {"ColWidth(0&)", 240.5}};
  utils.SaveGridWidths(ObjectRef(host), u"Grid", 0);
  utils.LoadGridWidths(ObjectRef(host), u"Grid", 0);
  EXPECT_EQ(host->values["ColWidth(0&)"], Variant(240.5)) << "kept as whoever reads it back does";
}

TEST_F(Grids, DialogsTellOfACancelOnlyWhenAsked) {
  const Control dialog(library.components().control(u"Open1"), plain_numbers);
  dialog.put(u"FileName", u"a.txt");
  dialog.call(u"ShowOpen");
  EXPECT_EQ(dialog.get<Text>(u"FileName"), u"a.txt");
}

}  // namespace
}  // namespace talutil
