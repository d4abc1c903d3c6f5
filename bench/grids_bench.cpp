// Grids: the cost of a loop over the rows of a host's grid in addition to the calls of the grid themselves, and the
// memory that our grid takes.
#include <benchmark/benchmark.h>
#include <malloc.h>

#include "bench/quick_grid.hpp"
#include "bench/toolkit.hpp"
#include "controls/grid.hpp"

namespace talutil {

namespace {

constexpr std::int32_t rows = 10000;

struct GridToolkit : Toolkit {
  std::shared_ptr<QuickGrid> grid = std::make_shared<QuickGrid>(rows);
};

void SelectGridRows(benchmark::State& state) {
  GridToolkit toolkit;
  for (auto _ : state) toolkit.utils.SelectGridRows(0, ObjectRef(toolkit.grid), 1);
}
BENCHMARK(SelectGridRows);

void SelectRowsBare(benchmark::State& state) {
  GridToolkit toolkit;
  Object& grid = *toolkit.grid;
  for (auto _ : state) {
    for (std::int32_t r = 0; r < rows; ++r) {
      const Variant arguments[] = {r, 0, Boolean(true)};
      grid.invoke(QuickGrid::text_matrix, Access::put, arguments);
    }
  }
}
BENCHMARK(SelectRowsBare);

void ExportGridData(benchmark::State& state) {
  GridToolkit toolkit;
  for (auto _ : state) {
    toolkit.platform.chosen_files = {u"C:\\x.txt"};
    toolkit.utils.ExportGridData(ObjectRef(toolkit.grid), 0, Boolean(true), u"x");
  }
}
BENCHMARK(ExportGridData)->Unit(benchmark::kMillisecond);

void ExportBare(benchmark::State& state) {
  GridToolkit toolkit;
  Object& grid = *toolkit.grid;
  for (auto _ : state) {
    std::string text;
    for (std::int32_t r = 0; r < rows; ++r) {
      const Variant row = r;
      if (grid.invoke(QuickGrid::row_hidden, Access::get, {&row, 1}).to_boolean(plain_numbers)) continue;
      for (std::int32_t c = 0; c < QuickGrid::columns; ++c) {
        const Variant cell[] = {r, c};
        if (grid.invoke(QuickGrid::column_hidden, Access::get, {cell + 1, 1}).to_boolean(plain_numbers)) continue;
        if (c > 0) text += ',';
        text += to_ansi(grid.invoke(QuickGrid::text_matrix, Access::get, cell).to_text(plain_numbers));
      }
      text += "\r\n";
    }
    toolkit.platform.files.put(u"C:\\x.txt", std::move(text));
  }
}
BENCHMARK(ExportBare)->Unit(benchmark::kMillisecond);

/// A million cells of 12 characters.
void MemoryOfGrid(benchmark::State& state) {
  constexpr std::int32_t filled_rows = 50000;
  constexpr std::int32_t columns = 20;
  GridToolkit toolkit;
  const auto in_use = [] {
    const auto information = mallinfo2();
    return static_cast<double>(information.uordblks + information.hblkhd);
  };
  for (auto _ : state) {
    const double before = in_use();
    Grid grid(toolkit.library.platform());
    grid.put_Cols(columns);
    for (std::int32_t r = 0; r < filled_rows; ++r) {
      grid.put_Rows(r + 1);
      for (std::int32_t c = 0; c < columns; ++c) grid.put_cell(r, c, u"cell 1234 12");
    }
    state.counters["bytes_a_cell"] = (in_use() - before) / (static_cast<double>(filled_rows) * columns);
  }
}
BENCHMARK(MemoryOfGrid)->Unit(benchmark::kMillisecond);

}  // namespace

}  // namespace talutil
