#pragma once

#include <memory>
#include <vector>

#include "archives/passed_over.hpp"
#include "platform/folders.hpp"

namespace talutil::archives {

/// A file or folder to be packed.
struct Item {
  std::size_t folder = 0;  ///< The folder it is in: an index into Collection's places.
  Text name;               ///< Its name in that folder.
  std::string entry;       ///< Its name in the archive: UTF-8, "/" between the parts and at the end of a folder's name.
  FileFacts facts;
};

/// The files and folders that a list of items refers to. Folders are walked once and opened again when their files
/// are packed, so that a deep or wide tree never keeps more than a few of them open.
class Collection {
 public:
  /// The archive being written, which is never packed into itself.
  struct Archive {
    Text folder;
    Text name;
  };

  Collection(Folders& folders, Archive archive) : folders_(folders), archive_(std::move(archive)) {}

  /// Adds what an item refers to: a file; a folder with its tree, stored under the folder's own name; or, with
  /// wildcards in its last part, the matching files (and folders if `recurse` is set), stored relative to the folder
  /// before the wildcards. With `keep_folders` false, entries have no folder part in their names and folders get no
  /// entries. Returns whether anything matched.
  bool add(const Text& item, bool recurse, bool keep_folders);

  [[nodiscard]] const std::vector<Item>& items() const noexcept { return items_; }

  /// What was found, but has a name that no archive could restore.
  [[nodiscard]] const PassedOver& left_out() const noexcept { return left_out_; }

  /// Removes the duplicates of files that several items referred to. Fails with bad_parameters if two different files
  /// would have the same name in the archive, since leaving one out would lose it.
  void drop_repeated();

  /// The folder that an item is in. It stays open until the next call.
  [[nodiscard]] Folder& folder_of(const Item& item);

 private:
  /// A folder: its name and its parent, or its path if it has no parent.
  struct Place {
    std::size_t parent = 0;
    Text name;
    bool is_first = false;
  };
  struct Pending {
    std::size_t folder;
    std::string prefix;
  };

  void add_entry(std::size_t folder, TextView name, const FileFacts& facts, const std::string& prefix, bool recurse,
                 bool keep_folders);
  void walk(bool keep_folders);
  [[nodiscard]] std::unique_ptr<Folder> open(std::size_t place);
  [[nodiscard]] bool is_archive(Folder& folder, TextView name) const;

  Folders& folders_;
  Archive archive_;
  std::vector<Place> places_;
  std::vector<Item> items_;
  PassedOver left_out_;
  std::vector<Pending> pending_;
  std::unique_ptr<Folder> opened_;
  std::size_t opened_place_ = 0;
};

}  // namespace talutil::archives
