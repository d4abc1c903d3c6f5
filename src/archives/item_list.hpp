#pragma once

#include <vector>

#include "automation/text.hpp"

/// Lists of items: names separated by blanks, those with blanks in double quotes, wildcards in the last part.
namespace talutil::archives {

[[nodiscard]] std::vector<Text> read_item_list(TextView list);

/// The parts between separators; empty ones and "." are left out.
[[nodiscard]] std::vector<Text> parts_of(TextView path);

/// Which entries of an archive are asked for. An item of one part is compared with an entry's last part; any item with
/// the first parts of an entry as well, so that a folder stands for its tree. An empty list and "*.*" mean all.
class EntryFilter {
 public:
  explicit EntryFilter(TextView list);
  [[nodiscard]] bool matches(const std::vector<Text>& entry) const;

 private:
  std::vector<std::vector<Text>> items_;
};

}  // namespace talutil::archives
