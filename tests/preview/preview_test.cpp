#include <gmock/gmock.h>

#include <array>
#include <cstdio>
#include <sstream>

#include "controls/grid.hpp"
#include "controls/print_control.hpp"
#include "preview/frm_print_preview.hpp"
#include "tests/fakes/recording_control.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil {

namespace {

using ::testing::ElementsAre;
using testing::error_of;
using ::testing::HasSubstr;
using testing::RecordingControl;
using Uses = std::vector<std::string>;

std::vector<TextRun> texts_of(const Page& page) {
  std::vector<TextRun> runs;
  for (const PageItem& item : page.items) {
    if (const auto* const run = std::get_if<TextRun>(&item)) runs.push_back(*run);
  }
  return runs;
}

/// The text of a page above its footer, a line each run: "left,top text".
std::string runs_of(const Page& page) {
  std::string lines;
  for (const TextRun& run : texts_of(page)) {
    if (run.top == 15944) continue;
    lines += std::to_string(run.left) + ',' + std::to_string(run.top) + ' ' + to_utf8(run.text) + '\n';
  }
  return lines;
}

/// The texts of a page that are at a height, from the left, without the space between them.
std::string line_at(const Page& page, std::int32_t top) {
  std::string line;
  for (const TextRun& run : texts_of(page)) {
    if (run.top == top) line += (line.empty() ? "" : "|") + to_utf8(run.text);
  }
  return line;
}

using Preview = testing::UtilsTest;

/// A print control that notes how builders drive it.
struct RecordingPrintControl final : RecordingControl, PreviewPages {
  [[nodiscard]] const Page* shown_page() const override { return nullptr; }
  [[nodiscard]] float zoom_percent() const override { return 100; }
  [[nodiscard]] std::optional<TwipsRectangle> guides() const override { return {}; }
};

struct Builders : Preview {
  std::shared_ptr<RecordingControl> print = std::make_shared<RecordingPrintControl>();
  std::shared_ptr<RecordingControl> source = std::make_shared<RecordingControl>();
  Variant holder{ObjectRef(source)};

  Builders() {
    for (const char* property : {"HeaderFontName", "FontName", "Zoom", "Duplex", "PaperSize", "Orientation", "Header",
                                 "Text", "RenderControl"}) {
      print->values[property] = {};
    }
    print->values["MarginLeft"] = print->values["MarginTop"] = print->values["MarginRight"] = 100;
    print->values["PageWidth"] = 10000;
    print->values["CurrentPage"] = print->values["PageCount"] = std::int16_t{1};
    print->methods = {"StartDoc", "EndDoc", "TextBox"};
    platform.controls[u"VSPrinter8LibCtl.VSPrinter"] = print;
    source->values["hwnd"] = 77;
  }

  std::string header_of(const Variant& from, const Variant& to) {
    utils.GridPrintPreview(100, 1, u"Sales", u"C:\\x", holder, from, to, u"Cap");
    return to_utf8(print->values["Header"].to_text(plain_numbers));
  }

  std::int32_t error_of_text_box() {
    source->values["Text"] = u"words";
    return error_of([&] { utils.TextBoxPrintPreview(50, 1, u"Notes", u"C:\\x", holder); });
  }

