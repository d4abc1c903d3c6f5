// A client whose objects answer a use only as what the member is, and what the library makes of objects that fail.
#include <cmath>

#include "examples/host/window_objects.hpp"
#include "table_object.hpp"
#include "typed_picture_box.hpp"

using namespace talutil::hosts;

namespace {

HRESULT draw(_ORVUtils* u, const wchar_t* text) {
  return u->MyDrawText(Short{10}, Short{20}, Short{50}, Short{40}, Value(text), Long{255}, Short{0},
                       Number<VARIANT_BOOL>{VARIANT_TRUE}, Number<VARIANT_BOOL>{});
}

void typed_picture_boxes_are_drawn_on(_ORVUtils* u) {
  TypedPictureBox picture;
  check_equal(S_OK, u->put_DrawTextPictureBox(Value(&picture).get()), "a picture box");
  UndrivenObject undriven;
  check_equal(run_time_error(13), u->put_DrawTextPictureBox(undriven.value().get()), "an object without automation");
  check_equal(S_OK, draw(u, L"abc"), "a text that has room");
  check_equal(L"abc bold in 255 at 300,350", picture.box.printed, "what the box printed");
  check_equal(S_OK, draw(u, L"longer than the rectangle"), "a text that has none");
  check_equal(L"abc bold in 255 at 300,350", picture.box.printed, "which is not printed");
  check_equal(5, picture.box.colour, "the colour is put back");
  u->put_DrawTextPictureBox(Value(static_cast<IDispatch*>(nullptr)).get());
  check_equal(1U, picture.references, "references afterwards");
}

HWND window(const wchar_t* window_class, DWORD style, int x, int y, int width, int height, HWND parent) {
  return CreateWindowW(window_class, L"", style, x, y, width, height, parent, nullptr, nullptr, nullptr);
}

/// Holds one of the host's own objects, of which nothing must be left at the end.
class Held {
 public:
  Held(Scriptable* object, const char* name) : object_(object), name_(name) {}
  Held(const Held&) = delete;
  Held& operator=(const Held&) = delete;
  ~Held() { check_equal(0U, object_->Release(), std::string("references to ") + name_); }
  [[nodiscard]] Scriptable* get() const { return object_; }

