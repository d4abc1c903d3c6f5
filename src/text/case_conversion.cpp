#include <algorithm>

#include "automation/control.hpp"
#include "controls/control_factory.hpp"
#include "controls/name_case_converter.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

/// The case styles of iCharactercase and iCharacterCaseSuburbs; any other value leaves the text unchanged.
constexpr std::int16_t style_none = 0;
constexpr std::int16_t style_name = 1;
constexpr std::int16_t style_lower = 2;
constexpr std::int16_t style_upper = 3;

/// Uses a converter of its own, which is released before this returns.
Text in_name_case(const ORVUtils& utils, const Text& text) {
  const Control converter(utils.library().controls().create(NameCaseConverter::class_name), utils.locale());
  return converter.call(u"NameCase", {text}).to_text(converter.locale());
}

bool has_machinery(TextView text) noexcept {
  constexpr TextView machinery = u"MACHINERY";
  const auto is_letter = [](char16_t unit, char16_t letter) { return upper_case(unit) == letter; };
  return std::search(text.begin(), text.end(), machinery.begin(), machinery.end(), is_letter) != text.end();
}

bool names_machinery(const ORVUtils& utils, const Variant& value) {
  if (const auto* const text = value.get_if<Text>()) return has_machinery(*text);
  const Variant plain = value.value();
  return !plain.is_null() && has_machinery(plain.to_text(utils.locale()));
}

}  // namespace

Variant ORVUtils::ConvertCase(const std::int16_t& iFlag, const Variant& vStr) {
  if (names_machinery(*this, vStr)) return vStr;
  const std::int16_t style = settings().iCharactercase;
  if (style <= style_none) return vStr;
  const Text s = VerifyTextData(0, 0, vStr);
  if (s.empty()) return vStr;
  if (iFlag == 1 || style == style_name) return in_name_case(*this, s);
  if (style == style_lower) return lower_case(s);
  if (style == style_upper) return upper_case(s);
  return vStr;
}

Variant ORVUtils::ConvertCaseSuburbs(const Variant& vStr) {
  const std::int16_t style = settings().iCharacterCaseSuburbs;
  if (style <= style_none) return vStr;
  const Text s = VerifyTextData(0, 0, vStr);
  if (s.empty()) return vStr;
  if (style == style_name) return in_name_case(*this, s);
  if (style == style_upper) return upper_case(s);
  return vStr;
}

}  // namespace talutil
