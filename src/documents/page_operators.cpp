#include "documents/page_operators.hpp"

#include <charconv>
#include <cmath>
#include <utility>

namespace talutil {

/// Writes a decimal number without zeros at its end, and a blank.
/// @param value the number, times ten to the power of `decimals`
void PageOperators::number(std::int64_t value, int decimals) {
  if (value < 0) operators_ += '-';
  const std::uint64_t size = value < 0 ? 0 - static_cast<std::uint64_t>(value) : static_cast<std::uint64_t>(value);
  std::uint64_t unit = 1;
  for (int i = 0; i < decimals; ++i) unit *= 10;
  char digits[20];
  operators_.append(digits, std::to_chars(digits, std::end(digits), size / unit).ptr);
  std::uint64_t rest = size % unit;
  if (rest != 0) operators_ += '.';
  while (rest != 0) {
    unit /= 10;
    operators_ += static_cast<char>('0' + rest / unit);
    rest %= unit;
  }
  operators_ += ' ';
}

void PageOperators::colour(std::optional<std::uint32_t>& current, std::uint32_t wanted, std::string_view setter) {
  if (current == wanted) return;
  current = wanted;
  for (const int shift : {0, 8, 16}) {
    const std::uint32_t part = (wanted >> shift) & 0xFF;
    number((part * 10'000 + 127) / 255, 4);
  }
  operators_ += setter;
}

void PageOperators::text(std::string_view font, float points, std::uint32_t letters, std::int32_t left,
                         std::int32_t bottom, std::string_view bytes) {
  if (bytes.empty()) return;
  colour(fill_, letters, "rg\n");
  operators_ += "BT\n";
  if (font_ != font || points_ != points) {
    font_ = font;
    points_ = points;
    (operators_ += '/') += font;
    operators_ += ' ';
    number(std::llround(points * 1000), 3);
    operators_ += "Tf\n";
  }
  if (!fills_letters_) operators_ += "0 Tr\n";
  fills_letters_ = true;
  length(left);
  length(bottom);
  operators_ += "Td\n(";
  for (const char c : bytes) {
    const auto code = static_cast<unsigned char>(c);
    if (code < ' ' || code > '~') {
      operators_ += '\\';
      for (const int shift : {6, 3, 0}) operators_ += static_cast<char>('0' + ((code >> shift) & 7));
      continue;
    }
    if (c == '(' || c == ')' || c == '\\') operators_ += '\\';
    operators_ += c;
  }
  operators_ += ") Tj\nET\n";
}

void PageOperators::rectangle(const TwipsRectangle& place, std::int32_t bottom) {
  length(place.left);
  length(bottom);
  length(place.width);
  length(place.height);
  operators_ += "re\n";
}

void PageOperators::filled(const TwipsRectangle& place, std::int32_t bottom, std::uint32_t wanted) {
  colour(fill_, wanted, "rg\n");
  rectangle(place, bottom);
  operators_ += "f\n";
}

void PageOperators::framed(const TwipsRectangle& place, std::int32_t bottom, std::int32_t line_width,
                           std::uint32_t wanted) {
  colour(stroke_, wanted, "RG\n");
  if (line_width_ != line_width) {
    line_width_ = line_width;
    length(line_width);
    operators_ += "w\n";
  }
  rectangle(place, bottom);
  operators_ += "S\n";
}

std::string PageOperators::take() {
  std::string taken = std::move(operators_);
  *this = {};
  return taken;
}

}  // namespace talutil
