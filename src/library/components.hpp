#pragma once

#include <cstdint>

#include "automation/object.hpp"

namespace talutil {

/// The controls without a window of their own that members drive. The hidden components window (`FrmComponents`) holds
/// them; it is loaded when something first asks for one.
class Components {
 public:
  virtual ~Components() = default;

  /// Makes the window and its controls if there are none, and reads ComputerName. Raises what a control raises, after
  /// which there is no window.
  virtual void load() = 0;

  /// Closes the window with its controls. One that is not loaded is loaded first, as hosts observe.
  virtual void unload() = 0;

  /// A control by its name on the window. Raises 438 for a name that is not on it.
  [[nodiscard]] virtual ObjectRef control(TextView name) = 0;

  /// The table that exports fill, `Grid1`, the caller's until the reference ends. A host that is asked for a cell may
  /// export another grid before it answers: that export gets another control of the same class.
  [[nodiscard]] virtual ObjectRef borrow_scratch_grid() = 0;

  /// The handle for dialogs to be owned by.
  [[nodiscard]] virtual std::intptr_t owner_handle() = 0;
};

}  // namespace talutil
