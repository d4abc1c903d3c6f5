#pragma once

#include <memory>
#include <span>
#include <unordered_map>
#include <vector>

#include "platform/folders.hpp"

namespace talutil::archives {

/// The folder that an archive is unpacked into. Caches the contents of each folder it has visited, so that each is
/// listed only once, however many entries there are. Names that differ in case are one name where the platform says so.
class Destination {
 public:
  Destination(Folders& folders, Files& files, const Text& path);

  enum class Answer : std::uint8_t { made, kept, refused };

  /// Creates a file. Returns `kept` if it exists and must not be overwritten, `refused` if a folder or a link is in the
  /// way, or a file that this run has written under a name that differs in case. Of several entries of one name the
  /// last one remains.
  [[nodiscard]] Answer create(const std::vector<Text>& parts, bool overwrite, std::unique_ptr<NewFile>& file);

  /// Whether this run has created the file already. Writers of one file take turns, so it must have its name by then.
  [[nodiscard]] bool has_written(const std::vector<Text>& parts) const;

  /// The folder of a file as a key: the same for all files in it.
  [[nodiscard]] Text folder_of(const std::vector<Text>& parts) const {
    return key_of(std::span(parts).first(parts.size() - 1));
  }

  /// Creates a folder and its parents. Returns false if a file or a link is in the way.
  bool make_folder(const std::vector<Text>& parts, const FileFacts& facts);

  /// Sets the times and rights of the folders that this run has made; writing files into them has changed both.
  void finish_folders();

 private:
  struct Known {
    Text name;  ///< As spelled on disk.
    FileKind kind = FileKind::file;
    Text written_as{};  ///< The name of the entry that this run has written it from.
  };
  struct Place {
    std::vector<Text> parts;  ///< As spelled on disk.
    std::unordered_map<Text, Known> entries;
  };

  [[nodiscard]] Text key_of(const Text& name) const;
  [[nodiscard]] Text key_of(std::span<const Text> parts) const;
  [[nodiscard]] Place* place_of(std::span<const Text> parts);
  [[nodiscard]] Folder& open(const Place& place);
  Place& read(const Text& key, std::vector<Text> parts);

  struct Opened {
    Text name;
    std::unique_ptr<Folder> folder;
  };

  bool ignores_case_;
  std::unique_ptr<Folder> root_;
  std::unordered_map<Text, Place> places_;
  std::vector<Opened> opened_;  ///< The way from the root to the folder used last.
  std::vector<std::pair<std::vector<Text>, FileFacts>> finished_later_;
};

}  // namespace talutil::archives
