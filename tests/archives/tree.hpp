#pragma once

#include <gtest/gtest.h>

#include <map>
#include <string>

#include "archives/packing.hpp"
#include "archives/split_set.hpp"
#include "archives/unpacking.hpp"
#include "tests/fakes/rows.hpp"
#include "tests/platform/real_platform.hpp"

/// Trees of files on the real platform, as maps from path ("a\b.txt", folders with "\" at the end) to content.
namespace talutil::archives::testing {

using talutil::testing::check_rows;
using talutil::testing::real_files;
using talutil::testing::real_folders;
using talutil::testing::Rows;
using talutil::testing::scratch_folder;

using Tree = std::map<Text, std::string>;

inline void write_file(const Text& base, const Text& path, const std::string& content) {
  auto folder = real_folders()->open(base);
  std::size_t begin = 0;
  for (std::size_t end = 0; (end = path.find(u'\\', begin)) != Text::npos; begin = end + 1) {
    folder = folder->folder(path.substr(begin, end - begin), true);
  }
  if (begin == path.size()) return;
  const auto file = folder->create(path.substr(begin));
  file->write_at(0, content);
  const FileFacts facts{.modified = 1234567891, .mode = 0644};
  file->finish(&facts);
  file->take_name();
}

inline void write_tree(const Text& base, const Tree& tree) {
  for (const auto& [path, content] : tree) write_file(base, path, content);
}

inline void read_into(Folder& folder, const Text& prefix, Tree& tree) {
  folder.list([&](TextView name, const FileFacts& facts) {
    const Text path = prefix + Text(name);
    if (facts.kind == FileKind::folder) {
      tree[path + u"\\"];
      return read_into(*folder.folder(name, false), path + u"\\", tree);
    }
    const auto file = folder.open(name);
    std::string& content = tree[path];
    content.resize(static_cast<std::size_t>(file->size()));
    content.resize(file->read_at(0, content));
  });
}

inline Tree read_tree(const Text& base) {
  Tree tree;
  read_into(*real_folders()->open(base), {}, tree);
  return tree;
}

/// The paths of a tree, with a bar between them.
inline Text paths_of(const Tree& tree) {
  Text all;
  for (const auto& [path, content] : tree) all += (all.empty() ? u"" : u"|") + path;
  return all;
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
  return code_of([&] { pack(archive, items, options, *real_folders(), progress); });
}

inline Code unpack_files(const Text& archive, const Text& destination, const UnpackingOptions& options = {},
                         const PasswordQuestion& ask = {}, Progress progress = Progress()) {
  Folders& folders = *real_folders();
  return code_of(
      [&] { Archive(archive, folders).extract(destination, options, folders, *real_files(), ask, progress); });
}

inline Code test_file(const Text& archive, const UnpackingOptions& options = {}, const PasswordQuestion& ask = {}) {
  Progress progress;
  return code_of([&] { Archive(archive, *real_folders()).test(options, ask, progress); });
}

/// A folder of its own for each test, with an archive in it.
struct ArchiveTest : ::testing::Test {
  /// What an archive unpacks to.
  static Tree unpacked(const Text& archive, const Text& password = {}) {
    const Text target = scratch_folder();
    EXPECT_EQ(unpack_files(archive, target, {.password = password}), Code::ok);
    EXPECT_EQ(test_file(archive, {.password = password}), Code::ok);
    return read_tree(target);
  }

  Text folder = scratch_folder();
  Text archive = folder + u"a.zip";
};

}  // namespace talutil::archives::testing
