#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <random>
#include <sstream>
#include <vector>

#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "platform/page_model.hpp"
#include "platform/platform.hpp"
#include "tests/fakes/fake_files.hpp"
#include "tests/fakes/fake_stores.hpp"
#include "tests/fakes/fake_windows.hpp"

namespace talutil::testing {

/// A platform without a machine: it records what the library asks for and answers as the test says. Fields
/// can be set at any time; the clock moves only when it is set. It must outlive the library that uses it.
struct FakePlatform : MessageBoxes,
                      Screen,
                      Computer,
                      Clock,
                      FormWindows,
                      ControlMakers,
                      MessagePump,
                      RandomSource,
                      Folders,
                      InputBoxes,
                      FileDialogs,
                      FolderPicker,
                      Guids,
                      Drawing,
                      WindowPrinting,
                      FontFiles,
                      Printers,
                      Machine,
                      CalendarTimeConversions {
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
  std::int32_t messages_handled = 0;  ///< How often waiting messages were let in.
  std::int32_t waits = 0;
  std::int32_t hourglasses = 0;  ///< Shown now.

  bool has_registered_controls = true;

  // What is answered. A box without a scripted answer is one that the user closed.
  std::deque<MessageAnswer> answers;
  float twips_x = 15;
  float twips_y = 15;
  Locale separators;
  Date current_time{40000.5};          ///< 6 July 2009, 12:00
  std::map<Text, ObjectRef> controls;  ///< Third-party controls by class name; a null one fails with 429.

  std::int32_t quits_after_waits = 1;  ///< The wait that ends with the thread being asked to quit.
  std::mt19937 random{7};
  std::function<void(std::span<std::uint8_t>)> random_bytes;  ///< In the place of the generator, where it is set.
  std::unique_ptr<Cryptography> cryptography = make_cryptography();  ///< The real one: it needs no machine.

  std::deque<Text> passwords;  ///< What is typed into masked boxes; without one they are cancelled.
  std::vector<Text> password_prompts;
  std::deque<Text> inputs;  ///< What is typed into input boxes.
  std::vector<Message> input_boxes;
  std::deque<Text> chosen_files;  ///< What file dialogs answer; without one they are cancelled.
  std::vector<FileDialog> file_dialogs;
  bool gives_up = false;                 ///< Esc, while there is an hourglass.
  std::function<void()> during_dialogs;  ///< What a host's timer does while a file or printer dialog is open.
  std::vector<std::string> drawn;        ///< What was drawn and printed, in words.
  std::int32_t pointer_resets = 0;
  FakePreviewState preview;         ///< What the preview window shows, and what its user does.
  FakeFormState form;               ///< What the other windows show.
  std::map<Text, ItemFacts> items;  ///< Files and folders that there are details of.
  std::vector<PrintSettings> print_jobs;
  bool prints = true;  ///< Whether the printer dialog is answered with OK.

  FakeRegistry registry;
  FakeNetwork network;
  FakeProfiles profiles;
  FakeSettingsStore settings_store;

  FakeFiles files;

  WesternCodePage code_page;

  // What the library gets; a test may put real parts there before it has its library.
  TimeConversions* used_times = this;
  Files* used_files = &files;
  Folders* used_folders = this;
  Profiles* used_profiles = &profiles;
  SettingsStore* used_settings = &settings_store;
  Registry* used_registry = &registry;
  CodePage* used_code_page = &code_page;

  FakePlatform() = default;
  FakePlatform(const FakePlatform&) = delete;
  FakePlatform& operator=(const FakePlatform&) = delete;

  [[nodiscard]] Platform platform() {
    return {*this, *this,         *this,          *this,          *this,          *this,       *this,
            *this, *cryptography, *used_profiles, *used_settings, *used_times,    *used_files, *this,
            *this, *used_folders, *this,          *used_registry, network,        *this,       *this,
            *this, *this,         *this,          *this,          *used_code_page};
  }

  MessageAnswer show(TextView text, MessageButtons buttons, TextView title) override {
    messages.push_back({Text(text), buttons, Text(title)});
    return next_of(answers).value_or(buttons == MessageButtons::yes_no ? MessageAnswer::no : MessageAnswer::cancel);
  }

  float twips_per_pixel_x() override { return twips_x; }
  float twips_per_pixel_y() override { return twips_y; }
  Text name() override { return u"FAKEPC"; }
  Locale locale() override { return separators; }
  Date now() override { return current_time; }
  std::int64_t utc_offset_seconds() override { return 600 * 60; }

  std::unique_ptr<HiddenWindow> make_hidden(TextView caption) override {
    window_captions.emplace_back(caption);
    return std::make_unique<Window>(*this);
  }

  bool handle_waiting() override {
    ++messages_handled;
    return true;
  }
  bool wait_and_handle() override { return ++waits < quits_after_waits; }

  std::unique_ptr<Folder> open(const Text& /*path*/) override { raise(ErrorNumber::path_not_found); }
  [[nodiscard]] bool ignores_case() const noexcept override { return true; }

  std::optional<Text> ask(TextView prompt, TextView title, Entry entry) override {
    if (entry == Entry::masked) {
      password_prompts.emplace_back(prompt);
      return next_of(passwords);
    }
    input_boxes.push_back({Text(prompt), MessageButtons::ok, Text(title)});
    return next_of(inputs);
  }

  std::optional<Text> choose(TextView /*title*/, std::intptr_t /*owner*/) override { return std::nullopt; }
  Text make() override { return u"{00000000-0000-4000-8000-000000000001}"; }
  std::optional<ChosenFile> choose(const FileDialog& dialog) override {
    file_dialogs.push_back(dialog);
    if (during_dialogs) during_dialogs();
    std::optional<Text> path = next_of(chosen_files);
    return path ? std::optional(ChosenFile{std::move(*path), dialog.filter_index}) : std::nullopt;
  }

  void draw_text(std::intptr_t device_context, const PixelRectangle& place, TextView text, std::int32_t colour,
                 bool breaks_words) override {
    std::ostringstream line;
    line << "draw on " << device_context << " (" << place.left << ',' << place.top << ")-(" << place.right << ','
         << place.bottom << ") \"" << to_utf8(text) << "\" colour " << colour << (breaks_words ? " broken" : "");
    drawn.push_back(line.str());
  }

  void configure_printer(std::int32_t /*window*/) override {}
  void send_to_printer(std::int32_t /*window*/) override {}
  void reset_pointer() override { ++pointer_resets; }
  WindowImage image_of(std::intptr_t window) override {
    drawn.push_back("image of " + std::to_string(window));
    return {2, 1, {255, 0, 0, 0, 0, 255}};
  }

  std::vector<std::uint8_t> wide_font(bool /*is_fixed_width*/) override { return {}; }
  bool print(const Document& document, const PrintSettings& settings) override {
    print_jobs.push_back(settings);
    if (during_dialogs) during_dialogs();
    return prints && !document.pages.empty();
  }

  std::vector<DriveFacts> drives() override {
    return {{u"C:", u"Fixed", u"SYSTEM", u"NTFS", 1000ULL << 30, 250ULL << 30}, {u"D:", u"CD-ROM", u"", u"", 0, 0}};
  }
  MemoryFacts memory() override { return {8ULL << 30, 2ULL << 30, 0, 0}; }
  ProcessorFacts processor() override { return {u"A processor", u"x86", 4, 2400}; }
  OperatingSystemFacts operating_system() override { return {u"A system", u"10.0", name(), u"me", u"", 93784}; }
  ItemFacts item(const Text& path) override {
    const auto found = items.find(path);
    if (found == items.end()) raise(ErrorNumber::file_not_found);
    return found->second;
  }

  std::unique_ptr<FormView> make_form(FormEvents& events, const FormDescription& /*description*/) override {
    return std::make_unique<FakeForm>(form, events);
  }

  std::unique_ptr<PreviewView> make_preview(PreviewEvents& events, const PreviewPages* pages) override {
    return std::make_unique<FakePreview>(preview, events, pages);
  }

  std::unique_ptr<Waiting> show_hourglass() override {
    struct Shown final : Waiting {
      explicit Shown(FakePlatform& shown_on) : platform(shown_on) { ++platform.hourglasses; }
      ~Shown() override { --platform.hourglasses; }
      [[nodiscard]] bool is_given_up() const override { return platform.gives_up; }
      FakePlatform& platform;
    };
    return std::make_unique<Shown>(*this);
  }

  void fill(std::span<std::uint8_t> bytes) override {
    if (random_bytes) return random_bytes(bytes);
    for (std::uint8_t& byte : bytes) byte = static_cast<std::uint8_t>(random());
  }

  bool may_have_any() override { return has_registered_controls; }
  ObjectRef create(TextView class_name) override {
    controls_asked_for.emplace_back(class_name);
    const auto found = controls.find(Text(class_name));
    if (found != controls.end() && !found->second) raise(ErrorNumber::cannot_create_object);
    return found == controls.end() ? nullptr : found->second;
  }

 private:
  template <class Answer>
  static std::optional<Answer> next_of(std::deque<Answer>& scripted) {
    if (scripted.empty()) return std::nullopt;
    Answer answer = std::move(scripted.front());
    scripted.pop_front();
    return answer;
  }

  class Window final : public HiddenWindow {
   public:
    explicit Window(FakePlatform& owner) : owner_(owner) { ++owner_.open_windows; }
    Window(const Window&) = delete;
    Window& operator=(const Window&) = delete;
    ~Window() override { --owner_.open_windows; }
    [[nodiscard]] std::intptr_t handle() override { return 0x1234; }

   private:
    FakePlatform& owner_;
  };
};

}  // namespace talutil::testing
