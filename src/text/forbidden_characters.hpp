#pragma once

#include <cstdint>

#include "platform/code_page.hpp"

namespace talutil {

/// A replacement of all characters that have the code of `from`.
struct Replacement {
  TextView from;
  TextView to;
};

/// Characters that would end a quoted database text, or that hosts use as separators. The order matters: each step
/// works on the result of the previous one.
inline constexpr Replacement forbidden[] = {
    {u"&", u"and"}, {u"\"", u""}, {u"'", u"\u00B4"}, {u"\t", u""}, {u"#", u""}, {u">", u""}, {u"<", u""}, {u"?", u""},
};

/// The further replacements that a field may ask for.
inline constexpr Replacement comma_removal{u",", u""};
inline constexpr Replacement blank_removal{u" ", u""};

/// The text after all steps of `forbidden` and, by these flags, the further ones, in this order; in a single pass.
[[nodiscard]] Text without_forbidden(CodePage& page, TextView text, bool drops_commas, bool drops_blanks);

}  // namespace talutil
