#include <array>
#include <fstream>

#include "automation/run_time_error.hpp"
#include "platform/posix/posix_platform.hpp"
#include "platform/preview_view.hpp"

namespace talutil::posix {

namespace {

/// Keeps sizes but shows nothing.
class PreviewWindow final : public PreviewView {
 public:
  void set_caption(TextView /*caption*/) override {}
  [[nodiscard]] std::int32_t window_state() const override { return state_; }
  void set_window_state(std::int32_t state) override { state_ = state; }
  [[nodiscard]] float width() const override { return width_; }
  void set_width(float width) override { width_ = width; }
  [[nodiscard]] float height() const override { return height_; }
  void set_height(float height) override { height_ = height; }
  [[nodiscard]] float inner_width() const override { return width_; }
  [[nodiscard]] float inner_height() const override { return height_; }
  void size_pages(float /*width*/, float /*height*/) override {}
  void check(PreviewMenu /*item*/, bool /*is_checked*/) override {}
  void show_page() override {}
  void show_modal() override { throw RunTimeError(ErrorNumber::action_not_supported, Text(no_screen)); }
  void close() override {}

 private:
  std::int32_t state_ = 0;
  float width_ = 12000;
  float height_ = 9000;
};

}  // namespace

std::unique_ptr<PreviewView> PosixFormWindows::make_preview(PreviewEvents& /*events*/, const PreviewPages* /*pages*/) {
  return std::make_unique<PreviewWindow>();
}

WindowImage PosixDrawing::image_of(std::intptr_t /*window*/) { raise(ErrorNumber::action_not_supported); }

std::vector<std::uint8_t> PosixFontFiles::wide_font(bool is_fixed_width) {
  // Where distributions install the two font families that cover most scripts.
  static constexpr std::array folders{"/usr/share/fonts/truetype/dejavu/", "/usr/share/fonts/dejavu/",
                                      "/usr/share/fonts/TTF/"};
  const std::string name = is_fixed_width ? "DejaVuSansMono.ttf" : "DejaVuSans.ttf";
  for (const char* folder : folders) {
    std::ifstream file(folder + name, std::ios::binary);
    if (file) return {std::istreambuf_iterator<char>(file), {}};
  }
  return {};
}

}  // namespace talutil::posix
