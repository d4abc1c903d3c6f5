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

/// Writes a document as PDF: compressed, its text searchable, a bookmark for each section. Nothing has the file's name
/// before all is written. A document without pages gets an empty one. Raises what the file raises, and 7.
void write_pdf(const Document& document, const PdfInformation& information, FontFiles& fonts, Files& files,
               const Text& path);

}  // namespace talutil
