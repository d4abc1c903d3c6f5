#include "platform/posix/posix_settings.hpp"

#include <fcntl.h>
#include <stdlib.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <fstream>
#include <iterator>

#include "platform/profile_document.hpp"

namespace talutil::posix {

namespace {

constexpr TextView settings_key = u"HKEY_CURRENT_USER\\Software\\TALUtil\\Settings\\";
constexpr std::uint32_t text_type = 1;

class Descriptor {
 public:
  explicit Descriptor(int number) noexcept : number_(number) {}
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  ~Descriptor() {
    if (number_ >= 0) close(number_);
  }
  [[nodiscard]] int number() const noexcept { return number_; }

 private:
  int number_;
};

std::string native_path(const Text& file) { return to_utf8(file); }

std::optional<std::string> read_file(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return std::nullopt;
  return std::string(std::istreambuf_iterator<char>(in), {});
}

bool write_all(int descriptor, std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t count = write(descriptor, bytes.data(), bytes.size());
    if (count < 0) return false;
    bytes.remove_prefix(static_cast<std::size_t>(count));
  }
  return true;
}

/// Puts a whole file in the place of another, which keeps its access rights. Nothing changes where it cannot be done.
void replace_file(const std::string& path, std::string_view bytes) {
  struct stat old {};
  const bool is_there = stat(path.c_str(), &old) == 0;
  if (is_there && access(path.c_str(), W_OK) != 0) return;
  std::string draft = path + ".XXXXXX";
  const Descriptor file(mkostemp(draft.data(), O_CLOEXEC));
  if (file.number() < 0) return;
  constexpr mode_t usual_rights = 0644;
  const bool is_written = write_all(file.number(), bytes) &&
                          fchmod(file.number(), is_there ? old.st_mode & 0777U : usual_rights) == 0 &&
                          fsync(file.number()) == 0 && rename(draft.c_str(), path.c_str()) == 0;
  if (!is_written) unlink(draft.c_str());
}

/// What the platform's buffer would hold: bytes of the code page, and no more than fit.
Text as_read(TextView text) { return from_ansi(to_ansi(text.substr(0, Profiles::longest_value))); }

/// A key of the hive; the application and the section end at a NUL, as the platform's names do.
Text key_of(const Text& application, const Text& section) {
  const auto name = [](const Text& text) { return text.substr(0, text.find(u'\0')); };
  Text key = Text(settings_key) + name(application);
  return section.empty() ? key : key + u'\\' + name(section);
}

Text name_of(const Text& key) { return key.substr(0, key.find(u'\0')); }

}  // namespace

Text PosixProfiles::value(const Text& file, const Text& section, const Text& item) {
  const auto bytes = read_file(native_path(file));
  return bytes ? as_read(ProfileDocument(*bytes).value(section, item).value_or(Text())) : Text();
}

Text PosixProfiles::item_names(const Text& file, const Text& section) {
  Text names;
  if (const auto bytes = read_file(native_path(file))) {
    for (const Text& name : ProfileDocument(*bytes).item_names(section)) names.append(name).append(1, u'\0');
  }
  return as_read(names);
}

void PosixProfiles::put(const Text& file, const Text& section, const Text& item, const Text& value) {
  const std::string path = native_path(file);
  const std::size_t slash = path.rfind('/');
  const std::string folder = slash == std::string::npos ? "." : path.substr(0, slash + 1);
  const Descriptor lock(open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (lock.number() < 0 || flock(lock.number(), LOCK_EX) != 0) return;
  const std::string before = read_file(path).value_or("");
  ProfileDocument document(before);
  document.put(section, item, value);
  if (std::string after = document.bytes(); after != before) replace_file(path, after);
}

std::optional<Text> PosixSettingsStore::value(const Text& application, const Text& section, const Text& key) {
  const auto found = hive_.value(key_of(application, section), name_of(key));
  if (!found || found->type != text_type) return std::nullopt;
  return from_utf16_bytes(found->data);
}

void PosixSettingsStore::put(const Text& application, const Text& section, const Text& key, const Text& value) {
  hive_.put(key_of(application, section), name_of(key), {text_type, to_utf16_bytes(value)});
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
