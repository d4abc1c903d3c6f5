#include "archives/collection.hpp"

#include <algorithm>
#include <unordered_map>

#include "archives/file_errors.hpp"
#include "platform/file_names.hpp"

namespace talutil::archives {

namespace {

bool is_missing(const RunTimeError& error) {
  const auto number = static_cast<ErrorNumber>(error.number());
  return number == ErrorNumber::path_not_found || number == ErrorNumber::file_not_found ||
         number == ErrorNumber::bad_file_name_or_number;
}

Text without_separators_at_end(Text path) {
  while (path.size() > 1 && separators.find(path.back()) != TextView::npos) path.pop_back();
  return path;
}

}  // namespace

bool Collection::add(const Text& item, bool recurse, bool keep_folders) {
  const Text path = without_separators_at_end(item);
  TextView pattern = last_part(path);
  const Text folder_path = path.substr(0, path.size() - pattern.size());
  // "C:\", "." and ".." do not name a folder to pack; its contents are meant.
  const bool is_nameless = pattern.empty() || pattern == u"." || pattern == u"..";
  places_.push_back({0, is_nameless ? path : folder_path, true});
  const std::size_t place = places_.size() - 1;
  if (is_nameless) pattern = u"*.*";
  bool has_matched = false;
  try {
    opened_ = open(place);
    opened_place_ = place;
    const auto found = [&](TextView name, const FileFacts& facts) {
      if (name_matches(name, pattern) && !is_archive(*opened_, name)) {
        has_matched = true;
        add_entry(place, name, facts, {}, recurse, keep_folders);
      }
    };
    const bool is_plain = pattern.find_first_of(u"*?") == TextView::npos;
    if (const auto known = is_plain ? opened_->facts(pattern) : std::nullopt) {
      found(pattern, *known);
    } else {
      opened_->list(found);
    }
  } catch (const RunTimeError& error) {
    // A missing path simply matches nothing.
    if (!is_missing(error)) throw Error(Code::cannot_read, to_utf8(item) + ": " + error.what());
    return false;
  }
  walk(keep_folders);
  return has_matched;
}

void Collection::add_entry(std::size_t folder, TextView name, const FileFacts& facts, const std::string& prefix,
                           bool recurse, bool keep_folders) {
  const bool has_control_character = std::ranges::any_of(name, [](char16_t unit) { return unit < u' '; });
  if (facts.kind == FileKind::unnameable || has_control_character) return left_out_.add(from_utf8(prefix) + Text(name));
  // Left by a run of the library that was killed.
  if (name.starts_with(temporary_prefix)) return;
  if (facts.kind == FileKind::file) {
    items_.push_back({folder, Text(name), prefix + to_utf8(name), facts});
  } else if (facts.kind == FileKind::folder && recurse) {
    std::string below = keep_folders ? prefix + to_utf8(name) + "/" : std::string();
    if (keep_folders) items_.push_back({folder, Text(name), below, facts});
    places_.push_back({folder, Text(name), false});
    pending_.push_back({places_.size() - 1, std::move(below)});
  }
}

void Collection::walk(bool keep_folders) {
  while (!pending_.empty()) {
    const Pending next = std::move(pending_.back());
    pending_.pop_back();
    with_code(Code::cannot_read, from_utf8(next.prefix), [&] {
      const std::unique_ptr<Folder> folder = open(next.folder);
      folder->list([&](TextView name, const FileFacts& facts) {
        if (!is_archive(*folder, name)) add_entry(next.folder, name, facts, next.prefix, true, keep_folders);
      });
    });
  }
}

void Collection::drop_repeated() {
  std::vector<Item> kept;
  kept.reserve(items_.size());
  std::unordered_map<std::string, std::size_t> seen;
  for (Item& item : items_) {
    const auto [found, is_new] = seen.emplace(item.entry, kept.size());
    if (is_new) {
      kept.push_back(std::move(item));
      continue;
    }
    const Item& first = kept[found->second];
    const bool is_same = with_code(Code::cannot_read, [&] {
      if (first.name != item.name) return false;
      if (first.folder == item.folder) return true;
      // Not in one expression: only the most recent folder stays open.
      const Text first_path = folder_of(first).path();
      return first_path == folder_of(item).path();
    });
    if (!is_same) throw Error(Code::bad_parameters, item.entry + ": two files would have this name in the archive");
  }
  items_ = std::move(kept);
}

std::unique_ptr<Folder> Collection::open(std::size_t place) {
  if (places_[place].is_first) return folders_.open(places_[place].name);
  std::vector<std::size_t> way;
  for (; !places_[place].is_first; place = places_[place].parent) way.push_back(place);
  std::unique_ptr<Folder> folder = folders_.open(places_[place].name);
  for (auto step = way.rbegin(); step != way.rend(); ++step) folder = folder->folder(places_[*step].name, false);
  return folder;
}

bool Collection::is_archive(Folder& folder, TextView name) const {
  if (!folders_.ignores_case()) return name == archive_.name && folder.path() == archive_.folder;
  return equals_without_case(name, archive_.name) && equals_without_case(folder.path(), archive_.folder);
}

Folder& Collection::folder_of(const Item& item) {
  if (!opened_ || opened_place_ != item.folder) {
    opened_ = open(item.folder);
    opened_place_ = item.folder;
  }
  return *opened_;
}

}  // namespace talutil::archives
