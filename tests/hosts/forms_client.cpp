// A client with controls of its own: grids and combos that the library drives late-bound, and the boxes that it shows.
#include <fstream>
#include <sstream>

#include "boxes.hpp"
#include "table_object.hpp"

using namespace talutil::hosts;

namespace {

constexpr LONG tick_column = 0;

void tick(_ORVUtils* u, Value& grid, short on) { u->SelectGridRows(Long{tick_column}, grid, Short{on}); }

std::wstring words_of(const SeenBox& box) {
  std::wstring words = box.title;
  for (const WindowText& part : box.parts) {
    std::wstring text = part.text;
    std::erase(text, L'&');
    if (!text.empty()) words += L'|' + text;
  }
  return words;
}

/// The boxes that a call shows, one after another, each answered with a button. What is typed goes into an input box.
std::vector<std::wstring> boxes_of(const Desktop& desktop, const std::vector<std::pair<const wchar_t*, int>>& answers,
                                   const std::function<void()>& call, const std::wstring& pictures = {}) {
  std::vector<std::wstring> seen;
  std::atomic<bool> is_over = false;
  std::thread user([&] {
    desktop.enter();
    HWND last = nullptr;
    for (const auto& [typed, button] : answers) {
      HWND box = nullptr;
      for (int i = 0; i < 200 && (box == nullptr || box == last); ++i) {
        box = wait_for_box(is_over);
        if (box == last) Sleep(20);
      }
      if (box == nullptr) return;
      last = box;
      seen.push_back(words_of(look_at_box(box)));
      // Children have no caption of their own to read in another thread: by message.
      if (HWND entry = FindWindowExW(box, nullptr, L"Edit", nullptr); entry != nullptr) {
        SendMessageW(entry, WM_SETTEXT, 0, reinterpret_cast<LPARAM>(typed));
        if (!pictures.empty()) {
          Sleep(300);
          take_picture(pictures, L"input_box");
        }
      }
      PostMessageW(box, WM_COMMAND, static_cast<WPARAM>(button), 0);
      for (int i = 0; i < 100 && IsWindow(box) != FALSE; ++i) Sleep(20);
    }
  });
  call();
  is_over = true;
  user.join();
  return seen;
}

void confirmations_ask_twice(_ORVUtils* u, const Desktop& desktop, const std::wstring& pictures) {
  const std::wstring question =
      L"Confirm Delete|Type YES in uppercase characters to confirm deletion of this record|OK|Cancel";
  VARIANT_BOOL answer = 7;
  auto seen = boxes_of(
      desktop, {{L"YES", IDOK}}, [&] { u->CheckDeleteRecord(&answer); }, pictures);
  check_equal(VARIANT_TRUE, answer, "YES confirms");
  if (check_equal(std::size_t{1}, seen.size(), "boxes")) check_equal(question, seen[0], "the input box");

  // Yes asks again, and so does a cancelled box; No ends it.
  seen = boxes_of(desktop, {{L"yes", IDOK}, {L"", IDYES}, {L"", IDCANCEL}, {L"", IDNO}},
                  [&] { u->CheckModifyDatabase(Text(L"Rename"), &answer); });
  check_equal(VARIANT_FALSE, answer, "no confirmation");
  if (!check_equal(std::size_t{4}, seen.size(), "boxes until No")) return;
  for (const wchar_t* part : {L"Warning", L"|Yes", L"|No"})
    check(seen[1].find(part) != std::wstring::npos, "the warning has " + narrow(part) + " and is " + narrow(seen[1]));
}

void failures_are_told(_ORVUtils* u, const Desktop& desktop) {
  Value undriven = Value::undriven();
  const auto seen = boxes_of(desktop, {{L"", IDOK}}, [&] { tick(u, undriven, 1); });
  if (check_equal(std::size_t{1}, seen.size(), "boxes"))
    check_equal(L"forms_client|OK|ORVUtils SelectGridRows Type mismatch", seen[0], "an object without automation");
}

/// Exports a table, the user saving to what the dialog proposes.
std::string exported(_ORVUtils* u, const Desktop& desktop, const std::wstring& folder, Value& grid, int button) {
  u->put_sReportsDir(*Text(folder + L"\\"));
  const std::wstring path = folder + L"\\Sales\\Sales.txt";
  std::wstring title;
  const auto answer = [&](HWND dialog) {
    title = describe(dialog).text;
    Sleep(300);
    PostMessageW(dialog, WM_COMMAND, static_cast<WPARAM>(button), 0);
  };
  act_and_watch(desktop, answer,
                [&] { u->ExportGridData(grid, Short{0}, Number<VARIANT_BOOL>{VARIANT_TRUE}, Text(L"Sales")); });
  check_equal(L"Save Data to File", title, "the title of the dialog");
  std::ifstream file(path.c_str(), std::ios::binary);
  if (!file) return "(no file)";
  std::ostringstream bytes;
  bytes << file.rdbuf();
  file.close();
  DeleteFileW(path.c_str());
  return bytes.str();
}

void grids_are_exported(_ORVUtils* u, const Desktop& desktop, const std::wstring& folder) {
  TableObject table(2, 2);
  table.text(0, 0) = L"a,b";
  table.text(1, 1) = L"\u20AC";
  Value grid(&table);
  check_equal(std::string("\"a,b\",\r\n,\x80\r\n"), exported(u, desktop, folder, grid, IDOK), "the file");
  check_equal(std::string("(no file)"), exported(u, desktop, folder, grid, IDCANCEL), "after Cancel");
}

/// A form as PrintScreen wants it.
class FormObject final : public NamelessObject {
 public:
  explicit FormObject(HWND window) : window_(window) {}
  std::vector<DISPID> uses;
  ULONG STDMETHODCALLTYPE AddRef() override { return 2; }
  ULONG STDMETHODCALLTYPE Release() override { return 1; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* name, UINT, LCID, DISPID* ids) override {
    *ids = lstrcmpiW(*name, L"hwnd") == 0 ? 1 : lstrcmpiW(*name, L"Refresh") == 0 ? 2 : DISPID_UNKNOWN;
    return *ids == DISPID_UNKNOWN ? DISP_E_UNKNOWNNAME : S_OK;
  }
  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS*, VARIANT* result, EXCEPINFO*,
                                   UINT*) override {
    if ((flags & (id == 2 ? DISPATCH_METHOD : DISPATCH_PROPERTYGET)) == 0) return DISP_E_MEMBERNOTFOUND;
    uses.push_back(id);
    if (id == 2) return UpdateWindow(window_), S_OK;
    V_VT(result) = VT_I4;
    V_I4(result) = static_cast<LONG>(reinterpret_cast<std::intptr_t>(window_));
    return S_OK;
  }

