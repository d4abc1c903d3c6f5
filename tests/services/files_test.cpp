#include "tests/fakes/late_members.hpp"

namespace talutil::testing {
namespace {

struct FileMembers : LateMembers {
  std::vector<Text>& calls = platform.files.calls;
};

TEST_F(FileMembers, FindFilesAndFolders) {
  platform.files.put(u"C:\\D\\a.txt", "");
  platform.files.put(u"C:\\D\\b.htm", "");
  platform.files.put(u"C:\\D\\hidden.txt", "", file_attribute::hidden);
  platform.files.put(u"C:\\D\\system.txt", "", file_attribute::system);
  platform.files.put(u"C:\\D\\sub\\below\\x", "");
  // clang-format off
  check({
      {u"FileExists", {{u"", "False"}, {u"c:\\d\\A.TXT", "True"}, {u"\"C:\\D\\a.txt\"", "True"},
       {u"\"C:\\D\\a.txtX", "True"}, {u"\"", "False"}, {u"\"\"", "False"}, {u"C:\\D\\*.txt", "True"},
       {u"C:\\D\\hidden.txt", "False"}, {u"C:\\D\\system.txt", "False"}, {u"C:\\D\\sub", "False"},
       {u"C:\\D\\", "True"}, {u"C:\\D\\c.txt", "False"}}},
      {u"PathExists", {{u"", "False"}, {u"C:\\D\\a.txt", "False"}, {u"\"", "False"}, {u"\"\"", "False"},
       {u"c:\\d\\SUB", "True"},
       {u"\"C:\\D\\sub\"", "True"}, {u"\"C:\\D\\subX", "True"}, {u"C:\\D\\sub\\", "True"}, {u"C:\\D\\c.txt", "False"}}},
      {u"GetFileList", {{u",|C:\\D\\|", "A.TXT,B.HTM"}, {u", |C:\\D\\|", "A.TXT, B.HTM, "},
       {u",|C:\\D\\|*.htm", "B.HTM"},
       {u"|C:\\D\\|", "A.TXTB.HTM"}, {u",|C:\\D\\sub\\|", ""}, {u"|C:\\D\\sub\\|", "error 5"}, {u",|C:\\D|", ""}}},
      {u"GetFileCount", {{u"C:\\D\\|", "2"}, {u"C:\\D\\|*.htm", "1"}, {u"C:\\D\\sub\\|", "0"}, {u"C:\\D|", "0"}}},
  });
  platform.files.failures[u"attributes"] = ErrorNumber::device_io_error;
  check({{u"PathExists", {{u"C:\\D\\sub", "False"}}}});
  platform.files.failures[u"search"] = ErrorNumber::bad_file_name_or_number;
  check({{u"FileExists", {{u"C:\\D\\a.txt", "False"}}}, {u"PathExists", {{u"C:\\D\\sub", "False"}}},
         {u"GetFileCount", {{u"C:\\D\\|", "error 52"}}}, {u"GetFileList", {{u",|C:\\D\\|", "error 52"}}}});
  // clang-format on
}

TEST_F(FileMembers, TakePathsApartAsAModelDoes) {
  platform.files.current_folders[u"A"] = u"A:\\X";
  std::vector<Text> paths{u""};
  for (std::size_t i = 0; paths[i].size() < 4; ++i) {
    for (const char16_t next : TextView(u"\"\\:.a")) paths.push_back(paths[i] + next);
  }
  for (const Text& given : paths) {
    SCOPED_TRACE(to_utf8(given));
    const Text bare = given.size() > 1 && given[0] == u'"' ? given.substr(1, given.size() - 2) : given;
    Text folder = bare.substr(0, bare.rfind(u'\\') + 1);
    const bool has_drive = folder.empty() && bare.substr(0, 2).ends_with(u':') && bare[0] != u':';
    const Text file = bare.substr(has_drive && bare.size() > 2 ? 2 : folder.size());
    if (folder.empty() && !given.empty()) folder = has_drive && bare[0] == u'a' ? u"A:\\X\\" : u"C:\\HOST\\";
    Text path = given;
    EXPECT_EQ(utils.ExtractFilename(path, Boolean(true)), file);
    EXPECT_EQ(path, bare);
    EXPECT_EQ(utils.ExtractFilename(path = given, Boolean(false)), file.substr(0, file.find(u'.')));
    EXPECT_EQ(utils.ExtractPathName(path = given), folder);
    EXPECT_EQ(path, bare);
  }
  platform.files.failures[u"current_folder"] = ErrorNumber::device_io_error;
  check({{u"ExtractPathName", {{u"a:file", "\\"}}}});
}

TEST_F(FileMembers, VerifyFilePathShowsErrorsAndDeleteFilesNone) {
  utils.VerifyFilePath(u"Q:\\x\\");
  utils.VerifyFilePath(u"C:\\\u0416\u0101\\");
  EXPECT_EQ(calls.back(), u"make_path C:\\?a\\") << "in ANSI";
  platform.files.failures = {{u"make_path", ErrorNumber::file_not_found},
                             {u"delete_files", ErrorNumber::cannot_create_object}};
  utils.VerifyFilePath(u"C:\\x\\");
  utils.DeleteFiles(u"C:\\x\\*.*");
  EXPECT_EQ(calls.back(), u"delete_files C:\\x\\*.*");
  EXPECT_EQ(
      platform.messages,
      (std::vector<FakePlatform::Message>{{u"File not found   VerifyFilePath : C:\\x\\", MessageButtons::ok, u""}}));
}

TEST_F(FileMembers, SetupFileFoldersFallsBack) {
  SharedSettings& settings = library.settings();
  settings.sReportsDir = u"Q:\\Reports\\";
  settings.sHelpDir = u"C:\\H\\";
  utils.SetupFileFolders();
  EXPECT_EQ(settings.sReportsDir + settings.sTemplatesDir, u"C:\\TAL\\ORV3\\Reports\\C:\\TAL\\ORV3\\Templates\\");
  for (const TextView made : {u"Pictures", u"Reports\\JobSheets", u"Reports\\SummaryJobSheets\\Processed", u"BinTemp",
                              u"Data\\Backups", u"Templates\\Letters"}) {
    EXPECT_TRUE(bool(utils.PathExists(u"C:\\TAL\\ORV3\\" + Text(made)))) << to_utf8(made);
  }
  check({{u"PathExists", {{u"C:\\H", "True"}, {u"C:\\TAL\\ORV3\\Help", "False"}}}});
  calls.clear();
  platform.files.failures[u"make_path"] = ErrorNumber::file_not_found;
  for (const Boolean is_programmer : {Boolean::from_bits(1), Boolean(true)}) {
    settings.bIsProgrammer = is_programmer;
    utils.SetupFileFolders();
  }
  EXPECT_EQ(calls.size(), 2U) << "one a call";
  ASSERT_EQ(platform.messages.size(), 1U) << "for exactly True";
  EXPECT_EQ(platform.messages[0].text, u"SetupFileFolders - File not found");
}

}  // namespace
}  // namespace talutil::testing
