// A client with objects of its own, of third parties and of the example's windows, which answer a use only as what the
// member is; and what the library makes of objects that fail.
#include "bench/hosts/host_grid.hpp"
#include "examples/host/window_objects.hpp"
#include "hostile_values.hpp"

using namespace talutil::hosts;

namespace {

/// The dots of a colour within a picture.
int dots_of(IDispatch* picture, COLORREF colour) {
  const auto context = reinterpret_cast<HDC>(static_cast<LONG_PTR>(V_I4(&use(picture, L"hDC").result.get())));
  int count = 0;
  for (int i = 0; i < 100 * 100; ++i) count += GetPixel(context, i % 100, i / 100) == colour ? 1 : 0;
  return count;
}

/// Texts are drawn by a picture box of the example host's, or on its context. Nothing is left of it at the end.
void pictures_are_drawn_on(_ORVUtils* u) {
  const HWND outer = window(L"Static", WS_OVERLAPPEDWINDOW, 400, 300);
  Scriptable* const picture = picture_object(outer, 100, 100);
  put(picture, L"ForeColor", 5L);
  check_equal(S_OK, put(u, L"DrawTextPictureBox", picture), "a picture box");
  constexpr COLORREF red = 255;
  int dots = 0;
  for (const wchar_t* const text : {L"abc", L"longer than the rectangle"}) {
    const HRESULT status = u->MyDrawText(Short{10}, Short{20}, Short{60}, Short{40}, Value(text), Long{red}, Short{0},
                                         Flag{VARIANT_TRUE}, Flag{});
    check_equal(S_OK, status, narrow(text));
    const int before = std::exchange(dots, dots_of(picture, red));
    check(dots > before, "the dots of a text, by the box or on its context: " + std::to_string(dots));
  }
  check_equal(5, V_I4(&use(picture, L"ForeColor").result.get()), "the colour is put back");
  put(u, L"DrawTextPictureBox", Value::nothing());
  check_equal(0U, picture->Release(), "references at the end");
  DestroyWindow(outer);
}

/// A search for what the combo's Text answers, here an object, in a control that takes it in one way alone.
void search_texts_are_put(_ORVUtils* u) {
  for (const bool by_reference : {true, false}) {
    bool is_put = false;
    const auto take = [&](const VARIANT& value) {
      is_put = V_VT(&value) == VT_DISPATCH && V_DISPATCH(&value) == &with_value;
    };
    auto* const combo = new Scriptable;
    combo->property(L"Text", [] { return variant(&with_value); });
    combo->property(L"SearchText", {}, by_reference ? Scriptable::Setter() : take,
                    by_reference ? Scriptable::Setter(take) : Scriptable::Setter());
    combo->method(L"Refresh", {0, 0}, [](const Scriptable::Arguments&) { return VARIANT{}; });
    for (const wchar_t* name : {L"ListIndex", L"ColumnSearch", L"SearchMethod", L"Action", L"SearchIndex"})
      combo->property(
          name, [] { return variant(LONG{0}); }, [](const VARIANT&) {});
    check_equal(S_OK, u->SearchCombo(Value(combo), Short{0}, Long()), "a search for an object");
    check(is_put, by_reference ? "a property that keeps an object" : "one that takes any value");
    check(combo->Release() == 0 && with_value.references == 1, "references afterwards");
  }
}

Outcome save_widths(_ORVUtils* u, Value& grid, bool is_early) {
  if (!is_early) return use(u, L"SaveGridWidths", grid, L"Grid", short{0});
  return early_outcome(u->SaveGridWidths(grid, Text(L"Grid"), Short{0}));
}

HRESULT WINAPI fill_in(EXCEPINFO* exception) {
  exception->scode = their_error;
  exception->bstrSource = SysAllocString(L"OtherGrid");
  exception->bstrDescription = SysAllocString(L"The grid is busy.");
  exception->bstrHelpFile = SysAllocString(L"grid.chm");
  exception->dwHelpContext = 77;
  return S_OK;
}

HRESULT raise_with_help(const Use& use) { return fill_in(use.exception), DISP_E_EXCEPTION; }

/// The caller has to ask for what the error is.
HRESULT raise_deferred(const Use& use) {
  use.exception->pfnDeferredFillIn = fill_in;
  return DISP_E_EXCEPTION;
}

template <HRESULT Code>
HRESULT raise_bare(const Use& use) {
  use.exception->scode = Code;
  return DISP_E_EXCEPTION;
}

template <HRESULT Code>
HRESULT answer(const Use&) {
  return Code;
}

void errors_of_objects_reach_the_caller(_ORVUtils* u) {
  constexpr auto unplugged = static_cast<HRESULT>(0x80070002U);  // Known to the system, unknown to hosts.
  constexpr const wchar_t* of_the_system = nullptr;
  const struct {
    HRESULT (*fails)(const Use&);
    HRESULT number;
    const wchar_t* text;
  } rows[] = {
      {raise_with_help, their_error, L"OtherGrid: The grid is busy."},
      {raise_deferred, their_error, L"OtherGrid: The grid is busy."},
      {raise_bare<unplugged>, unplugged, of_the_system},
      {answer<unplugged>, unplugged, of_the_system},
      {answer<E_NOTIMPL>, run_time_error(445), L"TALUtil.ORVUtils: Object doesn't support this action"},
      {answer<E_ACCESSDENIED>, run_time_error(70), L"TALUtil.ORVUtils: Permission denied"},
      {answer<E_NOINTERFACE>, run_time_error(430),
       L"TALUtil.ORVUtils: Class does not support Automation or does not support expected interface"},
      {answer<DISP_E_NONAMEDARGS>, run_time_error(446), L"TALUtil.ORVUtils: Object doesn't support named arguments"},
      {answer<DISP_E_NOTACOLLECTION>, run_time_error(451),
       L"TALUtil.ORVUtils: Property let procedure not defined and property get procedure did not return an object"},
  };
  HostGrid table(3, 1);
  Value grid(&table);
  for (const auto& row : rows) {
    table.before = row.fails;
    for (const bool is_early : {true, false}) {
      const Outcome heard = save_widths(u, grid, is_early);
      const std::string name = shown(row.number) + (is_early ? ", early" : ", late");
      check_equal(row.number, heard.error, name);
      check_equal(row.number == their_error ? L"grid.chm#77" : L"#0", heard.help, name + ": its help");
      const bool is_general = heard.text.find(L"Application-defined") != std::wstring::npos;
      if (row.text != of_the_system)
        check_equal(row.text, heard.text, name);
      else
        check(heard.text.starts_with(L": ") && heard.text.size() > 2 && !is_general, name + ": " + narrow(heard.text));
    }
  }
  check_equal(2U, table.references, "references after errors");

  std::pair<Value, int> others[] = {
      {Value::undriven(), 13}, {Value(&with_value), 438}, {Value::nothing(), 91}, {Value::null(), 424}};
  for (auto& [other, number] : others) {
    for (const bool is_early : {true, false})
      check_equal(run_time_error(number), save_widths(u, other, is_early).error, "what cannot be driven");
  }
}

void grids_are_driven(_ORVUtils* u) {
  HostGrid table(10000, 1);
  // A variable of a script within a variable: the object is found behind both.
  Value inner(&table);
  Value outer(&inner.get());
  Value outermost(&outer.get());
  Long count;
  u->SelectGridRows(Long{0}, outermost, Short{1});
  check_equal(L"True", table.text(9999, 0), "the last row is ticked");
  u->CountGridSelectedRows(Long{0}, outermost, count);
  check_equal(10000, count.value, "the ticked rows");
  check_equal(2, std::ranges::max(table.look_ups), "a member is looked up once a call");

  // The host lets go of its variable, and calls the library again, in the middle of a call.
  Long pages;
  table.before = [&](const Use& use) {
    if (use.member != HostGrid::TextMatrix) return S_OK;
    inner = Value();
    return u->GetMaxPages(Long{4}, Long{14}, pages);
  };
  u->SelectGridRows(Long{0}, outermost, Short{0});
  check_equal(L"False", table.text(9999, 0), "the grid is kept for as long as the call");
  check_equal(4, pages.value, "a call within a call");
  check_equal(1U, table.references, "references that are left");
}

}  // namespace

int wmain(int, wchar_t**) {
  return run_checks([] {
    const Pointer<_ORVUtils> object = create_object();
    for (const auto check_part :
         {pictures_are_drawn_on, search_texts_are_put, errors_of_objects_reach_the_caller, grids_are_driven})
      check_part(object.get());
    object->Terminate();
  });
}
