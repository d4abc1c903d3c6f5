#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

constexpr std::uint32_t normal_files = 0;

/// Runs one statement of a member that carries on after errors. Returns whether it succeeded.
template <class Statement>
bool without_error(Statement&& statement) {
  try {
    statement();
  } catch (const RunTimeError&) {
    return false;
  }
  return true;
}

/// Removes the first and the last character of a path that begins with a quote, whatever the last one is. A lone quote
/// stays.
void remove_quotes(Text& path) {
  if (path.size() > 1 && path.front() == u'"') path = path.substr(1, path.size() - 2);
}

bool is_any_found(Files& files, const Text& pattern, std::uint32_t mask) {
  bool found = false;
  files.search(pattern, mask, [&](TextView /*name*/) {
    found = true;
    return false;
  });
  return found;
}

/// Calls `found` for each matching normal file in a folder.
template <class Found>
void for_each_file(Files& files, const Text& path, const Text& pattern, Found found) {
  files.search(path + (pattern.empty() ? u"*.*" : pattern), normal_files, [&](TextView name) {
    if (name != u"." && name != u"..") found(name);
    return true;
  });
}

bool is_drive_path(TextView path) { return path.find(u':') == 1; }

/// A text with only the characters of the system's ANSI code page, by which these members pass on what they get.
Text as_ansi(const Platform& platform, const Text& text) {
  return platform.code_page.text_of(platform.code_page.bytes_of(text));
}

/// The application's own folder, which contains the fallback folders.
constexpr TextView program_folder = u"C:\\TAL\\ORV3";

/// A step of the set-up: creates a folder below a configured one. If that fails, the fallback replaces the configured
/// folder.
struct FolderStep {
  Text SharedSettings::*setting;
  TextView fall_back;
  TextView below;  ///< Without a trailing separator.
};

constexpr FolderStep pictures{&SharedSettings::sPicturesDir, u"\\Pictures\\", u""};
constexpr FolderStep drawings{&SharedSettings::sDrawingsDir, u"\\Drawings\\", u""};
constexpr FolderStep templates{&SharedSettings::sTemplatesDir, u"\\Templates\\", u""};
constexpr FolderStep help_files{&SharedSettings::sHelpDir, u"\\Help\\", u""};
constexpr FolderStep reports(TextView below) { return {&SharedSettings::sReportsDir, u"\\Reports\\", below}; }

constexpr FolderStep folder_steps[] = {
    pictures,
    drawings,
    reports(u""),
    reports(u"JobSheets"),
    reports(u"SummaryJobSheets"),
    reports(u"SummaryJobSheets\\Processed"),
    templates,
    help_files,
};

void provide_folder(ORVUtils& utils, const Platform& platform, const FolderStep& step) {
  Text& folder = utils.settings().*step.setting;
  const Text below(step.below);
  const auto make = [&] {
    platform.files.make_path(as_ansi(platform, below.empty() ? folder : folder + below + u'\\'));
  };
  make();
  if (utils.PathExists(folder + below)) return;
  folder = Text(program_folder).append(step.fall_back);
  make();
}

}  // namespace

Boolean ORVUtils::FileExists(Text sFilename) {
  if (sFilename.empty()) return Boolean(false);
  remove_quotes(sFilename);
  bool found = false;
  Files& files = library_.platform().files;
  const bool searched = without_error([&] { found = is_any_found(files, sFilename, normal_files); });
  if (sFilename.empty() || !searched || !found) return Boolean(false);
  // The file's name is extracted as well, but the result is True whatever comes of it.
  without_error([&] { ExtractFilename(sFilename, Boolean(true)); });
  return Boolean(true);
}

Boolean ORVUtils::PathExists(Text sDirectory) {
  if (sDirectory.empty()) return Boolean(false);
  remove_quotes(sDirectory);
  bool found = false;
  std::uint32_t attributes = 0;
  Files& files = library_.platform().files;
  const bool searched = without_error([&] { found = is_any_found(files, sDirectory, file_attribute::folder); });
  if (sDirectory.empty() || !searched || !found) return Boolean(false);
  without_error([&] { attributes = files.attributes(sDirectory); });
  return Boolean((attributes & file_attribute::folder) != 0);
}

