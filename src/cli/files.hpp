#pragma once

#include <string>
#include <string_view>

#include "automation/text.hpp"

namespace talutil::cli {

/// The bytes of a file, or of standard input for "-". A file that cannot be read fails with what the system
/// says of it.
[[nodiscard]] std::string read_bytes(const std::string& path);

/// Puts a file in the place of what stood there. Fails with what the system says.
void write_bytes(const std::string& path, std::string_view bytes);

/// A text in UTF-8; anything else fails, `what` telling where it came from.
[[nodiscard]] Text utf8_text(std::string_view bytes, const std::string& what);

}  // namespace talutil::cli
