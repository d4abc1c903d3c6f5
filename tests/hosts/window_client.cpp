// A client that looks at the library's windows: the components window, and the box that Terminate shows.
#include <algorithm>
#include <fstream>

#include "boxes.hpp"

using namespace talutil::hosts;

namespace {

std::vector<HWND> components_windows() {
  return top_windows([](HWND window) { return describe(window).text == L"Form1"; });
}

SeenBox terminate_and_watch(_ORVUtils* u, short debug_mode, const Desktop& desktop, const std::wstring& pictures) {
  u->put_DebugMode(debug_mode);
  const auto close = [&](HWND box) {
    Sleep(300);  // Until it is painted.
    take_picture(pictures, L"message_box");
    PostMessageW(box, WM_COMMAND, IDOK, 0);
  };
  return act_and_watch(desktop, close, [&] { check_equal(S_OK, u->Terminate(), "Terminate"); });
}

/// Asks for a folder with a title; the user chooses the folder of Windows, or closes the dialog.
void folder_is_picked(_ORVUtils* u, const Desktop& desktop, const std::wstring& pictures, bool chooses) {
  constexpr UINT set_selection = WM_USER + 102;
  const std::string what = chooses ? "choosing a folder" : "closing the dialog";
  std::array<char, MAX_PATH> folder{};
  GetWindowsDirectoryA(folder.data(), static_cast<UINT>(folder.size()));
  HWND owner = nullptr;
  const auto answer = [&](HWND dialog) {
    owner = GetWindow(dialog, GW_OWNER);
    if (chooses) SendMessageW(dialog, set_selection, TRUE, reinterpret_cast<LPARAM>(folder.data()));
    Sleep(300);  // Until the tree has unfolded.
    if (chooses) take_picture(pictures, L"folder_picker");
    PostMessageW(dialog, WM_COMMAND, chooses ? IDOK : IDCANCEL, 0);
  };
  Text chosen;
  const SeenBox box = act_and_watch(
      desktop, answer, [&] { check_equal(S_OK, u->BrowseForFolder(Text(L"Where are the reports?"), chosen), what); });
  if (!check(box.seen, what + ": a dialog")) return;
  check(std::ranges::any_of(box.parts, [](const WindowText& part) { return part.text == L"Where are the reports?"; }),
        what + ": its title");
  check(owner == components_windows().at(0), what + ": it is owned by the components window");
  const auto expected = chooses ? std::wstring(folder.begin(), std::ranges::find(folder, '\0')) : std::wstring();
  check_equal(expected, std::wstring(chosen.view()), what + ": the answer");
}

bool shows(const SeenBox& box, const std::wstring& text) {
  return std::ranges::any_of(box.parts, [&](const WindowText& part) { return part.text.starts_with(text); });
}

/// Packs a file with a password, forgets the password, and unpacks: the user is asked for it.
void password_is_asked_for(_ORVUtils* u, const Desktop& desktop, const std::wstring& pictures) {
  std::array<wchar_t, MAX_PATH> temporary{};
  const std::wstring folder(temporary.data(), GetTempPathW(MAX_PATH, temporary.data()));
  const std::wstring archive = folder + L"window_client.zip";
  const std::wstring file = folder + L"window_client.txt";
  std::ofstream(std::string(file.begin(), file.end())) << "content";
  DeleteFileW(archive.c_str());
  Number<VARIANT_BOOL> no;
  u->CallZIPFiles(Text(archive.c_str()), Text(file.c_str()), Short{}, Text(L"key"), no);
  u->CallZIPFiles(Text((folder + L"other.zip").c_str()), Text(file.c_str()), Short{}, Text(), no);
  const std::wstring target = folder + L"window_client_out";
  DeleteFileW((target + L"\\window_client.txt").c_str());
  bool is_masked = false;
  const auto type = [&](HWND dialog) {
    const HWND entry = GetDlgItem(dialog, 100);
    is_masked = (GetWindowLongW(entry, GWL_STYLE) & ES_PASSWORD) != 0;
    SetWindowTextW(entry, L"key");
    Sleep(300);  // Until it is painted.
    take_picture(pictures, L"password_box");
    PostMessageW(dialog, WM_COMMAND, IDOK, 0);
  };
  const SeenBox box =
      act_and_watch(desktop, type, [&] { u->CallUnZIPFiles(Text(archive.c_str()), Text(target.c_str()), Text(), no); });
  check_equal(L"Encrypted archive", box.title, "the title of the password box");
  check(shows(box, L"Password of window_client.txt:"), "its prompt");
  check(is_masked, "what is typed is masked");
  check(GetFileAttributesW((target + L"\\window_client.txt").c_str()) != INVALID_FILE_ATTRIBUTES, "it was unpacked");
}

void components_window_is_hidden(_ORVUtils* u) {
  const std::vector<HWND> windows = components_windows();
  if (!check_equal(std::size_t{1}, windows.size(), "windows with the caption Form1")) return;
  check(IsWindowVisible(windows[0]) == FALSE, "it is not visible");
  check_equal(GetCurrentThreadId(), GetWindowThreadProcessId(windows[0], nullptr), "the thread of the window");
  const Pointer<_ORVUtils> second = create_object();
  check_equal(std::size_t{1}, components_windows().size(), "windows with a second object");
  u->put_DebugMode(0);
  u->Terminate();
  check(IsWindow(windows[0]) == FALSE, "it is gone after Terminate");
  check_equal(std::size_t{0}, components_windows().size(), "windows after Terminate");
}

void box_has_text_and_button(const SeenBox& box) {
  if (!check(box.seen, "a box with DebugMode 1")) return;
  check_equal(L"window_client", box.title, "its title, which is the program's name");
  int texts = 0;
  int buttons = 0;
  for (const WindowText& part : box.parts) {
    if (part.class_name == L"Button") {
      ++buttons;
      check(part.text.find(L"OK") != std::wstring::npos, "the button says OK and not " + narrow(part.text));
    } else if (!part.text.empty()) {
      ++texts;
      check_equal(L"Closing ORVUtils Components form", part.text, "the text of the box");
    }
  }
  check_equal(1, buttons, "buttons");
  check_equal(1, texts, "texts");
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  const Desktop desktop;
  return run_checks([&] {
    const Pointer<_ORVUtils> object = create_object();
    const std::wstring pictures = std::wstring(arguments[1]) + L"\\..\\screenshots";
    folder_is_picked(object.get(), desktop, pictures, true);
    folder_is_picked(object.get(), desktop, pictures, false);
    password_is_asked_for(object.get(), desktop, pictures);
    components_window_is_hidden(object.get());
    box_has_text_and_button(terminate_and_watch(object.get(), 1, desktop, pictures));
    check(!terminate_and_watch(object.get(), -1, desktop, pictures).seen, "no box with DebugMode -1");
  });
}
