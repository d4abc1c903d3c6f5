#pragma once

#include <functional>
#include <map>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "platform/form_view.hpp"
#include "platform/preview_view.hpp"

namespace talutil::testing {

/// What windows show, and what their user does.
struct FakeFormState {
  std::vector<std::string> uses;  ///< In words.
  std::map<int, Text> texts;
  std::map<int, bool> hidden;
  std::map<int, bool> masked;
  bool has_frame = true;
  TableSource* table = nullptr;
  std::int32_t bar_column = -1;
  Text copied;
  std::int32_t windows = 0;
  FormEvents* events = nullptr;  ///< Of the last window.
  FormView* view = nullptr;
  std::function<void(FormEvents&)> user;  ///< What is done while a window is shown and waited for.
};

class FakeForm final : public FormView {
 public:
  FakeForm(FakeFormState& state, FormEvents& events) : state_(state), events_(events) {
    ++state_.windows;
    state_.events = &events;
    state_.view = this;
    state_.texts.clear();
    state_.hidden.clear();
    state_.masked.clear();
    state_.has_frame = true;
  }
  FakeForm(const FakeForm&) = delete;
  FakeForm& operator=(const FakeForm&) = delete;
  ~FakeForm() override { --state_.windows; }

  void set_caption(TextView /*caption*/) override {}
  void set_text(std::uint8_t part, TextView text) override { state_.texts[part] = text; }
  [[nodiscard]] Text text(std::uint8_t part) const override { return state_.texts[part]; }
  void set_visible(std::uint8_t part, bool is_visible) override { state_.hidden[part] = !is_visible; }
  void mask(std::uint8_t part) override { state_.masked[part] = true; }
  void set_colour(std::int32_t /*colour*/) override {}
  void remove_frame() override { state_.has_frame = false; }
  void keep_on_top() override { state_.uses.emplace_back("on top"); }
  [[nodiscard]] std::intptr_t dialog_owner() const override { return 0x5678; }
  void keep_open() override { state_.uses.emplace_back("kept open"); }
  void fit() override {}
  void set_tabs(std::uint8_t /*part*/, std::span<const TextView> /*captions*/) override {}
  void set_table(std::uint8_t /*part*/, TableSource& table, std::int32_t bar_column) override {
    state_.table = &table;
    state_.bar_column = bar_column;
  }
  void copy(TextView text) override { state_.copied = text; }
  void show() override { state_.uses.emplace_back("show"); }
  void show_modal() override {
    if (state_.user) state_.user(events_);
    close(CloseMode::control_menu);
  }
  [[nodiscard]] bool is_open() const override { return is_open_; }
  void close(CloseMode mode) override {
    if (!is_open_) return;
    is_open_ = false;
    events_.closing(mode);
  }

 private:
  FakeFormState& state_;
  FormEvents& events_;
  bool is_open_ = true;
};

/// A preview window without a screen: what it shows and how it is used stay here when it is gone.
struct FakePreviewState {
  std::vector<std::string> uses;  ///< In words: "check 11", and a caption as it is.
  std::int32_t state = 0;
  float width = 12000;
  float height = 9000;
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

  void set_caption(TextView caption) override { state_.uses.push_back(to_utf8(caption)); }
  [[nodiscard]] std::int32_t window_state() const override { return state_.state; }
  void set_window_state(std::int32_t state) override { state_.state = state; }
  [[nodiscard]] float width() const override { return state_.width; }
  void set_width(float width) override { state_.width = width; }
  [[nodiscard]] float height() const override { return state_.height; }
  void set_height(float height) override { state_.height = height; }
  [[nodiscard]] float inner_width() const override { return state_.width - frame; }
  [[nodiscard]] float inner_height() const override { return state_.height - frame; }
  void size_pages(float width, float height) override {
    std::ostringstream use;
    use << "pages " << width << " by " << height;
    state_.uses.push_back(use.str());
  }
  void check(PreviewMenu item, bool is_checked) override {
    state_.uses.push_back((is_checked ? "check " : "uncheck ") + std::to_string(static_cast<int>(item)));
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
  static constexpr float frame = 300;  ///< What the frame takes of both.
  FakePreviewState& state_;
  PreviewEvents& events_;
  bool is_closed_ = false;
};

}  // namespace talutil::testing
