#pragma once

#include <map>
#include <set>

#include "automation/run_time_error.hpp"
#include "platform/file_names.hpp"
#include "platform/files.hpp"

namespace talutil::testing {

/// Files in memory, found by their full path in any case, and folders that are there because something lies in them
/// or because they were made. Drive C: is the only one. Any operation can be made to fail.
struct FakeFiles final : Files {
  struct File {
    std::string bytes;
    std::uint32_t attributes = 0;
  };
  std::map<Text, File> files;       ///< By path in upper case; so the names that a search gives are in upper case too.
  std::set<Text> folders{u"C:\\"};  ///< Each with its "\", in upper case.
  std::map<Text, Text> current_folders{{u"", u"C:\\HOST"}, {u"C", u"C:\\HOST"}};
  std::vector<Text> calls;               ///< make_path, delete_files and open_output, with their paths.
  std::map<Text, ErrorNumber> failures;  ///< By operation ("search", "make_path", "write", ...).

  void put(const Text& path, std::string bytes, std::uint32_t attributes = 0) {
    files[upper_case(path)] = {std::move(bytes), attributes};
    add_folders(path);
  }
  [[nodiscard]] std::string bytes(const Text& path) const {
    const auto found = files.find(upper_case(path));
    return found == files.end() ? "(no file)" : found->second.bytes;
  }

  void search(const Text& pattern, std::uint32_t mask, const std::function<bool(TextView)>& found) override {
    fail_if_told(u"search");
    const Text whole = upper_case(is_open_ended(pattern) ? pattern + u"*.*" : pattern);
    const Text name(last_part(whole));
    const Text folder = whole.substr(0, whole.size() - name.size());
    const auto gives = [&](const Text& path, std::uint32_t attributes) {
      const Text entry = path.substr(std::min(folder.size(), path.size()));
      const bool is_here = path.starts_with(folder) && !entry.empty() && entry.find(u'\\') == Text::npos;
      return !is_here || (attributes & ~mask) != 0 || !name_matches(entry, name) || found(entry);
    };
    for (const auto& [path, file] : files) {
      if (!gives(path, file.attributes & 0x16U)) return;
    }
    for (const Text& path : folders) {
      if (!gives(path.substr(0, path.size() - 1), file_attribute::folder)) return;
    }
    if (folders.contains(folder)) (void)gives(folder + u".", file_attribute::folder);
  }

  std::uint32_t attributes(const Text& path) override {
    fail_if_told(u"attributes");
    const Text whole = upper_case(path);
    if (folders.contains(whole) || folders.contains(whole + u"\\")) return file_attribute::folder;
    const auto file = files.find(whole);
    if (file == files.end()) raise(ErrorNumber::file_not_found);
    return file->second.attributes;
  }

  bool make_path(const Text& path) override {
    calls.push_back(u"make_path " + path);
    fail_if_told(u"make_path");
    if (!upper_case(path).starts_with(u"C:")) return false;
    add_folders(path);
    return true;
  }

  Text current_folder(TextView drive) override {
    fail_if_told(u"current_folder");
    const auto found = current_folders.find(upper_case(drive));
    return found == current_folders.end() ? Text() : found->second;
  }

  void delete_files(const Text& pattern) override {
    calls.push_back(u"delete_files " + pattern);
    fail_if_told(u"delete_files");
  }

  std::unique_ptr<InputFile> open_input(const Text& path) override {
    fail_if_told(u"open_input");
    const auto file = files.find(upper_case(path));
    if (file == files.end()) raise(ErrorNumber::file_not_found);
    return std::make_unique<Input>(*this, file->second.bytes);
  }

  std::unique_ptr<OutputFile> open_output(const Text& path) override {
    calls.push_back(u"open_output " + path);
    fail_if_told(u"open_output");
    return std::make_unique<Output>(*this, path);
  }

  void append(const Text& path, std::string_view bytes) override {
    fail_if_told(u"append");
    files[upper_case(path)].bytes += bytes;
  }

 private:
  struct Input final : InputFile {
    Input(FakeFiles& files, std::string all) : owner(files), bytes(std::move(all)) {}
    [[nodiscard]] std::uint64_t size() const noexcept override { return bytes.size(); }
    std::size_t read(std::span<char> buffer) override {
      owner.fail_if_told(u"read");
      const std::size_t count = bytes.copy(buffer.data(), buffer.size(), place);
      place += count;
      return count;
    }
    FakeFiles& owner;
    std::string bytes;
    std::size_t place = 0;
  };
  struct Output final : OutputFile {
    Output(FakeFiles& files, const Text& path) : owner(files), name(path) {}
    void write(std::string_view bytes) override {
      owner.fail_if_told(u"write");
      text += bytes;
    }
    void close() override { owner.put(name, text); }
    FakeFiles& owner;
    Text name;
    std::string text;
  };

  void add_folders(const Text& path) {
    for (std::size_t end = path.find(u'\\'); end != Text::npos; end = path.find(u'\\', end + 1)) {
      folders.insert(upper_case(path.substr(0, end + 1)));
    }
  }
  void fail_if_told(TextView operation) const {
    if (const auto found = failures.find(Text(operation)); found != failures.end()) raise(found->second);
  }
};

}  // namespace talutil::testing
