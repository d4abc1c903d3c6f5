#pragma once

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "platform/form_view.hpp"

namespace talutil::testing {

/// What windows show, and what their user does.
struct FakeFormState {
  std::vector<std::string> uses;  ///< In words.
  Text caption;
  std::map<int, Text> texts;
  std::map<int, bool> hidden;
  std::map<int, bool> masked;
  std::int32_t colour = 0;
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

  void set_caption(TextView caption) override { state_.caption = caption; }
  void set_text(std::uint8_t part, TextView text) override { state_.texts[part] = text; }
  [[nodiscard]] Text text(std::uint8_t part) const override { return state_.texts[part]; }
  void set_visible(std::uint8_t part, bool is_visible) override { state_.hidden[part] = !is_visible; }
  void mask(std::uint8_t part) override { state_.masked[part] = true; }
  void set_colour(std::int32_t colour) override { state_.colour = colour; }
  void remove_frame() override { state_.has_frame = false; }
  void keep_on_top() override { state_.uses.emplace_back("on top"); }
  [[nodiscard]] std::intptr_t dialog_owner() const override { return 0x5678; }
  void keep_open() override { state_.uses.emplace_back("kept open"); }
  void fit() override {}
  void set_tabs(std::uint8_t /*part*/, std::span<const TextView> captions) override {
    state_.uses.push_back("tabs " + std::to_string(captions.size()));
  }
  void set_table(std::uint8_t /*part*/, TableSource& table, std::int32_t bar_column) override {
    state_.table = &table;
    state_.bar_column = bar_column;
  }
  void copy(TextView text) override { state_.copied = text; }
  void show() override { state_.uses.emplace_back("show"); }
  void show_modal() override {
    state_.uses.emplace_back("show modal");
    if (state_.user) state_.user(events_);
    close(CloseMode::control_menu);
  }
  [[nodiscard]] bool is_open() const override { return is_open_; }
  void close(CloseMode mode) override {
    if (!is_open_) return;
    is_open_ = false;
    state_.uses.emplace_back(mode == CloseMode::code ? "closed by code" : "closed by the menu");
    events_.closing(mode);
  }

 private:
  FakeFormState& state_;
  FormEvents& events_;
  bool is_open_ = true;
};

}  // namespace talutil::testing
