#pragma once

#include <algorithm>
#include <map>

#include "client.hpp"

namespace talutil::hosts {

/// A grid of the client's, as another maker's would be: properties by name, of which TextMatrix can be put; counted
/// look-ups and references.
class TableObject final : public NamelessObject {
 public:
  TableObject(LONG rows, LONG columns)
      : rows_(rows), columns_(columns), cells_(static_cast<std::size_t>(rows * columns)) {}

  ULONG references = 1;
  std::map<std::wstring, int> look_ups;
  std::function<HRESULT(DISPID member, WORD flags, EXCEPINFO* exception)> before;  ///< Other than S_OK ends the use.

  [[nodiscard]] std::wstring& text(LONG row, LONG column) {
    return cells_[static_cast<std::size_t>(row * columns_ + column)];
  }
  [[nodiscard]] LONG rows() const noexcept { return rows_; }
  [[nodiscard]] LONG columns() const noexcept { return columns_; }

  ULONG STDMETHODCALLTYPE AddRef() override { return ++references; }
  ULONG STDMETHODCALLTYPE Release() override { return --references; }

  enum Member : DISPID {
    Rows = 1,
    Cols,
    FixedRows,
    ColDataType,
    ColHidden,
    RowHidden,
    TextMatrix,
    Cell,
    Row,
    RowSel,
    End
  };
  static constexpr const wchar_t* names[] = {L"Rows",      L"Cols",       L"FixedRows", L"ColDataType", L"ColHidden",
                                             L"RowHidden", L"TextMatrix", L"Cell",      L"Row",         L"RowSel"};

  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* asked, UINT, LCID, DISPID* ids) override {
    ++look_ups[*asked];
    const auto* const found =
        std::ranges::find_if(names, [&](const wchar_t* name) { return lstrcmpiW(name, *asked) == 0; });
    *ids = found == std::end(names) ? DISPID_UNKNOWN : static_cast<DISPID>(found - names) + 1;
    return *ids == DISPID_UNKNOWN ? DISP_E_UNKNOWNNAME : S_OK;
  }

  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* parameters, VARIANT* result,
                                   EXCEPINFO* exception, UINT*) override {
    if (before) {
      const HRESULT status = before(id, flags, exception);
      if (status != S_OK) return status;
    }
    const bool is_put = flags == DISPATCH_PROPERTYPUT;
    if (is_put ? id != TextMatrix : (flags & DISPATCH_PROPERTYGET) == 0) return DISP_E_MEMBERNOTFOUND;
    const auto argument = [&](UINT index) { return V_I4(&parameters->rgvarg[parameters->cArgs - 1 - index]); };
    const auto answer = [&](LONG number) {
      V_VT(result) = VT_I4;
      V_I4(result) = number;
      return S_OK;
    };
    switch (id) {
      case Rows:
        return answer(rows_);
      case Cols:
        return answer(columns_);
      case FixedRows:
      case RowSel:
        return answer(0);
      case Row:
        return answer(rows_ - 1);
      case ColDataType:
        return answer(11);
      case Cell:
        return answer(text(argument(1), argument(2)) == L"True" ? 1 : 2);
      case ColHidden:
      case RowHidden:
        V_VT(result) = VT_BOOL;
        V_BOOL(result) = VARIANT_FALSE;
        return S_OK;
      case TextMatrix: {
        std::wstring& cell = text(argument(0), argument(1));
        if (is_put) {
          const VARIANT& value = parameters->rgvarg[0];
          cell = V_VT(&value) == VT_BOOL ? (V_BOOL(&value) != 0 ? L"True" : L"False") : L"?";
          return S_OK;
        }
        V_VT(result) = VT_BSTR;
        V_BSTR(result) = SysAllocStringLen(cell.data(), static_cast<UINT>(cell.size()));
        return S_OK;
      }
      default:
        return DISP_E_MEMBERNOTFOUND;
    }
  }

 private:
  LONG rows_;
  LONG columns_;
  std::vector<std::wstring> cells_;
};

}  // namespace talutil::hosts
