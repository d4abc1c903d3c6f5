#pragma once

#include <optional>

#include "controls/grid.hpp"
#include "forms/form.hpp"
#include "infoforms/system_report.hpp"

namespace talutil {

/// The system information: drives, memory, processor, operating system, and the details of a folder or file.
class FrmSysInfo final : public Form {
 public:
  enum Part : std::uint8_t {
    tabs,
    path_label,
    path,
    show,
    choose_folder,
    choose_file,
    facts,
    details,
    refresh,
    copy,
    close
  };

  explicit FrmSysInfo(Library& library);

  /// Shows the window until it is closed.
  void show_window() { show_modal(); }

 protected:
  void fill(FormView& view) override;
  void on_click(std::uint8_t part) override;
  void on_tab(std::int32_t tab) override;

 private:
  [[nodiscard]] bool is_item_shown() const noexcept;
  void read();
  void show_tab(FormView& view);
  void show_item(FormView& view, const Text& path);

  Grid facts_;
  Grid details_;
  std::vector<FactTable> tables_;
  std::optional<FactTable> item_;
  std::int32_t tab_ = 0;
};

}  // namespace talutil
