#pragma once

#include <memory>

#include "automation/locale.hpp"
#include "dates/week_tables.hpp"
#include "library/shared_settings.hpp"
#include "platform/platform.hpp"
#include "services/mod_zip_files.hpp"

namespace talutil {

class ControlFactory;
class FrmCmdLineHelp;
class FrmComponents;
class FrmInputBox;
class FrmPrintPreview;
class FrmShKeys;
class FrmSysInfo;

/// One loaded library: the shared settings, the platform and the components window. The DLL has exactly one.
class Library {
 public:
  explicit Library(const Platform& platform);
  Library(const Library&) = delete;
  Library& operator=(const Library&) = delete;
  ~Library();

  /// The start-up routine, run once and before the first object is handed out: loads the components window,
  /// which fills ComputerName, then reads the screen's twips per pixel (rounded, halves to even).
  void start();

  [[nodiscard]] SharedSettings& settings() noexcept { return settings_; }
  [[nodiscard]] WeekTables& week_tables() noexcept { return week_tables_; }
  [[nodiscard]] ModZipFiles& zip_files() noexcept { return zip_files_; }
  [[nodiscard]] const Platform& platform() const noexcept { return platform_; }
  [[nodiscard]] FrmComponents& components() noexcept { return *components_; }
  [[nodiscard]] const ControlFactory& controls() const noexcept { return *controls_; }

  // Windows, made when they are first asked for.
  [[nodiscard]] FrmPrintPreview& preview();
  [[nodiscard]] FrmInputBox& input_box();
  [[nodiscard]] FrmShKeys& shortcut_keys();
  [[nodiscard]] FrmCmdLineHelp& command_line_help();
  [[nodiscard]] FrmSysInfo& system_information();

  /// Whether one of them is on the screen.
  [[nodiscard]] bool has_open_windows() const noexcept;

  /// Takes those off the screen that nobody waits for.
  void close_notices();

  /// The user's separators, with the current year of the clock.
  [[nodiscard]] Locale locale() const;

 private:
  Platform platform_;
  SharedSettings settings_;
  WeekTables week_tables_;
  ModZipFiles zip_files_;
  std::unique_ptr<ControlFactory> controls_;
  std::unique_ptr<FrmComponents> components_;
  std::unique_ptr<FrmPrintPreview> preview_;
  std::unique_ptr<FrmInputBox> input_box_;
  std::unique_ptr<FrmShKeys> shortcut_keys_;
  std::unique_ptr<FrmCmdLineHelp> command_line_help_;
  std::unique_ptr<FrmSysInfo> system_information_;
};

}  // namespace talutil
