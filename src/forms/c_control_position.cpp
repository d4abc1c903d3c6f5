#include "library/c_control_position.hpp"

#include "automation/checked.hpp"
#include "automation/control.hpp"
#include "library/host_objects.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

constexpr std::int16_t twips = 1;

/// The distance between the mouse and where the drag began.
float distance(float mouse, std::int32_t start) { return static_cast<float>(double{mouse} - start); }

/// Limits a control's new position to the inside of the form. A control larger than the form is aligned with the far
/// edge, so that its position is negative; it is not corrected again.
float within(const Control& control, const Control& form, float place, TextView size, TextView room) {
  if (place < 0) return 0;
  const auto control_size = control.get<float>(size);
  const auto form_room = form.get<float>(room);
  return place + control_size > form_room ? form_room - control_size : place;
}

}  // namespace

cControlPosition::cControlPosition(Library& library) : library_(library), utils_(std::make_unique<ORVUtils>(library)) {}

cControlPosition::~cControlPosition() = default;

Text cControlPosition::settings_item() const { return number_to_text(ControlID) + u"ControlSize"; }

void cControlPosition::DragControl(const Variant& vForm, const Variant& oCtrl, float X, float Y) {
  const Locale locale = library_.locale();
  const Control form(vForm, locale);
  const Control control(oCtrl, locale);
  float across = distance(X, DragStartX);
  float down = distance(Y, DragStartY);
  if (has_scale(control)) {
    const Variant mode = control.get(u"ScaleMode");
    across = control.get<float>(u"ScaleX", {across, mode, twips});
    down = control.get<float>(u"ScaleY", {down, mode, twips});
  }
  // From the original mouse distances, not from the result of the control's own scale.
  if (const Control container(control.get(u"Container"), locale); has_scale(container)) {
    const Variant mode = container.get(u"ScaleMode");
    across = container.get<float>(u"ScaleX", {distance(X, DragStartX), twips, mode});
    down = container.get<float>(u"ScaleY", {distance(Y, DragStartY), twips, mode});
  }

  const auto old_left = control.get<float>(u"left");
  const auto old_top = control.get<float>(u"Top");
  const float new_left = within(control, form, old_left + across, u"Width", u"ScaleWidth");
  const float new_top = within(control, form, old_top + down, u"Height", u"ScaleHeight");
  if (new_left == old_left && new_top == old_top) return;
  control.call(u"Move", {new_left, new_top});
  left = control.get<std::int32_t>(u"left");
  Top = control.get<std::int32_t>(u"Top");
}

void cControlPosition::GetControlPosition() {
  const Text stored =
      utils_->GetCfgFileData(ControlName, settings_item(), {}, utils_->settings().sNatNameC, Boolean(false));
  if (!stored.empty()) {
    const auto field = [&](std::int32_t number) {
      return round_to<std::int32_t>(leading_number(utils_->GetData(stored, number, number + 1)));
    };
    left = field(0);
    Top = field(1);
    Width = field(2);
    Height = field(3);
  }
  // A saved position of exactly 0 is also replaced by the default.
  if (Top == 0) Top = DefaultTop;
  if (left == 0) left = DefaultLeft;
}

void cControlPosition::SaveControlPosition() {
  if (ControlName.empty()) return;
  Text value;
  for (const std::int32_t number : {left, Top, Width, Height}) value += number_to_text(number) + u',';
  utils_->SaveCfgFileData(ControlName, settings_item(), value, utils_->settings().sNatNameC, Boolean(false));
}

}  // namespace talutil
