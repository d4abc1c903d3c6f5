#pragma once

#include "platform/font_files.hpp"
#include "platform/printers.hpp"

namespace talutil::posix {

/// Hands documents, as PDF, to the system's "lp". There is no dialog: the system's default printer takes them.
class PosixPrinters final : public Printers {
 public:
  explicit PosixPrinters(FontFiles& fonts) noexcept : fonts_(fonts) {}
  bool print(const Document& document, const PrintSettings& settings) override;

 private:
  FontFiles& fonts_;
};

}  // namespace talutil::posix
