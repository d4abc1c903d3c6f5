#pragma once

#include <optional>

#include "platform/platform.hpp"

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
};

class Win32FormWindows final : public FormWindows {
 public:
  /// Its handle raises 51 where the platform makes no window.
  std::unique_ptr<HiddenWindow> make_hidden(TextView caption) override;
  std::unique_ptr<FormView> make_form(FormEvents& events, const FormDescription& description) override;
  std::unique_ptr<PreviewView> make_preview(PreviewEvents& events, PrintControl* pages) override;
};

class Win32MessagePump final : public MessagePump {
 public:
  bool handle_waiting() override;
  bool wait_and_handle() override;
};

}  // namespace talutil::win32