  std::string uses() { return print->taken_uses(); }
};

TEST_F(Builders, SetThePrintControlUpInOrder) {
  library.settings().sGridPaperDuplex = u"Horizontal";
  library.settings().sGridPaperSize = u"A3";
  platform.preview.user = [&](PreviewEvents&) { print->uses.emplace_back("shown"); };
  utils.GridPrintPreview(75, 2, u"Sales", u"C:\\x", holder, Variant(), Variant(), u"Cap");
  EXPECT_EQ(uses(),
            "put HeaderFontName = \"Courier New\"|put FontName = \"Courier New\"|put Zoom = 75#|put Duplex = 3%|"
            "put PaperSize = 8%|put #34 = False|put #60 = 1%|put #152 = True|put #126 = True|put #57 = 100%|"
            "put Orientation = 1%|put Header = \"  Sales\"|call StartDoc|put RenderControl = 77&|call EndDoc|"
            "CurrentPage|PageCount|CurrentPage|put CurrentPage = 1%|CurrentPage|PageCount|shown");
  EXPECT_EQ(error_of_text_box(), 0);
  const std::string text_box = uses();
  EXPECT_THAT(text_box, ::testing::StartsWith("put Zoom = 50#|put PaperSize = 9%|put #34 = False|"));
  EXPECT_THAT(text_box,
              HasSubstr("|put Orientation = 0%|put Header = \"  Notes\"|call StartDoc|put Text = \"words\"|"));
  source->values = {{"ListCount", 2}, {"List(0&)", u"a"}, {"List(1&)", u"b"}};
  utils.ListBoxPrintPreview(50, 0, u"Notes", u"C:\\x", holder);
  EXPECT_THAT(uses(), HasSubstr("|call TextBox(\"a\", 100&, 100&, 9800&, 567&)|"
                                "call TextBox(\"b\", 100&, 780&, 9800&, 567&)|call EndDoc|"));
}

TEST_F(Builders, DatesStandInTheHeader) {
  const Date from{39877.25};
  EXPECT_EQ(header_of(u"DateTimeOnly", from), "  Sales  05/03/2009 06:00");
  EXPECT_EQ(header_of(from, u"7/3/2009 8:30"), "  Sales  05/03/2009 To 07/03/2009");
  EXPECT_EQ(header_of(Variant(), from), "  Sales");
  EXPECT_EQ(header_of(from, Variant()), "  Sales");
  EXPECT_EQ(error_of([&] { header_of(Null{}, from); }), 94);
  EXPECT_EQ(error_of([&] { header_of(u"x", from); }), 13);
}

TEST_F(Preview, TheWindowPagesZoomsAndCloses) {
  const auto source = std::make_shared<RecordingControl>();
  source->values["Text"] = u"page\fpage\fend";
  auto& view = platform.preview;
  FrmPrintPreview& form = library.part<FrmPrintPreview>();
  view.width = 100;
  view.height = 1000;
  platform.twips_y = 12;
  constexpr std::int32_t f3 = 114;
  EXPECT_EQ(form.key_down(f3), f3) << "not loaded";
  static_cast<void>(form.print_control());
  EXPECT_EQ(form.key_down(f3), f3) << "not shown";
  view.user = [&](PreviewEvents& events) {
    EXPECT_EQ(events.key_down(f3), 115) << "passed on as F4";
    EXPECT_EQ(view.uses.back(), "Notes           Page 2 of 3      Press F9 to Print.");
    EXPECT_EQ(events.key_down(18), 18) << "Alt stays Alt";

    view.uses.clear();
    events.chosen(PreviewMenu::mnu150);
    EXPECT_EQ(view.uses, (Uses{"uncheck 6", "uncheck 7", "uncheck 8", "uncheck 9", "uncheck 10", "uncheck 11",
                               "uncheck 12", "check 11"}));
    events.zoom_step(true);
    events.zoom_step(true);
    EXPECT_EQ(form.print_control().get<double>(u"Zoom"), 200);

    events.chosen(PreviewMenu::mnuA3);
    events.chosen(PreviewMenu::mnuVertical);
    platform.prints = false;
    events.key_down(120);
    ASSERT_EQ(platform.print_jobs.size(), 1U);
    const PrintSettings& job = platform.print_jobs[0];
    EXPECT_EQ(std::tuple(job.paper_size, job.duplex, job.shows_dialog), std::tuple(8, 2, true));

    events.resized();
    EXPECT_EQ(view.uses.back(), "pages 8550 by 4380") << "in a window of 600 by 400 pixels at least";
    view.state = 1;
    events.resized();
    EXPECT_EQ(view.state, 0);

    platform.chosen_files = {u"C:\\out\\a.pdf"};
    events.chosen(PreviewMenu::mnuExportPDF);
    EXPECT_THAT(platform.files.bytes(u"C:\\out\\a.pdf"), ::testing::StartsWith("%PDF"));
    events.chosen(PreviewMenu::mnuExportPDF);
    platform.chosen_files = {u"C:\\out\\b.pdf"};
    platform.gives_up = true;
    events.chosen(PreviewMenu::mnuExportPDF);
    EXPECT_EQ(platform.files.bytes(u"C:\\out\\b.pdf"), "(no file)") << "given up";
    EXPECT_EQ(platform.hourglasses, 0);
    EXPECT_TRUE(platform.messages.empty()) << "a cancelled dialog is nobody's business";
    view.width = 12000;
  };
  utils.TextBoxPrintPreview(100, 1, u"Notes", u"C:\\exports\\", ObjectRef(source));
  EXPECT_EQ(form.key_down(f3), f3) << "closed";
  EXPECT_EQ(view.windows, 0);
  EXPECT_EQ(utils.GetCfgFileData(u"PrintPreview", u"WindowWidth", u"", u"", Boolean(false)), u"12000");
}

TEST_F(Builders, ErrorsOfPagingReachTheCallerOthersNobody) {
  print->methods.emplace_back("PrintDoc");
  for (const auto& [item, error] :
       {std::pair(PreviewMenu::mnuNext, 70), {PreviewMenu::mnuPrinter, 0}, {PreviewMenu::mnuExportPDF, 0}}) {
    platform.preview.user = [&, chosen = item](PreviewEvents& events) {
      print->before = [](const std::string& use) {
        if (use == "PageCount" || use.starts_with("call Print")) raise(ErrorNumber::permission_denied);
      };
      events.chosen(chosen);
      print->before = {};
    };
    EXPECT_EQ(error_of_text_box(), error);
    EXPECT_EQ(platform.preview.windows, 0) << "closed";
  }
  library.settings().EventLog = 1;
  library.settings().sORVPath = u"C:";
  platform.files.failures = {{u"append", ErrorNumber::permission_denied}};
  EXPECT_EQ(error_of_text_box(), 70);
  EXPECT_FALSE(library.part<FrmPrintPreview>().is_loaded()) << "a log that cannot be written leaves no half window";
}

TEST_F(Builders, AThirdPartyPrintControlIsDrivenButNotShown) {
  const auto other = std::make_shared<RecordingControl>();
  other->values = print->values;
  other->methods = print->methods;
  platform.controls[u"VSPrinter8LibCtl.VSPrinter"] = other;
  EXPECT_EQ(error_of_text_box(), 445);
  EXPECT_EQ(other->values["Text"], Variant(u"words"));
  EXPECT_EQ(platform.preview.windows, 0);
}

/// A host that calls builders at every opportunity.
struct Meanwhile : Preview {
  std::shared_ptr<RecordingControl> text = std::make_shared<RecordingControl>();
  std::shared_ptr<RecordingControl> grid = std::make_shared<RecordingControl>();

