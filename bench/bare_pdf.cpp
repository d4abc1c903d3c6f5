// What a table as PDF costs at the least: bare_pdf TABLE.csv OUT.pdf ROWS PARTS
// Writes a table without quotes, whose columns all have the same width, ROWS rows a page, the columns in PARTS parts
// behind the first column, which each of them repeats. Each cell has the operators that a report writes: a frame and a
// text. Nothing is measured, aligned, wrapped, coloured or checked. The pages are deflated by zlib at level 6, as most
// programs that write PDF do it.
#include <zlib.h>

#include <algorithm>
#include <charconv>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <iterator>
#include <string>
#include <string_view>
#include <vector>

namespace {

using Cells = std::vector<std::string_view>;

std::vector<Cells> rows_of(std::string_view text) {
  std::vector<Cells> rows;
  while (!text.empty()) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    std::string_view line = text.substr(0, end);
    text.remove_prefix(std::min(end + 1, text.size()));
    Cells& cells = rows.emplace_back();
    for (;;) {
      const std::size_t comma = std::min(line.find(','), line.size());
      cells.push_back(line.substr(0, comma));
      if (comma == line.size()) break;
      line.remove_prefix(comma + 1);
    }
  }
  return rows;
}

/// A file of numbered objects, written one after the other.
class Pdf {
 public:
  explicit Pdf(const char* path) : file_(path, std::ios::binary) { write("%PDF-1.4\n"); }

  /// Leaves out a number for an object that is written later.
  std::size_t reserve() {
    offsets_.push_back(0);
    return offsets_.size();
  }

  void write_object(std::size_t number, const std::string& body) {
    offsets_[number - 1] = size_;
    write(std::to_string(number) + " 0 obj\n" + body + "\nendobj\n");
  }

  void write_stream(std::size_t number, const std::string& contents) {
    constexpr int level = 6;
    uLongf size = compressBound(static_cast<uLong>(contents.size()));
    packed_.resize(size);
    if (compress2(reinterpret_cast<Bytef*>(packed_.data()), &size, reinterpret_cast<const Bytef*>(contents.data()),
                  static_cast<uLong>(contents.size()), level) != Z_OK) {
      std::cerr << "bare_pdf: zlib could not deflate a page\n";
      std::exit(1);
    }
    packed_.resize(size);
    write_object(number,
                 "<</Filter/FlateDecode/Length " + std::to_string(size) + ">>stream\n" + packed_ + "\nendstream");
  }

  [[nodiscard]] bool close(std::size_t catalog) {
    const std::size_t start = size_;
    write("xref\n0 " + std::to_string(offsets_.size() + 1) + "\n0000000000 65535 f \n");
    for (const std::size_t offset : offsets_) {
      char line[32];
      write({line, static_cast<std::size_t>(std::snprintf(line, sizeof line, "%010zu 00000 n \n", offset))});
    }
    write("trailer\n<</Size " + std::to_string(offsets_.size() + 1) + "/Root " + std::to_string(catalog) +
          " 0 R>>\nstartxref\n" + std::to_string(start) + "\n%%EOF\n");
    file_.close();
    return file_.good();
  }

 private:
  void write(const std::string& bytes) {
    file_ << bytes;
    size_ += bytes.size();
  }

  std::ofstream file_;
  std::size_t size_ = 0;
  std::vector<std::size_t> offsets_;
  std::string packed_;
};

/// Appends a length, in tenths of a point, and a blank.
void append_length(std::string& contents, std::int64_t tenths) {
  char digits[24];
  contents.append(digits, std::to_chars(digits, std::end(digits), tenths / 10).ptr);
  if (tenths % 10 != 0) (contents += '.') += static_cast<char>('0' + tenths % 10);
  contents += ' ';
}

void append_cell(std::string& contents, std::string_view text, std::int64_t left, std::int64_t top,
                 std::int64_t width) {
  constexpr std::int64_t height = 126;
  for (const std::int64_t length : {left, top, width, height}) append_length(contents, length);
  contents += "re\nS\nBT\n";
  append_length(contents, left + 30);
  append_length(contents, top + 39);
  ((contents += "Td\n(") += text) += ") Tj\nET\n";
}

/// The operators of a page: the heading and some rows, of the first column and of those from `first` to before `end`.
std::string contents_of(const std::vector<Cells>& rows, std::size_t row, std::size_t last, std::size_t first,
                        std::size_t end) {
  constexpr std::int64_t margin = 567;
  const std::int64_t width = 4819 / static_cast<std::int64_t>(end - first + 1);
  std::string contents = "0.7529 0.7529 0.7529 RG\n0.5 w\n/F1 8 Tf\n";
  std::int64_t top = 7726;
  const auto append_row = [&](const Cells& cells) {
    append_cell(contents, cells[0], margin, top, width);
    for (std::size_t c = first; c < end; ++c) {
      append_cell(contents, cells[c], margin + width * static_cast<std::int64_t>(c - first + 1), top, width);
    }
    top -= 126;
  };
  append_row(rows[0]);
  for (; row < last; ++row) append_row(rows[row]);
  return contents;
}

}  // namespace

int main(int count, char** arguments) {
  if (count != 5) {
    std::cerr << "usage: bare_pdf TABLE.csv OUT.pdf ROWS PARTS\n";
    return 2;
  }
  std::ifstream input(arguments[1], std::ios::binary);
  const std::string text{std::istreambuf_iterator<char>(input), {}};
  const std::vector<Cells> rows = rows_of(text);
  const auto rows_a_page = static_cast<std::size_t>(std::atoi(arguments[3]));
  const auto parts = static_cast<std::size_t>(std::atoi(arguments[4]));
  if (rows.empty() || rows_a_page == 0 || parts == 0) {
    std::cerr << "bare_pdf: " << arguments[1] << " has no rows, or ROWS or PARTS is not a number above 0\n";
    return 1;
  }

  Pdf pdf(arguments[2]);
  const std::size_t catalog = pdf.reserve();
  const std::size_t tree = pdf.reserve();
  const std::size_t font = pdf.reserve();
  pdf.write_object(font, "<</Type/Font/Subtype/Type1/BaseFont/Helvetica/Encoding/WinAnsiEncoding>>");
  std::string pages;
  std::size_t page_count = 0;
  const std::size_t columns = rows[0].size();
  for (std::size_t part = 0; part < parts; ++part) {
    const std::size_t first = 1 + (columns - 1) * part / parts;
    const std::size_t end = 1 + (columns - 1) * (part + 1) / parts;
    for (std::size_t row = 1; row < rows.size(); row += rows_a_page) {
      const std::size_t contents = pdf.reserve();
      pdf.write_stream(contents, contents_of(rows, row, std::min(row + rows_a_page, rows.size()), first, end));
      const std::size_t page = pdf.reserve();
      pdf.write_object(page, "<</Type/Page/Parent " + std::to_string(tree) + " 0 R/MediaBox[0 0 595 842]/Contents " +
                                 std::to_string(contents) + " 0 R/Resources<</Font<</F1 " + std::to_string(font) +
                                 " 0 R>>>>>>");
      pages += std::to_string(page) + " 0 R\n";
      ++page_count;
    }
  }
  pdf.write_object(tree, "<</Type/Pages/Count " + std::to_string(page_count) + "/Kids[" + pages + "]>>");
  pdf.write_object(catalog, "<</Type/Catalog/Pages " + std::to_string(tree) + " 0 R>>");
  if (pdf.close(catalog)) return 0;
  std::cerr << "bare_pdf: " << arguments[2] << " could not be written\n";
  return 1;
}
