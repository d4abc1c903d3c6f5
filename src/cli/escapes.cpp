#include "cli/escapes.hpp"

#include "cli/failure.hpp"

namespace talutil::cli::escapes {

namespace {

constexpr TextView hexadecimal_digits = u"0123456789ABCDEF";

constexpr bool is_surrogate(char16_t unit) noexcept { return unit >= 0xD800 && unit <= 0xDFFF; }

/// Whether a character survives in a profile file: it must have no special meaning there and not be trimmed at either
/// end. Surrogate pairs are escaped as two units: longer, but correct.
bool comes_back(TextView text, std::size_t at) {
  constexpr TextView at_the_ends = u" \"'[;";
  const char16_t unit = text[at];
  if (unit < u' ' || unit == u'=' || unit == u']' || is_surrogate(unit)) return false;
  const bool is_at_an_end = at == 0 || at + 1 == text.size();
  return !is_at_an_end || at_the_ends.find(unit) == TextView::npos;
}

Failure bad_escape(TextView text) {
  return run_time_failure("\"" + to_utf8(text) + "\" has a backslash that begins neither \\\\ nor \\uXXXX");
}

}  // namespace

Text write(TextView text) {
  Text result;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] == u'\\') {
      result += u"\\\\";
    } else if (comes_back(text, i)) {
      result += text[i];
    } else {
      result += u"\\u";
      for (const unsigned shift : {12U, 8U, 4U, 0U}) result += hexadecimal_digits[text[i] >> shift & 15];
    }
  }
  return result;
}

Text read(TextView text) {
  Text result;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] != u'\\') {
      result += text[i];
    } else if (text.substr(i).starts_with(u"\\\\")) {
      result += u'\\';
      ++i;
    } else {
      const TextView digits = text.substr(i).starts_with(u"\\u") ? text.substr(i + 2, 4) : TextView();
      if (digits.size() != 4) throw bad_escape(text);
      unsigned unit = 0;
      for (const char16_t digit : digits) {
        const std::size_t value = hexadecimal_digits.find(upper_case(digit));
        if (value == TextView::npos) throw bad_escape(text);
        unit = unit << 4 | static_cast<unsigned>(value);
      }
      result += static_cast<char16_t>(unit);
      i += 5;
    }
  }
  return result;
}

}  // namespace talutil::cli::escapes
