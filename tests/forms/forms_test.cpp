#include <gmock/gmock.h>

#include "library/c_control_position.hpp"
#include "tests/fakes/late_members.hpp"
#include "tests/fakes/recording_control.hpp"

namespace talutil {

namespace {

using ::testing::ElementsAre;
using testing::error_of;
using ::testing::HasSubstr;
using testing::RecordingControl;

struct Forms : testing::LateMembers {
  std::shared_ptr<RecordingControl> control = std::make_shared<RecordingControl>();
  Variant holder{ObjectRef(control)};

  Forms() { library.settings().sNatNameC = u"CFG"; }

  std::string uses() { return control->taken_uses(); }

  [[nodiscard]] Text message() const { return platform.messages.empty() ? Text() : platform.messages.back().text; }
};

TEST_F(Forms, ComboEntriesAreFoundByTheirKey) {
  control->values = {{"Text", u"typed"},       {"ListCount", std::int32_t{5}}, {"ItemData(0&)", std::int32_t{7}},
                     {"ItemData(1&)", Null{}}, {"ItemData(2&)", u" 42 "},      {"ItemData(3&)", 42.0},
                     {"ItemData(4&)", u"x"}};
  EXPECT_EQ(utils.GetComboListIndex(holder, 42), 2) << "the first match wins";
  EXPECT_EQ(uses(), "put Text = \"\"|ListCount|ItemData(0&)|ItemData(1&)|ItemData(2&)");
  for (const std::int32_t key : {0, -1}) {
    EXPECT_EQ(utils.GetComboListIndex(holder, key), -1);
    EXPECT_EQ(uses(), "put Text = \"\"");
  }
  EXPECT_EQ(error_of([&] { utils.GetComboListIndex(holder, 8); }), 13) << "a key that is no number";
  EXPECT_EQ(control.use_count(), 2) << "no reference is kept";
}

TEST_F(Forms, CombosSearchForTypedText) {
  const Text warning = u"The Dropdown List text  ['abc'] is not a valid selection";
  // The selection is 2.
  const testing::Rows<std::int16_t, Variant, Variant, std::int32_t, Text> rows = {
      {"found, and selected", 2, u"abc", 5, 5, u""},
      {"found, and nothing to report", 1, u"abc", 5, 2, u""},
      {"not found", 0, u"abc", std::int16_t{-1}, -1, u""},
      {"not found, and reported", 1, u"abc", -1.0, -1, warning},
      {"nothing but what is removed", 1, u" ,\" ", -1, 0, u""},
      {"Null", 1, Null{}, -1, 0, u""},
      {"found, but the selection stays", 0, u"O'Neil, X", 5, 2, u""},
  };
  control->methods = {"Refresh"};
  testing::check_rows(
      rows, [&](std::int16_t flag, const Variant& text, const Variant& found, std::int32_t result, const Text& report) {
        control->values = {{"ListIndex", 2},     {"Text", text},         {"SearchText", {}}, {"ColumnSearch", {}},
                           {"SearchMethod", {}}, {"SearchIndex", found}, {"Action", {}}};
        platform.messages.clear();
        uses();
        EXPECT_EQ(utils.SearchCombo(holder, flag), result);
        EXPECT_EQ(message(), report);
        if (result == 0) {
          EXPECT_EQ(uses(), "call Refresh|ListIndex|Text") << "an empty box is not searched for";
        }
      });
  EXPECT_EQ(uses(),
            "call Refresh|ListIndex|Text|put SearchText = \"O'Neil, X\"|put ColumnSearch = 0%|put SearchMethod = "
            "2&|put Action = 0&|SearchIndex|put ListIndex = 2%|ListIndex");

  // With the text and the method of the caller's.
  EXPECT_EQ(utils.SearchComboEx(holder, u"", 9, 0), 0) << "the first entry is selected";
  EXPECT_EQ(uses(),
            "put SearchText = \"\"|put ColumnSearch = 0%|put SearchMethod = 9&|put Action = 0&|SearchIndex|put "
            "ListIndex = 0%|ListIndex");
  control->values["SearchIndex"] = -1;
  control->values["Text"] = Null{};
  EXPECT_EQ(utils.SearchComboEx(holder, u"x", 1, 1), -1);
  EXPECT_EQ(message(), u"The Dropdown List text  [''] is not a valid selection") << "the control's text";
  control->values["ListIndex"] = 40000;
  EXPECT_EQ(error_of([&] { utils.SearchCombo(holder, 0); }), 6);
}

TEST_F(Forms, GridWidthsAreRemembered) {
  control->values = {{"Cols", std::int32_t{3}}, {"ColWidth(1&)", std::int32_t{0}}, {"ColWidth(2&)", 0.0}};
  utils.LoadGridWidths(holder, u"Grid", 1);
  EXPECT_EQ(uses(), "Cols|put ColWidth(1&) = 1000#|put ColWidth(2&) = 1000#");
  control->values["ColWidth(1&)"] = 240.5;
  control->values["ColWidth(2&)"] = u"none";
  utils.SaveGridWidths(holder, u"Grid", 1);
  EXPECT_EQ(uses(), "Cols|ColWidth(1&)|ColWidth(2&)");
  utils.LoadGridWidths(holder, u"Grid", 1);
  EXPECT_EQ(uses(), "Cols|put ColWidth(1&) = 240.5#|put ColWidth(2&) = 0#") << "no number hides";
  utils.SaveGridWidths(holder, u"Grid", 32767);
  EXPECT_EQ(uses(), "Cols");
}

TEST_F(Forms, TicksAreSetAndCounted) {
  constexpr std::int16_t ticks = 11;
  control->values = {{"Rows", 4}, {"FixedRows", 1}, {"TextMatrix", {}}, {"ColDataType(3&)", ticks}};
  control->values.insert({{"ColDataType(0&)", 8}, {"Cell(5%, 1&, 3&)", 1}, {"Cell(5%, 2&, 3&)", 2}});
  control->values["Cell(5%, 3&, 3&)"] = u"1";
  utils.SelectGridRows(3, holder, 1);
  EXPECT_EQ(uses(),
            "Rows|FixedRows|ColDataType(3&)|put TextMatrix(1&, 3&) = True|put TextMatrix(2&, 3&) = True|put "
            "TextMatrix(3&, 3&) = True");
  EXPECT_EQ(control->look_ups.size(), 4) << "one a member";
  utils.SelectGridRows(3, holder, 2);
  utils.SelectGridRows(0, holder, 1);
  EXPECT_EQ(uses(), "Rows|FixedRows|ColDataType(3&)|Rows|FixedRows|ColDataType(0&)");
  EXPECT_EQ(utils.CountGridSelectedRows(3, holder), 2);
  EXPECT_EQ(uses(), "ColDataType(3&)|Rows|FixedRows|Cell(5%, 1&, 3&)|Cell(5%, 2&, 3&)|Cell(5%, 3&, 3&)");
  EXPECT_EQ(utils.CountGridSelectedRows(0, holder), 0);

  // Errors are reported, and what was counted before is the result.
  control->before = [](const std::string& use) {
    if (use == "Cell(5%, 2&, 3&)" || use == "put TextMatrix(2&, 3&) = True") throw RunTimeError(1234, u"It broke.");
  };
  EXPECT_EQ(utils.CountGridSelectedRows(3, holder), 1);
  EXPECT_EQ(message(), u"ORVUtils CountGridSelectedRows It broke.");
  utils.SelectGridRows(3, holder, 1);
  EXPECT_EQ(message(), u"ORVUtils SelectGridRows It broke.");
  utils.SelectGridRows(3, Null{}, 1);
  EXPECT_EQ(message(), u"ORVUtils SelectGridRows Object required");
  EXPECT_EQ(platform.pointer_resets, 3);
}

TEST_F(Forms, WindowStatesAreRemembered) {
  const char* const as_it_was = "put WindowState = 0#|WindowState|Width|put Width = 6000#|Height|put Height = 4500#";
  control->values = {{"WindowState", std::int16_t{2}}, {"Width", 6000.0F}, {"Height", 4500.0F}};
  utils.LoadWindowState(holder, u"Main");
  EXPECT_EQ(uses(), as_it_was);
  utils.SaveWindowState(holder, u"Main");
  EXPECT_EQ(uses(), "WindowState|WindowState|Width|Height");
  // A maximised window keeps its size to itself, and the last normal size survives it.
  control->values = {{"WindowState", std::int16_t{2}}, {"Width", 1.0F}, {"Height", 1.0F}};
  utils.SaveWindowState(holder, u"Main");
  utils.LoadWindowState(holder, u"Main");
  EXPECT_EQ(uses(), "WindowState|WindowState|put WindowState = 2#|WindowState");
  check({{u"SaveCfgFileData", {{u"Main|WindowState|0|CFG|False", "Empty"}}}});
  utils.LoadWindowState(holder, u"Main");
  EXPECT_EQ(uses(), as_it_was);
}

TEST_F(Forms, ConfirmationsWantYesInUpperCase) {
  platform.inputs = {u"yes", u" YES", u"YES"};
  platform.answers = {MessageAnswer::yes, MessageAnswer::yes};
  EXPECT_TRUE(utils.CheckDeleteRecord().is_exactly_true());
  EXPECT_EQ(platform.input_boxes.back().text, u"Type YES in uppercase characters to confirm deletion of this record");
  EXPECT_EQ(message(), u"You must type YES in uppercase characters.  Do you wish to delete this record?");
}

TEST_F(Forms, LaunchFailuresAreExplained) {
  for (std::int32_t code = -2; code < 40; ++code) utils.DrawShellExecuteError(code);
  EXPECT_EQ(platform.messages.size(), 16);
  EXPECT_EQ(platform.messages[1].text, u"File was not found.");
  EXPECT_EQ(message(), u"Application requires Microsoft Windows 32-bit extensions.");
}

TEST_F(Forms, PointsOnAnEdgeAreOutside) {
  const auto inside = [&](const Variant& x, const Variant& y) {
    return utils.GetMousePos(x, y, 10, std::int16_t{10}, 20.0, u"30").is_exactly_true();
  };
  EXPECT_TRUE(inside(15, 15) && inside(10.5F, 29.5)) << "numbers come before texts";
  EXPECT_FALSE(inside(10, 15) || inside(20, 15) || inside(15, 10) || inside(15, Null{}) || inside(Variant(), 15));
  check({{u"GetMousePos", {{u"5|5|10|10|9|9", "True"}, {u"=0|@error|=10|=10|=20|30", "error 13"}}}});
}

TEST_F(Forms, PagesAreCountedInSinglePrecision) {
  const std::tuple<std::int32_t, std::int32_t, std::int32_t> rows[] = {
      {10, 0, 0}, {4, 12, 3}, {4, 14, 4}, {10, -15, -2}, {2, 33554435, 16777216}};
  for (const auto& [on_a_page, count, pages] : rows) EXPECT_EQ(utils.GetMaxPages(on_a_page, count), pages) << count;
  EXPECT_EQ(error_of([&] { (void)utils.GetMaxPages(0, 0); }), 11);
  EXPECT_EQ(error_of([&] { (void)utils.GetMaxPages(1, 2147483647); }), 6);
}

TEST_F(Forms, TextIsDrawnIntoARectangle) {
  library.start();
  library.settings().DrawTextPictureBox = control;
  control->values = {{"FontBold", Boolean(false)}, {"ForeColor", 5}, {"hDC", 99}, {"CurrentX", 0}, {"CurrentY", 0}};
  control->values.insert({{"TextWidth(\"abc\")", 300}, {"TextHeight(\"abc\")", 200}});
  control->methods = {"Print"};
  const auto draw = [&](std::int16_t right, std::int16_t justify, bool wraps = false) {
    utils.MyDrawText(10, 20, right, 40, u"abc", 255, justify, Boolean(true), Boolean(wraps));
    return uses();
  };
  // Exactly as wide as the rectangle is not wider: 20 pixels of 15 twips.
  EXPECT_EQ(draw(30, 0),
            "FontBold|ForeColor|put FontBold = True|put ForeColor = 255&|TextWidth(\"abc\")|TextHeight(\"abc\")|put "
            "CurrentX = 150!|put CurrentY = 350!|call Print(\"abc\")|put ForeColor = 5&|put FontBold = False");
  for (const auto& [justify, left] : {std::pair(-2, "150!"), {-1, "150!"}, {0, "300!"}, {1, "450!"}}) {
    EXPECT_THAT(draw(50, static_cast<std::int16_t>(justify)), HasSubstr(std::string("put CurrentX = ") + left));
  }
  EXPECT_THAT(draw(29, -2), HasSubstr("call Print(\"abc\")")) << "runs over the edge";
  EXPECT_THAT(draw(29, -1), HasSubstr("|TextWidth(\"abc\")|hDC|"));
  draw(29, 1, true);
  EXPECT_THAT(platform.drawn, ElementsAre("draw on 99 (10,20)-(29,40) \"abc\" colour 255",
                                          "draw on 99 (10,20)-(29,40) \"abc\" colour 255 broken"));
  control->values.erase("TextWidth(\"abc\")");
  EXPECT_EQ(error_of([&] { draw(30, 0); }), 9);
  EXPECT_THAT(uses(), ::testing::EndsWith("|put FontBold = False")) << "put back after an error too";
  utils.MyDrawText(0, 0, 1, 1, u"", 0, 0, Boolean(false), Boolean(false));
  EXPECT_EQ(uses(), "");
}

struct MovableControl : Forms {
  cControlPosition position{library};
  std::shared_ptr<RecordingControl> form = std::make_shared<RecordingControl>();

