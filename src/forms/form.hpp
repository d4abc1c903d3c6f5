#pragma once

#include <memory>

#include "library/library.hpp"
#include "platform/form_view.hpp"

namespace talutil {

/// A window of the library: loaded on first use, at most one of each kind.
class Form : public FormEvents, public LibraryPart {
 public:
  ~Form() override;

  [[nodiscard]] bool is_loaded() const noexcept { return view_ != nullptr && view_->is_open(); }

  /// Closes the window by code.
  void unload();

  [[nodiscard]] bool is_shown_modal() const noexcept { return modal_calls_ > 0; }

  void clicked(std::uint8_t part) noexcept final;
  void tab_chosen(std::uint8_t part, std::int32_t tab) noexcept final;
  void escaped() noexcept final;
  void closing(CloseMode mode) noexcept final;

 protected:
  Form(Library& library, const FormDescription& description) : library_(library), description_(description) {}

  /// Returns the window, creating and filling it if necessary. Raises 445 where there is no screen.
  FormView& load();

  /// Shows the window until it is closed; a window that is already visible comes to the front.
  void show_modal();

  [[nodiscard]] Library& library() const noexcept { return library_; }

  // What each kind of window does. Errors in the last four are shown to the user in a message box.
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
