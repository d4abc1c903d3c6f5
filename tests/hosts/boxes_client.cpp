// A client whose user answers the boxes of the system: confirmations, dialogs for files and folders, passwords,
// messages; and what can be seen of the components window.
#include "windows.hpp"

using namespace talutil::hosts;

namespace {

/// The words of the boxes that a call shows, whose user presses one button after another.
std::vector<std::wstring> boxes_of(const std::vector<int>& buttons, const std::function<void()>& call) {
  std::vector<std::wstring> seen;
  with_user(dialog_class, call, [&](HWND box) {
    const int button = buttons.at(std::min(seen.size(), buttons.size() - 1));
    seen.push_back(words_of(box));
    PostMessageW(box, WM_COMMAND, static_cast<WPARAM>(button), 0);
  });
  return seen;
}

/// The answers that confirm are in the examples.
void confirmations_ask_twice(_ORVUtils* u) {
  VARIANT_BOOL answer = 7;
  // Yes asks again; No ends it.
  const auto seen = boxes_of({IDOK, IDYES, IDCANCEL, IDNO}, [&] { u->CheckModifyDatabase(Text(L"Rename"), &answer); });
  check(answer == VARIANT_FALSE && seen.size() == 4 && seen[1].starts_with(L"Warning|Yes|No|"), "no confirmation");
  check_equal(L"Rename|Type YES in uppercase characters to confirm|OK|Cancel", seen[0], "the input box");
}

/// Exports a table, the user saving to what the dialog proposes, or not.
void grids_are_exported(_ORVUtils* u, const std::wstring& folder) {
  CLSID grid_class{};
  require(CLSIDFromProgID(L"TALUtil.Grid", &grid_class), "CLSIDFromProgID");
  const auto table = create_object<IDispatch>(grid_class, IID_IDispatch);
  put(table.get(), L"Cols", 2L);
  for (const wchar_t* const row : {L"a,b", L"\t\u20AC"}) use(table.get(), L"AddItem", row);
  Value grid(table.get());
  u->put_sReportsDir(*Text(folder + L"\\"));
  const std::wstring path = folder + L"\\Sales\\Sales.txt";
  for (const auto& [button, expected] : {std::pair(IDOK, "\"a,b\",\r\n,\x80\r\n"), {IDCANCEL, "(no file)"}}) {
    DeleteFileW(path.c_str());
    std::wstring title;
    with_user(
        dialog_class, [&] { u->ExportGridData(grid, Short{0}, Flag{VARIANT_TRUE}, Text(L"Sales")); },
        [&, pressed = button](HWND dialog) {
          title = text_of(dialog);
          // The dialog has its proposal once it is filled.
          wait_until([&] { return IsWindowEnabled(GetDlgItem(dialog, IDOK)) != FALSE; });
          PostMessageW(dialog, WM_COMMAND, static_cast<WPARAM>(pressed), 0);
        });
    check_equal(L"Save Data to File", title, "the title of the dialog");
    check_equal(expected, bytes_of(path), "the file");
  }
  DeleteFileW(path.c_str());
}

std::vector<HWND> components_windows() {
  auto windows = top_windows(L"Static", false);
  std::erase_if(windows, [](HWND window) { return text_of(window) != L"Form1"; });
  return windows;
}

/// Asks for a folder with a title; the user chooses the folder of Windows, or closes the dialog.
void folders_are_picked(_ORVUtils* u) {
  constexpr UINT set_selection = WM_USER + 102;
  std::array<char, MAX_PATH> folder{};
  GetWindowsDirectoryA(folder.data(), static_cast<UINT>(folder.size()));
  const std::string name = folder.data();
  for (const int button : {IDOK, IDCANCEL}) {
    std::wstring chosen;
    const int seen = with_user(
        dialog_class, [&] { chosen = text(u, &_ORVUtils::BrowseForFolder, Text(L"Where are the reports?")); },
        [&](HWND dialog) {
          check(words_of(dialog).find(L"|Where are the reports?") != std::wstring::npos, narrow(words_of(dialog)));
          check(GetWindow(dialog, GW_OWNER) == components_windows().at(0), "it is owned by the components window");
          SendMessageW(dialog, set_selection, TRUE, reinterpret_cast<LPARAM>(name.c_str()));
          PostMessageW(dialog, WM_COMMAND, static_cast<WPARAM>(button), 0);
        });
    check_equal(1, seen, "dialogs");
    check_equal(button == IDOK ? std::wstring(name.begin(), name.end()) : std::wstring(), chosen, "the folder");
  }
}

/// Packs a file with a password, forgets the password, and unpacks: the user is asked for it.
void passwords_are_asked_for(_ORVUtils* u) {
  std::array<wchar_t, MAX_PATH> temporary{};
  const std::wstring folder(temporary.data(), GetTempPathW(MAX_PATH, temporary.data()));
  const std::wstring archive = folder + L"boxes_client.zip";
  const std::wstring file = folder + L"boxes_client.txt";
  const std::wstring target = folder + L"boxes_client_out";
  std::ofstream(std::string(file.begin(), file.end())) << "content";
  DeleteFileW(archive.c_str());
  DeleteFileW((target + L"\\boxes_client.txt").c_str());
  Flag no;
  u->CallZIPFiles(Text(archive), Text(file), Short{}, Text(L"key"), no);
  u->CallZIPFiles(Text(folder + L"other.zip"), Text(file), Short{}, Text(), no);
  const int seen = with_user(
      dialog_class, [&] { u->CallUnZIPFiles(Text(archive), Text(target), Text(), no); },
      [](HWND box) {
        check(words_of(box).starts_with(L"Encrypted archive|Password of boxes_client.txt:"), narrow(words_of(box)));
        const HWND entry = controls(box, L"Edit").at(0);
        check(has_style(entry, GWL_STYLE, ES_PASSWORD), "what is typed is masked");
        SendMessageW(entry, WM_SETTEXT, 0, reinterpret_cast<LPARAM>(L"key"));
        PostMessageW(box, WM_COMMAND, IDOK, 0);
      });
  check_equal(1, seen, "password boxes");
  check_equal("content", bytes_of(target + L"\\boxes_client.txt"), "what was unpacked");
}

void components_window_is_hidden(_ORVUtils* u) {
  const std::vector<HWND> windows = components_windows();
  if (!check_equal(std::size_t{1}, windows.size(), "windows with the caption Form1")) return;
  check_equal(GetCurrentThreadId(), GetWindowThreadProcessId(windows[0], nullptr), "the thread of the window");
  const Pointer<_ORVUtils> second = create_object();
  check(components_windows() == windows, "the window of a second object");
  u->put_DebugMode(1);
  const auto seen = boxes_of({IDOK}, [&] { check_equal(S_OK, u->Terminate(), "Terminate"); });
  check(seen == std::vector<std::wstring>{L"boxes_client|OK|Closing ORVUtils Components form"}, "its message");
  check(IsWindow(windows[0]) == FALSE && components_windows().empty(), "it is gone after Terminate");
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  enter_desktop();
  const std::wstring folder = arguments[1];
  return run_checks([&] {
    const Pointer<_ORVUtils> object = create_object();
    _ORVUtils* const u = object.get();
    confirmations_ask_twice(u);
    grids_are_exported(u, folder);
    folders_are_picked(u);
    passwords_are_asked_for(u);
    components_window_is_hidden(u);
  });
}
