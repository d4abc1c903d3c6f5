#include "automation/control.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

// Values of msgFlag; any other is neither.
constexpr std::int16_t report_failure = 1;
constexpr std::int16_t select_found = 2;

constexpr std::int32_t not_found = -1;

/// Makes the control search its first column; returns its SearchIndex.
Variant search(const Control& combo, const Variant& text, std::int32_t method) {
  constexpr std::int16_t first_column = 0;
  constexpr std::int32_t start = 0;
  combo.put(u"SearchText", text);
  combo.put(u"ColumnSearch", first_column);
  combo.put(u"SearchMethod", method);
  combo.put(u"Action", start);
  return combo.get(u"SearchIndex");
}

/// Selects an entry; returns what the control then reports as selected.
std::int32_t select(const Control& combo, const Variant& index) {
  combo.put(u"ListIndex", index);
  return combo.get<std::int32_t>(u"ListIndex");
}

/// Two blanks before the bracket, as users know the message. A Null text counts as empty.
void report(const Control& combo, MessageBoxes& boxes) {
  const Variant value = combo.get(u"Text").value();
  const Text text = value.is_null() ? Text() : value.to_text(combo.locale());
  boxes.show(u"The Dropdown List text  ['" + text + u"'] is not a valid selection", MessageButtons::ok, {});
}

}  // namespace

std::int32_t ORVUtils::GetComboListIndex(const Variant& cboCombo, const std::int32_t& vBranchUniqueID) {
  const Control combo(cboCombo, locale());
  combo.put(u"Text", u"");
  // Keys are positive; 0 means none.
  if (vBranchUniqueID <= 0) return not_found;
  const auto count = combo.get<std::int32_t>(u"ListCount");
  for (std::int32_t i = 0; i < count; ++i) {
    if (combo.get(u"ItemData", {i}).equals_number(vBranchUniqueID, combo.locale())) return i;
  }
  return not_found;
}

std::int32_t ORVUtils::SearchCombo(const Variant& cboCombo, const std::int16_t& msgFlag) {
  // The control's search method for typed text.
  constexpr std::int32_t typed_text_method = 2;
  constexpr std::int16_t remove_commas = 1;
  const Control combo(cboCombo, locale());
  combo.call(u"Refresh");
  const auto selected = combo.get<std::int16_t>(u"ListIndex");
  const Variant text = combo.get(u"Text");
  // 0 rather than -1, because an empty box is not a failed search.
  if (VerifyTextData(0, remove_commas, text).empty()) return 0;

  const Variant found = search(combo, text, typed_text_method);
  // Without the flag the selection stays, and the result is the selection, not the entry found.
  const std::int32_t result = found.equals_number(not_found, combo.locale())
                                  ? not_found
                                  : select(combo, msgFlag == select_found ? found : Variant(selected));
  if (msgFlag == report_failure && result == not_found) report(combo, library_.platform().message_boxes);
  return result;
}

std::int32_t ORVUtils::SearchComboEx(const Variant& cboCombo, const Text& sFind, const std::int32_t& SearchMethod,
                                     const std::int16_t& msgFlag) {
  constexpr std::int16_t first_entry = 0;
  const Control combo(cboCombo, locale());
  const Variant found = search(combo, sFind, SearchMethod);
  const std::int32_t result = found.equals_number(not_found, combo.locale())
                                  ? not_found
                                  : select(combo, msgFlag == select_found ? found : Variant(first_entry));
  if (msgFlag == report_failure && result == not_found) report(combo, library_.platform().message_boxes);
  return result;
}

}  // namespace talutil
