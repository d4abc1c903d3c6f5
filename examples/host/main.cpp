// A small host of TALUtil: a window with a combo box, a table, a list of the library's results, a drawing and two
// controls that can be dragged around. Register TALUtil.dll first (regsvr32), or run the host next to its manifest.
#include "window_objects.hpp"
// After windows.h.
#include <commctrl.h>

#include "talutil.h"

namespace {

using namespace TALUtil;

enum Command : int { find_branch = 100, tick_all, tick_none, count_ticks, export_table, print_window, table_id };

constexpr LONG done_column = 3;

/// A text as an argument for the library, which takes texts by reference.
class Bstr {
 public:
  Bstr(const wchar_t* text) : text_(SysAllocString(text)) {}
  Bstr(const Bstr&) = delete;
  Bstr& operator=(const Bstr&) = delete;
  ~Bstr() { SysFreeString(text_); }
  operator BSTR*() { return &text_; }

 private:
  BSTR text_;
};

template <class T>
T* by_reference(T&& value) {
  return &value;
}

/// The table, TALUtil.Grid: late-bound, as scripts use it.
class Table {
 public:
  Table() {
    CLSID class_id;
    if (FAILED(CLSIDFromProgID(L"TALUtil.Grid", &class_id)) ||
        FAILED(CoCreateInstance(class_id, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch,
                                reinterpret_cast<void**>(&object_)))) {
      throw std::runtime_error("TALUtil is not registered: run regsvr32 TALUtil.dll");
    }
  }
  Table(const Table&) = delete;
  Table& operator=(const Table&) = delete;
  ~Table() { object_->Release(); }

  [[nodiscard]] IDispatch* object() const { return object_; }

  template <class... Arguments>
  VARIANT use(WORD flags, const wchar_t* name, Arguments... arguments) const {
    DISPID id = 0;
    auto* text = const_cast<wchar_t*>(name);
    object_->GetIDsOfNames(IID_NULL, &text, 1, LOCALE_USER_DEFAULT, &id);
    VARIANT in_order[] = {arguments..., VARIANT{}};
    constexpr std::size_t count = sizeof...(Arguments);
    std::vector<VARIANT> last_first(std::reverse_iterator(in_order + count), std::reverse_iterator(in_order));
    DISPID value = DISPID_PROPERTYPUT;
    const bool is_put = flags == DISPATCH_PROPERTYPUT;
    DISPPARAMS parameters{last_first.data(), is_put ? &value : nullptr, static_cast<UINT>(count), is_put ? 1U : 0U};
    VARIANT result{};
    object_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, flags, &parameters, is_put ? nullptr : &result, nullptr,
                    nullptr);
    for (VARIANT& argument : last_first) VariantClear(&argument);
    return result;
  }

  void put(const wchar_t* name, LONG value) const { use(DISPATCH_PROPERTYPUT, name, variant(value)); }
  void add_row(const std::wstring& cells) const { use(DISPATCH_METHOD, L"AddItem", variant(cells)); }
  [[nodiscard]] std::wstring text(LONG row, LONG column) const {
    VARIANT cell = use(DISPATCH_PROPERTYGET, L"TextMatrix", variant(row), variant(column));
    std::wstring result = text_of(cell);
    VariantClear(&cell);
    return result;
  }
  [[nodiscard]] LONG rows() const { return V_I4(by_reference(use(DISPATCH_PROPERTYGET, L"Rows"))); }

 private:
  IDispatch* object_ = nullptr;
};

/// A control that can be dragged: the library follows the mouse and remembers the position.
struct Movable {
  HWND window = nullptr;
  _cControlPosition* position = nullptr;
  Scriptable* control = nullptr;
};

class Host {
 public:
  Host() = default;
  Host(const Host&) = delete;
  Host& operator=(const Host&) = delete;

  int run() {
    if (FAILED(CoCreateInstance(CLSID_ORVUtils, nullptr, CLSCTX_INPROC_SERVER, IID__ORVUtils,
                                reinterpret_cast<void**>(&utils_)))) {
      throw std::runtime_error("TALUtil is not registered: run regsvr32 TALUtil.dll");
    }
    utils_->put_sNatNameC(*Bstr(L"Bookings"));
    make_window();
    VARIANT form = variant(form_);
    utils_->LoadWindowState(&form, Bstr(L"MainWindow"));
    VariantClear(&form);
    MSG message;
    while (GetMessageW(&message, nullptr, 0, 0) > 0) {
      if (IsDialogMessageW(window_, &message) != FALSE) continue;
      TranslateMessage(&message);
      DispatchMessageW(&message);
    }
    return 0;
  }

 private:
  static Host& of(HWND window) { return *reinterpret_cast<Host*>(GetWindowLongPtrW(window, GWLP_USERDATA)); }

