// Checks what must hold for any pattern and any name: files_fuzz -max_len=512 -runs=1000000

#include <filesystem>

#include "archives/entry_names.hpp"
#include "archives/item_list.hpp"
#include "automation/run_time_error.hpp"
#include "fuzz/input.hpp"
#include "platform/file_names.hpp"
#include "platform/posix/drive_paths.hpp"

namespace talutil {
namespace {

using fuzz::require;

/// Matches by trying everything, for patterns without the special rules for dots.
bool naive_match(TextView name, TextView pattern) {
  if (pattern.empty()) return name.empty();
  if (pattern[0] == u'*')
    return naive_match(name, pattern.substr(1)) || (!name.empty() && naive_match(name.substr(1), pattern));
  return !name.empty() && upper_case(name[0]) == upper_case(pattern[0]) &&
         naive_match(name.substr(1), pattern.substr(1));
}

void check_pattern(const std::string& bytes) {
  constexpr TextView letters = u"abA*";
  Text name;
  Text pattern;
  for (std::size_t i = 0; i < bytes.size() && i < 24; ++i) {
    const char16_t letter = letters[static_cast<std::uint8_t>(bytes[i]) % letters.size()];
    (i % 2 == 0 || letter == u'*' ? pattern : name) += letter;
  }
  require(name_matches(name, pattern) == naive_match(name, pattern), "patterns");
  const Text any = from_ansi(bytes);
  (void)name_matches(any, any);
}

/// A path is read below its drive, and an archive's entry goes below its folder, whatever they are called.
void check_names(const Text& text) {
  static const std::string root = [] {
    std::string folder = (std::filesystem::temp_directory_path() / "talutil-fuzz-XXXXXX").string();
    require(mkdtemp(folder.data()) != nullptr, "a folder is made");
    std::filesystem::create_directories(folder + "/c/a");
    setenv("TALUTIL_DRIVES", folder.c_str(), 1);
    return folder;
  }();
  try {
    const std::string native = posix::DrivePaths().native(u"C:\\" + text);
    require(std::filesystem::path(native).lexically_normal().string().starts_with(root + "/c"), "a path on its drive");
  } catch (const RunTimeError&) {
  }

  const auto parts = archives::safe_parts(text);
  if (!parts) return;
  Text joined;
  for (const Text& part : *parts) {
    require(!part.empty() && part != u".." && part != u"." && part.find_first_of(TextView(u"/\\:\0", 4)) == Text::npos,
            "a part stays in its folder");
    require(!is_device_name(part), "a part is no device");
    joined += (joined.empty() ? u"" : u"/") + part;
  }
  require(archives::safe_parts(joined) == parts, "a safe name stays");
  if (text.find(u'"') != Text::npos) return;
  require(archives::EntryFilter(u"\"" + joined + u"\"").matches(*parts), "an entry is found by its name");
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string bytes(reinterpret_cast<const char*>(data), size);
  talutil::check_pattern(bytes);
  talutil::check_names(talutil::from_utf8(bytes));
  return 0;
}
