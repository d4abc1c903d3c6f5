#pragma once

#include <cstdint>
#include <memory>

#include "automation/member_table.hpp"

namespace talutil {

class Library;
class ORVUtils;

/// The second class that hosts create: one object for each control that a user may drag about a form.
/// Positions and sizes are twips. The published names are kept as they are.
class cControlPosition {
 public:
  explicit cControlPosition(Library& library);
  cControlPosition(const cControlPosition&) = delete;
  cControlPosition& operator=(const cControlPosition&) = delete;
  virtual ~cControlPosition();

  [[nodiscard]] Library& library() const noexcept { return library_; }

  /// Moves a control after the mouse, no further than the inside of its form, and keeps its new place in left and Top.
  /// Nothing happens where the mouse has not moved. A control or a container counts as a form or picture box, and
  /// scales the distance, when it answers ScaleMode and ScaleX. Raises what the controls raise; 91 and 424 for what is
  /// no object.
  /// @param X, Y where the mouse is, by value, against DragStartX and DragStartY
  virtual void DragControl(const Variant& vForm, const Variant& oCtrl, float X, float Y);

  /// Reads left, Top, Width and Height as they were saved under ControlName and ControlID; a number that is missing
  /// is 0. Then, saved or not, a Top of 0 becomes DefaultTop and a left of 0 DefaultLeft. The control is not moved.
  /// Raises 6 for numbers beyond 32 bits.
  virtual void GetControlPosition();

  /// Saves left, Top, Width and Height, each followed by a comma; nothing for an empty ControlName.
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
  std::unique_ptr<ORVUtils> utils_;  ///< The settings are reached through a toolkit of the object's own.
};

/// The interface of cControlPosition, slot by slot.
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
