#pragma once

#include <array>
#include <memory>

#include "automation/object.hpp"
#include "library/components.hpp"
#include "library/shared_settings.hpp"
#include "platform/platform.hpp"

namespace talutil {

class ControlFactory;

/// The hidden window: it contains the non-visual controls that members drive, and owns the library's dialogs. It is
/// created on first use and closed by Terminate.
class FrmComponents final : public Components {
 public:
  static constexpr TextView caption = u"Form1";

  struct Place {
    TextView name;
    TextView class_name;
  };

  /// The controls in their order on the window.
  static constexpr std::array<Place, 7> places{{
      {u"Crypto1", u"PolarCryptoLibCtl.Crypto"},
      {u"Open1", u"MSComDlg.CommonDialog"},
      {u"dlgSave2", u"MSComDlg.CommonDialog"},
      {u"Grid1", u"VSFlex8Ctl.VSFlexGrid"},
      {u"MSysInfo1", u"SystemInfoControl.MSysInfo"},
      {u"UnZipCtrl", u"DUZACTXLibCtl.duzactxctrl"},
      {u"ZipCtrl", u"DZACTXLibCtl.dzactxctrl"},
  }};

  FrmComponents(const Platform& platform, const ControlFactory& factory, SharedSettings& settings);

  [[nodiscard]] bool is_loaded() const noexcept { return window_ != nullptr; }

  void load() override;
  void unload() override;
  [[nodiscard]] ObjectRef control(TextView name) override;
  [[nodiscard]] ObjectRef borrow_scratch_grid() override;
  [[nodiscard]] std::intptr_t owner_handle() override;

  /// The host's data connection calls this to report an error: shows it and stores its number.
  void report_database_error(std::int32_t number, const Text& description, std::int32_t code, const Text& source,
                             const Text& help_file, const Text& context);

  /// The number of the last error reported since the window was loaded; 0 if there was none.
  [[nodiscard]] std::int32_t last_database_error() const noexcept { return last_database_error_; }

 private:
  using Controls = std::array<ObjectRef, places.size()>;

  const Platform& platform_;
  const ControlFactory& factory_;
  SharedSettings& settings_;
  std::unique_ptr<HiddenWindow> window_;
  Controls controls_;
  std::int32_t last_database_error_ = 0;
  bool is_scratch_grid_lent_ = false;
};

}  // namespace talutil
