#include "documents/pdf_writer.hpp"

#include <algorithm>
#include <array>

#include "automation/run_time_error.hpp"
#include "documents/font_metrics.hpp"
#include "documents/pdf_fonts.hpp"

namespace talutil {

namespace {

constexpr float points(std::int32_t twips) noexcept { return static_cast<float>(twips) / 20; }

struct Rgb {
  float red;
  float green;
  float blue;
};

constexpr Rgb rgb_of(std::uint32_t colour) noexcept {
  const auto part = [colour](int shift) { return static_cast<float>((colour >> shift) & 0xFF) / 255; };
  return {part(0), part(8), part(16)};
}

WideFont wide_font_of(const TextRun& run) noexcept {
  if (run.is_named_font) return WideFont::named;
  return run.font.family == FontFamily::courier ? WideFont::fixed : WideFont::proportional;
}

/// What every report is written in, whatever its data.
constexpr const char* language = "en-GB";

/// The document's language and title bar, for which the PDF library has no functions. Failures show up in `check`.
void set_catalog(PdfDocument& pdf) {
  const HPDF_Doc document = pdf.get();
  document->pdf_version = std::max(document->pdf_version, HPDF_VER_14);  // The first with languages and title bars.
  HPDF_Dict_Add(document->catalog, "Lang", HPDF_String_New(document->mmgr, language, nullptr));
  const HPDF_Dict preferences = HPDF_Dict_New(document->mmgr);
  HPDF_Dict_AddBoolean(preferences, "DisplayDocTitle", HPDF_TRUE);
  HPDF_Dict_Add(document->catalog, "ViewerPreferences", preferences);
}

/// Adds the bookmarks, parts below their report.
void add_bookmarks(PdfDocument& pdf, const Document& document, const std::vector<HPDF_Page>& pages) {
  const HPDF_Encoder utf8 = HPDF_GetEncoder(pdf.get(), "UTF-8");
  HPDF_Outline report = nullptr;
  for (const Bookmark& bookmark : document.bookmarks) {
    if (bookmark.page >= pages.size()) continue;
    const HPDF_Outline parent = bookmark.level == 0 ? nullptr : report;
    const HPDF_Outline outline = HPDF_CreateOutline(pdf.get(), parent, to_utf8(bookmark.title).c_str(), utf8);
    HPDF_Outline_SetDestination(outline, HPDF_Page_CreateDestination(pages[bookmark.page]));
    if (bookmark.level == 0) report = outline;
  }
  if (document.bookmarks.size() > 1) HPDF_SetPageMode(pdf.get(), HPDF_PAGE_MODE_USE_OUTLINE);
}

/// Draws the items of one page, skipping those entirely outside it.
class PageWriter {
 public:
  PageWriter(PdfDocument& pdf, const Page& page) : pdf_(pdf), page_(page), target_(HPDF_AddPage(pdf.get())) {
    HPDF_Page_SetWidth(target_, points(page.width));
    HPDF_Page_SetHeight(target_, points(page.height));
  }

  void write() {
    for (const PageItem& item : page_.items) std::visit([this](const auto& held) { draw(held); }, item);
  }

  [[nodiscard]] HPDF_Page target() const noexcept { return target_; }

 private:
  [[nodiscard]] bool is_outside(std::int32_t left, std::int32_t top) const noexcept {
    return top >= page_.height || left >= page_.width;
  }
  [[nodiscard]] float y_of(std::int32_t top) const noexcept { return points(page_.height - top); }

  void draw(const TextRun& run) {
    if (is_outside(run.left, run.top)) return;
    HPDF_Font font = nullptr;
    if (run.is_wide) font = pdf_.wide_font(wide_font_of(run));
    const bool is_wide = font != nullptr;
    if (!is_wide) font = pdf_.standard_font(run.font.family, run.font.is_bold);
    const Rgb colour = rgb_of(run.colour);
    HPDF_Page_SetRGBFill(target_, colour.red, colour.green, colour.blue);
    HPDF_Page_BeginText(target_);
    HPDF_Page_SetFontAndSize(target_, font, run.font.points);
    // The embedded font has one weight: strokes along its outlines make it bold.
    const bool is_stroked = is_wide && run.font.is_bold;
    if (is_stroked) {
      HPDF_Page_SetRGBStroke(target_, colour.red, colour.green, colour.blue);
      HPDF_Page_SetLineWidth(target_, run.font.points / 30);
    }
    HPDF_Page_SetTextRenderingMode(target_, is_stroked ? HPDF_FILL_THEN_STROKE : HPDF_FILL);
    const std::string bytes = is_wide ? to_utf8(run.text) : to_ansi(run.text);
    HPDF_Page_TextOut(target_, points(run.left), y_of(run.top + baseline(run.font)), bytes.c_str());
    HPDF_Page_EndText(target_);
  }