  Meanwhile() {
    text->values["Text"] = u"one\ftwo";
    grid->values = {{"hwnd", 1}, {"Rows", 1}, {"Cols", 1}, {"TextMatrix(0&, 0&)", u"cell"}};
  }

  std::int32_t show(const Text& name) {
    library.settings().AutomatedEndOfMonth = Boolean(false);
    return error_of([&] { utils.TextBoxPrintPreview(100, 1, name, u"C:\\" + name, ObjectRef(text)); });
  }
  std::int32_t write(const Text& caption) {
    library.settings().AutomatedEndOfMonth = Boolean(true);
    const Variant holder{ObjectRef(grid)};
    return error_of([&] { utils.GridPrintPreview(50, 2, u"Month", u"", holder, Variant(), Variant(), caption); });
  }
  std::vector<std::int32_t> month_end() {
    return {write(u"BankSummaryReport"), write(u"SalesReport"), write(u"Other")};
  }

  [[nodiscard]] bool is_written(const Text& report) {
    return platform.files.bytes(u"C:\\TAL\\ORV3\\DATA\\MONTHLYREPORTS\\" + report + u".pdf").starts_with("%PDF");
  }
  FrmPrintPreview& form = library.part<FrmPrintPreview>();
};

TEST_F(Meanwhile, UnattendedRunsShowNothing) {
  EXPECT_THAT(month_end(), ElementsAre(0, 0, 0));
  EXPECT_EQ(write(u"badDebtsReport"), 0);
  EXPECT_EQ(platform.files.files.size(), 2U) << "there are no reports of other names";
  EXPECT_EQ(write(u"BadDebtsReport"), 0);
  EXPECT_TRUE(is_written(u"BadDebtsReport"));
  platform.files.failures = {{u"write", ErrorNumber::disk_full}};
  EXPECT_EQ(write(u"SalesReport"), 0);
  EXPECT_THAT(platform.preview.uses, ::testing::IsEmpty());
  EXPECT_EQ(platform.preview.windows, 0) << "unloaded";
}

TEST_F(Meanwhile, AReportThatIsBeingBuiltOrShownIsNotTouched) {
  std::vector<std::int32_t> errors;
  const auto interfere = [&](const std::string& use) {
    if (use == "hwnd") return;
    for (RecordingControl* const source : {text.get(), grid.get()}) source->before = {};
    errors = {write(u"SalesReport"), show(u"Other")};
  };
  text->before = interfere;
  platform.preview.user = [&](PreviewEvents& events) {
    EXPECT_EQ(show(u"Other"), 400);
    EXPECT_EQ(form.print_control().get<double>(u"Zoom"), 100);
    events.key_down(114);
    EXPECT_EQ(platform.preview.uses.back(), "Notes           Page 2 of 2      Press F9 to Print.");
    platform.chosen_files = {u"C:\\a.pdf"};
    events.chosen(PreviewMenu::mnuExportPDF);
    EXPECT_EQ(platform.file_dialogs.back().folder, u"C:\\Notes");
  };
  EXPECT_EQ(show(u"Notes"), 0);
  EXPECT_THAT(std::exchange(errors, {}), ElementsAre(400, 400));
  EXPECT_FALSE(is_written(u"SalesReport"));
  grid->before = interfere;
  EXPECT_EQ(write(u"BankSummaryReport"), 0);
  EXPECT_THAT(errors, ElementsAre(400, 400));
  EXPECT_TRUE(is_written(u"BankSummaryReport"));
  text->before = [](const std::string& /*use*/) { raise(ErrorNumber::permission_denied); };
  EXPECT_EQ(show(u"Notes"), 70);
  text->before = {};
  EXPECT_EQ(show(u"Notes"), 0) << "a failed report does not block the next";
  EXPECT_EQ(platform.preview.windows, 0);
}

TEST_F(Meanwhile, AMonthEndTakesThePlaceOfTheReportShown) {
  library.settings().EventLog = 1;
  library.settings().sORVPath = u"C:";
  const testing::Rows<PreviewMenu> opportunities = {
      {"a timer", PreviewMenu::mnuFile},
      {"a timer while the printer dialog is open", PreviewMenu::mnuPrinter},
      {"a timer while the file dialog is open", PreviewMenu::mnuExportPDF},
  };
  testing::check_rows(opportunities, [&](PreviewMenu item) {
    platform.files.files.clear();
    platform.preview.user = [&](PreviewEvents& events) {
      platform.during_dialogs = [&] {
        EXPECT_THAT(month_end(), ElementsAre(0, 0, 0));
        EXPECT_FALSE(form.is_loaded());
        EXPECT_EQ(platform.preview.windows, 1) << "the window outlives its loop";
      };
      platform.chosen_files = {u"C:\\chosen.pdf"};
      if (item == PreviewMenu::mnuFile) platform.during_dialogs();
      events.chosen(item);
      platform.during_dialogs = {};
      EXPECT_EQ(events.key_down(114), 114) << "it is nobody's window now";
      events.resized();
    };
    EXPECT_EQ(show(u"Notes"), 0);
    EXPECT_TRUE(is_written(u"BankSummaryReport") && is_written(u"SalesReport"));
    EXPECT_EQ(platform.files.files.size(), 3U) << "and the log, but no month end under the name chosen for another";
    EXPECT_EQ(platform.preview.windows, 0);
    // Loads and unloads by their letter: the first is built in the window shown, later ones load theirs.
    const std::string log = platform.files.bytes(u"C:\\EventLog.txt");
    std::string events;
    for (std::size_t at = 0; (at = log.find(":Form", at)) != std::string::npos; ++at) events += log[at + 5];
    EXPECT_EQ(events, "LQLQLQ");
  });
  platform.preview.user = [&](PreviewEvents& /*events*/) {
    EXPECT_THAT(month_end(), ElementsAre(0, 0, 0));
    platform.preview.user = {};
    EXPECT_EQ(show(u"Second"), 0) << "within the loop of the first";
  };
  EXPECT_EQ(show(u"First"), 0);
  EXPECT_EQ(platform.preview.windows, 0);
}

TEST_F(Meanwhile, PaperStaysForTheNextReportAndTheCaptionDoesNot) {
  std::tuple<std::int32_t, std::int32_t, std::int32_t> paper;
  platform.preview.user = [&](PreviewEvents& /*events*/) {
    const Control print = form.print_control();
    paper = {print.get<std::int32_t>(u"PaperSize"), print.get<std::int32_t>(u"Orientation"),
             print.get<std::int32_t>(u"Duplex")};
  };
  library.settings().sGridPaperSize = u"A3";
  library.settings().sGridPaperDuplex = u"Vertical";
  EXPECT_EQ(write(u"Jobs"), 0);
  library.settings().sGridPaperSize = u"a4";  // Texts in another case set nothing.
  library.settings().sGridPaperDuplex = u"horizontal";
  library.settings().AutomatedEndOfMonth = Boolean(false);
  utils.GridPrintPreview(50, 7, u"Month", u"", ObjectRef(grid), Variant(), Variant(), u"Jobs");
  EXPECT_EQ(paper, std::tuple(8, 1, 2));
  EXPECT_THAT(platform.preview.uses.back(), ::testing::StartsWith("Jobs   "));
  EXPECT_EQ(show(u"Notes"), 0);
  EXPECT_EQ(paper, std::tuple(9, 0, 2));
  EXPECT_THAT(platform.preview.uses.back(), ::testing::StartsWith("Notes   "));
}

struct Pages : Preview {
  std::shared_ptr<PrintControl> print = std::make_shared<PrintControl>(library.platform());

