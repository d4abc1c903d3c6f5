#include "archives/entry_names.hpp"

#include <algorithm>

#include "archives/item_list.hpp"
#include "platform/file_names.hpp"

namespace talutil::archives {

namespace {

constexpr std::size_t longest_part = 255;
constexpr std::size_t longest_path = 32'000;
constexpr std::size_t most_parts = 1'000;

/// Replaces whatever has a special meaning to Windows in a part of a path.
Text made_safe(Text part) {
  for (char16_t& unit : part) {
    if (unit < u' ' || TextView(u"<>:\"|?*").find(unit) != TextView::npos) unit = u'_';
  }
  const std::size_t kept = part.find_last_not_of(u" .") + 1;
  std::fill(part.begin() + static_cast<std::ptrdiff_t>(kept), part.end(), u'_');
  return is_device_name(part) ? u"_" + part : part;
}

TextView without_drive(TextView name) {
  const bool has_drive =
      name.size() >= 2 && name[1] == u':' && lower_case(name[0]) >= u'a' && lower_case(name[0]) <= u'z';
  return has_drive ? name.substr(2) : name;
}

bool has_refused_form(TextView name) noexcept {
  return name.find(u'\0') != TextView::npos || name.size() > longest_path;
}

/// Whether parts lead to a place below the destination that is not too deep.
bool are_below(const std::vector<Text>& parts) {
  return !parts.empty() && parts.size() <= most_parts &&
         std::ranges::none_of(parts, [](const Text& part) { return part == u".." || part.size() > longest_part; });
}

}  // namespace

std::optional<std::vector<Text>> safe_parts(TextView name) {
  if (has_refused_form(name)) return std::nullopt;
  std::vector<Text> parts = parts_of(without_drive(name));
  if (!are_below(parts)) return std::nullopt;
  for (Text& part : parts) {
    part = made_safe(std::move(part));
    if (part.size() > longest_part) return std::nullopt;
  }
  return parts;
}

std::optional<std::vector<Text>> own_parts(TextView name) {
  if (has_refused_form(name)) return std::nullopt;
  std::vector<Text> parts = parts_of(name, u"/");
  if (!are_below(parts)) return std::nullopt;
  return parts;
}

bool is_destination(TextView name) { return name.starts_with(u'.') && parts_of(name).empty(); }

}  // namespace talutil::archives