  void draw(const Box& box) {
    const TwipsRectangle& place = box.place;
    if (is_outside(place.left, place.top)) return;
    const auto outline = [&] {
      HPDF_Page_Rectangle(target_, points(place.left), y_of(place.top + place.height), points(place.width),
                          points(place.height));
    };
    if (box.fill) {
      const Rgb colour = rgb_of(*box.fill);
      HPDF_Page_SetRGBFill(target_, colour.red, colour.green, colour.blue);
      outline();
      HPDF_Page_Fill(target_);
    }
    if (box.line_width > 0) {
      const Rgb colour = rgb_of(box.line_colour);
      HPDF_Page_SetRGBStroke(target_, colour.red, colour.green, colour.blue);
      HPDF_Page_SetLineWidth(target_, points(box.line_width));
      outline();
      HPDF_Page_Stroke(target_);
    }
  }

  void draw(const Picture& picture) {
    if (is_outside(picture.place.left, picture.place.top) || !picture.pixels) return;
    const HPDF_Image image =
        HPDF_LoadRawImageFromMem(pdf_.get(), picture.pixels->data(), static_cast<HPDF_UINT>(picture.width),
                                 static_cast<HPDF_UINT>(picture.height), HPDF_CS_DEVICE_RGB, 8);
    if (image == nullptr) return pdf_.check();
    const TwipsRectangle& place = picture.place;
    HPDF_Page_DrawImage(target_, image, points(place.left), y_of(place.top + place.height), points(place.width),
                        points(place.height));
  }

  PdfDocument& pdf_;
  const Page& page_;
  HPDF_Page target_;
};

void save(PdfDocument& pdf, OutputFile& file) {
  HPDF_SaveToStream(pdf.get());
  pdf.check();
  HPDF_ResetStream(pdf.get());
  std::array<HPDF_BYTE, 65536> buffer;  // NOLINT(cppcoreguidelines-pro-type-member-init): filled before it is read.
  while (true) {
    auto size = static_cast<HPDF_UINT32>(buffer.size());
    const HPDF_STATUS status = HPDF_ReadFromStream(pdf.get(), buffer.data(), &size);
    if (size > 0) file.write({reinterpret_cast<const char*>(buffer.data()), size});
    if (status == HPDF_STREAM_EOF || size == 0) break;
    if (status != HPDF_OK) pdf.check();
  }
  HPDF_ResetError(pdf.get());
}

}  // namespace

void write_pdf(const Document& document, const PdfInformation& information, FontFiles& fonts, Files& files,
               const Text& path, const std::function<bool()>& is_given_up) {
  // Problems with the file are reported now, not after the work is done.
  const auto file = files.open_output(path);
  PdfDocument pdf(fonts);
  const auto inform = [&](HPDF_InfoType type, const Text& text) {
    if (!text.empty()) HPDF_SetInfoAttr(pdf.get(), type, to_utf8(text).c_str());
  };
  HPDF_SetCurrentEncoder(pdf.get(), "UTF-8");
  set_catalog(pdf);
  inform(HPDF_INFO_TITLE, information.title);
  inform(HPDF_INFO_AUTHOR, information.author);
  inform(HPDF_INFO_SUBJECT, information.subject);
  inform(HPDF_INFO_CREATOR, information.creator);

  std::vector<HPDF_Page> pages;
  for (const Page& page : document.pages) {
    if (is_given_up && is_given_up()) raise(ErrorNumber::cancelled);
    PageWriter writer(pdf, page);
    writer.write();
    pages.push_back(writer.target());
    pdf.check();
  }
  if (pages.empty()) HPDF_AddPage(pdf.get());
  add_bookmarks(pdf, document, pages);
  save(pdf, *file);
  file->close();
}

}  // namespace talutil
