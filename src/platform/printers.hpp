#pragma once

#include <cstdint>

#include "automation/text.hpp"
#include "platform/page_model.hpp"

namespace talutil {

/// How to print a document, with the codes of the platform's printing functions.
struct PrintSettings {
  Text title;  ///< The name of the print job.
  std::int32_t paper_size = 9;
  std::int32_t orientation = 0;  ///< 0 portrait, 1 landscape.
  std::int32_t duplex = 0;       ///< 1 simplex, 2 vertical, 3 horizontal, 0 for the printer's default.
  bool shows_dialog = false;
};

class Printers {
 public:
  virtual ~Printers() = default;

  /// Prints a document. Returns false if the dialog is cancelled. Raises 482 if there is no printer or printing fails.
  virtual bool print(const Document& document, const PrintSettings& settings) = 0;
};

}  // namespace talutil
