#include "automation/control.hpp"
#include "controls/zip_controls.hpp"
#include "services/mod_zip_files.hpp"
#include "tests/archives/tree.hpp"
#include "tests/fakes/recording_control.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil {
namespace {

using archives::testing::read_tree;
using archives::testing::Tree;
using archives::testing::write_file;
using testing::RecordingControl;

struct ZipFilesTest : testing::UtilsTest {
  ZipFilesTest()
      : UtilsTest([](auto& fake) {
          fake.used_files = testing::real_files();
          fake.used_folders = testing::real_folders();
        }) {}

  /// A third-party control, whose result is 0.
  std::shared_ptr<RecordingControl> replace(const Text& class_name, const char* result) {
    auto control = std::make_shared<RecordingControl>();
    control->values[result] = std::int16_t{0};
    platform.controls[class_name] = control;
    return control;
  }

  /// What a control was asked for since the last time: "40=0" for what was put, "24" for what was read.
  static std::string told(RecordingControl& control) {
    std::string all = control.taken_uses();
    using Mark = std::pair<std::string_view, std::string_view>;
    for (const auto& [mark, told] : {Mark("put ", ""), {"#", ""}, {"&", ""}, {" = ", "="}, {"|", " "}}) {
      for (std::size_t at = 0; (at = all.find(mark)) != std::string::npos;) all.replace(at, mark.size(), told);
    }
    return all;
  }

  void zip(const Text& archive, const Text& items, std::int16_t multi_volume = 0, const Text& password = {}) {
    utils.CallZIPFiles(archive, items, multi_volume, password, Boolean(false));
  }
  void unzip(const Text& archive, const Text& target, const Text& items = {}, bool overwrite = false) {
    utils.CallUnZIPFiles(archive, target, items, Boolean(overwrite));
  }

