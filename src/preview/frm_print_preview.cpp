#include "preview/frm_print_preview.hpp"

#include <algorithm>
#include <iterator>

#include "automation/control.hpp"
#include "automation/run_time_error.hpp"
#include "controls/control_factory.hpp"
#include "controls/print_control.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

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
    return P::rows(
        P::template accessors<&F::state, &F::set_state>("WindowState", "0 normal, 1 minimised, 2 maximised."),
        P::template accessors<&F::width, &F::set_width>("Width", "The width, in twips."),
        P::template accessors<&F::height, &F::set_height>("Height", "The height, in twips."));
  }

 private:
  PreviewView& view_;
};

FrmPrintPreview::FrmPrintPreview(Library& library) : library_(library) {}

FrmPrintPreview::~FrmPrintPreview() = default;

void FrmPrintPreview::load() {
  if (is_loaded()) return;
  // Everything is created before anything is stored, so that a failure does not leave half a window.
  const ControlFactory& controls = library_.controls();
  const Locale locale = library_.locale();
  auto print = std::make_unique<Control>(controls.create(u"VSPrinter8LibCtl.VSPrinter"), locale);
  auto dialog = std::make_unique<Control>(controls.create(u"MSComDlg.CommonDialog"), locale);
  auto pdf = std::make_unique<Control>(controls.create(u"VSPDF8LibCtl.VSPDF8"), locale);
  dialog->put(u"DialogTitle", u"Save Data to PDF File");
  dialog->put(u"Filter", u"Adobe PDF Format *.pdf|*.pdf");
  pdf->put(u"Subject", u"ORV PDF Data");
  auto view =
      library_.platform().form_windows.make_preview(*this, dynamic_cast<const PreviewPages*>(print->object().get()));
  auto form = std::make_shared<FormObject>(*view, locale);
  utils_ = std::make_unique<ORVUtils>(library_);
  print_ = std::move(print);
  save_dialog_ = std::move(dialog);
  pdf_export_ = std::move(pdf);
  view_ = std::move(view);
  form_ = std::move(form);

  is_loading_ = true;
  try {
    utils_->AppendEventLog(u"FormLoad", Text(form_name));
    utils_->LoadWindowState(form_, Text(settings_section));
    twips_x_ = library_.platform().screen.twips_per_pixel_x();
    twips_y_ = library_.platform().screen.twips_per_pixel_y();
  } catch (...) {
    drop();
    throw;
  }
}

const Control& FrmPrintPreview::print_control() {
  load();
  return *print_;
}

void FrmPrintPreview::query_unload() {
  if (!utils_) return;
  const auto utils = std::move(utils_);
  utils->AppendEventLog(u"FormQueryUnLoad", Text(form_name));
  utils->SaveWindowState(form_, Text(settings_section));
}

void FrmPrintPreview::unload() {
  if (!is_loaded()) return;
  struct Dropped {
    FrmPrintPreview& form;
    ~Dropped() { form.drop(); }
  };
  const Dropped dropped{*this};
  query_unload();
}

void FrmPrintPreview::drop() noexcept {
  utils_.reset();
  form_.reset();
  view_.reset();
  print_.reset();
  save_dialog_.reset();
  pdf_export_.reset();
}

void FrmPrintPreview::show_modal() {
  if (is_shown_) raise(ErrorNumber::form_already_displayed);
  load();
  struct Shown {
    bool& flag;
    ~Shown() { flag = false; }
  };
  is_shown_ = true;
  {
    const Shown shown{is_shown_};
    failure_ = nullptr;
    view_->show_modal();
  }
  unload();
  if (failure_) std::rethrow_exception(std::exchange(failure_, nullptr));
}

/// An error of the control closes the window: its user could not do anything about it, but the caller of show_modal
/// can.
template <class Work>
void FrmPrintPreview::guarded(Work work) noexcept {
  try {
    if (is_loaded()) work();
  } catch (...) {
    failure_ = std::current_exception();
    silently([this] { view_->close(); });
  }
}

void FrmPrintPreview::show_caption() {
  const auto page = print_->get<std::int16_t>(u"CurrentPage");
  const auto count = print_->get<std::int16_t>(u"PageCount");
  view_->set_caption((caption_text_.empty() ? report_name_ : caption_text_) + u"           Page " +
                     number_to_text(std::int32_t{page}) + u" of " + number_to_text(std::int32_t{count}) +
                     u"      Press F9 to Print.");
}

void FrmPrintPreview::go_to(std::int32_t page) {
  print_->put(u"CurrentPage", static_cast<std::int16_t>(page));
  view_->show_page();
  show_caption();
}

void FrmPrintPreview::activated() noexcept {
  guarded([this] {
    if (view_->window_state() == minimised) view_->set_window_state(normal);
    show_caption();
    do_chosen(PreviewMenu::mnuPrev);
    is_loading_ = false;
  });
}

void FrmPrintPreview::resized() noexcept {
  guarded([this] { keep_size(); });
}

