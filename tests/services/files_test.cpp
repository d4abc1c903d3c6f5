#include <gtest/gtest.h>

#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {
namespace {

class FileMembers : public UtilsTest {
 protected:
  bool file_exists(const Text& path) { return bool(utils.FileExists(path)); }
  bool path_exists(const Text& path) { return bool(utils.PathExists(path)); }
  std::vector<Text>& calls() { return platform.files.calls; }
};

TEST_F(FileMembers, FileExistsAndPathExists) {
  platform.files.put(u"C:\\Data\\a.txt", "");
  platform.files.put(u"C:\\Data\\hidden.txt", "", file_attribute::hidden);
  platform.files.put(u"C:\\Data\\system.txt", "", file_attribute::system);
  platform.files.put(u"C:\\Data\\sub\\b.txt", "");
  const Rows<Text, bool, bool> rows = {
      {"empty", u"", false, false},
      {"file", u"c:\\data\\A.TXT", true, false},
      {"quoted file", u"\"C:\\Data\\a.txt\"", true, false},
      {"first and last go, whatever the last is", u"\"C:\\Data\\a.txtX", true, false},
      {"a quote alone", u"\"", false, false},
      {"nothing in quotes", u"\"\"", false, false},
      {"wildcards", u"C:\\Data\\*.txt", true, false},
      {"hidden", u"C:\\Data\\hidden.txt", false, false},
      {"system", u"C:\\Data\\system.txt", false, false},
      {"folder", u"C:\\Data\\sub", false, true},
      {"quoted folder", u"\"C:\\Data\\sub\"", false, true},
      {"folder with its separator, which names its files too", u"C:\\Data\\sub\\", true, true},
      {"missing", u"C:\\Data\\c.txt", false, false},
  };
  check_rows(rows, [&](const Text& path, bool is_file, bool is_folder) {
    EXPECT_EQ(file_exists(path), is_file);
    EXPECT_EQ(path_exists(path), is_folder);
  });
  platform.files.failures[u"attributes"] = ErrorNumber::device_io_error;
  EXPECT_FALSE(path_exists(u"C:\\Data\\sub"));
  platform.files.failures[u"search"] = ErrorNumber::bad_file_name_or_number;
  EXPECT_FALSE(file_exists(u"C:\\Data\\a.txt"));
  EXPECT_FALSE(path_exists(u"C:\\Data\\sub"));
}

TEST_F(FileMembers, PathsInParts) {
  const Rows<Text, Text, Text, Text, Text> rows = {
      {"folder and extensions", u"C:\\d\\f.tar.gz", u"f.tar.gz", u"f", u"C:\\d\\", u"C:\\d\\f.tar.gz"},
      {"quotes are written back", u"\"C:\\a b\\x.y\"", u"x.y", u"x", u"C:\\a b\\", u"C:\\a b\\x.y"},
      {"folder only", u"C:\\dir\\", u"", u"", u"C:\\dir\\", u"C:\\dir\\"},
      {"drive and file", u"C:file.txt", u"file.txt", u"file", u"C:\\HOST\\", u"C:file.txt"},
      {"drive only", u"C:", u"C:", u"C:", u"C:\\HOST\\", u"C:"},
      {"missing drive", u"Q:file", u"file", u"file", u"C:\\HOST\\", u"Q:file"},
      {"name", u"file", u"file", u"file", u"C:\\HOST\\", u"file"},
      {"colon elsewhere", u"ab:c", u"ab:c", u"ab:c", u"C:\\HOST\\", u"ab:c"},
      {"leading dot", u"\\.x", u".x", u"", u"\\", u"\\.x"},
      {"empty", u"", u"", u"", u"", u""},
  };
  check_rows(rows, [&](const Text& given, const Text& file, const Text& stem, const Text& folder, const Text& after) {
    Text path = given;
    EXPECT_EQ(utils.ExtractFilename(path, Boolean(true)), file);
    EXPECT_EQ(path, after);
    EXPECT_EQ(utils.ExtractFilename(path, Boolean(false)), stem);
    path = given;
    EXPECT_EQ(utils.ExtractPathName(path), folder);
    EXPECT_EQ(path, after);
  });
  Text name = u"C:file";
  platform.files.failures[u"current_folder"] = ErrorNumber::device_io_error;
  EXPECT_EQ(utils.ExtractPathName(name), u"\\");
}

TEST_F(FileMembers, GetFileListAndCount) {
  platform.files.put(u"C:\\D\\A.TXT", "");
  platform.files.put(u"C:\\D\\B.HTM", "");
  platform.files.put(u"C:\\D\\EMPTY\\SUB\\X", "");
  const Rows<Text, Text, Text, std::string, std::int32_t> rows = {
      {"one character", u",", u"C:\\D\\", u"", "A.TXT,B.HTM", 2},
      {"longer delimiter stays", u", ", u"C:\\D\\", u"", "A.TXT, B.HTM, ", 2},
      {"pattern", u",", u"C:\\D\\", u"*.htm", "B.HTM", 1},
      {"no delimiter", u"", u"C:\\D\\", u"", "A.TXTB.HTM", 2},
      {"empty folder", u",", u"C:\\D\\EMPTY\\", u"", "", 0},
      {"empty folder, no delimiter", u"", u"C:\\D\\EMPTY\\", u"", "error 5", 0},
      {"a path without a separator", u",", u"C:\\D", u"", "", 0},
  };
  check_rows(rows,
             [&](const Text& delimiter, const Text& path, const Text& pattern, const std::string& list, int count) {
               EXPECT_EQ(outcome([&] { return utils.GetFileList(delimiter, path, pattern); }), list);
               EXPECT_EQ(utils.GetFileCount(path, pattern), count);
             });
  platform.files.failures[u"search"] = ErrorNumber::bad_file_name_or_number;
  EXPECT_EQ(error_of([&] { (void)utils.GetFileCount(u"|", u""); }), 52);
  EXPECT_EQ(error_of([&] { (void)utils.GetFileList(u",", u"|", u""); }), 52);
}

TEST_F(FileMembers, VerifyFilePathShowsErrorsAndDeleteFilesNone) {
  utils.VerifyFilePath(u"Q:\\x\\");
  utils.VerifyFilePath(u"C:\\\u0416\u0101\\");
  EXPECT_EQ(calls().back(), u"make_path C:\\?a\\");  // In ANSI.
  EXPECT_TRUE(platform.messages.empty());
  platform.files.failures[u"make_path"] = ErrorNumber::file_not_found;
  utils.VerifyFilePath(u"C:\\x\\");
  ASSERT_EQ(platform.messages.size(), 1U);
  EXPECT_EQ(platform.messages[0],
            (FakePlatform::Message{u"File not found   VerifyFilePath : C:\\x\\", MessageButtons::ok, u""}));
  platform.files.failures[u"delete_files"] = ErrorNumber::cannot_create_object;
  utils.DeleteFiles(u"C:\\x\\*.*");
  EXPECT_EQ(calls().back(), u"delete_files C:\\x\\*.*");
  EXPECT_EQ(platform.messages.size(), 1U);
}

TEST_F(FileMembers, BrowseForFolder) {
  EXPECT_EQ(utils.BrowseForFolder(u"Pick \u0101"), u"");
  platform.folder_picker.answer = u"C:\\chosen";
  EXPECT_EQ(utils.BrowseForFolder(u""), u"C:\\chosen");
  EXPECT_EQ(platform.folder_picker.asked[0], (std::pair<Text, std::intptr_t>{u"Pick a", platform.window_handle}));
  EXPECT_EQ(platform.open_windows, 1);
}

TEST_F(FileMembers, SetupFileFoldersWithGoodSettings) {
  SharedSettings& settings = library.settings();
  settings.sPicturesDir = u"C:\\P\\";
  settings.sDrawingsDir = u"C:\\D\\";
  settings.sReportsDir = u"C:\\R\\";
  settings.sTemplatesDir = u"C:\\T\\";
  settings.sHelpDir = u"C:\\H\\";
  utils.SetupFileFolders();
  std::vector<Text> expected;
  for (const TextView folder :
       {u"P\\", u"D\\", u"R\\", u"R\\JobSheets\\", u"R\\SummaryJobSheets\\", u"R\\SummaryJobSheets\\Processed\\",
        u"T\\", u"H\\", u"TAL\\ORV3\\BinTemp\\", u"TAL\\ORV3\\Data\\Backups\\", u"T\\Letters\\"}) {
    expected.push_back(u"make_path C:\\" + Text(folder));
  }
  EXPECT_EQ(calls(), expected);
}

TEST_F(FileMembers, SetupFileFoldersFallsBack) {
  SharedSettings& settings = library.settings();
  settings.sReportsDir = u"Q:\\Reports\\";
  settings.sHelpDir = u"C:\\H\\";
  utils.SetupFileFolders();
  EXPECT_EQ(settings.sPicturesDir, u"C:\\TAL\\ORV3\\Pictures\\");
  EXPECT_EQ(settings.sDrawingsDir, u"C:\\TAL\\ORV3\\Drawings\\");
  EXPECT_EQ(settings.sReportsDir, u"C:\\TAL\\ORV3\\Reports\\");
  EXPECT_EQ(settings.sTemplatesDir, u"C:\\TAL\\ORV3\\Templates\\");
  EXPECT_EQ(settings.sHelpDir, u"C:\\H\\");
  EXPECT_TRUE(path_exists(u"C:\\TAL\\ORV3\\Reports\\SummaryJobSheets\\Processed"));
  EXPECT_TRUE(path_exists(u"C:\\TAL\\ORV3\\Templates\\Letters"));

  calls().clear();
  platform.files.failures[u"make_path"] = ErrorNumber::file_not_found;
  utils.SetupFileFolders();
  EXPECT_EQ(calls().size(), 1U);
  EXPECT_TRUE(platform.messages.empty());
  settings.bIsProgrammer = Boolean::from_bits(1);  // Not exactly True.
  utils.SetupFileFolders();
  EXPECT_TRUE(platform.messages.empty());
  settings.bIsProgrammer = Boolean(true);
  utils.SetupFileFolders();
  ASSERT_EQ(platform.messages.size(), 1U);
  EXPECT_EQ(platform.messages[0].text, u"SetupFileFolders - File not found");
}

}  // namespace
}  // namespace talutil::testing
