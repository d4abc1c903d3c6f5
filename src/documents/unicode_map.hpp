#pragma once

#include <string>

namespace talutil {

/// The map (ToUnicode CMap) of an embedded font, whose codes are UTF-16: by it, programs that search or copy texts find
/// the letters that presentation forms stand for. Ligatures stay, because these programs take them apart themselves, in
/// the order that fits the direction.
[[nodiscard]] std::string unicode_map();

}  // namespace talutil
