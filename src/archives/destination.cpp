#include "archives/destination.hpp"

#include <algorithm>

#include "archives/file_errors.hpp"

namespace talutil::archives {

namespace {

/// Runs the work on one entry. If the platform cannot have a file of that name, returns `refused`, so that the entries
/// after it are not lost as well.
template <class Answer, class Work>
Answer unless_refused(Answer refused, Work&& work) {
  return with_code(Code::cannot_create, [&] {
    try {
      return work();
    } catch (const RunTimeError& error) {
      if (!error.is(ErrorNumber::bad_file_name_or_number)) throw;
      return refused;
    }
  });
}

}  // namespace

Destination::Destination(Folders& folders, Files& files, const Text& path) : ignores_case_(folders.ignores_case()) {
  with_code(Code::cannot_create, [&] {
    files.make_path(path + u"\\");
    root_ = folders.open(path);
    read({}, {});
  });
}

Text Destination::key_of(const Text& name) const { return ignores_case_ ? upper_case(name) : name; }

/// The key under which a folder is cached; no part contains a slash.
Text Destination::key_of(std::span<const Text> parts) const {
  Text key;
  for (const Text& part : parts) key += key_of(part) + u"/";
  return key;
}

Folder& Destination::open(const Place& place) {
  const auto [way, opened] = std::ranges::mismatch(place.parts, opened_, {}, {}, &Opened::name);
  opened_.erase(opened, opened_.end());
  for (auto part = way; part != place.parts.end(); ++part) {
    Folder& above = opened_.empty() ? *root_ : *opened_.back().folder;
    opened_.push_back({*part, above.folder(*part, false)});
  }
  return opened_.empty() ? *root_ : *opened_.back().folder;
}

Destination::Place& Destination::read(const Text& key, std::vector<Text> parts) {
  Place& place = places_.emplace(key, Place{std::move(parts), {}}).first->second;
  open(place).list([&](TextView name, const FileFacts& facts) {
    place.entries.emplace(key_of(Text(name)), Known{Text(name), facts.kind});
  });
  return place;
}

Destination::Place* Destination::place_of(std::span<const Text> parts) {
  const Text key = key_of(parts);
  if (const auto found = places_.find(key); found != places_.end()) return &found->second;
  Place* const above = place_of(parts.first(parts.size() - 1));
  if (above == nullptr) return nullptr;
  const Text& name = parts.back();
  if (!above->entries.contains(key_of(name))) static_cast<void>(open(*above).folder(name, true));
  const auto known = above->entries.try_emplace(key_of(name), Known{name, FileKind::folder, name}).first;
  if (known->second.kind != FileKind::folder) return nullptr;
  std::vector<Text> spelled = above->parts;
  spelled.push_back(known->second.name);
  return &read(key, std::move(spelled));
}

Destination::Answer Destination::create(const std::vector<Text>& parts, bool overwrite,
                                        std::unique_ptr<NewFile>& file) {
  return unless_refused(Answer::refused, [&] {
    Place* const place = place_of(std::span(parts).first(parts.size() - 1));
    if (place == nullptr) return Answer::refused;
    const auto [found, is_new] = place->entries.try_emplace(key_of(parts.back()), Known{parts.back()});
    Known& known = found->second;
    if (!is_new) {
      const bool is_twin = !known.written_as.empty() && known.written_as != parts.back();
      if (known.kind != FileKind::file || is_twin) return Answer::refused;
      if (!overwrite && known.written_as.empty()) return Answer::kept;
    }
    known.written_as = parts.back();
    file = open(*place).create(known.name);
    return Answer::made;
  });
}

bool Destination::has_written(const std::vector<Text>& parts) const {
  const auto place = places_.find(folder_of(parts));
  if (place == places_.end()) return false;
  const auto known = place->second.entries.find(key_of(parts.back()));
  return known != place->second.entries.end() && !known->second.written_as.empty();
}

bool Destination::make_folder(const std::vector<Text>& parts, const FileFacts& facts) {
  return unless_refused(false, [&] {
    const Place* const place = place_of(parts);
    if (place == nullptr) return false;
    // A folder that was there before keeps its rights.
    const Place& above = *place_of(std::span(parts).first(parts.size() - 1));
    if (!above.entries.at(key_of(parts.back())).written_as.empty()) finished_later_.emplace_back(place->parts, facts);
    return true;
  });
}

void Destination::finish_folders() {
  with_code(Code::cannot_create, [&] {
    // In an archive, inner folders come after the outer ones.
    for (auto folder = finished_later_.rbegin(); folder != finished_later_.rend(); ++folder) {
      const auto& [parts, facts] = *folder;
      const Place* const above = place_of(std::span(parts).first(parts.size() - 1));
      open(*above).set_facts(parts.back(), facts);
    }
  });
}

}  // namespace talutil::archives
