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

  /// The print control; loads the window if necessary.
  [[nodiscard]] const Control& print_control();

  /// Writes the document to a PDF file and creates its folder if necessary. The flag has no effect. Fails silently.
  void ExportToPDF(const Text& path, Boolean flag);

  /// Shows the window until it is closed. Raises 400 if it is already on the screen. Errors during paging and zooming
  /// close the window and are raised here; only printing and exporting fail silently.
  void show_modal();

  void unload();
  [[nodiscard]] bool is_loaded() const noexcept { return view_ != nullptr; }
  [[nodiscard]] bool is_shown() const noexcept { return is_shown_; }

  void activated() noexcept override;
  void resized() noexcept override;
  void chosen(PreviewMenu item) noexcept override;
  std::int32_t key_down(std::int32_t code) noexcept override;
  void closing() noexcept override;
  void zoom_step(bool larger) noexcept override;

 private:
  class FormObject;

  void load();
  void query_unload();
  void drop() noexcept;
  template <class Work>
  void guarded(Work work) noexcept;
  void do_chosen(PreviewMenu item);
  void show_caption();
  void go_to(std::int32_t page);
  void set_zoom(PreviewMenu item);
  void export_to_chosen_file();
  void keep_size();

  Library& library_;
  Text caption_text_;
  Text report_name_;
  Text export_folder_;
  std::unique_ptr<ORVUtils> utils_;
  std::unique_ptr<PreviewView> view_;
  std::unique_ptr<Control> print_;
  std::unique_ptr<Control> save_dialog_;
  std::unique_ptr<Control> pdf_export_;
  ObjectRef form_;
  std::exception_ptr failure_;  ///< Raised by show_modal when the window has closed.
  bool is_loading_ = false;     ///< True from loading until the first activation.
  bool is_shown_ = false;
  float twips_x_ = 0;
  float twips_y_ = 0;
};

}  // namespace talutil
