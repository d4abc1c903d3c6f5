#include "preview/frm_print_preview.hpp"

#include <algorithm>
#include <iterator>

#include "automation/control.hpp"
#include "automation/run_time_error.hpp"
#include "controls/control_factory.hpp"
#include "controls/print_control.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "preview/paper_choices.hpp"

namespace talutil {

namespace {

constexpr std::int32_t minimised = 1;
constexpr std::int32_t normal = 0;

// The platform's key codes.
constexpr std::int32_t key_alt = 18;
constexpr std::int32_t key_escape = 27;
constexpr std::int32_t key_f2 = 113;
constexpr std::int32_t key_f3 = 114;
constexpr std::int32_t key_f4 = 115;
constexpr std::int32_t key_f9 = 120;

struct ZoomItem {
  PreviewMenu item;
  double percent;
};
constexpr ZoomItem zoom_items[] = {
    {PreviewMenu::mnu25, 25},   {PreviewMenu::mnu50, 50},   {PreviewMenu::mnu75, 75},   {PreviewMenu::mnu100, 100},
    {PreviewMenu::mnu125, 125}, {PreviewMenu::mnu150, 150}, {PreviewMenu::mnu200, 200},
};

constexpr TextView no_pages = u"The print control that is registered in place of ours has no pages to show";

/// Runs an operation that fails silently.
template <class Work>
void silently(Work work) noexcept {
  try {
    work();
  } catch (...) {
    // Not reported: the window stays as it is.
  }
}

}  // namespace

/// The window as seen by the members that remember windows.
class FrmPrintPreview::FormObject final : public TableObject<FormObject> {
 public:
  FormObject(PreviewView& view, const Locale& locale) : TableObject(locale), view_(view) {}

  [[nodiscard]] std::int32_t state() const { return view_.window_state(); }
  void set_state(std::int32_t state) { view_.set_window_state(state); }
  [[nodiscard]] float width() const { return view_.width(); }
  void set_width(float width) { view_.set_width(width); }
  [[nodiscard]] float height() const { return view_.height(); }
  void set_height(float height) { view_.set_height(height); }

  template <class P>
  friend constexpr auto members_of(std::type_identity<FormObject>) {
    using F = FormObject;
    return P::rows(P::template accessors<&F::state, &F::set_state>("WindowState"),
                   P::template accessors<&F::width, &F::set_width>("Width"),
                   P::template accessors<&F::height, &F::set_height>("Height"));
  }

