#pragma once

#include <string>
#include <string_view>

#include "automation/text.hpp"

namespace talutil::cli {

/// The bytes of a file, or of standard input for "-". Fails with the system's message if it cannot be read.
[[nodiscard]] std::string read_bytes(const std::string& path);

/// Writes a file, replacing an existing one. Fails with the system's message.
void write_bytes(const std::string& path, std::string_view bytes);

/// Converts UTF-8 to a text; anything else fails with `what`, the name of its source.
[[nodiscard]] Text utf8_text(std::string_view bytes, const std::string& what);

}  // namespace talutil::cli
