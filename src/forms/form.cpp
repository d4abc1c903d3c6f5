#include "forms/form.hpp"

#include "automation/run_time_error.hpp"
#include "library/library.hpp"

namespace talutil {

Form::~Form() = default;

FormView& Form::load() {
  if (is_loaded()) return *view_;
  auto view = library_.platform().form_windows.make_form(*this, description_);
  fill(*view);
  view_ = std::move(view);
  return *view_;
}

void Form::unload() {
  if (is_loaded()) view_->close(CloseMode::code);
}

void Form::show_modal() {
  FormView& view = load();
  // A nested call leaves the window to the outer one, which closes it even if an error ends the showing.
  struct Call {
    Form& form;
    explicit Call(Form& shown) noexcept : form(shown) { ++form.modal_calls_; }
    Call(const Call&) = delete;
    Call& operator=(const Call&) = delete;
    ~Call() {
      if (--form.modal_calls_ == 0) form.view_.reset();
    }
  };
  const Call call(*this);
  view.show_modal();
}

template <class Work>
void Form::report_errors(Work work) noexcept {
  try {
    try {
      work();
    } catch (...) {
      const RunTimeError error = current_error();
      // The user cancelled the dialog and knows that.
      if (error.is(ErrorNumber::cancelled)) return;
      library_.platform().message_boxes.show(error.description(), MessageButtons::ok, {});
    }
  } catch (...) {
    // Nobody is left to report this to.
  }
}

void Form::clicked(std::uint8_t part) noexcept {
  report_errors([&] { on_click(part); });
}

void Form::tab_chosen(std::uint8_t /*part*/, std::int32_t tab) noexcept {
  report_errors([&] { on_tab(tab); });
}

void Form::escaped() noexcept {
  report_errors([&] { on_escape(); });
}

void Form::closing(CloseMode mode) noexcept {
  report_errors([&] { on_closing(mode); });
}

}  // namespace talutil
