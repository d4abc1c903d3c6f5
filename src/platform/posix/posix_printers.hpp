#pragma once

#include "platform/font_files.hpp"
#include "platform/printers.hpp"

namespace talutil::posix {

/// Passes documents to the system's "lp" as PDF. There is no dialog: they go to the default printer.
class PosixPrinters final : public Printers {
 public:
  explicit PosixPrinters(FontFiles& fonts) noexcept : fonts_(fonts) {}
  bool print(const Document& document, const PrintSettings& settings) override;

 private:
  FontFiles& fonts_;
};

}  // namespace talutil::posix