  HWND child(const wchar_t* window_class, const wchar_t* text, DWORD style, int x, int y, int width, int height,
             int id = 0, DWORD extended = 0) const {
    const HWND made =
        CreateWindowExW(extended, window_class, text, WS_CHILD | WS_VISIBLE | WS_CLIPSIBLINGS | style, x, y, width,
                        height, window_, reinterpret_cast<HMENU>(static_cast<INT_PTR>(id)), nullptr, nullptr);
    SendMessageW(made, WM_SETFONT, reinterpret_cast<WPARAM>(GetStockObject(DEFAULT_GUI_FONT)), TRUE);
    return made;
  }

  void make_window() {
    WNDCLASSW window_class{};
    window_class.lpfnWndProc = &handle;
    window_class.lpszClassName = L"BookingsHost";
    window_class.hCursor = LoadCursorW(nullptr, IDC_ARROW);
    window_class.hbrBackground = reinterpret_cast<HBRUSH>(COLOR_BTNFACE + 1);
    RegisterClassW(&window_class);
    window_ = CreateWindowExW(WS_EX_CONTROLPARENT, L"BookingsHost", L"Bookings", WS_OVERLAPPEDWINDOW, 20, 20, 760, 540,
                              nullptr, nullptr, nullptr, nullptr);
    SetWindowLongPtrW(window_, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(this));
    form_ = form_object(window_);

    child(L"Static", L"&Branch:", 0, 12, 15, 50, 18);
    combo_window_ = child(L"ComboBox", L"", CBS_DROPDOWN | WS_VSCROLL | WS_TABSTOP, 64, 12, 150, 200);
    constexpr std::pair<const wchar_t*, LONG> branches[] = {{L"Cork", 7}, {L"Dublin", 19}, {L"Galway", 42}};
    for (const auto& [name, key] : branches) {
      const LRESULT index = SendMessageW(combo_window_, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(name));
      SendMessageW(combo_window_, CB_SETITEMDATA, static_cast<WPARAM>(index), key);
    }
    combo_ = combo_object(combo_window_);

    constexpr std::pair<Command, const wchar_t*> buttons[] = {
        {find_branch, L"&Find branch 42"}, {tick_all, L"&Tick all"},      {tick_none, L"&Clear ticks"},
        {count_ticks, L"C&ount ticks"},    {export_table, L"&Export..."}, {print_window, L"&Print window"}};
    int x = 12;
    for (const auto& [command, text] : buttons) {
      child(L"Button", text, WS_TABSTOP, x, 44, 112, 26, command);
      x += 120;
    }
    make_table();
    child(L"Static", L"What the library &answered:", 0, 12, 308, 250, 18);
    answers_ =
        child(L"ListBox", L"", WS_VSCROLL | WS_TABSTOP | LBS_NOINTEGRALHEIGHT, 12, 326, 340, 160, 0, WS_EX_CLIENTEDGE);
    make_drawing();
    add_movable(L"Drag me", 1, 640, 100);
    add_movable(L"Drag me too", 2, 640, 150);
  }

  void make_table() {
    const wchar_t* const headings[] = {L"Job", L"Customer", L"Starts", L"Done"};
    table_.put(L"Cols", 4);
    table_.use(DISPATCH_PROPERTYPUT, L"ColDataType", variant(done_column), variant(LONG{11}));
    table_.add_row(L"Job\tCustomer\tStarts\tDone");
    table_.put(L"FixedRows", 1);
    table_.add_row(L"1001\tO\u00B4Neil and Sons\t12/03/2026 08:30\tFalse");
    table_.add_row(L"1002\tHarbour Lights, Ltd\t12/03/2026 10:00\tFalse");
    table_.add_row(L"1003\tMurphy\t13/03/2026 14:15\tFalse");
    list_ =
        child(WC_LISTVIEWW, L"Jobs", LVS_REPORT | LVS_OWNERDATA | WS_TABSTOP | WS_BORDER, 12, 84, 610, 210, table_id);
    ListView_SetExtendedListViewStyle(list_, LVS_EX_FULLROWSELECT | LVS_EX_GRIDLINES);
    for (int column = 0; column < 4; ++column) {
      LVCOLUMNW heading{};
      heading.mask = LVCF_TEXT | LVCF_WIDTH;
      heading.pszText = const_cast<wchar_t*>(headings[column]);
      heading.cx = column == 1 ? 240 : 120;
      SendMessageW(list_, LVM_INSERTCOLUMNW, static_cast<WPARAM>(column), reinterpret_cast<LPARAM>(&heading));
    }
    show_table();
  }

  void show_table() const { SendMessageW(list_, LVM_SETITEMCOUNT, static_cast<WPARAM>(table_.rows() - 1), 0); }

