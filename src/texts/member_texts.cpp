#include "texts/member_texts.hpp"

#include <algorithm>
#include <stdexcept>
#include <string>

namespace talutil::texts {

const ClassText& text_of(std::string_view class_name) {
  const auto classes = all_classes();
  const auto found = std::ranges::find(classes, class_name, [](const ClassText& entry) { return entry.text.name; });
  if (found == classes.end()) throw std::logic_error("no texts for the class " + std::string(class_name));
  return *found;
}

const MemberText& text_of(const ClassText& owner, std::string_view member) {
  const auto found = std::ranges::find(owner.members, member, &MemberText::name);
  if (found == owner.members.end()) {
    throw std::logic_error("no text for " + std::string(owner.text.name) + "." + std::string(member));
  }
  return *found;
}

}  // namespace talutil::texts
