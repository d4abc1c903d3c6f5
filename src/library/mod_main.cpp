#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"
#include "controls/control_factory.hpp"
#include "forms/frm_input_box.hpp"
#include "infoforms/frm_cmd_line_help.hpp"
#include "infoforms/frm_components.hpp"
#include "infoforms/frm_sh_keys.hpp"
#include "infoforms/frm_sys_info.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "preview/frm_print_preview.hpp"

namespace talutil {

Library::Library(const Platform& platform)
    : platform_(platform),
      controls_(std::make_unique<ControlFactory>(platform_)),
      components_(std::make_unique<FrmComponents>(platform_, *controls_, settings_)) {}

Library::~Library() = default;

void Library::start() {
  static_cast<void>(out_of_memory_error());
  components_->load();
  settings_.ScreenTwipsPerPixelX = round_to<std::int32_t>(platform_.screen.twips_per_pixel_x());
  settings_.ScreenTwipsPerPixelY = round_to<std::int32_t>(platform_.screen.twips_per_pixel_y());
}

namespace {

template <class Window>
Window& made_once(std::unique_ptr<Window>& window, Library& library) {
  if (!window) window = std::make_unique<Window>(library);
  return *window;
}

}  // namespace

FrmPrintPreview& Library::preview() { return made_once(preview_, *this); }
FrmInputBox& Library::input_box() { return made_once(input_box_, *this); }
FrmShKeys& Library::shortcut_keys() { return made_once(shortcut_keys_, *this); }
FrmCmdLineHelp& Library::command_line_help() { return made_once(command_line_help_, *this); }
FrmSysInfo& Library::system_information() { return made_once(system_information_, *this); }

bool Library::has_open_windows() const noexcept {
  const auto is_open = [](const auto& window) { return window && window->is_loaded(); };
  return is_open(preview_) || is_open(input_box_) || is_open(shortcut_keys_) || is_open(command_line_help_) ||
         is_open(system_information_);
}

void Library::close_notices() {
  if (input_box_ && !input_box_->is_shown_modal()) input_box_->unload();
  if (shortcut_keys_) shortcut_keys_->unload();
}

Locale Library::locale() const {
  Locale locale = platform_.computer.locale();
  locale.current_year = parts_of(platform_.clock.now()).year;
  return locale;
}

SharedSettings& ORVUtils::settings() const noexcept { return library_.settings(); }

Locale ORVUtils::locale() const { return library_.locale(); }

void ORVUtils::Terminate() {
  // Exactly 1: hosts use -1 and other values for switches of their own.
  if (settings().DebugMode == 1) {
    library_.platform().message_boxes.show(u"Closing ORVUtils Components form", MessageButtons::ok, {});
  }
  library_.close_notices();
  library_.components().unload();
}

}  // namespace talutil
