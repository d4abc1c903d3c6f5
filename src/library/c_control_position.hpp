#pragma once

#include <cstdint>
#include <memory>

#include "automation/member_table.hpp"

namespace talutil {

class Library;
class ORVUtils;

/// The second class that hosts create: one object per control that a user may drag around a form. Positions and sizes
/// are in twips. The published names are kept as they are.
class cControlPosition {
 public:
  explicit cControlPosition(Library& library);
  cControlPosition(const cControlPosition&) = delete;
  cControlPosition& operator=(const cControlPosition&) = delete;
  virtual ~cControlPosition();

  [[nodiscard]] Library& library() const noexcept { return library_; }

  /// Moves a control along with the mouse, but not beyond the inside of its form, and stores its new position in left
  /// and Top. Does nothing if the position stays the same. A control or container that has ScaleMode and ScaleX is
  /// treated as a form or picture box and scales the distance. Raises the controls' errors, and 91 and 424 for
  /// arguments that are not objects.
  /// @param X, Y the mouse position, passed by value; compared with DragStartX and DragStartY
  virtual void DragControl(const Variant& vForm, const Variant& oCtrl, float X, float Y);

  /// Reads left, Top, Width and Height as saved under ControlName and ControlID; a missing number is 0. Then, whether
  /// or not anything was saved, a Top of 0 becomes DefaultTop and a left of 0 DefaultLeft. Does not move the control.
  /// Raises 6 for numbers beyond 32 bits.
  virtual void GetControlPosition();

  /// Saves left, Top, Width and Height, each followed by a comma; does nothing if ControlName is empty.
  virtual void SaveControlPosition();

  std::int32_t Height = 0;
  std::int32_t Width = 0;
  std::int32_t Top = 0;
  std::int32_t left = 0;
  std::int32_t DefaultTop = 0;
  std::int32_t DefaultLeft = 0;
  std::int32_t ControlID = 0;
  Text ControlName;
  std::int32_t DragStartY = 0;
  std::int32_t DragStartX = 0;
  Boolean Dragging;
  Boolean Sizing;

 private:
  [[nodiscard]] Text settings_item() const;

  Library& library_;
  std::unique_ptr<ORVUtils> utils_;  ///< A toolkit object, through which the settings are accessed.
};

/// The interface of cControlPosition, in slot order.
template <class P>
constexpr auto members_of(std::type_identity<cControlPosition>) {
  using C = cControlPosition;
  return P::rows(
      P::template property<&C::Height>("Height", "The remembered height, in twips."),
      P::template property<&C::Width>("Width", "The remembered width, in twips."),
      P::template property<&C::Top>("Top", "The remembered top, in twips."),
      P::template property<&C::left>("left", "The remembered left, in twips."),
      P::template property<&C::DefaultTop>("DefaultTop", "The top to use when none is remembered."),
      P::template property<&C::DefaultLeft>("DefaultLeft", "The left to use when none is remembered."),
      P::template property<&C::ControlID>("ControlID", "The number of the control within its form."),
      P::template property<&C::ControlName>("ControlName", "The settings section; an empty one saves nothing."),
      P::template property<&C::DragStartY>("DragStartY", "Where the drag began, down."),
      P::template property<&C::DragStartX>("DragStartX", "Where the drag began, across."),
      P::template property<&C::Dragging>("Dragging", "A drag is in progress; kept for the host."),
      P::template property<&C::Sizing>("Sizing", "A resize is in progress; kept for the host."),
      P::template method<&C::DragControl>("DragControl", "Moves a control with the mouse, within its form.", "vForm",
                                          "oCtrl", "X", "Y"),
      P::template method<&C::GetControlPosition>("GetControlPosition", "Reads the remembered position."),
      P::template method<&C::SaveControlPosition>("SaveControlPosition", "Remembers the position."));
}

}  // namespace talutil
