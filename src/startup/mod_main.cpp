// A library's lifetime, from its start-up routine to Terminate: the one place that knows every layer.
#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"
#include "infoforms/frm_components.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

Library::Library(const Platform& platform)
    : platform_(platform),
      controls_(platform_),
      components_(std::make_unique<FrmComponents>(platform_, controls_, settings_)) {}

Library::~Library() {
  // In reverse order of creation, because windows use parts that existed before them.
  while (!parts_.empty()) parts_.pop_back();
}

void Library::start() {
  // Creates the error for a failed allocation while there is still memory for it.
  static_cast<void>(out_of_memory_error());
  components_->load();
  settings_.ScreenTwipsPerPixelX = round_to<std::int32_t>(platform_.screen.twips_per_pixel_x());
  settings_.ScreenTwipsPerPixelY = round_to<std::int32_t>(platform_.screen.twips_per_pixel_y());
}

Locale Library::locale() const {
  Locale locale = platform_.computer.locale();
  locale.current_year = platform_.clock.year();
  return locale;
}

SharedSettings& ORVUtils::settings() const noexcept { return library_.settings(); }

Locale ORVUtils::locale() const { return library_.locale(); }

void ORVUtils::Terminate() {
  // Exactly 1: hosts use -1 and other values for switches of their own.
  if (settings().DebugMode == 1) {
    library_.platform().message_boxes.show(u"Closing ORVUtils Components form", MessageButtons::ok, {});
  }
  library_.components().unload();
}

}  // namespace talutil