 private:
  PreviewView& view_;
};

FrmPrintPreview::FrmPrintPreview(Library& library) : library_(library) {}

FrmPrintPreview::~FrmPrintPreview() = default;

FrmPrintPreview::Building::Building(FrmPrintPreview& form, bool unattended) : form_(form) {
  if (form.is_building_ || (form.is_shown() && !unattended)) raise(ErrorNumber::form_already_displayed);
  form.is_building_ = true;
}

void FrmPrintPreview::load_controls() {
  if (print_) return;
  // Everything is created before anything is stored, so that a failure does not leave half a window.
  const ControlFactory& controls = library_.controls();
  const Locale locale = library_.locale();
  auto print = std::make_unique<Control>(controls.create(u"VSPrinter8LibCtl.VSPrinter"), locale);
  auto dialog = std::make_unique<Control>(controls.create(u"MSComDlg.CommonDialog"), locale);
  auto pdf = std::make_unique<Control>(controls.create(u"VSPDF8LibCtl.VSPDF8"), locale);
  dialog->put(u"DialogTitle", u"Save Data to PDF File");
  dialog->put(u"Filter", u"Adobe PDF Format *.pdf|*.pdf");
  pdf->put(u"Subject", u"ORV PDF Data");
  print_ = std::move(print);
  save_dialog_ = std::move(dialog);
  pdf_export_ = std::move(pdf);
}

const PreviewPages* FrmPrintPreview::pages() const { return dynamic_cast<const PreviewPages*>(print_->object().get()); }

void FrmPrintPreview::load() {
  if (is_loaded()) return;
  load_controls();
  const auto window = std::make_shared<Window>();
  window->view = library_.platform().form_windows.make_preview(*this, pages());
  window->form = std::make_shared<FormObject>(*window->view, library_.locale());
  window->utils = std::make_unique<ORVUtils>(library_);
  window_ = window;
  try {
    window->utils->AppendEventLog(u"FormLoad", Text(form_name));
    window->utils->LoadWindowState(window->form, Text(settings_section));
    twips_x_ = library_.platform().screen.twips_per_pixel_x();
    twips_y_ = library_.platform().screen.twips_per_pixel_y();
  } catch (...) {
    drop();
    throw;
  }
}

Control FrmPrintPreview::print_control() {
  load();
  return *print_;
}

void FrmPrintPreview::query_unload() {
  struct Dropped {
    FrmPrintPreview& form;
    ~Dropped() { form.drop(); }
  };
  const auto window = window_;
  const Dropped dropped{*this};
  const auto utils = std::move(window->utils);
  utils->AppendEventLog(u"FormQueryUnLoad", Text(form_name));
  utils->SaveWindowState(window->form, Text(settings_section));
}

void FrmPrintPreview::unload() {
  if (!is_loaded()) return;
  // The view reports the closing, which unloads. Only the waiting call drops the view, when its loop has ended.
  if (is_shown()) return window_->view->close();
  query_unload();
}

void FrmPrintPreview::drop() noexcept {
  window_.reset();
  // The control keeps its settings for the next report, but not the memory of this one's pages.
  if (auto* const pages = dynamic_cast<PrintControl*>(print_->object().get())) pages->discard();
}

void FrmPrintPreview::show_modal() {
  if (is_shown()) raise(ErrorNumber::form_already_displayed);
  load();
  if (pages() == nullptr) {
    unload();
    throw RunTimeError(ErrorNumber::action_not_supported, Text(no_pages));
  }
  const auto window = window_;
  {
    struct Shown {
      bool& flag;
      ~Shown() { flag = false; }
    };
    window->is_shown = true;
    const Shown shown{window->is_shown};
    window->view->show_modal();
  }
  if (window_ == window) unload();
  if (window->failure) std::rethrow_exception(window->failure);
}

/// An error of the control closes the window: its user could not do anything about it, but the caller of show_modal
/// can.
template <class Work>
void FrmPrintPreview::guarded(Work work) noexcept {
  const auto window = window_;
  if (!window) return;
  try {
    work(*window);
  } catch (...) {
    if (!window->failure) window->failure = std::current_exception();
    silently([&] { window->view->close(); });
  }
}

void FrmPrintPreview::show_caption(PreviewView& view) {
  const auto page = print_->get<std::int16_t>(u"CurrentPage");
  const auto count = print_->get<std::int16_t>(u"PageCount");
  view.set_caption((caption_text_.empty() ? report_name_ : caption_text_) + u"           Page " +
                   number_to_text(std::int32_t{page}) + u" of " + number_to_text(std::int32_t{count}) +
                   u"      Press F9 to Print.");
}

void FrmPrintPreview::go_to(PreviewView& view, std::int32_t page) {
  print_->put(u"CurrentPage", static_cast<std::int16_t>(page));
  view.show_page();
  show_caption(view);
}

void FrmPrintPreview::activated() noexcept {
  guarded([this](Window& window) {
    PreviewView& view = *window.view;
    if (view.window_state() == minimised) view.set_window_state(normal);
    show_caption(view);
    do_chosen(window, PreviewMenu::mnuPrev);
    window.is_loading = false;
  });
}

void FrmPrintPreview::resized() noexcept {
  guarded([this](Window& window) { keep_size(*window.view); });
}

void FrmPrintPreview::keep_size(PreviewView& view) {
  constexpr float smallest_width = 600;  // In pixels, like the next two.
  constexpr float smallest_height = 400;
  constexpr float frame = 10;
  if (twips_x_ == 0) return;
  if (view.window_state() == minimised) view.set_window_state(normal);
  if (view.inner_height() <= 0) return;
  if (view.width() < smallest_width * twips_x_) view.set_width(smallest_width * twips_x_);
  if (view.height() < smallest_height * twips_y_) view.set_height(smallest_height * twips_y_);
  view.size_pages(view.inner_width() - frame * twips_x_, view.inner_height() - frame * twips_y_);
}

void FrmPrintPreview::set_zoom(PreviewView& view, PreviewMenu chosen_item) {
  const auto* const chosen = std::ranges::find(zoom_items, chosen_item, &ZoomItem::item);
  print_->put(u"Zoom", chosen->percent);
  for (const ZoomItem& zoom : zoom_items) view.check(zoom.item, false);
  view.check(chosen->item, true);
  view.show_page();
}

void FrmPrintPreview::zoom_step(bool larger) noexcept {
  guarded([&](Window& window) {
    const auto zoom = print_->get<double>(u"Zoom");
    if (larger) {
      const auto* const next =
          std::ranges::find_if(zoom_items, [&](const ZoomItem& item) { return item.percent > zoom; });
      if (next != std::end(zoom_items)) set_zoom(*window.view, next->item);
    } else {
      const auto next = std::find_if(std::rbegin(zoom_items), std::rend(zoom_items),
                                     [&](const ZoomItem& item) { return item.percent < zoom; });
      if (next != std::rend(zoom_items)) set_zoom(*window.view, next->item);
    }
  });
}

void FrmPrintPreview::export_to_chosen_file(const Window& window) {
  save_dialog_->put(u"CancelError", Boolean(true));
  save_dialog_->put(u"InitDir", export_folder_);
  window.utils->VerifyFilePath(save_dialog_->get<Text>(u"InitDir"));
  save_dialog_->put(u"FileName", u"*.pdf");
  save_dialog_->call(u"ShowSave");
  // The dialog processes messages, and a host's timer may have unloaded the window along with its document.
  if (window_.get() != &window) return;
  const Text file = save_dialog_->get<Text>(u"FileName");
  if (!file.empty()) ExportToPDF(file, Boolean(false));
}

void FrmPrintPreview::ExportToPDF(const Text& path, Boolean /*flag*/) {
  silently([&] {
    load();
    // A copy, because ExtractPathName changes its argument, but the export needs the path as the host passed it.
    Text whole = path;
    library_.platform().files.make_path(window_->utils->ExtractPathName(whole));
    const auto hourglass = library_.platform().form_windows.show_hourglass();
    // Only what somebody asked for and waits for can be given up.
    const auto* const ours = dynamic_cast<const PdfExport*>(pdf_export_->object().get());
    if (ours != nullptr && is_shown())
      ours->convert(print_->object(), path, [&] { return hourglass->is_given_up(); });
    else
      pdf_export_->call(u"ConvertDocument", {print_->object(), path});
  });
}

void FrmPrintPreview::do_chosen(Window& window, PreviewMenu item) {
  PreviewView& view = *window.view;
  switch (item) {
    case PreviewMenu::mnuPrinter:
      silently([this] { print_->call(u"PrintDoc", {Boolean(true)}); });
      break;
    case PreviewMenu::mnuExportPDF:
      silently([&] { export_to_chosen_file(window); });
      break;
    case PreviewMenu::mnuClose:
      view.close();
      break;
    case PreviewMenu::mnuPrev:
      go_to(view, std::max<std::int32_t>(1, print_->get<std::int16_t>(u"CurrentPage") - 1));
      break;
    case PreviewMenu::mnuNext:
      go_to(view, std::min<std::int32_t>(print_->get<std::int16_t>(u"PageCount"),
                                         print_->get<std::int16_t>(u"CurrentPage") + 1));
      break;
    default:
      for (const auto& [property, choices] : {size_choices, duplex_choices}) {
        const auto chosen = std::ranges::find(choices, item, &PaperChoice::item);
        if (chosen != choices.end()) print_->put(property, chosen->code);
      }
      if (std::ranges::find(zoom_items, item, &ZoomItem::item) != std::end(zoom_items)) set_zoom(view, item);
      break;
  }
}

void FrmPrintPreview::chosen(PreviewMenu item) noexcept {
  guarded([&](Window& window) { do_chosen(window, item); });
}

std::int32_t FrmPrintPreview::key_down(std::int32_t code) noexcept {
  if (!is_loaded() || window_->is_loading || code == key_alt) return code;
  if (code == key_escape) chosen(PreviewMenu::mnuClose);
  if (code == key_f9) chosen(PreviewMenu::mnuPrinter);
  if (code == key_f2) chosen(PreviewMenu::mnuPrev);
  if (code == key_f3) chosen(PreviewMenu::mnuNext);
  // Report a different key, so that the host's forms do not act on this one as well.
  return key_f4;
}

void FrmPrintPreview::closing() noexcept {
  guarded([this](Window& /*window*/) { query_unload(); });
}

}  // namespace talutil
