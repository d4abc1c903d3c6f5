#pragma once

#include "automation/variant.hpp"
#include "forms/form.hpp"

namespace talutil {

/// The list of the host's shortcut keys. It stays above all other windows until the user closes it.
class FrmShKeys final : public Form {
 public:
  static constexpr std::uint8_t cmdPrint = 0;
  static constexpr std::uint8_t cmdCross = 1;
  static constexpr std::uint8_t keys_label = 2;
  static constexpr std::uint8_t Text1 = 3;

  static constexpr std::int16_t crossed = -99;  ///< The result after the cross button or the close box.

  explicit FrmShKeys(Library& library);

  /// Shows the window, or the existing one, and returns.
  void show();

  /// Prints the list after showing the printer dialog. Raises the print control's errors.
  void print();

  /// Sets the result to 0 and unloads the window.
  void close();

  [[nodiscard]] std::int16_t result() const noexcept { return result_; }

 protected:
  void fill(FormView& view) override;
  void on_click(std::uint8_t part) override;
  void on_escape() override { close(); }
  void on_closing(CloseMode mode) override;

 private:
  std::int16_t result_ = 0;
};

}  // namespace talutil
