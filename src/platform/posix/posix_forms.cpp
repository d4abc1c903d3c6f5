// Forms that are simple boxes are shown on the terminal; others cannot be shown.
#include <algorithm>
#include <iostream>
#include <map>

#include "automation/run_time_error.hpp"
#include "platform/form_view.hpp"
#include "platform/posix/posix_platform.hpp"

namespace talutil::posix {

namespace {

class TerminalForm final : public FormView {
 public:
  TerminalForm(FormEvents& events, const FormDescription& description, const Terminal& terminal)
      : events_(events), description_(description), terminal_(terminal) {}

  void set_caption(TextView caption) override { caption_ = caption; }
  void set_text(std::uint8_t part, TextView text) override { texts_[part] = text; }
  [[nodiscard]] Text text(std::uint8_t part) const override {
    const auto found = texts_.find(part);
    return found == texts_.end() ? Text() : found->second;
  }
  void set_visible(std::uint8_t part, bool is_visible) override { hidden_[part] = !is_visible; }
  void mask(std::uint8_t part) override { masked_[part] = true; }
  void set_colour(std::int32_t /*colour*/) override {}
  void remove_frame() override {}
  void keep_on_top() override {}
  void keep_open() override {}
  [[nodiscard]] std::intptr_t dialog_owner() const override { return 0; }
  void fit() override {}
  void set_tabs(std::uint8_t /*part*/, std::span<const TextView> /*captions*/) override {}
  void set_table(std::uint8_t /*part*/, TableSource& /*table*/, std::int32_t /*bar_column*/) override {}
  void copy(TextView /*text*/) override {}

  void show() override {
    print();
    std::cerr << '\n';
  }

  void show_modal() override {
    print();
    const FormPart* const entry = visible([](const FormPart& part) { return part.kind == PartKind::entry; });
    const FormPart* const button = visible([](const FormPart& part) { return part.is_default; });
    std::optional<Text> answer;
    if (entry != nullptr) {
      std::cerr << '\n';
      answer = PosixInputBoxes(terminal_).ask(u">", {}, masked_[entry->id] ? Entry::masked : Entry::shown);
      if (answer) texts_[entry->id] = *answer;
    } else {
      answer = terminal_.ask(" [Enter] ") ? std::optional(Text()) : std::nullopt;
    }
    if (answer && button != nullptr) events_.clicked(button->id);
    close(CloseMode::control_menu);
  }

  [[nodiscard]] bool is_open() const override { return is_open_; }
  void close(CloseMode mode) override {
    if (!is_open_) return;
    is_open_ = false;
    events_.closing(mode);
  }

 private:
  template <class Condition>
  [[nodiscard]] const FormPart* visible(Condition condition) {
    const auto found = std::ranges::find_if(description_.parts,
                                            [&](const FormPart& part) { return condition(part) && !hidden_[part.id]; });
    return found == description_.parts.end() ? nullptr : &*found;
  }

  void print() {
    std::cout.flush();
    std::cerr << to_utf8(caption_);
    for (const FormPart& part : description_.parts) {
      if (part.kind == PartKind::label && !hidden_[part.id]) std::cerr << ": " << to_utf8(text(part.id));
    }
  }

  FormEvents& events_;
  const FormDescription& description_;
  const Terminal& terminal_;
  Text caption_;
  std::map<std::uint8_t, Text> texts_;
  std::map<std::uint8_t, bool> hidden_;
  std::map<std::uint8_t, bool> masked_;
  bool is_open_ = true;
};

}  // namespace

std::unique_ptr<FormView> PosixFormWindows::make_form(FormEvents& events, const FormDescription& description) {
  const bool is_box = std::ranges::all_of(description.parts, [](const FormPart& part) {
    return part.kind == PartKind::label || part.kind == PartKind::entry || part.kind == PartKind::button;
  });
  if (!is_box) {
    throw RunTimeError(ErrorNumber::action_not_supported, Text(no_screen_for_windows));
  }
  return std::make_unique<TerminalForm>(events, description, terminal_);
}

}  // namespace talutil::posix
