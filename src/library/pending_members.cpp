#include "automation/run_time_error.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

// Members that have their slot but not their work yet: hosts get a plain error 445. A member that is built
// moves from here to its family's folder, and its row in the interface table loses the mark.

namespace {

[[noreturn]] void not_built() { raise(ErrorNumber::action_not_supported); }

}  // namespace

Boolean ORVUtils::GetMousePos(const Variant&, const Variant&, const Variant&, const Variant&, const Variant&,
                              const Variant&) {
  not_built();
}
std::int32_t ORVUtils::GetMaxPages(const std::int32_t&, const std::int32_t&) { not_built(); }
void ORVUtils::DrawShellExecuteError(const std::int32_t&) { not_built(); }
Boolean ORVUtils::CheckDeleteRecord() { not_built(); }
Boolean ORVUtils::CheckModifyDatabase(const Text&) { not_built(); }
void ORVUtils::ShowShortCutKeys() { not_built(); }
void ORVUtils::ShowCmdLineHelp() { not_built(); }
void ORVUtils::MyDrawText(const std::int16_t&, const std::int16_t&, const std::int16_t&, const std::int16_t&,
                          const Variant&, const std::int32_t&, const std::int16_t&, const Boolean&, const Boolean&) {
  not_built();
}
void ORVUtils::LoadWindowState(const Variant&, const Text&) { not_built(); }
void ORVUtils::SaveWindowState(const Variant&, const Text&) { not_built(); }
void ORVUtils::GridPrintPreview(const std::int16_t&, const std::int16_t&, const Text&, const Text&, const Variant&,
                                const Variant&, const Variant&, const Text&) {
  not_built();
}
void ORVUtils::TextBoxPrintPreview(const std::int16_t&, const std::int16_t&, const Text&, const Text&, const Variant&) {
  not_built();
}
void ORVUtils::ListBoxPrintPreview(const std::int16_t&, const std::int16_t&, const Text&, const Text&, const Variant&) {
  not_built();
}
std::int32_t ORVUtils::GetComboListIndex(const Variant&, const std::int32_t&) { not_built(); }
std::int32_t ORVUtils::SearchCombo(const Variant&, const std::int16_t&) { not_built(); }
std::int32_t ORVUtils::SearchComboEx(const Variant&, const Text&, const std::int32_t&, const std::int16_t&) {
  not_built();
}
void ORVUtils::LoadGridWidths(const Variant&, const Text&, const std::int16_t&) { not_built(); }
void ORVUtils::SaveGridWidths(const Variant&, const Text&, const std::int16_t&) { not_built(); }
void ORVUtils::ExportGridData(const Variant&, const std::int16_t&, const Boolean&, const Text&) { not_built(); }
void ORVUtils::ShowSysInfo() { not_built(); }
void ORVUtils::SelectGridRows(const std::int32_t&, const Variant&, const std::int16_t&) { not_built(); }
std::int32_t ORVUtils::CountGridSelectedRows(const std::int32_t&, const Variant&) { not_built(); }
Text ORVUtils::MyInputBox(const Text&, const Text&, const Boolean&, const Boolean&, const Boolean&, const Boolean&,
                          const std::int32_t&) {
  not_built();
}
void ORVUtils::PrintScreen(const Variant&) { not_built(); }

}  // namespace talutil
