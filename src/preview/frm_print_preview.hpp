#pragma once

#include <exception>
#include <memory>

#include "automation/control.hpp"
#include "controls/table_object.hpp"
#include "library/library.hpp"
#include "platform/preview_view.hpp"

namespace talutil {

class ORVUtils;

/// The print preview window: its state and behaviour, on top of a view. There is one per library, loaded when something
/// first accesses its controls. For the members that remember windows it is also a form: an object with WindowState,
/// Width and Height.
class FrmPrintPreview final : public PreviewEvents, public LibraryPart {
 public:
  static constexpr TextView form_name = u"frmPrintPreview";
  static constexpr TextView settings_section = u"PrintPreview";

  explicit FrmPrintPreview(Library& library);
  ~FrmPrintPreview() override;

  void set_caption_text(Text text) { caption_text_ = std::move(text); }
  void set_report_name(Text name) { report_name_ = std::move(name); }
  void set_export_folder(Text folder) { export_folder_ = std::move(folder); }

  /// The print control; loads the window if necessary. It is the same one for all reports, whose settings it keeps, and
  /// outlives every window. The result holds a reference of its own.
  [[nodiscard]] Control print_control();

  /// While it exists, a report is being built, during which hosts are asked for its contents and may call anything.
  class Building {
   public:
    /// Raises 400, having changed nothing, if another report is being built or, unless the report is `unattended`,
    /// while the window is on the screen. An unattended report takes the place of the one shown, whose window closes.
    Building(FrmPrintPreview& form, bool unattended);
    Building(const Building&) = delete;
    Building& operator=(const Building&) = delete;
    ~Building() { form_.is_building_ = false; }

   private:
    FrmPrintPreview& form_;
  };

  /// Writes the document to a PDF file and creates its folder if necessary. The flag has no effect. Fails silently.
  void ExportToPDF(const Text& path, Boolean flag);

  /// Shows the window until it is closed. Raises 400 if it is already on the screen, 445 if there is no screen or a
  /// third-party print control has no pages to show. Errors during paging and zooming
  /// close the window and are raised here; only printing and exporting fail silently.
  void show_modal();

  /// Unloads the window. If it is on the screen it closes, and show_modal returns as soon as the code that called this
  /// has.
  void unload();
  [[nodiscard]] bool is_loaded() const noexcept { return window_ != nullptr; }
  [[nodiscard]] bool is_shown() const noexcept { return is_loaded() && window_->is_shown; }

  void activated() noexcept override;
  void resized() noexcept override;
  void chosen(PreviewMenu item) noexcept override;
  std::int32_t key_down(std::int32_t code) noexcept override;
  void closing() noexcept override;
  void zoom_step(bool larger) noexcept override;

 private:
  class FormObject;

  /// A window from loading to unloading. Events and show_modal hold it, because a host that is called meanwhile, or a
  /// dialog that processes messages, may unload it.
  struct Window {
    std::unique_ptr<PreviewView> view;
    ObjectRef form;                   ///< Refers to the view.
    std::unique_ptr<ORVUtils> utils;  ///< Released when the window is about to close.
    std::exception_ptr failure;       ///< Raised by show_modal when the window has closed.
    bool is_loading = true;           ///< Until the first activation.
    bool is_shown = false;
  };

  void load();
  void load_controls();

  /// What the window shows; null for a third-party print control, which can only be driven.
  [[nodiscard]] const PreviewPages* pages() const;
  /// Reports the closing, keeps the window's size and drops it, even if that fails.
  void query_unload();
  void drop() noexcept;
  template <class Work>
  void guarded(Work work) noexcept;
  void do_chosen(Window& window, PreviewMenu item);
  void show_caption(PreviewView& view);
  void go_to(PreviewView& view, std::int32_t page);
  void set_zoom(PreviewView& view, PreviewMenu item);
  void export_to_chosen_file(const Window& window);
  void keep_size(PreviewView& view);

  Library& library_;
  Text caption_text_;
  Text report_name_;
  Text export_folder_;
  // The controls are created with the first window and used by all.
  std::unique_ptr<Control> print_;
  std::unique_ptr<Control> save_dialog_;
  std::unique_ptr<Control> pdf_export_;
  std::shared_ptr<Window> window_;  ///< Null while none is loaded.
  bool is_building_ = false;
  float twips_x_ = 0;
  float twips_y_ = 0;
};

}  // namespace talutil
