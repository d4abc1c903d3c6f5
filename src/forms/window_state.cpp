#include "automation/control.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

constexpr TextView state_item = u"WindowState";
constexpr TextView width_item = u"WindowWidth";
constexpr TextView height_item = u"WindowHeight";

constexpr double normal_state = 0;

}  // namespace

void ORVUtils::LoadWindowState(const Variant& frm, const Text& sCFGStr) {
  const Control form(frm, plain_numbers);
  const auto setting = [&](TextView item, const Text& otherwise) {
    return leading_number(GetCfgFileData(sCFGStr, Text(item), otherwise, settings().sNatNameC, Boolean(false)));
  };
  form.put(u"WindowState", setting(state_item, u"0"));
  if (!form.get(u"WindowState").equals_number(normal_state, form.locale())) return;
  // One after the other, because setting the width may change the form's height.
  form.put(u"Width", setting(width_item, form.get<Text>(u"Width")));
  form.put(u"Height", setting(height_item, form.get<Text>(u"Height")));
}

void ORVUtils::SaveWindowState(const Variant& frm, const Text& sCFGStr) {
  const Control form(frm, plain_numbers);
  const auto save = [&](TextView item, TextView property) {
    Text value = form.get<Text>(property);
    SaveCfgFileData(sCFGStr, Text(item), value, settings().sNatNameC, Boolean(false));
  };
  save(state_item, u"WindowState");
  // The last normal size is kept while the window is in another state.
  if (!form.get(u"WindowState").equals_number(normal_state, form.locale())) return;
  save(width_item, u"Width");
  save(height_item, u"Height");
}

}  // namespace talutil
