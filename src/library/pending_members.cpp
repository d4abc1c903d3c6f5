#include "automation/run_time_error.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

// Members that have their slot but not their work yet: hosts get a plain error 445. A member that is built
// moves from here to its family's folder, and its row in the interface table loses the mark.

namespace {

[[noreturn]] void not_built() { raise(ErrorNumber::action_not_supported); }

}  // namespace

void ORVUtils::ShowShortCutKeys() { not_built(); }
void ORVUtils::ShowCmdLineHelp() { not_built(); }
void ORVUtils::ShowSysInfo() { not_built(); }
Text ORVUtils::MyInputBox(const Text&, const Text&, const Boolean&, const Boolean&, const Boolean&, const Boolean&,
                          const std::int32_t&) {
  not_built();
}

}  // namespace talutil
