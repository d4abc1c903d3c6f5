#include "infoforms/frm_components.hpp"

#include <algorithm>

#include "automation/control.hpp"
#include "automation/run_time_error.hpp"
#include "controls/control_factory.hpp"

namespace talutil {

namespace {

// The system information control's property with the machine's name. The control publishes it only by this identifier.
constexpr std::int32_t computer_name_property = 0x68030010;

// The data connection's error number for a connection that is lost for good; all a user can do is restart.
constexpr std::int32_t connection_terminated = 17142;

/// The index of a control by name; raises 438 for an unknown name.
std::size_t place_of(TextView name) {
  constexpr const auto& places = FrmComponents::places;
  const auto* const place = std::ranges::find(places, name, &FrmComponents::Place::name);
  if (place == places.end()) raise(ErrorNumber::member_not_supported);
  return static_cast<std::size_t>(place - places.begin());
}

}  // namespace

FrmComponents::FrmComponents(const Platform& platform, const ControlFactory& factory, SharedSettings& settings)
    : platform_(platform), factory_(factory), settings_(settings) {}

void FrmComponents::load() {
  if (is_loaded()) return;
  // Everything is created and set up before anything is stored, so that a failure does not leave half a window and the
  // next use tries again.
  auto window = platform_.form_windows.make_hidden(caption);
  Controls controls;
  const bool are_ours = !platform_.control_makers.may_have_any();
  std::ranges::transform(places, controls.begin(), [&](const Place& place) {
    return are_ours ? factory_.create_own(place.class_name) : factory_.create(place.class_name);
  });
  // Our own controls answer with texts, so that the user's separators need not be read yet.
  const Locale locale = are_ours ? Locale{} : platform_.computer.locale();
  const Control dialog(controls[place_of(u"dlgSave2")], locale);
  dialog.put(u"DialogTitle", u"Save Data to File");
  dialog.put(u"Filter", u"Comma Delim Text File *.txt|*.txt|TAB Delim CSV|*.csv");
  dialog.put(u"Flags", file_dialog_flag::overwrite_prompt | file_dialog_flag::hide_read_only);
  const Control information(controls[place_of(u"MSysInfo1")], locale);
  settings_.ComputerName = information.get<Text>(computer_name_property);

  window_ = std::move(window);
  controls_ = std::move(controls);
  last_database_error_ = 0;
}

void FrmComponents::unload() {
  load();
  controls_ = {};
  window_.reset();
  last_database_error_ = 0;
}

ObjectRef FrmComponents::control(TextView name) {
  load();
  return controls_[place_of(name)];
}

ObjectRef FrmComponents::borrow_scratch_grid() {
  const std::size_t place = place_of(u"Grid1");
  if (is_scratch_grid_lent_) return factory_.create(places[place].class_name);
  ObjectRef grid = control(places[place].name);
  is_scratch_grid_lent_ = true;
  // Also keeps the control alive if the window closes meanwhile.
  return {grid.get(), [this, grid](Object* /*lent*/) { is_scratch_grid_lent_ = false; }};
}

std::intptr_t FrmComponents::owner_handle() {
  load();
  return window_->handle();
}

void FrmComponents::report_database_error(std::int32_t number, const Text& description, std::int32_t /*code*/,
                                          const Text& source, const Text& help_file, const Text& /*context*/) {
  load();
  // Users know the spelling "TData Error:".
  const Text message =
      number == connection_terminated
          ? u"An error has caused the database connection to be terminated. Please restart ORV.  If the problem "
            u"persists, contact tech support."
          : u"TData Error:" + number_to_text(number) + u" - " + description + u"  " + source + u"  " + help_file;
  platform_.message_boxes.show(message, MessageButtons::ok, {});
  last_database_error_ = number;
}

}  // namespace talutil
