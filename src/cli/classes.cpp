#include "cli/classes.hpp"

#include <algorithm>

#include "cli/failure.hpp"
#include "controls/common_dialog.hpp"
#include "controls/grid.hpp"
#include "controls/zip_controls.hpp"
#include "library/c_control_position.hpp"
#include "library/identity.hpp"
#include "library/interface_table.hpp"

namespace talutil::cli {

namespace {

constexpr std::span<const Member> tables[] = {described<ORVUtils>,   described<cControlPosition>,
                                              described<Grid>,       described<CommonDialog>,
                                              described<ZipControl>, described<UnzipControl>};
static_assert(std::size(tables) == std::size(identity::classes), "a table for each class");

std::optional<Entry> member_of(const PublishedClass& owner, std::string_view name) {
  const auto entries = entries_of(owner.members);
  const auto found =
      std::ranges::find_if(entries, [&](const Entry& entry) { return same_name(entry.any().name, name); });
  return found == entries.end() ? std::nullopt : std::optional(*found);
}

/// A class by its name or its ProgID.
const PublishedClass* class_named(const std::vector<PublishedClass>& classes, std::string_view name) {
  const auto found = std::ranges::find_if(classes, [&](const PublishedClass& entry) {
    return same_name(entry.name(), name) || same_name(entry.program_id, name);
  });
  return found == classes.end() ? nullptr : &*found;
}

}  // namespace

std::string PublishedClass::full_name(const Entry& entry) const {
  const std::string member(entry.any().name);
  return members.data() == tables[0].data() ? member : std::string(name()) + "." + member;
}

std::vector<PublishedClass> published_classes() {
  std::vector<PublishedClass> classes;
  for (std::size_t i = 0; i < std::size(tables); ++i) {
    const std::string_view program_id = identity::classes[i].program_id;
    const std::string_view name = program_id.substr(program_id.find('.') + 1);
    classes.push_back({program_id, tables[i], &texts::text_of(name)});
  }
  return classes;
}

std::vector<Entry> family_of(const PublishedClass& owner, std::string_view family) {
  std::vector<Entry> entries = entries_of(owner.members);
  std::erase_if(entries, [&](const Entry& entry) { return owner.text_of(entry).family != family; });
  std::ranges::sort(entries, std::ranges::less(), [](const Entry& entry) { return entry.any().name; });
  return entries;
}

std::string family_title(std::string_view family) {
  std::string title(family);
  if (!title.empty() && title.front() >= 'a' && title.front() <= 'z') title.front() += 'A' - 'a';
  return title;
}

Subject find_subject(std::string_view name) {
  const auto classes = published_classes();
  if (const PublishedClass* const found = class_named(classes, name)) return {*found, {}};
  if (const auto dot = name.rfind('.'); dot != std::string_view::npos) {
    if (const PublishedClass* const owner = class_named(classes, name.substr(0, dot))) {
      return {*owner, find_entry(owner->members, name.substr(dot + 1))};
    }
  }
  std::vector<Subject> found;
  for (const PublishedClass& owner : classes) {
    if (const auto member = member_of(owner, name)) found.push_back({owner, member});
    if (found.size() == 1 && &owner == &classes.front()) return found.front();
  }
  if (found.size() == 1) return found.front();
  if (found.empty()) return {classes.front(), find_entry(classes.front().members, name)};  // Raises, with near names.
  std::string choices;
  for (const Subject& subject : found) {
    choices += (choices.empty() ? "" : ", ") + subject.owner.full_name(*subject.member);
  }
  throw usage_failure("\"" + std::string(name) + "\" is a member of several classes; write one of " + choices);
}

}  // namespace talutil::cli
