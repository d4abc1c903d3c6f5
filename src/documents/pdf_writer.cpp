#include "documents/pdf_writer.hpp"

#include <libdeflate.h>

#include <algorithm>
#include <exception>
#include <memory>
#include <new>

#include "automation/run_time_error.hpp"
#include "documents/font_metrics.hpp"
#include "documents/page_operators.hpp"
#include "documents/pdf_fonts.hpp"
#include "documents/text_direction.hpp"

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

/// The text of a run as it is drawn from left to right.
Text drawn(const TextRun& run) { return run.is_right_to_left ? drawn_from_left(run.text) : run.text; }

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

struct FreeCompressor {
  void operator()(libdeflate_compressor* compressor) const noexcept { libdeflate_free_compressor(compressor); }
};

/// Deflates the contents of pages.
class ContentsCompressor {
 public:
  ContentsCompressor() : compressor_(libdeflate_alloc_compressor(level)) {
    if (!compressor_) throw std::bad_alloc();
  }

  /// Replaces what has been written for a page by its deflated form. The PDF library would keep it as it is until the
  /// document is saved, which takes many times the memory.
  void compress(PdfDocument& pdf, HPDF_Page page) {
    auto* const attributes = static_cast<HPDF_PageAttr>(page->attr);
    read(attributes->stream);
    packed_.resize(libdeflate_zlib_compress_bound(compressor_.get(), bytes_.size()));
    packed_.resize(
        libdeflate_zlib_compress(compressor_.get(), bytes_.data(), bytes_.size(), packed_.data(), packed_.size()));
    const HPDF_Stream packed = HPDF_MemStream_New(pdf.get()->mmgr, static_cast<HPDF_UINT>(packed_.size()));
    if (packed == nullptr) return pdf.check();
    HPDF_Stream_Write(packed, reinterpret_cast<const HPDF_BYTE*>(packed_.data()),
                      static_cast<HPDF_UINT>(packed_.size()));
    HPDF_Stream_Free(attributes->stream);
    attributes->stream = packed;
    attributes->contents->stream = packed;
    attributes->contents->filter = HPDF_STREAM_FILTER_NONE;
    attributes->contents->write_fn = &write_filter;
  }

 private:
  static constexpr int level = 6;

  /// Says in the file how the contents are packed; the PDF library says so only of what it packs itself.
  static HPDF_STATUS write_filter(HPDF_Dict /*contents*/, HPDF_Stream file) {
    return HPDF_Stream_WriteStr(file, "/Filter /FlateDecode\n");
  }

  void read(HPDF_Stream stream) {
    bytes_.resize(HPDF_Stream_Size(stream));
    auto size = static_cast<HPDF_UINT>(bytes_.size());
    HPDF_Stream_Seek(stream, 0, HPDF_SEEK_SET);
    HPDF_Stream_Read(stream, reinterpret_cast<HPDF_BYTE*>(bytes_.data()), &size);
    bytes_.resize(size);
  }

  std::unique_ptr<libdeflate_compressor, FreeCompressor> compressor_;
  std::string bytes_;
  std::string packed_;
};

/// Draws the items of one page, skipping those entirely outside it.
class PageWriter {
 public:
  PageWriter(PdfDocument& pdf, const Page& page) : pdf_(pdf), page_(page), target_(HPDF_AddPage(pdf.get())) {
    HPDF_Page_SetWidth(target_, points(page.width));
    HPDF_Page_SetHeight(target_, points(page.height));
  }

  void write() {
    for (const PageItem& item : page_.items) std::visit([this](const auto& held) { draw(held); }, item);
    flush();
  }

  [[nodiscard]] HPDF_Page target() const noexcept { return target_; }

 private:
  [[nodiscard]] bool is_outside(std::int32_t left, std::int32_t top) const noexcept {
    return top >= page_.height || left >= page_.width;
  }
  [[nodiscard]] float y_of(std::int32_t top) const noexcept { return points(page_.height - top); }

  /// Passes our own operators to the PDF library, before it adds some.
  void flush() {
    const std::string operators = operators_.take();
    if (operators.empty()) return;
    HPDF_Stream_Write(static_cast<HPDF_PageAttr>(target_->attr)->stream,
                      reinterpret_cast<const HPDF_BYTE*>(operators.data()), static_cast<HPDF_UINT>(operators.size()));
  }

