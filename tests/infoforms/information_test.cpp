#include <gmock/gmock.h>

#include "forms/frm_input_box.hpp"
#include "infoforms/frm_sh_keys.hpp"
#include "infoforms/frm_sys_info.hpp"
#include "infoforms/shortcut_keys.hpp"
#include "tests/fakes/recording_control.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil {

namespace {

using ::testing::ElementsAre;
using testing::error_of;
using testing::RecordingControl;

struct Windows : testing::UtilsTest {
  testing::FakeFormState& form = platform.form;

  Text ask(bool is_masked = false, bool has_entry = true, bool is_frameless = false, bool is_unclosable = false) {
    return utils.MyInputBox(u"Caption", u"Prompt", Boolean(is_masked), Boolean(has_entry), Boolean(is_frameless),
                            Boolean(is_unclosable), 0);
  }
  /// A user who types something and presses OK.
  void user_types(const Text& text) {
    form.user = [this, text](FormEvents& events) {
      form.texts[FrmInputBox::txtUserInput] = text;
      events.clicked(FrmInputBox::cmdOK);
    };
  }
};

TEST_F(Windows, InputBoxesKeepTheirLostFrame) {
  user_types(u"typed");
  EXPECT_EQ(ask(true), u"typed");
  EXPECT_TRUE(form.masked[FrmInputBox::txtUserInput]);
  EXPECT_EQ(ask(false, true, false, true), u"typed");
  EXPECT_FALSE(form.masked[FrmInputBox::txtUserInput]) << "not from one use to the next";
  EXPECT_TRUE(form.hidden[FrmInputBox::cmdOK]);
  form.user = [&](FormEvents& events) {
    form.texts[FrmInputBox::txtUserInput] = u"typed";
    events.escaped();
  };
  EXPECT_EQ(ask(false, true, true, false), u"") << "Esc, as the menu";
  EXPECT_FALSE(form.has_frame);
  form.user = {};
  EXPECT_EQ(ask(), u"") << "closed by its menu";
  EXPECT_FALSE(form.has_frame) << "once without a frame, always without";
}

TEST_F(Windows, NoticesStayUntilTheHostClosesThem) {
  user_types(u"before");
  EXPECT_EQ(ask(), u"before");
  EXPECT_EQ(ask(false, false, true, true), u"before") << "nobody waits for a notice";
  EXPECT_TRUE(form.hidden[FrmInputBox::cmdOK]);
  form.events->escaped();
  EXPECT_TRUE(library.part<FrmInputBox>().is_loaded()) << "Esc is no way to close it";
  EXPECT_EQ(error_of([&] { ask(); }), 400);
  EXPECT_EQ(utils.MyInputBox(u"C", u"Nearly done", Boolean(), Boolean(), Boolean(true), Boolean(true), 0), u"before");
  EXPECT_EQ(form.texts[FrmInputBox::lblPrompt], u"Nearly done");
  EXPECT_THAT(form.uses, ::testing::Contains("kept open"));
  form.view->close(CloseMode::code);

  form.user = [&](FormEvents& /*events*/) {
    EXPECT_EQ(error_of([&] { ask(false, false, true, true); }), 400) << "within a box that is waited for";
  };
  ask();
}

TEST_F(Windows, ShortcutKeysArePrintedAndClosed) {
  const auto print = std::make_shared<RecordingControl>();
  print->values["Text"] = {};
  print->methods = {"StartDoc", "EndDoc", "PrintDoc"};
  platform.controls[u"VSPrinter8LibCtl.VSPrinter"] = print;
  utils.ShowShortCutKeys();
  utils.ShowShortCutKeys();
  EXPECT_THAT(form.uses, ElementsAre("show", "on top", "show", "on top"));
  FrmShKeys& keys = library.part<FrmShKeys>();
  form.texts[FrmShKeys::Text1] = u"the keys";
  form.events->clicked(FrmShKeys::cmdPrint);
  EXPECT_THAT(print->uses,
              ElementsAre("call StartDoc", "put Text = \"the keys\"", "call EndDoc", "call PrintDoc(True)"));
  form.events->clicked(FrmShKeys::cmdCross);
  EXPECT_EQ(keys.result(), -99);
  EXPECT_TRUE(keys.is_loaded()) << "the button closes nothing";
  form.events->escaped();
  EXPECT_EQ(keys.result(), 0);
  EXPECT_FALSE(keys.is_loaded());
  utils.ShowShortCutKeys();
  form.view->close(CloseMode::control_menu);
  EXPECT_EQ(keys.result(), -99);
}

TEST(ShortcutKeys, AreRichText) {
  const std::string rich = to_utf8(shortcut_keys_rich_text());
  EXPECT_THAT(rich, ::testing::StartsWith("{\\rtf1\\ansi\\deff0{\\fonttbl{\\f0\\fmodern Courier New;}}"));
  EXPECT_THAT(rich, ::testing::HasSubstr("\\ul\\b\\fs24 GENERAL\\ulnone\\b0\\fs20\\par\r\nCopy Text CTRL+C\\par\r\n"));
  EXPECT_THAT(rich, ::testing::EndsWith("Telephone Contact = CTRL+T\\par\r\n}")) << "to its end";
}

TEST_F(Windows, TheSystemIsDescribed) {
  platform.items[u"C:\\a.txt"] = {false, 1536, 3, std::nullopt, Date{40000.5}, std::nullopt};
  form.user = [&](FormEvents& events) {
    EXPECT_EQ(form.bar_column, 6);
    events.tab_chosen(FrmSysInfo::tabs, 1);
    EXPECT_EQ(form.bar_column, -1);
    EXPECT_TRUE(form.hidden[FrmSysInfo::details]);
    events.tab_chosen(FrmSysInfo::tabs, 4);
    EXPECT_TRUE(form.hidden[FrmSysInfo::facts]);
    form.texts[FrmSysInfo::path] = u"C:\\a.txt";
    events.clicked(FrmSysInfo::show);
    events.clicked(FrmSysInfo::copy);
    platform.items.clear();
    events.clicked(FrmSysInfo::refresh);
    EXPECT_EQ(platform.messages.size(), 1U) << "the file has gone";
    EXPECT_EQ(form.table->row_count(), 0);
    events.clicked(FrmSysInfo::close);
  };
  utils.ShowSysInfo();
  const std::string copied = to_utf8(form.copied);
  EXPECT_THAT(copied, ::testing::StartsWith("Drives\r\n"
                                            "  Drive  Kind    Label   File system  Total       Free      Used\r\n"
                                            "  C:     Fixed   SYSTEM  NTFS         1,000.0 GB  250.0 GB  75%\r\n"
                                            "  D:     CD-ROM          not ready\r\n"
                                            "\r\nMemory\r\n"));
  for (const char* const line :
       {"  Page file, total  none", "  Speed               2400 MHz", "  Running for  1 day, 2 hours, 3 minutes",
        "  Size        1.5 KB (1,536 bytes)", "  Created     unknown", "  Modified    06/07/2009 12:00"}) {
    EXPECT_THAT(copied, ::testing::HasSubstr(std::string(line) + "\r\n"));
  }
  EXPECT_THAT(copied, ::testing::EndsWith("  Attributes  read-only, hidden\r\n"));
  EXPECT_EQ(size_words(1023), u"1,023 bytes");
  EXPECT_EQ(size_words(~0ULL), u"16.0 EB");
}

}  // namespace

}  // namespace talutil