  Text folder = testing::scratch_folder();
};

TEST_F(ZipFilesTest, TellsTheControlsInTheirOrder) {
  const auto zip_control = replace(u"DZACTXLibCtl.dzactxctrl", "#39");
  const auto unzip_control = replace(u"DUZACTXLibCtl.duzactxctrl", "#24");
  zip(u"a.zip", u"*.*", 1, u"key");
  EXPECT_EQ(told(*zip_control),
            "40=0 34=False 3=False 18=False 15=False 33=False 30=False 6=False 26=False 12=False 13=False 16=False "
            "24=False 29=False 14=False 36=False 28=False 17=False 23=False 10=False 9=False 7=False 4=True 19=False "
            "21=False 20=\"\" 22=\"\" 27=\"\" 25=\"\" 2=\"\" 31=\"\" 11=\"\" 1=\"\" 42=\"\" 37=0 8=0 5=6 38=100000000 "
            "32=0 44=0 35=\"key\" 34=True 37=1 1=\"a.zip\" 2=\"*.*\" 40=4 39 39");
  zip(u"a.zip", u"*.*", 2);
  EXPECT_EQ(told(*zip_control).find(" 37=1"), std::string::npos) << "only 1 asks for volumes";

  unzip(u"a.zip", u"C:\\out", u"*.txt", true);
  const std::string reset =
      "34=0 5=False 19=False 20=False 18=False 8=False 22=False 10=False 11=False 12=False 9=False 6=True 7=True "
      "15=True 13=True 14=True 21=\"\" 4=\"\" 2=\"\" 17=\"\" 31=\"\" 32=\"\" 1=\"\" 24=0 16=0 23=0 33=0 30=0 27=0 25=0 "
      "26=0 43=0 28=0% 3=1100 29=0 35=\"\" 37=0 42=0 1=\"a.zip\" 34=1 24 ";
  EXPECT_EQ(told(*unzip_control), reset + "1=\"a.zip\" 4=\"C:\\out\" 2=\"*.txt\" 10=True 34=8 24 24");
  unzip_control->before = [&](const std::string& use) {
    if (use == "#24") unzip_control->values[use] = std::int16_t{13};
  };
  unzip(u"a.zip", u"C:\\out");
  EXPECT_EQ(told(*unzip_control), reset + "24 24") << "what cannot be read is not extracted";
  ASSERT_EQ(platform.messages.size(), 1U);
  EXPECT_TRUE(platform.messages[0].text.starts_with(u"ORV Zipping Error: ZE_NAME  Missing"));
}

TEST_F(ZipFilesTest, CodesAreExplained) {
  constexpr std::pair<std::int16_t, const char*> rows[] = {
      {1, "ZE_BUSY  Busy, can 't enter now - You tried"},
      {12, "ZE_NONE      Nothing to do - The ItemList that you specified doesn't match any files to be zipped.  If"},
      {22, "  If this error occurred during a backup operation, your data is safe.  The data is copied"}};
  for (const std::int16_t well : {std::int16_t{-1}, std::int16_t{0}}) ModZipFiles::show_result(well, platform);
  EXPECT_TRUE(platform.messages.empty());
  for (const auto& [code, text] : rows) {
    ModZipFiles::show_result(code, platform);
    EXPECT_TRUE(to_utf8(platform.messages.back().text).starts_with(std::string("ORV Zipping Error: ") + text)) << code;
  }
}

TEST_F(ZipFilesTest, BacksUpAndRestores) {
  write_file(folder, u"data\\a.txt", "first");
  zip(folder + u"a.zip", folder + u"data", 0, u"key");
  unzip(folder + u"a.zip", folder + u"out");
  EXPECT_EQ(read_tree(folder + u"out"), (Tree{{u"data\\", ""}, {u"data\\a.txt", "first"}}));
  EXPECT_TRUE(platform.messages.empty());

  // The password is that of the last zip action; else the user is asked.
  zip(folder + u"b.zip", folder + u"data");
  platform.passwords = {u"wrong", u"key"};
  unzip(folder + u"a.zip", folder + u"again");
  EXPECT_EQ(platform.password_prompts,
            (std::vector<Text>{u"Password of data/a.txt:", u"That is not the password of data/a.txt:"}));
  EXPECT_EQ(read_tree(folder + u"again"), read_tree(folder + u"out"));
  unzip(folder + u"a.zip", folder + u"third");
  ASSERT_EQ(platform.messages.size(), 1U);
  EXPECT_TRUE(platform.messages[0].text.starts_with(u"ORV Zipping Error: ZE_ABORT"));
}

/// A host's handler, called as `handler(done, total, name)`.
struct Handler final : Object {
  std::function<Variant()> work;
  int calls = 0;
  std::int32_t member_id(TextView /*name*/) override { return default_member; }
  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override {
    EXPECT_EQ(std::tuple(member, access, arguments.size()), std::tuple(default_member, Access::call, 3U));
    ++calls;
    return work();
  }
};

TEST_F(ZipFilesTest, ControlsTellOfTheirProgress) {
  write_file(folder, u"a.txt", "first");
  auto own = std::make_shared<ZipControl>(library.platform());
  const Control control(own, plain_numbers);
  const auto handler = std::make_shared<Handler>();
  control.put(u"ZIPFile", folder + u"a.zip");
  control.put(u"ItemList", folder + u"a.txt");
  control.put(u"OnProgress", ObjectRef(handler));
  const testing::Rows<std::function<Variant()>, std::int16_t> rows = {
      {"nothing answered", [] { return Variant(); }, 0},
      {"cancelled", [] { return Variant(Boolean(true)); }, 9},
      {"an error of the handler", []() -> Variant { raise(ErrorNumber::overflow); }, 9},
      {"an action within it",
       [&] {
         control.put(u"Action", 4);
         EXPECT_EQ(own->ErrorCode, 1);
         return Variant();
       },
       0},
  };
  testing::check_rows(rows, [&](const std::function<Variant()>& work, std::int16_t result) {
    handler->work = work;
    handler->calls = 0;
    control.put(u"Action", 4);
    EXPECT_EQ(control.get<std::int16_t>(u"ErrorCode"), result);
    EXPECT_GT(handler->calls, 0);
  });
  EXPECT_GT(platform.messages_handled, 0);
  const Control unzip_control(std::make_shared<UnzipControl>(library.platform()), plain_numbers);
  unzip_control.put(UnzipControl::archive_name, folder + u"a.zip");
  unzip_control.put(UnzipControl::action, UnzipControl::extract);
  EXPECT_EQ(unzip_control.get<std::int16_t>(u"ErrorCode"), 16) << "no destination";
  control.put(20, u"kept");
  EXPECT_EQ(control.get<Text>(20), u"kept") << "a setting without a meaning";
}

}  // namespace
}  // namespace talutil
