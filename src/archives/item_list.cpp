#include "archives/item_list.hpp"

#include <algorithm>

#include "platform/file_names.hpp"

namespace talutil::archives {

namespace {

constexpr TextView blanks = u" \t\r\n";

bool item_matches(const std::vector<Text>& item, const std::vector<Text>& entry) {
  if (item.size() == 1 && name_matches(entry.back(), item.front())) return true;
  return item.size() <= entry.size() &&
         std::equal(item.begin(), item.end(), entry.begin(),
                    [](const Text& pattern, const Text& part) { return name_matches(part, pattern); });
}

}  // namespace

std::vector<Text> read_item_list(TextView list) {
  std::vector<Text> items;
  Text item;
  bool is_quoted = false;
  for (const char16_t unit : list) {
    if (unit == u'"') {
      is_quoted = !is_quoted;
    } else if (is_quoted || blanks.find(unit) == TextView::npos) {
      item += unit;
    } else if (!item.empty()) {
      items.push_back(std::move(item));
      item.clear();
    }
  }
  if (!item.empty()) items.push_back(std::move(item));
  return items;
}

std::vector<Text> parts_of(TextView path, TextView between) {
  std::vector<Text> parts;
  while (!path.empty()) {
    const std::size_t end = std::min(path.find_first_of(between), path.size());
    const TextView part = path.substr(0, end);
    path.remove_prefix(std::min(end + 1, path.size()));
    if (!part.empty() && part != u".") parts.emplace_back(part);
  }
  return parts;
}

EntryFilter::EntryFilter(TextView list) {
  for (const Text& item : read_item_list(list)) {
    if (auto parts = parts_of(item); !parts.empty()) items_.push_back(std::move(parts));
  }
}

bool EntryFilter::matches(const std::vector<Text>& entry) const {
  if (items_.empty()) return true;
  return !entry.empty() && std::ranges::any_of(items_, [&](const auto& item) { return item_matches(item, entry); });
}

}  // namespace talutil::archives
