#pragma once

#include <optional>

#include "platform/platform.hpp"
#include "platform/posix/posix_code_page.hpp"
#include "platform/posix/posix_cryptography.hpp"
#include "platform/posix/posix_file_dialogs.hpp"
#include "platform/posix/posix_files.hpp"
#include "platform/posix/posix_folder_picker.hpp"
#include "platform/posix/posix_folders.hpp"
#include "platform/posix/posix_guids.hpp"
#include "platform/posix/posix_input_boxes.hpp"
#include "platform/posix/posix_machine.hpp"
#include "platform/posix/posix_printers.hpp"
#include "platform/posix/posix_registry.hpp"
#include "platform/posix/posix_settings.hpp"
#include "platform/posix/posix_time_conversions.hpp"
#include "platform/posix/terminal.hpp"

namespace talutil::posix {

/// Message boxes on the terminal: the text goes to standard error, the answer comes from standard input.
class PosixMessageBoxes final : public MessageBoxes {
 public:
  explicit PosixMessageBoxes(const Terminal& terminal) noexcept : terminal_(terminal) {}

  MessageAnswer show(TextView text, MessageButtons buttons, TextView title) override;

 private:
  const Terminal& terminal_;
};

/// There is no screen to ask; 96 dpi is what documents and forms are designed for.
class PosixScreen final : public Screen {
 public:
  float twips_per_pixel_x() override { return standard_twips_per_pixel; }
  float twips_per_pixel_y() override { return standard_twips_per_pixel; }
  void reset_pointer() override {}

 private:
  static constexpr float standard_twips_per_pixel = 15;
};

class PosixComputer final : public Computer {
 public:
  /// The host name without its domain, in upper case, as hosts of the library know computers.
  Text name() override;

  /// From the environment (LC_ALL, LC_NUMERIC and so on), with defaults for whatever it leaves open.
  Locale locale() override;

 private:
  std::optional<Locale> locale_;
};

class PosixClock final : public Clock {
 public:
  Date now() override;
};

/// Windows that are never shown need no window system: they are objects without a handle.
class PosixFormWindows final : public FormWindows {
 public:
  explicit PosixFormWindows(const Terminal& terminal) noexcept : terminal_(terminal) {}

  std::unique_ptr<HiddenWindow> make_hidden(TextView caption) override;

  /// A window that has a size and a state but cannot be shown.
  std::unique_ptr<FormView> make_form(FormEvents& events, const FormDescription& description) override;
  std::unique_ptr<PreviewView> make_preview(PreviewEvents& events, const PreviewPages* pages) override;

  /// Nothing is shown; at a terminal, Ctrl+C ends the whole program.
  std::unique_ptr<Waiting> show_hourglass() override;

 private:
  const Terminal& terminal_;
};

/// Third-party controls exist on Windows only.
class PosixControlMakers final : public ControlMakers {
 public:
  ObjectRef create(TextView /*class_name*/) override { return nullptr; }
};

/// There are no messages; a signal that the program handles counts as a request to quit.
class PosixMessagePump final : public MessagePump {
 public:
  bool handle_waiting() override { return true; }
  bool wait_and_handle() override;
};

/// Without windows there is nothing to draw on.
class PosixDrawing final : public Drawing {
 public:
  void draw_text(std::intptr_t device_context, const PixelRectangle& place, TextView text, std::int32_t colour,
                 bool breaks_words) override;
  [[nodiscard]] WindowImage image_of(std::intptr_t window) override;
};

/// TrueType fonts from the system's font folders.
class PosixFontFiles final : public FontFiles {
 public:
  [[nodiscard]] std::vector<std::uint8_t> wide_font(bool is_fixed_width) override;
  [[nodiscard]] std::vector<std::uint8_t> named_font() override { return named_; }

  /// Names a font for the characters that the system's lack, by its contents.
  void name_font(std::vector<std::uint8_t> bytes) { named_ = std::move(bytes); }

 private:
  std::vector<std::uint8_t> named_;
};

/// The library that prints windows exists on Windows only.
class PosixWindowPrinting final : public WindowPrinting {
 public:
  void configure_printer(std::int32_t window) override;
  void send_to_printer(std::int32_t window) override;
};

/// One instance of each implementation, for a library to use. Must outlive the library.
struct PosixPlatform {
  /// Uses the code page chosen by the environment, or the given one. Throws std::runtime_error if it is unknown.
  PosixPlatform() : PosixPlatform(chosen_code_page()) {}
  explicit PosixPlatform(std::uint32_t code_page_number) : code_page(make_code_page(code_page_number)) {}

  std::unique_ptr<CodePage> code_page;
  Terminal terminal;
  PosixMessageBoxes message_boxes{terminal};
  PosixScreen screen;
  PosixComputer computer;
  PosixClock clock;
  PosixFormWindows form_windows{terminal};
  PosixControlMakers control_makers;
  PosixMessagePump message_pump;
  PosixRandomSource random_source;
  PosixCryptography cryptography;
  PosixFiles files;
  PosixFolderPicker folder_picker{terminal};
  PosixGuids guids;
  PosixFolders folders;
  PosixInputBoxes input_boxes{terminal};
  PosixProfiles profiles{files};
  Hive hive{Hive::default_path()};
  PosixSettingsStore settings_store{hive};
  PosixRegistry registry{hive, *code_page};
  PosixNetwork network;
  PosixFileDialogs file_dialogs{terminal};
  PosixDrawing drawing;
  PosixWindowPrinting window_printing;
  PosixFontFiles font_files;
  PosixPrinters printers{font_files};
  PosixMachine machine;
  PosixTimeConversions time_conversions;

  [[nodiscard]] Platform platform() {
    return {message_boxes,   screen,       computer,    clock,          form_windows,     control_makers, message_pump,
            random_source,   cryptography, profiles,    settings_store, time_conversions, files,          folder_picker,
            guids,           folders,      input_boxes, registry,       network,          file_dialogs,   drawing,
            window_printing, font_files,   printers,    machine,        *code_page};
  }
};

}  // namespace talutil::posix
