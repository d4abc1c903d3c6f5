// Checks what must hold for any name converted to another case: case_fuzz -max_len=512 -runs=1000000
#include <algorithm>

#include "controls/name_case.hpp"
#include "fuzz/host.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

using fuzz::require;

/// The letter regardless of its case, including the final sigma.
char16_t folded(char16_t unit) { return upper_case(unit == u'\u03C2' ? u'\u03C3' : unit); }

void check(fuzz::Input input) {
  const auto style = static_cast<std::int16_t>(input.byte() % 5);
  const Text text = input.text(255);
  const Text named = name_case(text);
  require(std::ranges::equal(named, text, {}, folded, folded), "only the case of letters changes");
  require(name_case(named) == named, "a name in name case stays");
  require(name_case(upper_case(text)) == name_case(lower_case(upper_case(text))),
          "the case of the input plays no part");

  static fuzz::Host host;
  ORVUtils& utils = host.utils();
  host.settings().iCharactercase = host.settings().iCharacterCaseSuburbs = style;
  const Text cleaned = utils.VerifyTextData(0, 0, text);
  const Variant suburb = utils.ConvertCaseSuburbs(text);
  const bool is_cased = !cleaned.empty() && (style == 1 || style == 3);
  require(suburb == Variant(!is_cased ? text : style == 1 ? name_case(cleaned) : upper_case(cleaned)), "a suburb");
  (void)utils.ConvertCase(1, text);
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  talutil::check({data, size, u"macMCoO'\u00B4\u2019 - ,.1stvanderXIIPOnsw\r\n\u00C9\u00E9\u03A3\u03C3"});
  return 0;
}