 private:
  HWND window_;
};

void forms_are_printed(_ORVUtils* u, const std::wstring& folder) {
  FormObject form(
      CreateWindowW(L"Static", L"Form", WS_OVERLAPPEDWINDOW, 0, 0, 300, 200, nullptr, nullptr, nullptr, nullptr));
  Value holder(&form);
  const std::wstring beside = folder + L"\\printhelper.dll";
  DeleteFileW(beside.c_str());
  check_equal(run_time_error(53), u->PrintScreen(holder), "without the print helper");
  check_equal(L"TALUtil.ORVUtils: File not found: printhelper.dll", early_outcome(S_OK).text, "its text");
  check_equal(std::size_t{1}, form.uses.size(), "what the form was asked for");
  const std::wstring helper = folder + L"\\printhelper\\printhelper.dll";
  check(CopyFileW(helper.c_str(), beside.c_str(), FALSE) != FALSE, "the print helper beside TALUtil.dll");
  form.uses.clear();
  check_equal(S_OK, u->PrintScreen(holder), "with the print helper");
  check(form.uses == std::vector<DISPID>{1, 2, 1}, "hwnd, Refresh, hwnd");
  const HMODULE module = GetModuleHandleW(beside.c_str());
  check(module != nullptr, "it is loaded from beside TALUtil.dll");
  // What it answers where there is no printer, and for what is no window.
  for (const char* name : {"ConfigurePrinter", "SendToPrinter"}) {
    const auto print = reinterpret_cast<LONG(WINAPI*)(LONG)>(reinterpret_cast<void*>(GetProcAddress(module, name)));
    if (check(print != nullptr, name)) check_equal(0, print(12345), std::string(name) + " of no window");
  }
  if (module != nullptr) FreeLibrary(module);
  DeleteFileW(beside.c_str());
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  const Desktop desktop;
  return run_checks([&] {
    const Pointer<_ORVUtils> object = create_object();
    _ORVUtils* const u = object.get();
    const std::wstring folder = arguments[1];
    confirmations_ask_twice(u, desktop, folder + L"\\..\\screenshots");
    failures_are_told(u, desktop);
    grids_are_exported(u, desktop, folder);
    forms_are_printed(u, folder);
  });
}
