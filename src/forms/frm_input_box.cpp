#include "forms/frm_input_box.hpp"

#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

using Box = FrmInputBox;

constexpr FormPart parts[] = {
    {.id = Box::lblPrompt,
     .kind = PartKind::label,
     .is_growing = true,
     .place = {7, 7, 206, 16},
     .caption = u"This is the prompt label"},
    {.id = Box::txtUserInput, .kind = PartKind::entry, .place = {7, 30, 206, 13}},
    {.id = Box::cmdOK, .kind = PartKind::button, .is_default = true, .place = {163, 50, 50, 14}, .caption = u"OK"},
};

constexpr FormDescription description{.parts = parts, .width = 220, .height = 71};

}  // namespace

FrmInputBox::FrmInputBox(Library& library) : Form(library, description) {}

void FrmInputBox::show_texts(FormView& view) const {
  view.set_caption(caption_);
  view.set_text(lblPrompt, prompt_);
  view.set_colour(colour_);
}

void FrmInputBox::fill(FormView& view) {
  view.keep_on_top();
  if (is_frameless_) view.remove_frame();
  show_texts(view);
  if (is_masked_) view.mask(txtUserInput);
}

Text FrmInputBox::ask(const Question& question) {
  const bool is_notice = question.is_frameless && question.is_unclosable;
  if (is_loaded() && (!is_notice || is_shown_modal())) raise(ErrorNumber::form_already_displayed);
  prompt_ = question.prompt;
  caption_ = question.caption;
  is_masked_ = bool(question.is_masked);
  colour_ = question.colour;
  // Never reset: the same form is used the next time.
  if (question.is_frameless) is_frameless_ = true;
  is_unclosable_ = bool(question.is_unclosable);

  const bool is_again = is_loaded();
  FormView& view = load();
  if (is_again) show_texts(view);
  if (question.is_unclosable) view.set_visible(cmdOK, false);
  if (!question.has_entry) view.set_visible(txtUserInput, false);
  view.fit();
  if (is_notice) {
    view.keep_open();
    view.show();
  } else {
    show_modal();
  }
  return result_;
}

void FrmInputBox::on_click(std::uint8_t part) {
  if (part != cmdOK) return;
  result_ = load().text(txtUserInput);
  unload();
}

void FrmInputBox::on_escape() {
  // Like the close box, if the box can be closed.
  if (!is_unclosable_) load().close(CloseMode::control_menu);
}

void FrmInputBox::on_closing(CloseMode mode) {
  if (mode == CloseMode::control_menu) result_.clear();
}

Text ORVUtils::MyInputBox(const Text& sCaption, const Text& sPrompt, const Boolean& bPassword,
                          const Boolean& bShowUserInput, const Boolean& bNoFrame, const Boolean& bNonCloseable,
                          const std::int32_t& lBackColor) {
  return library_.part<FrmInputBox>().ask(
      {sCaption, sPrompt, bPassword, bShowUserInput, bNoFrame, bNonCloseable, lBackColor});
}

}  // namespace talutil
