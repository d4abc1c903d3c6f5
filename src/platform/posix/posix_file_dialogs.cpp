#include "platform/posix/posix_file_dialogs.hpp"

#include <iostream>

#include "automation/run_time_error.hpp"
#include "platform/posix/posix_files.hpp"

namespace talutil::posix {

namespace {

bool exists(const Text& path) {
  try {
    static_cast<void>(PosixFiles().attributes(path));
    return true;
  } catch (const RunTimeError&) {
    return false;
  }
}

/// The path for what was typed: a bare name is in the dialog's folder.
Text path_of(const FileDialog& dialog, const Text& name) {
  Text path = name;
  const std::size_t name_start = path.find_last_of(u"\\/:") + 1;
  if (name_start == 0 && !dialog.folder.empty()) {
    const bool is_closed = dialog.folder.ends_with(u'\\') || dialog.folder.ends_with(u'/');
    path = dialog.folder + (is_closed ? u"" : u"\\") + name;
  }
  const bool has_extension = path.find(u'.', path.size() - name.size() + name_start) != Text::npos;
  if (!has_extension && !dialog.default_extension.empty()) path += u'.' + dialog.default_extension;
  return path;
}

/// Whether the dialog's flags allow this file.
bool is_accepted(const FileDialog& dialog, const Text& path, const Terminal& terminal) {
  if (dialog.purpose == FileDialog::Purpose::open) {
    if ((dialog.flags & file_dialog_flag::file_must_exist) == 0 || exists(path)) return true;
    std::cerr << '"' << to_utf8(path) << "\" does not exist\n";
    return false;
  }
  if ((dialog.flags & file_dialog_flag::overwrite_prompt) == 0 || !exists(path)) return true;
  const auto answer = terminal.ask('"' + to_utf8(path) + "\" exists. Replace it? [y/n] ");
  return answer && (answer->starts_with('y') || answer->starts_with('Y'));
}

}  // namespace

std::optional<ChosenFile> PosixFileDialogs::choose(const FileDialog& dialog) {
  const bool has_name = !dialog.file_name.empty();
  const Text suggested = has_name ? path_of(dialog, dialog.file_name) : Text();
  const std::string what = dialog.title.empty() ? "File" : to_utf8(dialog.title);
  const std::string hint = has_name ? " [a file, Enter for " + to_utf8(suggested) + ", Ctrl+D to cancel] "
                                    : " [a file, or Enter to cancel] ";
  while (const auto line = terminal_.ask(what + hint)) {
    if (line->empty() && !has_name) break;
    Text path = line->empty() ? suggested : path_of(dialog, from_utf8(*line));
    if (is_accepted(dialog, path, terminal_)) return ChosenFile{std::move(path), dialog.filter_index};
  }
  return std::nullopt;
}

}  // namespace talutil::posix
