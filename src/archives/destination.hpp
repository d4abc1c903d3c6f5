#pragma once

#include <memory>
#include <unordered_map>
#include <vector>

#include "platform/folders.hpp"

namespace talutil::archives {

/// The folder that an archive is unpacked below. It knows what is in each folder that it was asked for, by names
/// without regard to case, so that a name is looked for once however many entries there are.
class Destination {
 public:
  Destination(Folders& folders, Files& files, const Text& path);

  enum class Answer : std::uint8_t { made, kept, refused };

  /// Begins a file. `kept` when there is one that is not to be overwritten; `refused` where a folder or a link stands
  /// in the way, or a file that this run has written.
  [[nodiscard]] Answer create(const std::vector<Text>& parts, bool overwrite, std::unique_ptr<NewFile>& file);

  /// Makes a folder with those above it. False where a file or a link stands in the way.
  bool make_folder(const std::vector<Text>& parts, const FileFacts& facts);

  /// Gives the folders that were asked for their times and rights: what was written into them has changed both.
  void finish_folders();

 private:
  struct Known {
    Text name;  ///< As it is spelled there.
    FileKind kind = FileKind::file;
    bool is_written = false;
  };
  struct Place {
    std::vector<Text> parts;  ///< As they are spelled.
    std::unordered_map<Text, Known> entries;
  };

  [[nodiscard]] Place* place_of(std::span<const Text> parts);
  [[nodiscard]] Folder& open(const Place& place);
  Place& read(const Text& key, std::vector<Text> parts);

  std::unique_ptr<Folder> root_;
  std::unordered_map<Text, Place> places_;
  std::unique_ptr<Folder> opened_;
  const Place* opened_place_ = nullptr;
  std::vector<std::pair<std::vector<Text>, FileFacts>> finished_later_;
};

}  // namespace talutil::archives
