#include "platform/posix/posix_folder_picker.hpp"

#include <iostream>

#include "automation/run_time_error.hpp"
#include "platform/posix/posix_files.hpp"

namespace talutil::posix {

namespace {

bool is_folder(const Text& path) {
  try {
    return (PosixFiles().attributes(path) & file_attribute::folder) != 0;
  } catch (const RunTimeError&) {
    return false;
  }
}

}  // namespace

std::optional<Text> PosixFolderPicker::choose(TextView title, std::intptr_t /*owner*/) {
  const std::string prompt = to_utf8(title) + (title.empty() ? "" : " ") + "[a folder, or Enter to cancel] ";
  while (const auto line = terminal_.ask(prompt)) {
    if (line->empty()) break;
    const Text folder = from_utf8(*line);
    if (is_folder(folder)) return folder;
    std::cerr << '"' << *line << "\" is not a folder\n";
  }
  return std::nullopt;
}

}  // namespace talutil::posix
