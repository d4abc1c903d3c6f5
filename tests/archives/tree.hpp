#pragma once

#include <map>
#include <string>

#include "archives/packing.hpp"
#include "archives/unpacking.hpp"
#include "tests/platform/real_platform.hpp"

/// Trees of files on the real platform, as maps from path ("a\b.txt", folders with "\" at the end) to content.
namespace talutil::archives::testing {

using Tree = std::map<Text, std::string>;

inline std::unique_ptr<Folder> folder_of(const Text& base, const Text& path, Text& name) {
  auto folder = talutil::testing::real_folders()->open(base);
  std::vector<Text> parts;
  for (std::size_t begin = 0; begin < path.size();) {
    const std::size_t end = std::min(path.find(u'\\', begin), path.size());
    parts.push_back(path.substr(begin, end - begin));
    begin = end + 1;
  }
  for (std::size_t i = 0; i + 1 < parts.size(); ++i) folder = folder->folder(parts[i], true);
  name = parts.back();
  return folder;
}

inline void write_file(const Text& base, const Text& path, const std::string& content) {
  Text name;
  const auto folder = folder_of(base, path, name);
  if (path.ends_with(u'\\')) {
    folder->folder(name, true);
    return;
  }
  const auto file = folder->create(name);
  file->write_at(0, content);
  const FileFacts facts{.modified = 1234567891, .mode = 0644};
  file->finish(&facts);
  file->take_name();
}

inline void write_tree(const Text& base, const Tree& tree) {
  for (const auto& [path, content] : tree) write_file(base, path, content);
}

inline std::string content_of(StoredFile& file) {
  std::string content(static_cast<std::size_t>(file.size()), '\0');
  content.resize(file.read_at(0, content));
  return content;
}

inline void read_into(Folder& folder, const Text& prefix, Tree& tree) {
  folder.list([&](TextView name, const FileFacts& facts) {
    const Text path = prefix + Text(name);
    if (facts.kind == FileKind::folder) {
      tree[path + u"\\"];
      read_into(*folder.folder(name, false), path + u"\\", tree);
    } else {
      tree[path] = content_of(*folder.open(name));
    }
  });
}

inline Tree read_tree(const Text& base) {
  Tree tree;
  read_into(*talutil::testing::real_folders()->open(base), {}, tree);
  return tree;
}

/// Something to compress, another for each seed.
inline std::string some_text(std::size_t size, unsigned seed = 1) {
  std::string text;
  while (text.size() < size) text += "line " + std::to_string(seed = seed * 1664525U + 1013904223U) + "\r\n";
  text.resize(size);
  return text;
}

/// The code that work on an archive ends with.
template <class Work>
Code code_of(Work work) {
  try {
    work();
    return Code::ok;
  } catch (const Error& error) {
    return error.code();
  }
}

inline Code pack_files(const Text& archive, TextView items, const PackingOptions& options = {},
                       Progress progress = Progress()) {
  return code_of([&] { pack(archive, items, options, *talutil::testing::real_folders(), progress); });
}

inline Code unpack_files(const Text& archive, const Text& destination, const UnpackingOptions& options = {},
                         const PasswordQuestion& ask = {}, Progress progress = Progress()) {
  return code_of([&] {
    const auto folders = talutil::testing::real_folders();
    const auto files = talutil::testing::real_files();
    Archive(archive, *folders).extract(destination, options, *folders, *files, ask, progress);
  });
}

inline Code test_file(const Text& archive, const UnpackingOptions& options = {}, const PasswordQuestion& ask = {}) {
  Progress progress;
  return code_of([&] { Archive(archive, *talutil::testing::real_folders()).test(options, ask, progress); });
}

}  // namespace talutil::archives::testing
