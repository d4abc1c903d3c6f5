#pragma once

#include "platform/font_files.hpp"
#include "platform/printers.hpp"

namespace talutil::win32 {

/// The platform's printer dialog and its spooler.
class Win32Printers final : public Printers {
 public:
  bool print(const Document& document, const PrintSettings& settings) override;
};

/// Courier New and Arial as installed on the platform.
class Win32FontFiles final : public FontFiles {
 public:
  [[nodiscard]] std::vector<std::uint8_t> wide_font(bool is_fixed_width) override;
};

}  // namespace talutil::win32
