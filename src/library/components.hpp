#pragma once

#include <cstdint>

#include "automation/object.hpp"

namespace talutil {

/// The non-visual controls that members drive. They are on the hidden components window (`FrmComponents`), which is
/// loaded on first use.
class Components {
 public:
  virtual ~Components() = default;

  /// Creates the window and its controls if necessary, and reads ComputerName. Raises the controls' errors; there is no
  /// window then.
  virtual void load() = 0;

  /// Closes the window and its controls. Loads the window first if necessary, as hosts can observe.
  virtual void unload() = 0;

  /// A control by its name on the window. Raises 438 for an unknown name.
  [[nodiscard]] virtual ObjectRef control(TextView name) = 0;

  /// Lends the table that exports fill (`Grid1`) until the reference is released. A host that is asked for a cell may
  /// start another export meanwhile; that gets a separate control of the same class.
  [[nodiscard]] virtual ObjectRef borrow_scratch_grid() = 0;

  /// The window handle that owns dialogs.
  [[nodiscard]] virtual std::intptr_t owner_handle() = 0;
};

}  // namespace talutil
