#include <gmock/gmock.h>

#include "automation/control.hpp"
#include "controls/control_factory.hpp"
#include "infoforms/frm_components.hpp"
#include "tests/fakes/late_members.hpp"
#include "tests/fakes/recording_control.hpp"

namespace talutil {
namespace {

using talutil::testing::error_of;
using talutil::testing::FakePlatform;

using LibraryTest = testing::LateMembers;

TEST_F(LibraryTest, StartUpLoadsTheComponentsWindowAndReadsTheScreen) {
  platform.twips_x = 14.5F;  // Halves go to the even number.
  platform.twips_y = 15.5F;
  EXPECT_EQ(library.settings().ComputerName, u"");
  library.start();
  EXPECT_EQ(platform.window_captions, std::vector<Text>{u"Form1"});
  const SharedSettings& settings = library.settings();
  EXPECT_EQ(settings.ComputerName, u"FAKEPC");
  EXPECT_EQ(std::pair(settings.ScreenTwipsPerPixelX, settings.ScreenTwipsPerPixelY), std::pair(14, 16));
  const std::vector<Text> in_order = {
      u"PolarCryptoLibCtl.Crypto",   u"MSComDlg.CommonDialog",     u"MSComDlg.CommonDialog",  u"VSFlex8Ctl.VSFlexGrid",
      u"SystemInfoControl.MSysInfo", u"DUZACTXLibCtl.duzactxctrl", u"DZACTXLibCtl.dzactxctrl"};
  EXPECT_EQ(platform.controls_asked_for, in_order);

  // Where none are registered they are not looked for, until the next load.
  platform.has_registered_controls = false;
  utils.Terminate();
  EXPECT_EQ(platform.open_windows, 0);
  EXPECT_NE(library.components().control(u"ZipCtrl"), nullptr);
  EXPECT_EQ(platform.controls_asked_for, in_order);
}

TEST_F(LibraryTest, TerminateLoadsTheWindowOnceMoreToUnloadIt) {
  utils.Terminate();
  EXPECT_EQ(std::pair(platform.window_captions.size(), platform.open_windows), std::pair(std::size_t{1}, 0));
}

TEST_F(LibraryTest, LateCallsCoerceTheirArgumentsAndWriteBackWhatHasChanged) {
  check({{u"stringREPLACE", {{u"=5.5|5|x", "x.x"}}},
         // With a default in play the arguments travel through places of the call's own, and come back.
         {u"ExtractFilename", {{u"\"C:\\a.b\"", "a.b | C:\\a.b"}, {u"\"C:\\a.b\"|@missing", "a.b | C:\\a.b"}}},
         {u"WeekYearToDate", {{u"60|10000|0", "error 13 | 52"}}},
         // A variable that stands for an argument which its own caller left out is a value where one is required.
         {u"MyPos", {{u"a", "error 449"}, {u"@missing|b|1", "error 13"}, {u"@null|b|1", "error 94"}}},
         {u"StripNulls", {{u"a|b", "error 450"}}},
         {u"Nothing", {{u"@none", "error 438"}}}});
  EXPECT_EQ(call(u"StripNulls", u"a", Access::get), "a") << "a method's answer";
  EXPECT_EQ(call(u"lLoginSessionID", u" 12 ", Access::put), "Empty");
  for (const Access read : {Access::get, Access::call}) EXPECT_EQ(call(u"LLOGINsessionid", u"@none", read), "12");
  EXPECT_EQ(call(u"ComputerName", u"x", Access::put), "error 438");
}

TEST_F(LibraryTest, ObjectPropertiesKeepObjectsOfTheirKindUntilTheNextPut) {
  using talutil::testing::RecordingControl;
  const auto form = std::make_shared<RecordingControl>();
  const auto box = std::make_shared<RecordingControl>();
  form->values = {{"hwnd", 1}};
  box->values = {{"ScaleMode", 1}, {"ScaleX", 1.0F}};
  for (const TextView property : {u"FolderBrowseForm", u"SplashForm", u"DrawTextPictureBox"}) {
    const auto& fits = property == u"DrawTextPictureBox" ? box : form;
    const auto put = [&](const Variant& value) {
      Argument argument(value);
      call(property, Access::put, {&argument, 1});
    };
    const auto references = fits.use_count();
    put(ObjectRef(fits));
    for (const Variant& other : {Variant(ObjectRef(fits == box ? form : box)), Variant(u"a text"), Variant()}) {
      EXPECT_EQ(error_of([&] { put(other); }), 13);
    }
    EXPECT_EQ(fits.use_count(), references + 1) << "kept, once";
    EXPECT_THAT(fits->uses, ::testing::IsEmpty()) << "asked for names alone";
    put(ObjectRef());
    EXPECT_EQ(fits.use_count(), references);
  }
}

TEST_F(LibraryTest, AControlThatFailsLeavesNoHalfWindow) {
  platform.controls[u"DZACTXLibCtl.dzactxctrl"] = nullptr;
  EXPECT_EQ(error_of([&] { library.start(); }), 429) << "one that cannot be made";
  EXPECT_EQ(platform.open_windows, 0);
  platform.controls.clear();
  platform.controls[u"SystemInfoControl.MSysInfo"] = std::make_shared<testing::RecordingControl>();
  EXPECT_EQ(error_of([&] { library.start(); }), 438) << "one without a computer's name";
  EXPECT_EQ(platform.open_windows, 0);
  const auto theirs = std::make_shared<testing::RecordingControl>();
  theirs->values = {{"#1745027088", u"THEIRS"}};  // It knows its identifiers and nothing else.
  platform.controls[u"SystemInfoControl.MSysInfo"] = theirs;
  library.start();
  EXPECT_EQ(library.settings().ComputerName, u"THEIRS") << "a third-party control in the place of ours";
}

TEST_F(LibraryTest, DatabaseErrorReport) {
  auto& form = dynamic_cast<FrmComponents&>(library.components());
  for (const std::int32_t number : {17142, -5}) {
    form.report_database_error(number, u"what", 1, u"where", u"help.hlp", u"third");
    EXPECT_EQ(form.last_database_error(), number);
  }
  EXPECT_TRUE(
      platform.messages.at(0).text.starts_with(u"An error has caused the database connection to be terminated."));
  EXPECT_EQ(platform.messages.at(1).text, u"TData Error:-5 - what  where  help.hlp");
}

}  // namespace
}  // namespace talutil
