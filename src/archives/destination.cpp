#include "archives/destination.hpp"

#include <span>

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

/// The key under which a folder is cached; no part contains a separator.
Text key_of(std::span<const Text> parts) {
  Text key;
  for (const Text& part : parts) key += upper_case(part) + u"\\";
  return key;
}

}  // namespace

Destination::Destination(Folders& folders, Files& files, const Text& path) {
  with_code(Code::cannot_create, [&] {
    files.make_path(path + u"\\");
    root_ = folders.open(path);
    read({}, {});
  });
}

Folder& Destination::open(const Place& place) {
  if (place.parts.empty()) return *root_;
  if (opened_place_ == &place) return *opened_;
  std::unique_ptr<Folder> folder;
  for (const Text& part : place.parts) folder = (folder ? *folder : *root_).folder(part, false);
  opened_ = std::move(folder);
  opened_place_ = &place;
  return *opened_;
}

Destination::Place& Destination::read(const Text& key, std::vector<Text> parts) {
  Place& place = places_.emplace(key, Place{std::move(parts), {}}).first->second;
  open(place).list([&](TextView name, const FileFacts& facts) {
    place.entries.emplace(upper_case(Text(name)), Known{Text(name), facts.kind});
  });
  return place;
}

Destination::Place* Destination::place_of(std::span<const Text> parts) {
  const Text key = key_of(parts);
  if (const auto found = places_.find(key); found != places_.end()) return &found->second;
  Place* const above = place_of(parts.first(parts.size() - 1));
  if (above == nullptr) return nullptr;
  const Text& name = parts.back();
  if (!above->entries.contains(upper_case(name))) static_cast<void>(open(*above).folder(name, true));
  const auto known = above->entries.try_emplace(upper_case(name), Known{name, FileKind::folder}).first;
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
    const auto [found, is_new] = place->entries.try_emplace(upper_case(parts.back()), Known{parts.back()});
    Known& known = found->second;
    if (!is_new) {
      if (known.kind != FileKind::file || known.is_written) return Answer::refused;
      if (!overwrite) return Answer::kept;
    }
    known.is_written = true;
    file = open(*place).create(known.name);
    return Answer::made;
  });
}

bool Destination::make_folder(const std::vector<Text>& parts, const FileFacts& facts) {
  return unless_refused(false, [&] {
    const Place* const place = place_of(parts);
    if (place != nullptr) finished_later_.emplace_back(place->parts, facts);
    return place != nullptr;
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
