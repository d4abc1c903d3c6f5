#pragma once

#include <functional>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "platform/preview_view.hpp"

namespace talutil::testing {

/// A preview window without a screen: what it shows and how it is used stay here when it is gone.
struct FakePreviewState {
  std::vector<Text> captions;
  std::set<PreviewMenu> checked;
  std::vector<std::string> uses;  ///< "check mnu25 off" and so on for what has an order.
  std::int32_t state = 0;
  float width = 12000;
  float height = 9000;
  float frame = 300;  ///< What the frame takes of both.
  float pages_width = 0;
  float pages_height = 0;
  std::int32_t windows = 0;
  std::function<void(PreviewEvents&)> user;  ///< What is done while the window is shown.
};

class FakePreview final : public PreviewView {
 public:
  FakePreview(FakePreviewState& state, PreviewEvents& events, const PreviewPages* /*pages*/)
      : state_(state), events_(events) {
    ++state_.windows;
  }
  FakePreview(const FakePreview&) = delete;
  FakePreview& operator=(const FakePreview&) = delete;
  ~FakePreview() override { --state_.windows; }

  void set_caption(TextView caption) override { state_.captions.emplace_back(caption); }
  [[nodiscard]] std::int32_t window_state() const override { return state_.state; }
  void set_window_state(std::int32_t state) override { state_.state = state; }
  [[nodiscard]] float width() const override { return state_.width; }
  void set_width(float width) override { state_.width = width; }
  [[nodiscard]] float height() const override { return state_.height; }
  void set_height(float height) override { state_.height = height; }
  [[nodiscard]] float inner_width() const override { return state_.width - state_.frame; }
  [[nodiscard]] float inner_height() const override { return state_.height - state_.frame; }
  void size_pages(float width, float height) override {
    state_.pages_width = width;
    state_.pages_height = height;
  }
  void check(PreviewMenu item, bool is_checked) override {
    state_.uses.push_back((is_checked ? "check " : "uncheck ") + std::to_string(static_cast<int>(item)));
    if (is_checked)
      state_.checked.insert(item);
    else
      state_.checked.erase(item);
  }
  void show_page() override {}
  void show_modal() override {
    state_.uses.emplace_back("show");
    events_.activated();
    if (state_.user) state_.user(events_);
    close();
  }
  void close() override {
    if (!std::exchange(is_closed_, true)) events_.closing();
  }

 private:
  FakePreviewState& state_;
  PreviewEvents& events_;
  bool is_closed_ = false;
};

}  // namespace talutil::testing
