#include "platform/posix/posix_settings.hpp"

#include <errno.h>
#include <fcntl.h>
#include <sys/file.h>

#include <filesystem>

#include "automation/run_time_error.hpp"
#include "platform/posix/descriptor.hpp"
#include "platform/profile_document.hpp"

namespace talutil::posix {

namespace {

constexpr TextView settings_key = u"HKEY_CURRENT_USER\\Software\\TALUtil\\Settings\\";
constexpr std::uint32_t text_type = 1;

/// The contents of a file. Raises what opening and reading raise.
std::string read_file(PosixFiles& files, const Text& path) {
  const auto file = files.open_input(path);
  std::string bytes(static_cast<std::size_t>(file->size()), '\0');
  std::size_t filled = 0;
  while (filled < bytes.size()) {
    const std::size_t count = file->read(std::span(bytes).subspan(filled));
    if (count == 0) break;
    filled += count;
  }
  bytes.resize(filled);
  return bytes;
}

/// The contents of a file that is to be changed; only a missing one counts as empty, since all that is read here is
/// what remains of the file afterwards.
std::string read_for_change(PosixFiles& files, const Text& path) {
  try {
    return read_file(files, path);
  } catch (const RunTimeError& error) {
    if (!error.is(ErrorNumber::file_not_found)) throw;
    return {};
  }
}

/// A text as it comes out of the platform's buffer: in the code page, and no longer than fits.
Text as_read(TextView text) { return from_ansi(to_ansi(text.substr(0, Profiles::longest_value))); }

/// What a file says; empty if it cannot be read.
template <class Look>
Text look_up(PosixFiles& files, const Text& path, Look look) {
  try {
    return as_read(look(ProfileDocument(read_file(files, path))));
  } catch (const RunTimeError&) {
    return {};
  }
}

/// The hive key of an application and a section, both cut off at a NUL as the platform does.
Text key_of(const Text& application, const Text& section) {
  const Text key = Text(settings_key).append(up_to_nul(application));
  return section.empty() ? key : (key + u'\\').append(up_to_nul(section));
}

}  // namespace

Text PosixProfiles::value(const Text& file, const Text& section, const Text& item) {
  return look_up(files_, file,
                 [&](const ProfileDocument& document) { return document.value(section, item).value_or(Text()); });
}

Text PosixProfiles::item_names(const Text& file, const Text& section) {
  return look_up(files_, file, [&](const ProfileDocument& document) {
    Text names;
    for (const Text& name : document.item_names(section)) names.append(name).append(1, u'\0');
    return names;
  });
}

void PosixProfiles::put(const Text& file, const Text& section, const Text& item, const Text& value) {
  failure_.reset();
  try {
    write(file, section, item, value);
  } catch (const RunTimeError& error) {
    // As on Windows, hosts do not learn of it.
    failure_ = error;
  }
}

void PosixProfiles::write(const Text& file, const Text& section, const Text& item, const Text& value) {
  // The file itself gets replaced, so the folder is locked instead.
  const std::string folder = std::filesystem::path(files_.native(file)).parent_path();
  const Descriptor folder_lock(open(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (folder_lock.get() < 0) raise_for(errno == ENOENT ? ENOTDIR : errno, folder);
  lock(folder_lock, LOCK_EX);
  const std::string before = read_for_change(files_, file);
  ProfileDocument document(before);
  document.put(section, item, value);
  const std::string after = document.bytes();
  if (after == before) return;
  const auto output = files_.open_output(file);
  output->write(after);
  output->close();
}

bool PosixSettingsStore::remove(const Text& application, const Text& section, const Text& key) {
  return hive_.remove(key_of(application, section), up_to_nul(key));
}

std::optional<Text> PosixSettingsStore::value(const Text& application, const Text& section, const Text& key) {
  const auto found = hive_.value(key_of(application, section), up_to_nul(key));
  if (!found || found->type != text_type) return std::nullopt;
  return from_utf16_bytes(found->data);
}

void PosixSettingsStore::put(const Text& application, const Text& section, const Text& key, const Text& value) {
  hive_.put(key_of(application, section), up_to_nul(key), {text_type, to_utf16_bytes(value)});
}

std::vector<PosixSettingsStore::Setting> PosixSettingsStore::settings_of(const Text& application) {
  std::vector<Setting> settings;
  const Text top = key_of(application, {});
  for (const Hive::NamedValue& each : hive_.values_below(top)) {
    if (each.value.type != text_type) continue;
    const Text section = each.key.size() > top.size() ? each.key.substr(top.size() + 1) : Text();
    settings.push_back({section, each.name, from_utf16_bytes(each.value.data)});
  }
  return settings;
}

}  // namespace talutil::posix
