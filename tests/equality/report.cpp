#include "tests/equality/report.hpp"

#include <memory>
#include <string>

#include "controls/grid.hpp"
#include "controls/print_control.hpp"

namespace talutil::testing {

void write_report(const Platform& platform, const Text& file) {
  constexpr std::int32_t rows = 120;
  constexpr std::int32_t columns = 4;
  const auto grid = std::make_shared<Grid>(platform);
  grid->put_Cols(columns);
  grid->put_Rows(rows);
  grid->put_FixedRows(1);
  for (std::int32_t row = 0; row < rows; ++row) {
    for (std::int32_t column = 0; column < columns; ++column)
      grid->put_TextMatrix(row, column, u"Cell " + from_utf8(std::to_string(row * 7919 + column)) + u", 5 \u20ac");
  }
  const auto print = std::make_shared<PrintControl>(platform);
  print->Header = u"Bookings";
  print->StartDoc();
  print->RenderObject = ObjectRef(grid);
  print->put_RenderControl(0);
  print->EndDoc();
  PdfExport(platform).ConvertDocument(ObjectRef(print), file);
}

}  // namespace talutil::testing
