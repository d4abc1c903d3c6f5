#include "automation/checked.hpp"
#include "controls/control_factory.hpp"
#include "infoforms/frm_components.hpp"
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
  locale_ = platform_.computer.locale();
  components_->load();
  settings_.ScreenTwipsPerPixelX = round_to<std::int32_t>(platform_.screen.twips_per_pixel_x());
  settings_.ScreenTwipsPerPixelY = round_to<std::int32_t>(platform_.screen.twips_per_pixel_y());
}

FrmPrintPreview& Library::preview() {
  if (!preview_) preview_ = std::make_unique<FrmPrintPreview>(*this);
  return *preview_;
}

Locale Library::locale() const {
  Locale locale = locale_;
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
  library_.components().unload();
}

}  // namespace talutil
