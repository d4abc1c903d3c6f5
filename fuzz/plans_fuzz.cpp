// Checks what must hold for any plan, and for settings as they are exported: plans_fuzz -max_len=512 -runs=1000000
#include <algorithm>
#include <optional>
#include <set>

#include "cli/escapes.hpp"
#include "cli/failure.hpp"
#include "cli/plan.hpp"
#include "fuzz/input.hpp"
#include "library/interface_table.hpp"
#include "platform/profile_document.hpp"

namespace talutil {
namespace {

using fuzz::require;

void check_plan(std::string_view text) {
  // Those two read a file and the standard input.
  if (text.find("@file:") != std::string_view::npos || text.find("@-") != std::string_view::npos) return;
  try {
    std::set<std::string> names;
    for (const auto& column : cli::read_plan(text, described<ORVUtils>, plain_numbers)) {
      require(names.insert(column.name).second, "a column stands once");
      require(!column.steps.empty(), "a column has a step");
      for (const auto& step : column.steps) {
        require(step.value_place < step.arguments.size(), "a step takes the value");
        require(step.arguments.size() <= step.member->parameters().size(), "and no more than its member does");
      }
    }
  } catch (const cli::Failure& failure) {
    require(std::string_view(failure.what()).starts_with("line "), "a failure gives its line");
  }
}

void check_escapes(const Text& item, const Text& value) {
  using namespace cli::escapes;
  const Text written_item = write(item);
  const Text written_value = write(value);
  require(read(written_item) == item && read(written_value) == value, "what was escaped comes back");
  const std::string bytes = "\xEF\xBB\xBF[s]\r\n" + to_utf8(written_item) + "=" + to_utf8(written_value) + "\r\n";
  const auto entries = ProfileDocument(bytes).entries();
  require(entries.size() == 1 && read(entries[0].item) == item && read(entries[0].value) == value,
          "and does so from a profile file");
  try {
    require(read(write(read(value))) == read(value), "what is read can be written");
  } catch (const cli::Failure&) {
    require(value.find(u'\\') != Text::npos, "only a backslash is refused");
  }
}

void check(fuzz::Input input) {
  const Text item = input.text(12);
  const Text value = input.text(40);
  check_escapes(item, value);
  check_plan(input.rest());
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace std::string_view_literals;
  talutil::check({data, size,
                  u"\\\\u00"
                  u"Aau b=;[]\"'\t\0\r\n\u00E9\U0001F600\uFEFF"sv});
  return 0;
}
