#pragma once

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
/// once it is complete. A document without pages gets an empty one. Raises the errors of writing a file, and 7.
void write_pdf(const Document& document, const PdfInformation& information, FontFiles& fonts, Files& files,
               const Text& path);

}  // namespace talutil
