#pragma once

#include <functional>

#include "platform/files.hpp"
#include "platform/font_files.hpp"
#include "platform/page_model.hpp"

namespace talutil {

struct PdfInformation {
  Text title;
  Text author;
  Text subject;
  Text creator;
};

/// Writes a document as PDF: compressed, with searchable text and a bookmark per section. The file gets its name only
/// once it is complete. A document without pages gets an empty one. Raises the errors of writing a file, 7, and 32755
/// if the user gives up, which is asked before each page.
void write_pdf(const Document& document, const PdfInformation& information, FontFiles& fonts, Files& files,
               const Text& path, const std::function<bool()>& is_given_up = nullptr);

}  // namespace talutil
