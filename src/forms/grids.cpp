#include "automation/control.hpp"
#include "automation/run_time_error.hpp"
#include "forms/grid_export.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

// Codes of the grid.
constexpr double boolean_column = 11;
constexpr std::int16_t check_box_setting = 5;
constexpr double ticked = 1;

Text width_item(std::int32_t column) { return number_to_text(column) + u"ColWidth"; }

/// Runs the work of a member that reports its errors in a message box.
template <class Work>
void reporting_errors(const Platform& platform, TextView member, Work work) {
  try {
    work();
  } catch (...) {
    const RunTimeError error = current_error();
    platform.screen.reset_pointer();
    platform.message_boxes.show(u"ORVUtils " + Text(member) + u' ' + error.description(), MessageButtons::ok, {});
  }
}

}  // namespace

void ORVUtils::LoadGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn) {
  const Control grid(Grid1, plain_numbers);
  const auto columns = grid.get<std::int32_t>(u"Cols");
  for (std::int32_t c = iStartColumn; c < columns; ++c) {
    const Text width = GetCfgFileData(sCFGStr, width_item(c), u"1000", settings().sNatNameC, Boolean(false));
    grid.put(u"ColWidth", {c}, leading_number(width));
  }
}

void ORVUtils::SaveGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn) {
  const Control grid(Grid1, plain_numbers);
  const auto columns = grid.get<std::int32_t>(u"Cols");
  for (std::int32_t c = iStartColumn; c < columns; ++c) {
    Text width = grid.get<Text>(u"ColWidth", {c});
    SaveCfgFileData(sCFGStr, width_item(c), width, settings().sNatNameC, Boolean(false));
  }
}

void ORVUtils::SelectGridRows(const std::int32_t& lColumn, const Variant& vGrid, const std::int16_t& iSwitch) {
  reporting_errors(library_.platform(), u"SelectGridRows", [&] {
    const Control grid(vGrid, locale());
    const auto rows = grid.get<std::int32_t>(u"Rows");
    const auto first = grid.get<std::int32_t>(u"FixedRows");
    if (rows <= first || !grid.get(u"ColDataType", {lColumn}).equals_number(boolean_column, grid.locale())) return;
    if (iSwitch != 0 && iSwitch != 1) return;
    const auto tick = grid.repeated_put(u"TextMatrix", {first, lColumn, Boolean(iSwitch == 1)});
    for (std::int32_t r = first; r < rows; ++r) {
      tick->set(0, r);
      tick->run();
    }
  });
}

std::int32_t ORVUtils::CountGridSelectedRows(const std::int32_t& lColumn, const Variant& vGrid) {
  std::int32_t count = 0;
  reporting_errors(library_.platform(), u"CountGridSelectedRows", [&] {
    const Control grid(vGrid, locale());
    if (!grid.get(u"ColDataType", {lColumn}).equals_number(boolean_column, grid.locale())) return;
    const auto rows = grid.get<std::int32_t>(u"Rows");
    const auto first = grid.get<std::int32_t>(u"FixedRows");
    if (rows <= first) return;
    const auto state = grid.repeated_get(u"Cell", {check_box_setting, first, lColumn});
    for (std::int32_t r = first; r < rows; ++r) {
      state->set(1, r);
      if (state->run().equals_number(ticked, grid.locale())) ++count;
    }
  });
  return count;
}

void ORVUtils::ExportGridData(const Variant& m_Grid1, const std::int16_t& iDontSaveHeader, const Boolean& bSelection,
                              const Text& sFilename) {
  try {
    const Control dialog(library_.components().control(u"dlgSave2"), locale());
    // The reports folder itself ends with a backslash.
    dialog.put(u"InitDir", settings().sReportsDir + sFilename + u'\\');
    VerifyFilePath(dialog.get<Text>(u"InitDir"));
    dialog.put(u"CancelError", Boolean(true));
    dialog.put(u"FileName", sFilename + u".txt");
    dialog.call(u"ShowSave");
    const Text file = dialog.get<Text>(u"FileName");
    if (file.empty()) return;

    const Control grid(m_Grid1, locale());
    const Control scratch(library_.components().borrow_scratch_grid(), locale());
    GridExport grid_export(library_.platform(), grid, scratch);
    // Hosts rely on this meaning: True is every row, starting at row iDontSaveHeader.
    if (bSelection.is_exactly_true())
      grid_export.copy_all_rows(iDontSaveHeader);
    else
      grid_export.copy_selected_rows();
    grid_export.save(file, iDontSaveHeader == 0);
  } catch (...) {
    // A cancelled dialog is also an error, and a failed export is not reported.
  }
}

}  // namespace talutil