 private:
  Scriptable* object_;
  const char* name_;
};

void controls_are_dragged_on_a_form() {
  const HWND outer = window(L"Static", WS_OVERLAPPEDWINDOW, 0, 0, 400, 300, nullptr);
  const Held form(form_object(outer), "the form");
  const Held control(control_object(window(L"Static", WS_CHILD, 10, 10, 100, 50, outer), form.get()), "the control");
  Pointer<_cControlPosition> position;
  require(CoCreateInstance(CLSID_cControlPosition, nullptr, CLSCTX_INPROC_SERVER, IID__cControlPosition,
                           position.receive_untyped()),
          "creating TALUtil.cControlPosition");
  const float pixel = twips_per_pixel();
  check_equal(S_OK, position->DragControl(Value(form.get()), Value(control.get()), 20 * pixel, 30 * pixel), "a drag");
  LONG left = 0;
  LONG top = 0;
  position->get_left(&left);
  position->get_Top(&top);
  check_equal(std::lround(30 * pixel), left, "its left");
  check_equal(std::lround(40 * pixel), top, "its top");
  DestroyWindow(outer);
}

void combo_entries_are_found(_ORVUtils* u) {
  const HWND box = window(L"ComboBox", CBS_DROPDOWN, 0, 0, 100, 100, nullptr);
  for (const LONG key : {7, 19, 42}) {
    SendMessageW(box, CB_SETITEMDATA,
                 static_cast<WPARAM>(SendMessageW(box, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(L"entry"))), key);
  }
  const Held combo(combo_object(box), "the combo");
  LONG index = 0;
  check_equal(S_OK, u->GetComboListIndex(Value(combo.get()), Long{42}, &index), "a search for a key");
  check_equal(2, index, "its index");
  DestroyWindow(box);
}

/// A search for what the combo's Text answers, here an object, in a control that takes it in one way or the other.
std::wstring search_text_is_put(_ORVUtils* u, bool by_reference) {
  std::wstring how = L"not at all";
  HostObject text(HostObject::Kind::with_value);
  const Held combo(new Scriptable, "the combo");
  const auto take = [&](const wchar_t* way) {
    return [&how, &text, way](const VARIANT& value) {
      how = V_VT(&value) == VT_DISPATCH && V_DISPATCH(&value) == &text ? way : L"as another value";
    };
  };
  const auto ignore = [](const VARIANT&) {};
  const auto number = [] { return variant(LONG{0}); };
  combo.get()->method(L"Refresh", {0, 0}, [](const Scriptable::Arguments&) { return VARIANT{}; });
  combo.get()->property(L"Text", [&] { return variant(&text); });
  combo.get()->property(L"SearchText", {}, by_reference ? Scriptable::Setter() : take(L"as a value"),
                        by_reference ? take(L"by reference") : Scriptable::Setter());
  for (const wchar_t* name : {L"ListIndex", L"ColumnSearch", L"SearchMethod", L"Action", L"SearchIndex"}) {
    combo.get()->property(name, number, ignore);
  }
  LONG index = 0;
  check_equal(S_OK, u->SearchCombo(Value(combo.get()), Short{0}, &index), "a search for an object");
  check_equal(1U, text.references, "references to it");
  return how;
}

/// What a caller hears of an error: "source: description", help file and context.
struct Heard {
  HRESULT number = S_OK;
  std::wstring text;
  std::wstring help;
};

Heard early(_ORVUtils* u, Value& grid) {
  Heard heard{u->SaveGridWidths(grid, Text(L"Grid"), Short{0}), {}, {}};
  Pointer<IErrorInfo> error;
  GetErrorInfo(0, error.receive());
  if (!error) return heard;
  Text help;
  DWORD context = 0;
  error->GetHelpFile(help);
  error->GetHelpContext(&context);
  heard.help = std::wstring(help.view()) + L"#" + std::to_wstring(context);
  SetErrorInfo(0, error.get());
  heard.text = error_text();
  return heard;
}

Heard late(_ORVUtils* u, Value& grid) {
  DISPID id = 0;
  auto* name = const_cast<wchar_t*>(L"SaveGridWidths");
  require(u->GetIDsOfNames(IID_NULL, &name, 1, LOCALE_USER_DEFAULT, &id), "SaveGridWidths");
  const Value start(short{0});
  const Value section(L"Grid");
  std::array<VARIANT, 3> arguments{start.get(), section.get(), grid.get()};
  DISPPARAMS parameters{arguments.data(), nullptr, 3, 0};
  EXCEPINFO exception{};
  Heard heard{u->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, nullptr, &exception, nullptr),
              std::wstring(view(exception.bstrSource)) + L": " + std::wstring(view(exception.bstrDescription)),
              std::wstring(view(exception.bstrHelpFile)) + L"#" + std::to_wstring(exception.dwHelpContext)};
  if (heard.number == DISP_E_EXCEPTION) heard.number = exception.scode;
  for (BSTR text : {exception.bstrSource, exception.bstrDescription, exception.bstrHelpFile}) SysFreeString(text);
  return heard;
}

constexpr auto their_error = static_cast<HRESULT>(0x80041234U);

HRESULT raise_with_help(EXCEPINFO* exception) {
  exception->scode = their_error;
  exception->bstrSource = SysAllocString(L"OtherGrid");
  exception->bstrDescription = SysAllocString(L"The grid is busy.");
  exception->bstrHelpFile = SysAllocString(L"grid.chm");
  exception->dwHelpContext = 77;
  return DISP_E_EXCEPTION;
}

template <HRESULT Code>
HRESULT raise_bare(EXCEPINFO* exception) {
  exception->scode = Code;
  return DISP_E_EXCEPTION;
}

