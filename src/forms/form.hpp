#pragma once

#include <memory>

#include "library/library.hpp"
#include "platform/form_view.hpp"

namespace talutil {

/// A window of the library: loaded when something first needs it, one of its kind at a time.
class Form : public FormEvents, public LibraryPart {
 public:
  ~Form() override;

  [[nodiscard]] bool is_loaded() const noexcept { return view_ != nullptr && view_->is_open(); }

  /// Closes the window, as code does.
  void unload();

  [[nodiscard]] bool is_shown_modal() const noexcept { return modal_calls_ > 0; }

  void clicked(std::uint8_t part) noexcept final;
  void tab_chosen(std::uint8_t part, std::int32_t tab) noexcept final;
  void escaped() noexcept final;
  void closing(CloseMode mode) noexcept final;

 protected:
  Form(Library& library, const FormDescription& description) : library_(library), description_(description) {}

  /// The window, made and filled if need be. Raises 445 where there is no screen.
  FormView& load();

  /// Shows the window until it is closed; one that is shown already returns to the front.
  void show_modal();

  [[nodiscard]] Library& library() const noexcept { return library_; }

  // What the kinds of windows do. Errors of the last four are shown to the user in a box.
  virtual void fill(FormView& view) = 0;
  virtual void on_click(std::uint8_t part) = 0;
  virtual void on_tab(std::int32_t /*tab*/) {}
  virtual void on_escape() { unload(); }
  virtual void on_closing(CloseMode /*mode*/) {}

 private:
  template <class Work>
  void report_errors(Work work) noexcept;

  Library& library_;
  const FormDescription& description_;
  std::unique_ptr<FormView> view_;
  int modal_calls_ = 0;
};

}  // namespace talutil
