#pragma once

#include <vector>

#include "automation/text.hpp"
#include "platform/file_names.hpp"

/// Lists of items: names separated by blanks. Names that contain blanks are in double quotes; the last part may have
/// wildcards.
namespace talutil::archives {

[[nodiscard]] std::vector<Text> read_item_list(TextView list);

/// The parts between separators; empty parts and "." are left out.
[[nodiscard]] std::vector<Text> parts_of(TextView path, TextView between = separators);

/// Selects entries of an archive. An item with a single part is compared with the last part of an entry's name. Any
/// item is also compared with the first parts, so that a folder selects its tree. An empty list and "*.*" select all.
class EntryFilter {
 public:
  explicit EntryFilter(TextView list);
  [[nodiscard]] bool matches(const std::vector<Text>& entry) const;

 private:
  std::vector<std::vector<Text>> items_;
};

}  // namespace talutil::archives