template <HRESULT Code>
HRESULT answer(EXCEPINFO*) {
  return Code;
}

void errors_of_objects_reach_the_caller(_ORVUtils* u) {
  constexpr auto unplugged = static_cast<HRESULT>(0x80070002U);  // Known to the system, unknown to hosts.
  const struct {
    const char* name;
    HRESULT (*fails)(EXCEPINFO*);
    HRESULT number;
    const wchar_t* text;  ///< None: whatever the system calls it.
    const wchar_t* help;
  } rows[] = {
      {"with everything", raise_with_help, their_error, L"OtherGrid: The grid is busy.", L"grid.chm#77"},
      {"with a number alone", raise_bare<unplugged>, unplugged, nullptr, L"#0"},
      {"no exception", answer<unplugged>, unplugged, nullptr, L"#0"},
      {"E_NOTIMPL", answer<E_NOTIMPL>, run_time_error(445), L"TALUtil.ORVUtils: Object doesn't support this action",
       L"#0"},
      {"E_ACCESSDENIED", answer<E_ACCESSDENIED>, run_time_error(70), L"TALUtil.ORVUtils: Permission denied", L"#0"},
      {"E_NOINTERFACE", answer<E_NOINTERFACE>, run_time_error(430),
       L"TALUtil.ORVUtils: Class does not support Automation or does not support expected interface", L"#0"},
      {"DISP_E_NONAMEDARGS", answer<DISP_E_NONAMEDARGS>, run_time_error(446),
       L"TALUtil.ORVUtils: Object doesn't support named arguments", L"#0"},
      {"DISP_E_NOTACOLLECTION", answer<DISP_E_NOTACOLLECTION>, run_time_error(451),
       L"TALUtil.ORVUtils: Property let procedure not defined and property get procedure did not return an object",
       L"#0"},
  };
  TableObject table(3, 1);
  Value grid(&table);
  for (const auto& row : rows) {
    table.before = [&](DISPID, WORD, EXCEPINFO* exception) { return row.fails(exception); };
    for (const auto hear : {early, late}) {
      const Heard heard = hear(u, grid);
      const std::string name = std::string(row.name) + (hear == early ? ", early" : ", late");
      check_equal(row.number, heard.number, name);
      check_equal(row.help, heard.help, name + ": its help");
      if (row.text != nullptr) {
        check_equal(row.text, heard.text, name);
        continue;
      }
      const bool is_general = heard.text.find(L"Application-defined") != std::wstring::npos;
      check(heard.text.starts_with(L": ") && heard.text.size() > 2 && !is_general, name + ": " + narrow(heard.text));
    }
  }
  check_equal(2U, table.references, "references after errors");
}

void what_cannot_be_driven_is_an_error(_ORVUtils* u) {
  UndrivenObject undriven;
  HostObject other(HostObject::Kind::with_value);
  struct {
    const char* name;
    Value grid;
    int error;
  } rows[] = {
      {"an object without automation", undriven.value(), 13},
      {"an object without the members", Value(&other), 438},
      {"an empty reference", Value(static_cast<IDispatch*>(nullptr)), 91},
      {"Null", Value::null(), 424},
  };
  for (auto& row : rows) {
    check_equal(run_time_error(row.error), early(u, row.grid).number, std::string(row.name) + ", early");
    check_equal(run_time_error(row.error), late(u, row.grid).number, std::string(row.name) + ", late");
  }
}

}  // namespace

int wmain(int, wchar_t**) {
  return run_checks([] {
    const Pointer<_ORVUtils> object = create_object();
    _ORVUtils* const u = object.get();
    typed_picture_boxes_are_drawn_on(u);
    controls_are_dragged_on_a_form();
    combo_entries_are_found(u);
    check_equal(L"by reference", search_text_is_put(u, true), "a property that keeps an object");
    check_equal(L"as a value", search_text_is_put(u, false), "one that takes any value");
    errors_of_objects_reach_the_caller(u);
    what_cannot_be_driven_is_an_error(u);
    object->Terminate();
  });
}