  testing::Generator generator;

  /// The document that a job makes of a print control.
  template <class Job>
  const Document& made_by(const Job& job) {
    print->StartDoc();
    job();
    print->EndDoc();
    return *print->document();
  }
  const Document& document_of(const Text& text) {
    return made_by([&] { print->put_Text(text); });
  }
  const Document& document_of(const ObjectRef& grid) {
    return made_by([&] {
      print->RenderObject = grid;
      print->put_RenderControl(1);
    });
  }
  /// A grid of rows whose cells are parted by tabs.
  std::shared_ptr<Grid> grid_of(std::int32_t columns, const std::vector<Text>& rows = {}) {
    auto grid = std::make_shared<Grid>(library.platform());
    grid->put_Cols(columns);
    for (const Text& row : rows) grid->AddItem(row, -1);
    return grid;
  }
};

TEST_F(Pages, TextFlowsAndBreaks) {
  print->Header = u"  Notes";
  print->MarginRight = print->PageWidth() - print->MarginLeft - 1200;  // Ten letters of Courier.
  const std::string page = runs_of(document_of(u"one two three four\r\nabcdefghijklmn\tx\r\n\r\nb\u0001").pages[0]);
  EXPECT_EQ(page,
            "1134,1134 one two \n1134,1374 three four\n1134,1614 abcdefghij\n1134,1854 klmn\n2094,1854 x\n"
            "1134,2334 b^A\n"
            "1134,654   Notes\n");
  EXPECT_EQ(line_at(print->document()->pages[0], 15944), "06/07/2009|Page 1 of 1");
  EXPECT_EQ(document_of(u"a\fb\f\fc").pages.size(), 4U);
  Text lines;
  for (int i = 0; i < 61; ++i) lines += u"x\n";
  EXPECT_EQ(document_of(lines).pages.size(), 2U) << "60 lines of 240 twips";
  EXPECT_EQ(document_of(u"").pages.size(), 1U);
  EXPECT_EQ(print->document()->bookmarks.size(), 1U);
  EXPECT_EQ(print->CurrentPage(), 1);
  print->MarginLeft = 12000;
  EXPECT_EQ(error_of([&] { print->StartDoc(); }), 5);
  EXPECT_EQ(error_of([&] { print->put_PaperSize(999); }), 5);
  print->put_Zoom(-3);
  EXPECT_EQ(print->Zoom(), 10);
}

TEST_F(Pages, WordsBreakWhereANaiveBreakerBreaksThem) {
  for (int run = 0; run < 200; ++run) {
    const auto room = static_cast<std::size_t>(generator.whole(10, 30));
    // Letters of Courier in 10 points are 120 twips wide.
    print->MarginRight = print->PageWidth() - print->MarginLeft - static_cast<std::int32_t>(room) * 120;
    Text text;
    std::vector<Text> expected(1);
    for (int words = generator.whole(5, 40); words > 0; --words) {
      Text word(static_cast<std::size_t>(generator.whole(1, 12)), generator.one_of(TextView(u"abcdefghijklm")));
      text += (text.empty() ? u"" : u" ") + word;
      if (!expected.back().empty() && expected.back().size() + 1 + word.size() > room) expected.emplace_back();
      for (; word.size() > room; word.erase(0, room)) expected.insert(expected.end() - 1, word.substr(0, room));
      expected.back() += (expected.back().empty() ? u"" : u" ") + word;
    }
    const std::vector<TextRun> shown = texts_of(document_of(text).pages[0]);
    for (std::size_t line = 0; line < expected.size(); ++line) {
      EXPECT_EQ(to_utf8(trim_blanks(shown.at(line).text)), to_utf8(expected[line])) << to_utf8(text) << ", " << room;
    }
  }
}

TEST_F(Pages, RowsFillEveryPageToItsEnd) {
  print->MarginBottom = print->PageHeight() - print->MarginTop - 14400;
  for (int tries = 0; tries < 50; ++tries) {
    const auto grid = grid_of(1);
    std::vector<std::string> expected(1);
    std::int32_t used = 0;
    for (std::int32_t row = 0; row < 60; ++row) {
      const std::int32_t height = 240 * generator.whole(1, 10);
      grid->AddItem(u"r" + number_to_text(row), -1);
      grid->put_RowHeight(row, height);
      if (used + height > 14400) {
        expected.emplace_back();
        used = 0;
      }
      used += height;
      expected.back() += "r" + std::to_string(row) + ' ';
    }
    std::vector<std::string> shown;
    const PageList& pages = document_of(grid).pages;
    for (std::size_t i = 0; i < pages.size(); ++i) {
      shown.emplace_back();
      for (const TextRun& run : texts_of(pages[i]))
        shown.back() += run.left == 1134 + 60 ? to_utf8(run.text) + ' ' : "";
    }
    EXPECT_EQ(shown, expected);
  }
}

TEST_F(Pages, BoxesCountFromThePaperOrTheMarginsAndRunOffThePage) {
  print->MarginLeft = 1000;
  print->MarginTop = 2000;
  const Document& document = made_by([&] {
    for (const bool from_paper : {false, true}) {
      print->PhysicalPage = Boolean(from_paper);
      print->TextBox(u"a long entry that is cut off", 100, 200, 1300, 567);
    }
    print->TextBox(u"x", 1134, 16800, 1300, 567);
  });
  ASSERT_EQ(document.pages.size(), 1U);
  EXPECT_EQ(runs_of(document.pages[0]),
            "1100,2200 a long\n1100,2440 entry that\n100,200 a long\n100,440 entry that\n1134,16800 x\n");
}

TEST_F(Pages, GridsAreLaidOutAsTheyLook) {
  const auto grid = grid_of(4, {u"Name\tHidden\tSum\tDone", u"N0\th\t12.5\tTrue", u"N1", u"N2"});
  grid->put_FixedRows(1);
  grid->put_ColHidden(1, Boolean(true));
  grid->put_RowHidden(2, Boolean(true));
  grid->put_ColDataType(3, 11);
  grid->put_ColWidth(0, 600);
  // Courier of 8 points: 96 twips a letter, rows of 252.
  EXPECT_EQ(runs_of(document_of(grid).pages[0]),
            "1194,1164 Name\n1794,1164 Sum\n2794,1164 Done\n1194,1416 N0\n2290,1416 12.5\n1194,1668 N2\n");
  for (int i = 0; i < 60; ++i) grid->AddItem(u"more", -1);
  EXPECT_EQ(line_at(document_of(grid).pages[1], 1164), "Name|Sum|Done") << "headings on every page";

  // Long texts go on in the next line where the grid shows them so; a row's own height cuts them off.
  const auto small = grid_of(2, {u"one two three four\t7", u"next\tb"});
  const auto runs_of_small = [&] { return runs_of(document_of(small).pages[0]); };
  small->put_ColAlignment(1, 3);
  EXPECT_EQ(runs_of_small(), "1194,1164 one two t\n2586,1164 7\n1194,1416 next\n2586,1416 b\n");
  small->WordWrap = Boolean(true);
  EXPECT_EQ(runs_of_small(),
            "1194,1164 one two\n1194,1356 three\n1194,1548 four\n2586,1164 7\n1194,1800 next\n2586,1800 b\n");
  small->put_RowHeight(0, 450);
  EXPECT_EQ(runs_of_small(), "1194,1164 one two\n1194,1356 three\n2586,1164 7\n1194,1614 next\n2586,1614 b\n");
  small->FontName = u"Times New Roman";
  small->FontSize = 20;
  small->GridLines = 0;
  const Page without_lines = document_of(small).pages[0];
  ASSERT_EQ(texts_of(without_lines).size(), without_lines.items.size());
  EXPECT_EQ(texts_of(without_lines)[0].font, (FontStyle{FontFamily::times, false, 20}));

  // A grid that fails in the middle leaves the document as it was.
  const auto broken = std::make_shared<RecordingControl>();
  broken->values = {{"Rows", 2}, {"Cols", 1}, {"TextMatrix(0&, 0&)", u"a"}};
  const Document& whole = made_by([&] {
    print->put_Text(u"before");
    print->RenderObject = ObjectRef(broken);
    EXPECT_EQ(error_of([&] { print->put_RenderControl(1); }), 9);
    print->put_Text(u"after");
  });
  EXPECT_EQ(runs_of(whole.pages[0]), "1134,1134 before\n1134,1374 after\n");

  // What answers for nothing but its window is a picture.
  const Document& drawn = made_by([&] { print->put_RenderControl(42); });
  EXPECT_THAT(platform.drawn, ElementsAre("image of 42"));
  EXPECT_EQ(std::get<Picture>(drawn.pages[0].items.at(0)).place, (TwipsRectangle{1134, 1134, 30, 15}));
}

TEST_F(Pages, LinesFromRightToLeftBeginAtTheRight) {
  print->MarginRight = print->PageWidth() - print->MarginLeft - 1200;  // Ten letters of Courier, up to 2334.
  const auto lines = [&](const Text& text) { return runs_of(document_of(text).pages[0]); };
  // Wrapped in the order of reading; then each line is put into order.
  EXPECT_EQ(lines(u"\u05D0\u05D1 ab \u05D2\u05D3\u05D4\u05D5\u05D6"),
            "1734,1134 ab\n2094,1134 \u05D0\u05D1\n1974,1134  \n1734,1374 \u05D2\u05D3\u05D4\u05D5\u05D6\n")
      << "with a blank between, but none at the end";
  // Tab stops count from there as well.
  EXPECT_EQ(lines(u"\u05D0\tb"), "2214,1134 \u05D0\n1254,1134 b\n");

  const auto grid = grid_of(2, {u"\u05D0 1\t\u05D0", u"b \u05D0\t7"});
  grid->put_ColAlignment(1, 1);
  print->MarginRight = 1134;
  // Courier of 8 points: 96 twips a letter; columns of 1000 with 60 on either side.
  EXPECT_EQ(runs_of(document_of(grid).pages[0]),
            "1786,1164 1\n1978,1164 \u05D0\n1882,1164  \n2194,1164 \u05D0\n"
            "1194,1416 b \n1386,1416 \u05D0\n2194,1416 7\n");
}

TEST_F(Pages, HeadersKeepTheirNameAndDates) {
  const testing::Rows<std::size_t, std::size_t, bool> names = {
      {"a short name", 20, 1, true},
      {"smaller letters", 300, 3, true},
      {"far more than there is room", 100'000, 3, false},
  };
  testing::check_rows(names, [&](std::size_t length, std::size_t lines, bool is_whole) {
    Text name = u"Bookings";
    while (name.size() < length) name += u" of customer";
    print->Header = u"  " + name + u"  01/03/2009 To 31/03/2009";
    Text shown;
    std::size_t runs = 0;
    for (const TextRun& run : texts_of(document_of(u"text").pages[0])) {
      if (run.top >= 1134) continue;
      ++runs;
      shown += run.text;
      EXPECT_GE(run.top, 360);
      EXPECT_LE(run.top + line_height(run.font), 1134 - 240);
      EXPECT_LE(run.left + run.width, 11906 - 1134);
      EXPECT_GE(run.font.points, 6);
    }
    std::erase(shown, u' ');
    Text whole = name + u"01/03/2009To31/03/2009";
    std::erase(whole, u' ');
    EXPECT_EQ(runs, lines);
    EXPECT_EQ(shown == whole, is_whole);
    EXPECT_TRUE(shown.starts_with(u"Bookingsofcustomer") && shown.ends_with(u"01/03/2009To31/03/2009"));
  });
}

TEST_F(Pages, CharactersWithoutAShapeAreShownEverywhere) {
  const Text text = u"a" + Text(1, u'\0') + u"b\tc\r\nd\u001B\u0085e\rf";
  print->Header = text;
  const auto grid = grid_of(1, {u""});
  grid->put_TextMatrix(0, 0, text);
  grid->put_ColWidth(0, 5000);
  const Document& line = document_of(grid);
  EXPECT_EQ(line_at(line.pages[0], 1164), "a^@b    c d^[^\u00C5e f");
  EXPECT_EQ(to_utf8(line.title), "a^@b    c d^[^\u00C5e f");
  EXPECT_EQ(line_at(line.pages[0], 390 + 168), "d^[^\u00C5e") << "a header has lines of its own";
  grid->WordWrap = Boolean(true);
  EXPECT_THAT(runs_of(document_of(grid).pages[0]),
              ::testing::StartsWith("1194,1164 a^@b    c\n1194,1356 d^[^\u00C5e\n1194,1548 f\n"));
}

TEST_F(Pages, PartsOfAWideGridSayWhatTheyShow) {
  const auto grid = grid_of(24);
  grid->put_Rows(60);
  grid->put_FixedCols(1);
  for (std::int32_t r = 0; r < 60; ++r) {
    for (std::int32_t c = 0; c < 24; ++c) grid->put_TextMatrix(r, c, number_to_text(r) + u"/" + number_to_text(c));
  }
  grid->put_ColWidth(23, 20000);
  print->Header = u"Wide";
  // 9638 twips of room, of which the fixed column takes 1000; 57 rows on a page.
  const std::tuple<std::size_t, const char*, const char*> pages[] = {
      {1, "57/0|57/1|57/2|57/3|57/4|57/5|57/6|57/7|57/8", "Part 1 of 4: columns 2 to 9 of 24"},
      {5, "57/0|57/17|57/18|57/19|57/20|57/21|57/22", "Part 3 of 4: columns 18 to 23 of 24"},
      {6, "0/0|0/23", "Part 4 of 4: column 24 of 24"},
  };
  const Document& document = document_of(grid);
  ASSERT_EQ(document.pages.size(), 8U);
  for (const auto& [page, first_row, note] : pages) {
    EXPECT_EQ(line_at(document.pages[page], 1164), first_row);
    EXPECT_THAT(line_at(document.pages[page], 15944), HasSubstr("Page " + std::to_string(page + 1) + " of 8"));
    EXPECT_THAT(line_at(document.pages[page], 15944), HasSubstr(note));
    for (const PageItem& item : document.pages[page].items) {
      const auto* const box = std::get_if<Box>(&item);
      EXPECT_LE(box == nullptr ? 0 : box->place.left + box->place.width, 11906 - 1134);
    }
  }
  std::ostringstream marks;
  for (const auto& [title, page, level] : document.bookmarks) marks << int{level} << page << to_utf8(title) << '|';
  EXPECT_EQ(marks.str(), "00Wide|10Columns 2 to 9|12Columns 10 to 17|14Columns 18 to 23|16Column 24|");
  grid->put_FixedCols(12);
  EXPECT_EQ(line_at(document_of(grid).pages[2], 1164).substr(0, 4), "0/9|") << "too wide to be repeated";
}

TEST_F(Pages, CellsHaveTheirLooks) {
  const auto grid = std::make_shared<RecordingControl>();
  grid->values = {{"Rows", 2}, {"Cols", 3}, {"FixedRows", 1}, {"FixedCols", 1}, {"GridLinesFixed", 0}};
  grid->values.insert({{"ForeColor", 0xFF}, {"BackColor", 0xFFFF}, {"GridColor", 0x123456}});
  grid->values.insert({{"ForeColorFixed", 0xFF0000}, {"BackColorFixed", std::int32_t(0x8000000F)}});
  grid->values.insert({{"MergeCells", 1}, {"MergeRow(0&)", Boolean(true)}});
  constexpr const char* texts[] = {"00", "Both", "Both", "10", "11", "12"};
  for (int cell = 0; cell < 6; ++cell) {
    const std::string place = std::to_string(cell / 3) + "&, " + std::to_string(cell % 3) + "&)";
    grid->values["TextMatrix(" + place] = from_utf8(texts[cell]);
    for (const char* const setting : {"Cell(2%, ", "Cell(6%, ", "Cell(7%, "}) grid->values[setting + place] = 0;
  }
  grid->values["Cell(6%, 1&, 1&)"] = 0xFFFFFF;
  grid->values["Cell(7%, 1&, 2&)"] = 0x00FF00;
  grid->values["Cell(2%, 1&, 2&)"] = 4;
  grid->values["Cell(13%, 0&, 0&)"] = Boolean(true);
  const Document& document = document_of(grid);
  std::string looks;
  const Box* box = nullptr;
  for (const PageItem& item : document.pages[0].items) {
    if (const auto* const next = std::get_if<Box>(&item)) box = next;
    const auto* const run = std::get_if<TextRun>(&item);
    if (run == nullptr || box == nullptr || run->top < 1134 || run->top > 15000) continue;
    std::array<char, 100> line{};
    std::snprintf(line.data(), line.size(), "%s%s %06X on %06X, line %06X, %d wide, at %d\n",
                  to_utf8(run->text).c_str(), run->font.is_bold ? " bold" : "", run->colour,
                  box->fill.value_or(0xFFFFFF), box->line_width > 0 ? box->line_colour : 0, box->place.width,
                  run->left - box->place.left);
    looks += line.data();
  }
  EXPECT_EQ(looks,
            "00 bold FF0000 on E8E8E8, line 000000, 1000 wide, at 60\n"
            "Both FF0000 on E8E8E8, line 000000, 2000 wide, at 60\n"
            "10 FF0000 on E8E8E8, line 000000, 1000 wide, at 748\n"
            "11 0000FF on FFFFFF, line 123456, 1000 wide, at 748\n"
            "12 00FF00 on 00FFFF, line 123456, 1000 wide, at 404\n");
  EXPECT_EQ(std::ranges::count_if(grid->uses, [](const std::string& use) { return use.starts_with("Cell(13%"); }), 2)
      << "what a grid does not answer is not asked again";
}

}  // namespace

}  // namespace talutil
