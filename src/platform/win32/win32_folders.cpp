#include "platform/win32/win32_folders.hpp"

#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/last_error.hpp"
#include "platform/win32/stored_files.hpp"

namespace talutil::win32 {

namespace {

/// For WIN32_FIND_DATAW and WIN32_FILE_ATTRIBUTE_DATA.
template <class Data>
FileFacts facts_of(const Data& data) {
  FileFacts facts;
  const bool is_folder = (data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  const bool is_link = (data.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0;
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
    const TextView plain = TextView(path_).substr(extended.size());
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
    } while (FindNextFileW(search.get(), &entry) != 0);
  }

  [[nodiscard]] std::optional<FileFacts> facts(TextView name) override {
    WIN32_FILE_ATTRIBUTE_DATA data;
    if (GetFileAttributesExW(wide(below(name)), GetFileExInfoStandard, &data) == 0) return std::nullopt;
    return facts_of(data);
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
    const DWORD attributes = GetFileAttributesW(wide(path));
    if (attributes == INVALID_FILE_ATTRIBUTES) raise_last_error();
    const DWORD kind = attributes & (FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT);
    if (kind != FILE_ATTRIBUTE_DIRECTORY) raise(ErrorNumber::path_file_access);
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

  static constexpr TextView extended = u"\\\\?\\";

 private:
  [[nodiscard]] Text below(TextView name) const { return path_ + Text(name); }

  Text path_;
};

/// The full path, with nothing left for the platform to interpret.
Text full_path(const Text& path) {
  const wchar_t* const given = path.empty() ? L"." : wide(path);
  const DWORD size = GetFullPathNameW(given, 0, nullptr, nullptr);
  Text full(size, u'\0');
  const DWORD length = GetFullPathNameW(given, size, reinterpret_cast<wchar_t*>(full.data()), nullptr);
  if (length == 0 || length >= size) raise(ErrorNumber::path_not_found);
  full.resize(length);
  if (full.back() != u'\\') full += u'\\';
  if (full.starts_with(Win32Folder::extended)) return full;
  if (full.starts_with(u"\\\\")) return Text(Win32Folder::extended) + u"UNC\\" + full.substr(2);
  return Text(Win32Folder::extended) + full;
}

}  // namespace

std::unique_ptr<Folder> Win32Folders::open(const Text& path) {
  Text full = full_path(path);
  const DWORD attributes = GetFileAttributesW(wide(full));
  if (attributes == INVALID_FILE_ATTRIBUTES || (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0) {
    raise(ErrorNumber::path_not_found);
  }
  return std::make_unique<Win32Folder>(std::move(full));
}

}  // namespace talutil::win32
