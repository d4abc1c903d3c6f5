// Checks what must hold for any profile file and any item put into it: profiles_fuzz -max_len=512 -runs=1000000
#include <algorithm>

#include "fuzz/input.hpp"
#include "platform/profile_document.hpp"

namespace talutil {
namespace {

using fuzz::require;

Text without(Text text, TextView units) {
  std::erase_if(text, [&](char16_t unit) { return units.find(unit) != TextView::npos; });
  return text;
}

bool is_blank(char16_t unit) { return (unit >= 9 && unit <= 13) || unit == 32 || unit == 26; }

/// What is read of a value: without blanks around it, and without one pair of quotes.
Text as_read(TextView value) {
  value = up_to_nul(value);
  while (!value.empty() && is_blank(value.front())) value.remove_prefix(1);
  while (!value.empty() && is_blank(value.back())) value.remove_suffix(1);
  const bool is_quoted = value.size() > 1 && (value[0] == u'"' || value[0] == u'\'') && value[0] == value.back();
  return Text(is_quoted ? value.substr(1, value.size() - 2) : value);
}

void check(fuzz::Input input) {
  // Names that a line can hold, and that are not a comment's or a header's.
  const Text section = without(input.text(12), u"\r\n");
  const Text item = without(input.text(12), u"\r\n=;[");
  const Text value = without(input.text(24), u"\r\n");
  ProfileDocument document(input.rest());
  const auto before = document.entries();
  require(ProfileDocument(document.bytes()).entries() == before, "the bytes written hold the same items");
  for (const auto& entry : before) (void)document.item_names(entry.section);

  document.put(section, item, value);
  require(document.value(section, item) == as_read(value), "what was put is read");
  const auto after = document.entries();
  require(after.size() == before.size() || after.size() == before.size() + 1, "one item at most is added");
  const auto first = std::ranges::mismatch(before, after).in1 - before.begin();
  const auto last = std::mismatch(before.rbegin(), before.rend() - first, after.rbegin()).first - before.rbegin();
  require(before.size() - static_cast<std::size_t>(first + last) <= (after.size() == before.size() ? 1 : 0),
          "all other items stay");
  if (is_ascii(section + item + value)) {
    require(ProfileDocument(document.bytes()).entries() == after, "and are in the bytes written");
  }
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace std::string_view_literals;
  talutil::check({data, size, u"aA b=;[]\"'\t\0\u001A\r\n\u00E9\u0142"sv});
  return 0;
}
