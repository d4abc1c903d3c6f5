#pragma once

#include "controls/grid.hpp"
#include "forms/form.hpp"

namespace talutil {

/// The switches of the host's command line in a grid, followed by examples.
class FrmCmdLineHelp final : public Form {
 public:
  static constexpr std::uint8_t Grid1 = 0;
  static constexpr std::uint8_t examples_label = 1;
  static constexpr std::uint8_t rtbExamples = 2;

  explicit FrmCmdLineHelp(Library& library);

  /// Shows the window until it is closed.
  void show() { show_modal(); }

 protected:
  void fill(FormView& view) override;
  void on_click(std::uint8_t /*part*/) override {}

 private:
  Grid grid_;
};

}  // namespace talutil
