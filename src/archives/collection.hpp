#pragma once

#include <memory>
#include <vector>

#include "platform/folders.hpp"

namespace talutil::archives {

/// A file or folder to be packed.
struct Item {
  std::size_t folder = 0;  ///< Where it lies: a place in Collection's folders.
  Text name;               ///< In that folder.
  std::string entry;       ///< Its name in the archive: UTF-8, parts joined by "/", a folder's with one at its end.
  FileFacts facts;
};

/// What the items of a list lead to. The folders are walked once and opened again when their files are packed, so
/// that a deep or wide tree does not hold more than a few of them open.
class Collection {
 public:
  /// Where the archive itself lies: it is never packed into itself.
  struct Archive {
    Text folder;
    Text name;
  };

  Collection(Folders& folders, Archive archive) : folders_(folders), archive_(std::move(archive)) {}

  /// Adds what an item means: a file, a folder with its tree under the folder's own name, or by wildcards in its last
  /// part several files, and folders with `recurse`, named relative to the folder before the wildcards. With
  /// `keep_folders` false the names of all have their last part only, and folders are no entries.
  void add(const Text& item, bool recurse, bool keep_folders);

  [[nodiscard]] const std::vector<Item>& items() const noexcept { return items_; }

  /// Keeps one of each file that several items of the list led to. Fails with bad_parameters for two files that would
  /// have one name in the archive: leaving one out would lose it.
  void drop_repeated();

  /// The folder of an item. The last one stays open for the next call.
  [[nodiscard]] Folder& folder_of(const Item& item);

 private:
  /// A folder by its parent and its name there; one without a parent by its path.
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
  std::vector<Pending> pending_;
  std::unique_ptr<Folder> opened_;
  std::size_t opened_place_ = 0;
};

}  // namespace talutil::archives
