#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "services/sequential_file.hpp"

namespace talutil {

namespace {

/// Resizes an array to the indexes 0 to n, preserving its contents, and returns the element at n.
Text& resize_to(TextArray& list, std::size_t n) {
  // A resize that preserves the contents cannot change the lower bound.
  if (list.allocated && list.lower_bound != 0) raise(ErrorNumber::subscript_out_of_range);
  list.allocated = true;
  list.items.resize(n + 1);
  return list.items.back();
}

/// Writes the elements from index 0 to the upper bound, one per line.
void write_lines(const TextArray& list, SequentialOutput& file) {
  const std::int32_t last = list.upper_bound();
  for (std::int32_t i = 0; i <= last; ++i) file.write_line(list.at(i));
}

}  // namespace

std::int32_t ORVUtils::OpenBigFile(const Text& sFilename, TextArray& sFList, const std::int16_t& iEraseBlanks) {
  if (!FileExists(sFilename).is_exactly_true()) return 0;
  SequentialInput file(library_.platform(), sFilename);
  std::size_t n = 0;
  while (!file.at_end()) {
    Text& element = resize_to(sFList, n);
    if (iEraseBlanks == 1) {
      Text line;
      file.read_line(line);
      // A skipped line leaves behind the element made for it, so the upper bound can be n.
      if (VerifyTextData(0, 0, line).empty()) continue;
      element = std::move(line);
    } else {
      file.read_line(element);
    }
    ++n;
  }
  return checked_cast<std::int32_t>(n);
}

std::int32_t ORVUtils::OpenFile(const Text& sFilename, TextArray& sFList, const std::int32_t& iRowLimit) {
  if (!FileExists(sFilename).is_exactly_true()) return 0;
  SequentialInput file(library_.platform(), sFilename);
  std::int32_t n = 0;
  // The limit is checked after each line, so 0 or less means no limit.
  while (!file.at_end()) {
    file.read_line(resize_to(sFList, static_cast<std::size_t>(n)));
    n = checked_add(n, 1);
    if (n == iRowLimit) break;
  }
  return n;
}

void ORVUtils::SaveBigFile(const TextArray& sFList, const Text& sFilename) {
  SequentialOutput file(library_.platform(), sFilename);
  write_lines(sFList, file);
  file.close();
}

void ORVUtils::CopyFileToBackupFile(const Text& sSrcFileName, const Text& sDestFileName) {
  constexpr std::int32_t row_limit = 30000;
  TextArray lines;
  OpenFile(sSrcFileName, lines, row_limit);
  SequentialOutput file(library_.platform(), sDestFileName);
  // A source without lines leaves the array without bounds: this raises 9, and the existing backup stays.
  write_lines(lines, file);
  file.close();
}

void ORVUtils::SaveTextBox(const Text& sText, const Text& sFilename) {
  SequentialOutput file(library_.platform(), sFilename);
  file.write_line(sText);
  file.close();
}

Text ORVUtils::LoadTextBox(const Text& sFilename) {
  if (!FileExists(sFilename).is_exactly_true()) return {};
  return SequentialInput(library_.platform(), sFilename).read_rest();
}

}  // namespace talutil