void FrmPrintPreview::keep_size() {
  constexpr float smallest_width = 600;  // In pixels, like the next two.
  constexpr float smallest_height = 400;
  constexpr float frame = 10;
  if (twips_x_ == 0) return;
  if (view_->window_state() == minimised) view_->set_window_state(normal);
  if (view_->inner_height() <= 0) return;
  if (view_->width() < smallest_width * twips_x_) view_->set_width(smallest_width * twips_x_);
  if (view_->height() < smallest_height * twips_y_) view_->set_height(smallest_height * twips_y_);
  view_->size_pages(view_->inner_width() - frame * twips_x_, view_->inner_height() - frame * twips_y_);
}

void FrmPrintPreview::set_zoom(PreviewMenu chosen_item) {
  const auto* const chosen = std::ranges::find(zoom_items, chosen_item, &ZoomItem::item);
  print_->put(u"Zoom", chosen->percent);
  for (const ZoomItem& zoom : zoom_items) view_->check(zoom.item, false);
  view_->check(chosen->item, true);
  view_->show_page();
}

void FrmPrintPreview::zoom_step(bool larger) noexcept {
  guarded([&] {
    const auto zoom = print_->get<double>(u"Zoom");
    if (larger) {
      const auto* const next =
          std::ranges::find_if(zoom_items, [&](const ZoomItem& item) { return item.percent > zoom; });
      if (next != std::end(zoom_items)) set_zoom(next->item);
    } else {
      const auto next = std::find_if(std::rbegin(zoom_items), std::rend(zoom_items),
                                     [&](const ZoomItem& item) { return item.percent < zoom; });
      if (next != std::rend(zoom_items)) set_zoom(next->item);
    }
  });
}

void FrmPrintPreview::export_to_chosen_file() {
  save_dialog_->put(u"CancelError", Boolean(true));
  save_dialog_->put(u"InitDir", export_folder_);
  utils_->VerifyFilePath(save_dialog_->get<Text>(u"InitDir"));
  save_dialog_->put(u"FileName", u"*.pdf");
  save_dialog_->call(u"ShowSave");
  const Text file = save_dialog_->get<Text>(u"FileName");
  if (!file.empty()) ExportToPDF(file, Boolean(false));
}

void FrmPrintPreview::ExportToPDF(const Text& path, Boolean /*flag*/) {
  silently([&] {
    load();
    // A copy, because ExtractPathName changes its argument, but the export needs the path as the host passed it.
    Text whole = path;
    library_.platform().files.make_path(utils_->ExtractPathName(whole));
    pdf_export_->call(u"ConvertDocument", {print_->object(), path});
  });
}

void FrmPrintPreview::do_chosen(PreviewMenu item) {
  switch (item) {
    case PreviewMenu::mnuPrinter:
      silently([this] { print_->call(u"PrintDoc", {Boolean(true)}); });
      break;
    case PreviewMenu::mnuExportPDF:
      silently([this] { export_to_chosen_file(); });
      break;
    case PreviewMenu::mnuClose:
      view_->close();
      break;
    case PreviewMenu::mnuPrev:
      go_to(std::max<std::int32_t>(1, print_->get<std::int16_t>(u"CurrentPage") - 1));
      break;
    case PreviewMenu::mnuNext:
      go_to(std::min<std::int32_t>(print_->get<std::int16_t>(u"PageCount"),
                                   print_->get<std::int16_t>(u"CurrentPage") + 1));
      break;
    case PreviewMenu::mnuA3:
      print_->put(u"PaperSize", std::int16_t{8});
      break;
    case PreviewMenu::mnuA4:
      print_->put(u"PaperSize", std::int16_t{9});
      break;
    case PreviewMenu::mnuSimplex:
      print_->put(u"Duplex", std::int16_t{1});
      break;
    case PreviewMenu::mnuVertical:
      print_->put(u"Duplex", std::int16_t{2});
      break;
    case PreviewMenu::mnuHorizontal:
      print_->put(u"Duplex", std::int16_t{3});
      break;
    default:
      if (std::ranges::find(zoom_items, item, &ZoomItem::item) != std::end(zoom_items)) set_zoom(item);
      break;
  }
}

void FrmPrintPreview::chosen(PreviewMenu item) noexcept {
  guarded([&] { do_chosen(item); });
}

std::int32_t FrmPrintPreview::key_down(std::int32_t code) noexcept {
  if (is_loading_ || !is_loaded() || code == key_alt) return code;
  if (code == key_escape) chosen(PreviewMenu::mnuClose);
  if (code == key_f9) chosen(PreviewMenu::mnuPrinter);
  if (code == key_f2) chosen(PreviewMenu::mnuPrev);
  if (code == key_f3) chosen(PreviewMenu::mnuNext);
  // Report a different key, so that the host's forms do not act on this one as well.
  return key_f4;
}

void FrmPrintPreview::closing() noexcept {
  guarded([this] { query_unload(); });
}

}  // namespace talutil
