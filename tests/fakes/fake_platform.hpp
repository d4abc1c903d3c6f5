#pragma once

#include <cstdint>
#include <deque>
#include <map>
#include <memory>
#include <vector>

#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "platform/platform.hpp"
#include "tests/fakes/fake_files.hpp"

namespace talutil::testing {

/// A platform without a machine: it records what the library asks for and answers as the test says. Fields
/// can be set at any time; the clock moves only when told. It must outlive the library that uses it.
struct FakePlatform final : MessageBoxes, Screen, Computer, Clock, FormWindows, ControlMakers {
  struct Message {
    Text text;
    MessageButtons buttons = MessageButtons::ok;
    Text title;
    friend bool operator==(const Message&, const Message&) = default;
  };

  // What was asked for, in order.
  std::vector<Message> messages;
  std::vector<Text> window_captions;
  std::vector<Text> controls_asked_for;
  std::int32_t open_windows = 0;

  // What is answered. A box without a scripted answer is one that the user closed.
  std::deque<MessageAnswer> answers;
  float twips_x = 15;
  float twips_y = 15;
  Text computer_name = u"FAKEPC";
  Locale separators;
  Date current_time{40000.5};  ///< 6 July 2009, 12:00
  std::intptr_t window_handle = 0x1234;
  std::map<Text, ObjectRef> controls;  ///< Another maker's controls by class name; a null one fails with 429.

  FakeFiles files;
  FakeFolderPicker folder_picker;
  FakeGuids guids;

  FakePlatform() = default;
  FakePlatform(const FakePlatform&) = delete;
  FakePlatform& operator=(const FakePlatform&) = delete;

  [[nodiscard]] Platform platform() { return {*this, *this, *this, *this, *this, *this, files, folder_picker, guids}; }

  MessageAnswer show(TextView text, MessageButtons buttons, TextView title) override {
    messages.push_back({Text(text), buttons, Text(title)});
    if (answers.empty()) return buttons == MessageButtons::yes_no ? MessageAnswer::no : MessageAnswer::cancel;
    const MessageAnswer answer = answers.front();
    answers.pop_front();
    return answer;
  }

  float twips_per_pixel_x() override { return twips_x; }
  float twips_per_pixel_y() override { return twips_y; }
  Text name() override { return computer_name; }
  Locale locale() override { return separators; }
  Date now() override { return current_time; }

  std::unique_ptr<HiddenWindow> make_hidden(TextView caption) override {
    window_captions.emplace_back(caption);
    return std::make_unique<Window>(*this);
  }

  ObjectRef create(TextView class_name) override {
    controls_asked_for.emplace_back(class_name);
    const auto found = controls.find(Text(class_name));
    if (found == controls.end()) return nullptr;
    if (!found->second) raise(ErrorNumber::cannot_create_object);
    return found->second;
  }

 private:
  class Window final : public HiddenWindow {
   public:
    explicit Window(FakePlatform& owner) : owner_(owner) { ++owner_.open_windows; }
    Window(const Window&) = delete;
    Window& operator=(const Window&) = delete;
    ~Window() override { --owner_.open_windows; }
    [[nodiscard]] std::intptr_t handle() const noexcept override { return owner_.window_handle; }

   private:
    FakePlatform& owner_;
  };
};

}  // namespace talutil::testing