Text ORVUtils::ExtractFilename(Text& vSpecIn, const Boolean& bIncludeExt) {
  if (vSpecIn.empty()) return {};
  remove_quotes(vSpecIn);
  Text name = vSpecIn;
  if (const std::size_t separator = vSpecIn.rfind(u'\\'); separator != Text::npos) {
    name = vSpecIn.substr(separator + 1);
  } else if (is_drive_path(vSpecIn) && vSpecIn.size() > 2) {
    name = vSpecIn.substr(2);
  }
  // The first dot, not the last: hosts have names such as report.final.txt.
  return bIncludeExt ? name : name.substr(0, name.find(u'.'));
}

Text ORVUtils::ExtractPathName(Text& vSpecIn) {
  if (vSpecIn.empty()) return {};
  remove_quotes(vSpecIn);
  if (const std::size_t separator = vSpecIn.rfind(u'\\'); separator != Text::npos) {
    return vSpecIn.substr(0, separator + 1);
  }
  Files& files = library_.platform().files;
  Text folder;
  if (is_drive_path(vSpecIn)) without_error([&] { folder = files.current_folder(vSpecIn.substr(0, 1)); });
  if (folder.empty()) without_error([&] { folder = files.current_folder({}); });
  return folder.ends_with(u'\\') ? folder : folder + u'\\';
}

void ORVUtils::VerifyFilePath(const Text& sPath) {
  try {
    library_.platform().files.make_path(as_ansi(library_.platform(), sPath));
  } catch (const RunTimeError& error) {
    library_.platform().message_boxes.show(error.description() + u"   VerifyFilePath : " + sPath, MessageButtons::ok,
                                           {});
  }
}

void ORVUtils::DeleteFiles(const Text& sFileSpec) {
  without_error([&] { library_.platform().files.delete_files(sFileSpec); });
}

std::int32_t ORVUtils::GetFileCount(const Text& sPath, const Text& sFiles) {
  std::int32_t count = 0;
  for_each_file(library_.platform().files, sPath, sFiles, [&](TextView /*name*/) { count = checked_add(count, 1); });
  return count;
}

Text ORVUtils::GetFileList(const Text& sDelimiter, const Text& sPath, const Text& sFiles) {
  Text list;
  for_each_file(library_.platform().files, sPath, sFiles, [&](TextView name) { list.append(name).append(sDelimiter); });
  // Only a one-character delimiter can equal the last character. An empty delimiter equals the "last character" of an
  // empty list, and removing from that fails.
  const TextView last_character = TextView(list).substr(list.empty() ? 0 : list.size() - 1);
  if (last_character != sDelimiter) return list;
  if (list.empty()) raise(ErrorNumber::invalid_procedure_call);
  list.pop_back();
  return list;
}

Text ORVUtils::BrowseForFolder(const Text& szTitle) {
  const std::intptr_t owner = library_.components().owner_handle();
  return library_.platform().folder_picker.choose(as_ansi(library_.platform(), szTitle), owner).value_or(Text());
}

void ORVUtils::SetupFileFolders() {
  Files& files = library_.platform().files;
  try {
    for (const FolderStep& step : folder_steps) provide_folder(*this, library_.platform(), step);
    const Text fixed(program_folder);
    files.make_path(fixed + u"\\BinTemp\\");
    files.make_path(fixed + u"\\Data\\Backups\\");
    files.make_path(as_ansi(library_.platform(), settings().sTemplatesDir + u"Letters\\"));
  } catch (const RunTimeError& error) {
    if (!settings().bIsProgrammer.is_exactly_true()) return;
    library_.platform().message_boxes.show(u"SetupFileFolders - " + error.description(), MessageButtons::ok, {});
  }
}

Text ORVUtils::GetNewGuid() { return library_.platform().guids.make(); }

}  // namespace talutil
