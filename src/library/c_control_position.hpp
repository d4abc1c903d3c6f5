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

  /// Moves a control along with the mouse, but not beyond the inside of its form, and stores its new place. Call it
  /// from the control's MouseMove event while the button is pressed, after setting DragStartX and DragStartY in
  /// MouseDown. The control is moved by its Move; left and Top then hold its new position. If the position stays the
  /// same, nothing happens. A control wider or higher than the form is aligned with the far edge. A control or
  /// container that has ScaleMode and ScaleX counts as a form or picture box, whose scale converts the distance.
  /// @param vForm the form, with ScaleWidth and ScaleHeight
  /// @param oCtrl the control, with left, Top, Width, Height, Move and Container
  /// @param X the mouse's position across, as the event reports it; its distance from DragStartX counts
  /// @param Y the mouse's position down; its distance from DragStartY counts
  /// @raises 438 if the form or control lacks one of these members
  /// @raises 424 if vForm or oCtrl is not an object
  /// @raises 91 if vForm or oCtrl is Nothing
  /// @reads DragStartX, DragStartY
  /// @changes left, Top
  /// @family control positions
  /// @see SaveControlPosition
  /// @example Only objects can be dragged
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     On Error Resume Next
  ///     p.DragControl "frmJobs", "cmdSave", 120, 40
  ///     Print Err.Number
  ///     ' 424
  virtual void DragControl(const Variant& vForm, const Variant& oCtrl, float X, float Y);

  /// Reads left, Top, Width and Height as saved under ControlName and ControlID; it does not move the control. A part
  /// that was not saved is 0; without anything saved, the four stay as they are. Then, in either case, a Top of 0
  /// becomes DefaultTop and a left of 0 DefaultLeft, so a control saved at the very edge comes back at its default. The
  /// settings are those of the selector sNatNameC.
  /// @raises 6 if a number is beyond 32 bits
  /// @reads ControlName, ControlID, DefaultTop, DefaultLeft, sNatNameC, sUserName, sDatabaseName
  /// @changes left, Top, Width, Height
  /// @family control positions
  /// @see SaveControlPosition, GetCfgFileData
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.ControlName = "frmNew"
  ///     p.DefaultLeft = 120
  ///     p.DefaultTop = 240
  ///     p.GetControlPosition
  ///     Print p.left & " " & p.Top
  ///     ' 120 240
  virtual void GetControlPosition();

  /// Saves left, Top, Width and Height under ControlName and ControlID; does nothing if ControlName is empty. The
  /// section is ControlName, the item ControlID followed by "ControlSize", the value the four numbers, each followed by
  /// a comma. The settings are those of the selector sNatNameC.
  /// @raises 57 if the user's store cannot be written
  /// @reads ControlName, ControlID, left, Top, Width, Height, sNatNameC, sUserName, sDatabaseName
  /// @family control positions
  /// @see GetControlPosition, SaveCfgFileData
  /// @example
  ///     u.sDatabaseName = "Main"
  ///     u.sUserName = "anne"
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.ControlName = "frmJobs"
  ///     p.ControlID = 3
  ///     p.left = 120
  ///     p.Top = 480
  ///     p.Width = 2400
  ///     p.Height = 1200
  ///     p.SaveControlPosition
  ///     Set q = CreateObject("TALUtil.cControlPosition")
  ///     q.ControlName = "frmJobs"
  ///     q.ControlID = 3
  ///     q.GetControlPosition
  ///     Print q.left & " " & q.Top & " " & q.Width & " " & q.Height
  ///     ' 120 480 2400 1200
  virtual void SaveControlPosition();

  /// The height of the control, in twips, as saved and read back. The host applies it to the control, and sets it
  /// before saving.
  /// @family control positions
  /// @see GetControlPosition, SaveControlPosition
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.Height = 1200
  ///     Print p.Height
  ///     ' 1200
  std::int32_t Height = 0;

  /// The width of the control, in twips, as saved and read back. The host applies it to the control, and sets it before
  /// saving.
  /// @family control positions
  /// @see GetControlPosition, SaveControlPosition
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.Width = 2400
  ///     Print p.Width
  ///     ' 2400
  std::int32_t Width = 0;

  /// The top of the control, in twips: as saved and read back, or where it was dragged.
  /// @family control positions
  /// @see DragControl, GetControlPosition, SaveControlPosition
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.Top = 480
  ///     Print p.Top
  ///     ' 480
  std::int32_t Top = 0;

  /// The left edge of the control, in twips: as saved and read back, or where it was dragged. The name is in lower
  /// case, which only clients that look at case notice.
  /// @family control positions
  /// @see DragControl, GetControlPosition, SaveControlPosition
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.left = 120
  ///     Print p.left
  ///     ' 120
  std::int32_t left = 0;

  /// The top that GetControlPosition uses when none was saved, or 0 was, in twips.
  /// @family control positions
  /// @see GetControlPosition, DefaultLeft
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.DefaultTop = 240
  ///     Print p.DefaultTop
  ///     ' 240
  std::int32_t DefaultTop = 0;

  /// The left edge that GetControlPosition uses when none was saved, or 0 was, in twips.
  /// @family control positions
  /// @see GetControlPosition, DefaultTop
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.DefaultLeft = 120
  ///     Print p.DefaultLeft
  ///     ' 120
  std::int32_t DefaultLeft = 0;

  /// The number of the control within its form, which is part of the setting's item.
  /// @family control positions
  /// @see GetControlPosition, SaveControlPosition
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.ControlID = 3
  ///     Print p.ControlID
  ///     ' 3
  std::int32_t ControlID = 0;

  /// The section of the settings, usually the form's name; with an empty one nothing is saved. Reading does not check
  /// it: an empty one reads the section without a name.
  /// @family control positions
  /// @see GetControlPosition, SaveControlPosition
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.ControlName = "frmJobs"
  ///     Print p.ControlName
  ///     ' frmJobs
  Text ControlName;

  /// Where the drag began, down: the host stores Y of MouseDown here.
  /// @family control positions
  /// @see DragControl, DragStartX
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.DragStartY = 60
  ///     Print p.DragStartY
  ///     ' 60
  std::int32_t DragStartY = 0;

  /// Where the drag began, across: the host stores X of MouseDown here.
  /// @family control positions
  /// @see DragControl, DragStartY
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.DragStartX = 75
  ///     Print p.DragStartX
  ///     ' 75
  std::int32_t DragStartX = 0;

  /// Whether a drag is in progress: a flag for the host, which the class neither sets nor reads.
  /// @family control positions
  /// @see DragControl, Sizing
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.Dragging = True
  ///     Print p.Dragging
  ///     ' True
  Boolean Dragging;

  /// Whether the control is being resized: a flag for the host, which the class neither sets nor reads. Resizing is up
  /// to the host; the class only stores Width and Height.
  /// @family control positions
  /// @see Dragging
  /// @example
  ///     Set p = CreateObject("TALUtil.cControlPosition")
  ///     p.Sizing = True
  ///     Print p.Sizing
  ///     ' True
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
  return P::rows(P::template property<&C::Height>("Height"), P::template property<&C::Width>("Width"),
                 P::template property<&C::Top>("Top"), P::template property<&C::left>("left"),
                 P::template property<&C::DefaultTop>("DefaultTop"),
                 P::template property<&C::DefaultLeft>("DefaultLeft"), P::template property<&C::ControlID>("ControlID"),
                 P::template property<&C::ControlName>("ControlName"),
                 P::template property<&C::DragStartY>("DragStartY"), P::template property<&C::DragStartX>("DragStartX"),
                 P::template property<&C::Dragging>("Dragging"), P::template property<&C::Sizing>("Sizing"),
                 P::template method<&C::DragControl>("DragControl", "vForm", "oCtrl", "X", "Y"),
                 P::template method<&C::GetControlPosition>("GetControlPosition"),
                 P::template method<&C::SaveControlPosition>("SaveControlPosition"));
}

}  // namespace talutil
