#pragma once

#include "client.hpp"

namespace talutil::hosts {

/// A grid of the client's, as a third-party one would be: texts, of which those of a column of Booleans can be put.
class HostGrid final : public HostObject {
 public:
  HostGrid(LONG rows, LONG columns)
      : HostObject({L"Rows", L"Cols", L"FixedRows", L"ColDataType", L"ColHidden", L"RowHidden", L"TextMatrix", L"Cell",
                    L"Row", L"RowSel"},
                   [this](const Use& use) {
                     const HRESULT status = before ? before(use) : S_OK;
                     return status == S_OK ? answer(use) : status;
                   }),
        rows_(rows),
        columns_(columns),
        cells_(static_cast<std::size_t>(rows * columns)) {}

  enum Member : DISPID { Rows = 1, Cols, FixedRows, ColDataType, ColHidden, RowHidden, TextMatrix, Cell, Row, RowSel };

  std::function<HRESULT(const Use&)> before;  ///< May end a use by another answer than S_OK.

  [[nodiscard]] LONG rows() const noexcept { return rows_; }
  [[nodiscard]] LONG columns() const noexcept { return columns_; }
  [[nodiscard]] std::wstring& text(LONG row, LONG column) {
    return cells_[static_cast<std::size_t>(row * columns_ + column)];
  }

 private:
  HRESULT answer(const Use& use) {
    const auto number = [&](UINT index) { return V_I4(&use.argument(index)); };
    if (use.is_put() && use.member != TextMatrix) return DISP_E_MEMBERNOTFOUND;
    switch (use.member) {
      case Rows:
        return use.answer(rows_);
      case Cols:
        return use.answer(columns_);
      case FixedRows:
      case RowSel:
        return use.answer(0L);
      case Row:
        return use.answer(rows_ - 1);
      case ColDataType:
        return use.answer(11L);
      case Cell:
        return use.answer(text(number(1), number(2)) == L"True" ? 1L : 2L);
      case ColHidden:
      case RowHidden:
        return use.answer(Value::of_type(VT_BOOL));
      case TextMatrix: {
        std::wstring& cell = text(number(0), number(1));
        if (!use.is_put()) return use.answer(std::wstring_view(cell));
        const VARIANT& value = use.argument(2);
        cell = V_VT(&value) == VT_BOOL ? (V_BOOL(&value) != 0 ? L"True" : L"False") : L"?";
        return S_OK;
      }
      default:
        return DISP_E_MEMBERNOTFOUND;
    }
  }

  LONG rows_;
  LONG columns_;
  std::vector<std::wstring> cells_;
};

}  // namespace talutil::hosts
