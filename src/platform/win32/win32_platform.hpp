#pragma once

#include <atomic>
#include <optional>

#include "platform/platform.hpp"
#include "platform/win32/win32_code_page.hpp"
#include "platform/win32/win32_cryptography.hpp"
#include "platform/win32/win32_drawing.hpp"
#include "platform/win32/win32_file_dialogs.hpp"
#include "platform/win32/win32_files.hpp"
#include "platform/win32/win32_folder_picker.hpp"
#include "platform/win32/win32_folders.hpp"
#include "platform/win32/win32_guids.hpp"
#include "platform/win32/win32_input_boxes.hpp"
#include "platform/win32/win32_machine.hpp"
#include "platform/win32/win32_printers.hpp"
#include "platform/win32/win32_registry.hpp"
#include "platform/win32/win32_settings.hpp"
#include "platform/win32/win32_time_conversions.hpp"

namespace talutil::win32 {

class Win32MessageBoxes final : public MessageBoxes {
 public:
  MessageAnswer show(TextView text, MessageButtons buttons, TextView title) override;
};

class Win32Screen final : public Screen {
 public:
  float twips_per_pixel_x() override;
  float twips_per_pixel_y() override;
  void reset_pointer() override;
};

class Win32Computer final : public Computer {
 public:
  Text name() override;
  Locale locale() override;

 private:
  std::optional<Locale> locale_;
};

class Win32Clock final : public Clock {
 public:
  Date now() override;
  std::int32_t year() override;

 private:
  std::atomic<std::uint64_t> known_year_ = 0;  ///< The second in which it was found, and in the last 16 bits the year.
};

class Win32FormWindows final : public FormWindows {
 public:
  /// The window's `handle` raises 51 if the platform cannot create it.
  std::unique_ptr<HiddenWindow> make_hidden(TextView caption) override;
  std::unique_ptr<FormView> make_form(FormEvents& events, const FormDescription& description) override;
  std::unique_ptr<PreviewView> make_preview(PreviewEvents& events, const PreviewPages* pages) override;
  std::unique_ptr<Waiting> show_hourglass() override;
};

class Win32MessagePump final : public MessagePump {
 public:
  bool handle_waiting() override;
  bool wait_and_handle() override;
};

/// One instance of each implementation, for a library to use. Must outlive the library.
struct Win32Platform {
  /// The COM layer supplies the makers of third-party controls.
  explicit Win32Platform(ControlMakers& makers) noexcept : control_makers(makers) {}

  ControlMakers& control_makers;
  Win32MessageBoxes message_boxes;
  Win32Screen screen;
  Win32Computer computer;
  Win32Clock clock;
  Win32FormWindows form_windows;
  Win32MessagePump message_pump;
  Win32RandomSource random_source;
  Win32Cryptography cryptography;
  Win32Profiles profiles;
  Win32SettingsStore settings_store;
  Win32TimeConversions time_conversions;
  Win32Files files;
  Win32FolderPicker folder_picker;
  Win32Guids guids;
  Win32Folders folders;
  Win32InputBoxes input_boxes;
  Win32Registry registry;
  Win32Network network;
  Win32FileDialogs file_dialogs;
  Win32Drawing drawing;
  Win32WindowPrinting window_printing;
  Win32FontFiles font_files;
  Win32Printers printers;
  Win32Machine machine;
  Win32CodePage code_page;

  [[nodiscard]] Platform platform() {
    return {message_boxes,   screen,       computer,    clock,          form_windows,     control_makers, message_pump,
            random_source,   cryptography, profiles,    settings_store, time_conversions, files,          folder_picker,
            guids,           folders,      input_boxes, registry,       network,          file_dialogs,   drawing,
            window_printing, font_files,   printers,    machine,        code_page};
  }
};

}  // namespace talutil::win32