  /// One row per position that MyDrawText supports, first with a short text, then with one too long for its rectangle.
  void make_drawing() {
    constexpr int width = 370;
    picture_window_ = child(L"Static", L"", SS_OWNERDRAW, 368, 326, width, 160, 0, WS_EX_CLIENTEDGE);
    picture_ = picture_object(picture_window_, width, 160);
    VARIANT box = variant(picture_);
    utils_->put_DrawTextPictureBox(box);
    VariantClear(&box);
    VARIANT device{};
    DISPID id = 1;
    DISPPARAMS none{};
    picture_->Invoke(id, IID_NULL, 0, DISPATCH_PROPERTYGET, &none, &device, nullptr, nullptr);
    const HDC context = reinterpret_cast<HDC>(static_cast<LONG_PTR>(V_I4(&device)));
    SelectObject(context, GetStockObject(NULL_BRUSH));
    for (short row = 0; row < 4; ++row) {
      const auto justify = static_cast<short>(row - 2);
      const auto top = static_cast<short>(6 + 37 * row);
      draw(context, 6, top, 120, L"iJustify " + std::to_wstring(justify), justify, false);
      draw(context, 136, top, 100, L"too long for its rectangle", justify, false);
      if (justify != -2) draw(context, 250, top, 110, L"too long, with bWordWrap", justify, true);
    }
  }

  void draw(HDC context, short left, short top, short width, const std::wstring& words, short justify,
            bool wraps) const {
    const auto right = static_cast<short>(left + width);
    const auto bottom = static_cast<short>(top + 33);
    Rectangle(context, left, top, right, bottom);
    VARIANT text = variant(words);
    utils_->MyDrawText(&left, &top, const_cast<short*>(&right), const_cast<short*>(&bottom), &text,
                       by_reference(LONG{0x00800000}), &justify, by_reference(VARIANT_BOOL{VARIANT_FALSE}),
                       by_reference(VARIANT_BOOL{wraps ? VARIANT_TRUE : VARIANT_FALSE}));
    VariantClear(&text);
  }

  void add_movable(const wchar_t* text, LONG number, int x, int y) {
    Movable movable;
    movable.window = child(L"Static", text, SS_CENTER | SS_CENTERIMAGE | SS_NOTIFY | WS_BORDER, x, y, 90, 34);
    movable.control = control_object(movable.window, form_);
    CoCreateInstance(CLSID_cControlPosition, nullptr, CLSCTX_INPROC_SERVER, IID__cControlPosition,
                     reinterpret_cast<void**>(&movable.position));
    movable.position->put_ControlName(*Bstr(L"MainWindow"));
    movable.position->put_ControlID(number);
    movable.position->put_DefaultLeft(static_cast<LONG>(static_cast<float>(x) * twips_per_pixel()));
    movable.position->put_DefaultTop(static_cast<LONG>(static_cast<float>(y) * twips_per_pixel()));
    movable.position->GetControlPosition();
    LONG left = 0;
    LONG top = 0;
    movable.position->get_left(&left);
    movable.position->get_Top(&top);
    SetWindowPos(movable.window, HWND_TOP, static_cast<int>(static_cast<float>(left) / twips_per_pixel()),
                 static_cast<int>(static_cast<float>(top) / twips_per_pixel()), 0, 0, SWP_NOSIZE);
    SetWindowLongPtrW(movable.window, GWLP_USERDATA, static_cast<LONG_PTR>(movables_.size()));
    SetWindowSubclass(movable.window, &drag, 0, reinterpret_cast<DWORD_PTR>(this));
    movables_.push_back(movable);
  }

  /// The mouse over a movable control, in the control's own coordinates, in twips.
  static LRESULT CALLBACK drag(HWND window, UINT message, WPARAM what, LPARAM where, UINT_PTR, DWORD_PTR host) {
    Host& self = *reinterpret_cast<Host*>(host);
    const auto x = static_cast<float>(static_cast<short>(LOWORD(where))) * twips_per_pixel();
    const auto y = static_cast<float>(static_cast<short>(HIWORD(where))) * twips_per_pixel();
    if (message == WM_LBUTTONDOWN || message == WM_LBUTTONUP || (message == WM_MOUSEMOVE && GetCapture() == window)) {
      Movable& movable = self.movables_[static_cast<std::size_t>(GetWindowLongPtrW(window, GWLP_USERDATA))];
      if (message == WM_LBUTTONDOWN) {
        SetCapture(window);
        movable.position->put_DragStartX(static_cast<LONG>(x));
        movable.position->put_DragStartY(static_cast<LONG>(y));
      } else if (message == WM_MOUSEMOVE) {
        VARIANT form = variant(self.form_);
        VARIANT control = variant(movable.control);
        movable.position->DragControl(&form, &control, x, y);
        VariantClear(&form);
        VariantClear(&control);
      } else {
        ReleaseCapture();
        movable.position->SaveControlPosition();
        self.tell(L"A control was dragged; its place is remembered.");
      }
      return 0;
    }
    return DefSubclassProc(window, message, what, where);
  }

