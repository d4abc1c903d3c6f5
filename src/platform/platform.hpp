#pragma once

#include <cstdint>
#include <memory>

#include "automation/date.hpp"
#include "automation/locale.hpp"
#include "automation/object.hpp"
#include "automation/text.hpp"
#include "platform/code_page.hpp"
#include "platform/cryptography.hpp"
#include "platform/drawing.hpp"
#include "platform/file_dialogs.hpp"
#include "platform/files.hpp"
#include "platform/folder_picker.hpp"
#include "platform/folders.hpp"
#include "platform/font_files.hpp"
#include "platform/guids.hpp"
#include "platform/input_boxes.hpp"
#include "platform/machine.hpp"
#include "platform/network.hpp"
#include "platform/printers.hpp"
#include "platform/registry.hpp"
#include "platform/settings.hpp"
#include "platform/time_conversions.hpp"

/// The seam between the core and the platform: one small interface per concern, so that each fake fits on a page.
namespace talutil {

enum class MessageButtons : std::uint8_t { ok, yes_no };
enum class MessageAnswer : std::uint8_t { ok, cancel, yes, no };

class MessageBoxes {
 public:
  virtual ~MessageBoxes() = default;

  /// Shows a modal message and waits for the answer. With an empty title, the box has the host application's title.
  /// Where there is nobody to ask, the answer is that of a closed box (cancel, or no).
  virtual MessageAnswer show(TextView text, MessageButtons buttons, TextView title) = 0;
};

class Screen {
 public:
  virtual ~Screen() = default;

  /// Twips (1/1440 inch) per pixel, horizontally and vertically; 15 at 96 dpi.
  [[nodiscard]] virtual float twips_per_pixel_x() = 0;
  [[nodiscard]] virtual float twips_per_pixel_y() = 0;

  /// Restores the mouse pointer's normal shape.
  virtual void reset_pointer() = 0;
};

class Computer {
 public:
  virtual ~Computer() = default;

  /// The machine's name; empty if it has none.
  [[nodiscard]] virtual Text name() = 0;

  /// The user's separators as of the first call. The platform does not fill in the year.
  [[nodiscard]] virtual Locale locale() = 0;
};

class Clock {
 public:
  virtual ~Clock() = default;

  /// The current local date and time, to the second.
  [[nodiscard]] virtual Date now() = 0;

  /// The current local year, which every call of a member needs.
  [[nodiscard]] virtual std::int32_t year() { return parts_of(now()).year; }
};

/// A window that is never shown. The destructor closes it.
class HiddenWindow {
 public:
  virtual ~HiddenWindow() = default;

  /// The platform's window handle, for dialogs that need an owner; 0 where there are no windows.
  [[nodiscard]] virtual std::intptr_t handle() = 0;
};

class FormEvents;
class FormView;
struct FormDescription;
class PreviewEvents;
class PreviewPages;
class PreviewView;

/// The time for which a user waits for something that takes long.
class Waiting {
 public:
  Waiting() = default;
  Waiting(const Waiting&) = delete;
  Waiting& operator=(const Waiting&) = delete;
  virtual ~Waiting() = default;

  /// Whether the user gives up waiting, by the Esc key.
  [[nodiscard]] virtual bool is_given_up() const = 0;
};

class FormWindows {
 public:
  virtual ~FormWindows() = default;
  [[nodiscard]] virtual std::unique_ptr<HiddenWindow> make_hidden(TextView caption) = 0;

  /// Creates a window with controls. The description and the presenter must outlive it. Raises 445 where there is no
  /// screen.
  [[nodiscard]] virtual std::unique_ptr<FormView> make_form(FormEvents& events, const FormDescription& description) = 0;

  /// Creates the preview window, which shows `pages`, or null if a third-party control displays its own pages. Both
  /// arguments must outlive the view.
  [[nodiscard]] virtual std::unique_ptr<PreviewView> make_preview(PreviewEvents& events, const PreviewPages* pages) = 0;

  /// Shows the hourglass for as long as the result exists.
  [[nodiscard]] virtual std::unique_ptr<Waiting> show_hourglass() = 0;
};

/// The messages waiting for the host's windows.
class MessagePump {
 public:
  virtual ~MessagePump() = default;

  /// Handles every waiting message. Returns false on a request to quit, which the thread's own loop still receives.
  virtual bool handle_waiting() = 0;

  /// Waits for a message, then handles all. Returns false as above.
  virtual bool wait_and_handle() = 0;
};

class ControlMakers {
 public:
  virtual ~ControlMakers() = default;

  /// Whether the user may have registered third-party controls. Asked once before several are created, because most
  /// users have none and looking for each takes time.
  [[nodiscard]] virtual bool may_have_any() { return true; }

  /// Creates the third-party control that the user has registered for a class name; null if there is none. Raises 429
  /// if one is registered but cannot be created.
  [[nodiscard]] virtual ObjectRef create(TextView class_name) = 0;
};

/// What the library needs from the platform. The caller owns the parts, which must outlive the library.
struct Platform {
  MessageBoxes& message_boxes;
  Screen& screen;
  Computer& computer;
  Clock& clock;
  FormWindows& form_windows;
  ControlMakers& control_makers;
  MessagePump& message_pump;
  RandomSource& random_source;
  Cryptography& cryptography;
  Profiles& profiles;
  SettingsStore& settings_store;
  TimeConversions& time_conversions;
  Files& files;
  FolderPicker& folder_picker;
  Guids& guids;
  Folders& folders;
  InputBoxes& input_boxes;
  Registry& registry;
  Network& network;
  FileDialogs& file_dialogs;
  Drawing& drawing;
  WindowPrinting& window_printing;
  FontFiles& font_files;
  Printers& printers;
  Machine& machine;
  CodePage& code_page;
};

}  // namespace talutil
