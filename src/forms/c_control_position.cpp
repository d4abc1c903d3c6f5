#include "forms/c_control_position.hpp"

#include "automation/run_time_error.hpp"

namespace talutil {

// The slots are there; dragging and the settings behind it are not built yet.
void cControlPosition::DragControl(const Variant&, const Variant&, float, float) {
  raise(ErrorNumber::action_not_supported);
}

void cControlPosition::GetControlPosition() { raise(ErrorNumber::action_not_supported); }

void cControlPosition::SaveControlPosition() { raise(ErrorNumber::action_not_supported); }

}  // namespace talutil