  void tell(const std::wstring& text) const {
    const LRESULT index = SendMessageW(answers_, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(text.c_str()));
    SendMessageW(answers_, LB_SETTOPINDEX, static_cast<WPARAM>(index), 0);
  }

  void do_command(int command) {
    LONG answer = 0;
    VARIANT grid = variant(table_.object());
    switch (command) {
      case find_branch: {
        VARIANT combo = variant(combo_);
        utils_->GetComboListIndex(&combo, by_reference(LONG{42}), &answer);
        VariantClear(&combo);
        SendMessageW(combo_window_, CB_SETCURSEL, static_cast<WPARAM>(answer), 0);
        tell(L"GetComboListIndex: branch 42 is entry " + std::to_wstring(answer));
        break;
      }
      case tick_all:
      case tick_none:
        utils_->SelectGridRows(by_reference(LONG{done_column}), &grid, by_reference(short{command == tick_all}));
        tell(command == tick_all ? L"SelectGridRows: every job is ticked" : L"SelectGridRows: no job is ticked");
        break;
      case count_ticks:
        utils_->CountGridSelectedRows(by_reference(LONG{done_column}), &grid, &answer);
        tell(L"CountGridSelectedRows: " + std::to_wstring(answer));
        break;
      case export_table:
        utils_->ExportGridData(&grid, by_reference(short{0}), by_reference(VARIANT_BOOL{VARIANT_TRUE}), Bstr(L"Jobs"));
        tell(L"ExportGridData has ended");
        break;
      case print_window: {
        VARIANT form = variant(form_);
        const HRESULT result = utils_->PrintScreen(&form);
        VariantClear(&form);
        tell(FAILED(result) ? L"PrintScreen: printhelper.dll is not beside TALUtil.dll" : L"PrintScreen has ended");
        break;
      }
      default:
        break;
    }
    VariantClear(&grid);
    show_table();
    InvalidateRect(list_, nullptr, FALSE);
  }

  /// The list view asks for each cell when painting it.
  void give_cell(NMLVDISPINFOW& wanted) const {
    static std::wstring text;
    if ((wanted.item.mask & LVIF_TEXT) == 0) return;
    text = table_.text(wanted.item.iItem + 1, wanted.item.iSubItem);
    wanted.item.pszText = text.data();
  }

  void close() {
    VARIANT form = variant(form_);
    utils_->SaveWindowState(&form, Bstr(L"MainWindow"));
    VariantClear(&form);
    VARIANT nothing = variant(static_cast<IDispatch*>(nullptr));
    utils_->put_DrawTextPictureBox(nothing);
    for (const Movable& movable : movables_) {
      movable.position->Release();
      movable.control->Release();
    }
    picture_->Release();
    combo_->Release();
    utils_->Terminate();
    utils_->Release();
    form_->Release();
    PostQuitMessage(0);
  }

  static LRESULT CALLBACK handle(HWND window, UINT message, WPARAM what, LPARAM value) {
    if (GetWindowLongPtrW(window, GWLP_USERDATA) == 0) return DefWindowProcW(window, message, what, value);
    Host& self = of(window);
    switch (message) {
      case WM_COMMAND:
        if (HIWORD(what) == BN_CLICKED) self.do_command(LOWORD(what));
        return 0;
      case WM_NOTIFY:
        if (reinterpret_cast<NMHDR*>(value)->code == LVN_GETDISPINFOW) {
          self.give_cell(*reinterpret_cast<NMLVDISPINFOW*>(value));
        }
        return 0;
      case WM_DRAWITEM: {
        const auto& item = *reinterpret_cast<DRAWITEMSTRUCT*>(value);
        paint_picture(item.hwndItem, item.hDC);
        return TRUE;
      }
      case WM_DESTROY:
        self.close();
        return 0;
      default:
        return DefWindowProcW(window, message, what, value);
    }
  }

  _ORVUtils* utils_ = nullptr;
  Table table_;
  HWND window_ = nullptr;
  HWND combo_window_ = nullptr;
  HWND list_ = nullptr;
  HWND answers_ = nullptr;
  HWND picture_window_ = nullptr;
  Scriptable* form_ = nullptr;
  Scriptable* combo_ = nullptr;
  Scriptable* picture_ = nullptr;
  std::vector<Movable> movables_;
};

}  // namespace

int WINAPI wWinMain(HINSTANCE, HINSTANCE, wchar_t*, int) {
  CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
  InitCommonControls();
  int status = 1;
  try {
    status = Host().run();
  } catch (const std::exception& error) {
    MessageBoxA(nullptr, error.what(), "Bookings", MB_OK | MB_ICONERROR);
  }
  CoUninitialize();
  return status;
}