  void draw(const TextRun& run) {
    if (is_outside(run.left, run.top)) return;
    if (run.is_wide) {
      if (const HPDF_Font font = pdf_.wide_font(wide_font_of(run)); font != nullptr) return draw_wide(run, font);
    }
    const char* const font = HPDF_Page_GetLocalFontName(target_, pdf_.standard_font(run.font.family, run.font.is_bold));
    if (font == nullptr) return pdf_.check();
    operators_.text(font, run.font.points, run.colour, run.left, page_.height - run.top - baseline(run.font),
                    to_ansi(drawn(run)));
  }

  void draw_wide(const TextRun& run, HPDF_Font font) {
    flush();
    const Rgb colour = rgb_of(run.colour);
    HPDF_Page_SetRGBFill(target_, colour.red, colour.green, colour.blue);
    HPDF_Page_BeginText(target_);
    HPDF_Page_SetFontAndSize(target_, font, run.font.points);
    // The embedded font has one weight: strokes along its outlines make it bold.
    if (run.font.is_bold) {
      HPDF_Page_SetRGBStroke(target_, colour.red, colour.green, colour.blue);
      HPDF_Page_SetLineWidth(target_, run.font.points / 30);
    }
    HPDF_Page_SetTextRenderingMode(target_, run.font.is_bold ? HPDF_FILL_THEN_STROKE : HPDF_FILL);
    HPDF_Page_TextOut(target_, points(run.left), y_of(run.top + baseline(run.font)), to_utf8(drawn(run)).c_str());
    HPDF_Page_EndText(target_);
  }

  void draw(const Box& box) {
    const TwipsRectangle& place = box.place;
    if (is_outside(place.left, place.top)) return;
    const std::int32_t bottom = page_.height - place.top - place.height;
    if (box.fill) operators_.filled(place, bottom, *box.fill);
    if (box.line_width > 0) operators_.framed(place, bottom, box.line_width, box.line_colour);
  }

  void draw(const Picture& picture) {
    if (is_outside(picture.place.left, picture.place.top) || !picture.pixels) return;
    const HPDF_Image image =
        HPDF_LoadRawImageFromMem(pdf_.get(), picture.pixels->data(), static_cast<HPDF_UINT>(picture.width),
                                 static_cast<HPDF_UINT>(picture.height), HPDF_CS_DEVICE_RGB, 8);
    if (image == nullptr) return pdf_.check();
    flush();
    const TwipsRectangle& place = picture.place;
    HPDF_Page_DrawImage(target_, image, points(place.left), y_of(place.top + place.height), points(place.width),
                        points(place.height));
  }

  PdfDocument& pdf_;
  const Page& page_;
  HPDF_Page target_;
  PageOperators operators_;
};

/// Receives the document from the PDF library in small pieces. Exceptions must not pass through C.
class FileStream {
 public:
  explicit FileStream(OutputFile& file) : file_(file) {}

  /// Saves a document into the file, without a copy of it in memory.
  void save(PdfDocument& pdf) {
    pdf.get()->stream = HPDF_CallbackWriter_New(pdf.get()->mmgr, &write, this);
    HPDF_SaveToStream(pdf.get());
    if (reason_) std::rethrow_exception(reason_);
    pdf.check();
    file_.write(waiting_);
  }

 private:
  static HPDF_STATUS write(HPDF_Stream stream, const HPDF_BYTE* bytes, HPDF_UINT size) noexcept {
    auto& self = *static_cast<FileStream*>(stream->attr);
    try {
      self.waiting_.append(reinterpret_cast<const char*>(bytes), size);
      constexpr std::size_t enough = 1U << 16U;
      if (self.waiting_.size() < enough) return HPDF_OK;
      self.file_.write(self.waiting_);
      self.waiting_.clear();
      return HPDF_OK;
    } catch (...) {
      self.reason_ = std::current_exception();
      return HPDF_FILE_IO_ERROR;
    }
  }

  OutputFile& file_;
  std::string waiting_;
  std::exception_ptr reason_;
};

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
  ContentsCompressor compressor;
  for (std::size_t i = 0; i < document.pages.size(); ++i) {
    if (is_given_up && is_given_up()) raise(ErrorNumber::cancelled);
    const Page page = document.pages[i];
    PageWriter writer(pdf, page);
    writer.write();
    compressor.compress(pdf, writer.target());
    pages.push_back(writer.target());
    pdf.check();
  }
  if (pages.empty()) HPDF_AddPage(pdf.get());
  add_bookmarks(pdf, document, pages);
  FileStream(*file).save(pdf);
  file->close();
}

}  // namespace talutil
