#pragma once

#include "automation/boolean.hpp"
#include "forms/form.hpp"

namespace talutil {

/// The library's input box: a prompt, an entry and an OK button, above all other windows. Its result, and the loss of
/// its frame, last from one use to the next.
class FrmInputBox final : public Form {
 public:
  static constexpr std::uint8_t lblPrompt = 0;
  static constexpr std::uint8_t txtUserInput = 1;
  static constexpr std::uint8_t cmdOK = 2;

  explicit FrmInputBox(Library& library);

  struct Question {
    Text caption;
    Text prompt;
    Boolean is_masked;
    Boolean has_entry{true};
    Boolean is_frameless;
    Boolean is_unclosable;
    std::int32_t colour = 0;
  };

  /// Shows the box and returns the result: the text of the entry, or an empty text if the box was closed by its menu. A
  /// question without a frame that cannot be closed is a notice; the call does not wait for it and returns the previous
  /// result. Raises 400 if the box is already on the screen, unless both are notices: the first then shows the second's
  /// text.
  [[nodiscard]] Text ask(const Question& question);

 protected:
  void fill(FormView& view) override;
  void on_click(std::uint8_t part) override;
  void on_escape() override;
  void on_closing(CloseMode mode) override;

 private:
  void show_texts(FormView& view) const;

  Text caption_;
  Text prompt_;
  bool is_masked_ = false;
  bool is_frameless_ = false;
  bool is_unclosable_ = false;
  std::int32_t colour_ = 0;
  Text result_;
};

}  // namespace talutil