  MovableControl() {
    form->values = {{"ScaleWidth", 1000.0F}, {"ScaleHeight", 800.0F}};
    control->values = {{"left", 100.0F}, {"Top", 100.0F}, {"Width", 300.0F}, {"Height", 200.0F}};
    control->values["Container"] = ObjectRef(std::make_shared<RecordingControl>());
    control->methods = {"Move"};
    position.DragStartX = 10;
    position.DragStartY = 20;
  }

  std::string drag(float x, float y) {
    position.DragControl(ObjectRef(form), holder, x, y);
    return uses();
  }
};

TEST_F(MovableControl, StaysWithinItsForm) {
  control->before = [&](const std::string& use) {
    if (use == "call Move(160.5!, 81!)") control->values["left"] = 160.5F;
  };
  EXPECT_EQ(drag(70.5F, 1), "Container|left|Top|Width|Height|call Move(160.5!, 81!)|left|Top");
  EXPECT_EQ(position.left, 160) << "halves to even";
  EXPECT_EQ(position.Top, 100) << "what the control says, not what it was told";
  EXPECT_THAT(drag(-5000, -5000), HasSubstr("|call Move(0!, 0!)|"));
  EXPECT_THAT(drag(5000, 5000), HasSubstr("|call Move(700!, 600!)|")) << "right and bottom edge";
  EXPECT_EQ(drag(10, 20), "Container|left|Top|Width|Height") << "no move where nothing has changed";
  form->values["ScaleWidth"] = 100.0F;
  EXPECT_THAT(drag(5000, 20), HasSubstr("|call Move(-200!, 100!)|")) << "not brought back a second time";
}

TEST_F(MovableControl, DistancesAreScaled) {
  const auto container = std::make_shared<RecordingControl>();
  control->values["ScaleMode"] = std::int16_t{3};
  control->values["ScaleX(50!, 3%, 1%)"] = 750.0F;
  control->values["ScaleY(10!, 3%, 1%)"] = 150.0F;
  control->values["Container"] = ObjectRef(container);
  EXPECT_EQ(drag(60, 30),
            "ScaleMode|ScaleX(50!, 3%, 1%)|ScaleY(10!, 3%, 1%)|Container|left|Top|Width|Height|call Move(700!, "
            "250!)|left|Top");
  // A container with a scale starts again from the mouse's own distances.
  container->values = {{"ScaleMode", std::int16_t{7}}, {"ScaleX(50!, 1%, 7%)", 2.5F}, {"ScaleY(10!, 1%, 7%)", 4.5F}};
  EXPECT_THAT(drag(60, 30), HasSubstr("|call Move(102.5!, 104.5!)|"));
  EXPECT_EQ(container->taken_uses(), "ScaleMode|ScaleX(50!, 1%, 7%)|ScaleY(10!, 1%, 7%)");
  control->values.erase("Container");
  EXPECT_NE(error_of([&] { drag(60, 20); }), 0);
}

TEST_F(MovableControl, PositionsAreRemembered) {
  position.ControlName = u"Job";
  position.ControlID = 12;
  position.Top = 480;
  position.Width = 2400;
  position.Height = -1200;
  position.SaveControlPosition();
  EXPECT_EQ(utils.GetCfgFileData(u"Job", u"12ControlSize", u"", u"CFG", Boolean(false)), u"0,480,2400,-1200,");
  position.DefaultLeft = 99;
  position.GetControlPosition();
  EXPECT_EQ(position.left, 99) << "0 gives way to the default";
  Text stored = u"1.5,x,9999999999,";
  utils.SaveCfgFileData(u"Job", u"12ControlSize", stored, u"CFG", Boolean(false));
  EXPECT_EQ(error_of([&] { position.GetControlPosition(); }), 6);
  EXPECT_EQ(position.left, 2);
  position.ControlName.clear();
  position.SaveControlPosition();
  EXPECT_EQ(utils.GetCfgFileData(u"", u"12ControlSize", u"none", u"CFG", Boolean(false)), u"none");
}

}  // namespace

}  // namespace talutil
