#include "platform/win32/win32_folders.hpp"

#include "automation/run_time_error.hpp"
#include "platform/win32/extended_path.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/last_error.hpp"
#include "platform/win32/stored_files.hpp"

namespace talutil::win32 {

namespace {

/// Whether an entry stands for another one. Folders of cloud storage are reparse points too, but their tags lack the
/// name-surrogate bit (IsReparseTagNameSurrogate).
bool is_link_entry(const WIN32_FIND_DATAW& data) {
  constexpr DWORD name_surrogate = 0x20000000;
  return (data.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0 && (data.dwReserved0 & name_surrogate) != 0;
}

FileFacts facts_of(const WIN32_FIND_DATAW& data) {
  FileFacts facts;
  const bool is_folder = (data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  const bool is_link = is_link_entry(data);
  facts.kind = is_folder ? (is_link ? FileKind::link : FileKind::folder) : FileKind::file;
  facts.size = is_folder ? 0 : joined(data.nFileSizeHigh, data.nFileSizeLow);
  facts.modified = seconds_of(data.ftLastWriteTime);
  facts.attributes = data.dwFileAttributes & (kept_attributes | FILE_ATTRIBUTE_DIRECTORY);
  return facts;
}

class Win32Folder final : public Folder {
 public:
  /// Takes a path in the extended form (\\?\), which is used literally and has no length limit, with a trailing
  /// separator.
  explicit Win32Folder(Text path) : path_(std::move(path)) {}

  [[nodiscard]] Text path() const override {
    const TextView plain = TextView(path_).substr(extended_prefix.size());
    if (plain.starts_with(u"UNC\\")) return u"\\" + Text(plain.substr(3, plain.size() - 4));
    return Text(plain.size() == 3 ? plain : plain.substr(0, plain.size() - 1));
  }

  void list(const std::function<void(TextView name, const FileFacts& facts)>& found) override {
    WIN32_FIND_DATAW entry;
    const Owned<kind::FileSearch> search(FindFirstFileW(wide(path_ + u"*"), &entry));
    if (!search) raise_last_error();
    do {
      const TextView name = view(entry.cFileName, wcslen(entry.cFileName));
      if (name != u"." && name != u"..") found(name, facts_of(entry));
    } while (find_next(search, entry));
  }

  [[nodiscard]] std::optional<FileFacts> facts(TextView name) override {
    const auto found = find(name);
    return found ? std::optional(facts_of(*found)) : std::nullopt;
  }

  [[nodiscard]] std::unique_ptr<StoredFile> open(TextView name) override {
    return open_stored_file(below(name), FILE_SHARE_READ | FILE_SHARE_WRITE);
  }

  [[nodiscard]] std::unique_ptr<NewFile> create(TextView name) override { return create_new_file(path_, name); }

  [[nodiscard]] std::unique_ptr<Folder> folder(TextView name, bool make_missing) override {
    const Text path = below(name);
    if (make_missing && CreateDirectoryW(wide(path), nullptr) == 0 && GetLastError() != ERROR_ALREADY_EXISTS) {
      raise_last_error();
    }
    const auto found = find(name);
    if (!found) raise_last_error();
    const bool is_folder = (found->dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
    if (!is_folder || is_link_entry(*found)) raise(ErrorNumber::path_file_access);
    return std::make_unique<Win32Folder>(path + u"\\");
  }

  void set_facts(TextView name, const FileFacts& facts) override {
    const Text path = below(name);
    const FILETIME time = file_time(facts.modified);
    const Owned<kind::File> entry(CreateFileW(wide(path), FILE_WRITE_ATTRIBUTES, FILE_SHARE_READ | FILE_SHARE_WRITE,
                                              nullptr, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr));
    if (entry) SetFileTime(entry.get(), nullptr, nullptr, &time);
    if ((facts.attributes & kept_attributes) != 0) SetFileAttributesW(wide(path), facts.attributes & kept_attributes);
  }

  void remove(TextView name) override {
    if (DeleteFileW(wide(below(name))) == 0) raise_last_error();
  }

 private:
  [[nodiscard]] Text below(TextView name) const { return path_ + Text(name); }

  /// One entry; nothing if it is missing, with the system's last error. Names hold no wildcards.
  [[nodiscard]] std::optional<WIN32_FIND_DATAW> find(TextView name) const {
    WIN32_FIND_DATAW entry;
    const Owned<kind::FileSearch> search(FindFirstFileW(wide(below(name)), &entry));
    return search ? std::optional(entry) : std::nullopt;
  }

  Text path_;
};

}  // namespace

std::unique_ptr<Folder> Win32Folders::open(const Text& path) {
  Text full = extended_path(path);
  if (full.back() != u'\\') full += u'\\';
  const DWORD attributes = GetFileAttributesW(wide(full));
  if (attributes == INVALID_FILE_ATTRIBUTES || (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0) {
    raise(ErrorNumber::path_not_found);
  }
  return std::make_unique<Win32Folder>(std::move(full));
}

}  // namespace talutil::win32
