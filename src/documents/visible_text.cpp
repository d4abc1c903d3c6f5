#include "documents/visible_text.hpp"

#include <algorithm>

namespace talutil {

namespace {

Text shown(TextView text, char16_t line_end) {
  if (std::ranges::none_of(text, is_control)) return Text(text);
  constexpr std::size_t tab_stop = 8;
  Text result;
  std::size_t line_start = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char16_t unit = text[i];
    if (unit == u'\t') {
      result.append(tab_stop - (result.size() - line_start) % tab_stop, u' ');
    } else if (unit == u'\n' || unit == u'\r') {
      if (text.substr(i).starts_with(u"\r\n")) ++i;
      result += line_end;
      if (line_end == u'\n') line_start = result.size();
    } else if (is_control(unit)) {
      append_visible(result, unit);
    } else {
      result += unit;
    }
  }
  return result;
}

}  // namespace

void append_visible(Text& text, char16_t control) {
  text += u'^';
  text += static_cast<char16_t>(control ^ 0x40);
}

Text visible_text(TextView text) { return shown(text, u'\n'); }

Text visible_line(TextView text) { return shown(text, u' '); }

}  // namespace talutil
