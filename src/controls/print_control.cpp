#include "controls/print_control.hpp"

#include <algorithm>
#include <cmath>

#include "automation/checked.hpp"
#include "automation/control.hpp"
#include "documents/pdf_writer.hpp"

namespace talutil {

namespace {

constexpr std::int32_t landscape = 1;

std::int32_t checked_code(std::int32_t code, std::int32_t most) {
  if (code < 0 || code > most) raise(ErrorNumber::invalid_procedure_call);
  return code;
}

}  // namespace

PrintControl::PrintControl(const Platform& platform)
    : TableObject(platform), platform_(platform), metrics_(std::make_shared<FontMetrics>(platform.font_files)) {}

void PrintControl::put_Zoom(float percent) {
  zoom_ = std::isnan(percent) ? zoom_ : std::clamp(percent, smallest_zoom, largest_zoom);
}

void PrintControl::put_PaperSize(std::int32_t code) {
  if (paper_size(code).code != code) raise(ErrorNumber::invalid_procedure_call);
  paper_size_ = code;
}

void PrintControl::put_Orientation(std::int32_t orientation) { orientation_ = checked_code(orientation, landscape); }

void PrintControl::put_Duplex(std::int32_t duplex) { duplex_ = checked_code(duplex, 3); }

std::int32_t PrintControl::PageWidth() const noexcept {
  const auto& paper = paper_size(paper_size_);
  return orientation_ == landscape ? paper.height : paper.width;
}

std::int32_t PrintControl::PageHeight() const noexcept {
  const auto& paper = paper_size(paper_size_);
  return orientation_ == landscape ? paper.width : paper.height;
}

std::int32_t PrintControl::PageCount() const noexcept {
  return document_ ? static_cast<std::int32_t>(document_->pages.size()) : 0;
}

void PrintControl::put_CurrentPage(std::int32_t page) {
  page = std::clamp(page, std::min(1, PageCount()), PageCount());
  // Composed now rather than when it is drawn, so that whoever asks for the page gets the error if it fails.
  if (page > 0) shown_page_ = document_->pages[static_cast<std::size_t>(page) - 1];
  current_page_ = page;
}

std::optional<TwipsRectangle> PrintControl::guides() const {
  const Page* const page = shown_page();
  if (page == nullptr || !ShowGuides) return std::nullopt;
  return TwipsRectangle{MarginLeft, MarginTop, page->width - MarginLeft - MarginRight,
                        page->height - MarginTop - MarginBottom};
}

FontStyle PrintControl::text_font() const {
  const float size = FontSize * static_cast<float>(TextScale) / 100;
  return {family_of(FontName), false, std::clamp(size, 2.0F, 200.0F)};
}

ReportComposer& PrintControl::composer() {
  if (!composer_) StartDoc();
  return *composer_;
}

void PrintControl::StartDoc() {
  constexpr float largest_footer = 10;
  constexpr std::int32_t smallest_room = 720;
  PageSetup setup;
  setup.width = PageWidth();
  setup.height = PageHeight();
  setup.margin_left = MarginLeft;
  setup.margin_top = MarginTop;
  setup.margin_right = MarginRight;
  setup.margin_bottom = MarginBottom;
  const std::int64_t across = std::int64_t{setup.width} - MarginLeft - MarginRight;
  const std::int64_t down = std::int64_t{setup.height} - MarginTop - MarginBottom;
  if (std::min({MarginLeft, MarginTop, MarginRight, MarginBottom}) < 0 || across < smallest_room ||
      down < smallest_room) {
    raise(ErrorNumber::invalid_procedure_call);
  }
  setup.header = Header;
  setup.header_font = {family_of(HeaderFontName), is_header_bold_, header_points_};
  setup.footer_font = FontStyle{family_of(HeaderFontName), false, std::min(header_points_, largest_footer)};
  setup.has_rule = HeaderRule == 1;
  setup.footer = format_date(platform_.clock.now(), u"DD/MM/YYYY");
  setup.wraps_words = bool(WordWrap);
  discard();
  composer_.emplace(metrics_, std::move(setup));
}

void PrintControl::put_Text(const Text& text) { composer().add_text(text, text_font()); }

void PrintControl::TextBox(const Text& text, std::int32_t left, std::int32_t top, std::int32_t width,
                           std::int32_t height) {
  const std::int32_t from_left = PhysicalPage ? 0 : MarginLeft;
  const std::int32_t from_top = PhysicalPage ? 0 : MarginTop;
  composer().add_text_box(text, {checked_add(left, from_left), checked_add(top, from_top), width, height}, text_font());
}

void PrintControl::put_RenderControl(std::int32_t window) {
  const Variant source = std::exchange(RenderObject, {});
  if (const auto* const object = source.get_if<ObjectRef>(); object != nullptr && *object) {
    const Control grid(*object, locale());
    if (grid.answers(u"Rows") && grid.answers(u"Cols") && grid.answers(u"TextMatrix")) {
      // Read before the composer is used: the host may start another document meanwhile.
      GridContents contents(grid, {family_of(FontName), false, 8});
      return composer().add_grid(std::move(contents));
    }
  }
  WindowImage image = platform_.drawing.image_of(window);
  Picture picture;
  picture.width = image.width;
  picture.height = image.height;
  picture.place.width = round_to<std::int32_t>(static_cast<float>(image.width) * platform_.screen.twips_per_pixel_x());
  picture.place.height =
      round_to<std::int32_t>(static_cast<float>(image.height) * platform_.screen.twips_per_pixel_y());
  picture.pixels = std::make_shared<const std::vector<std::uint8_t>>(std::move(image.pixels));
  composer().add_picture(std::move(picture));
}

void PrintControl::EndDoc() {
  document_ = std::make_shared<const Document>(composer().finish());
  composer_.reset();
  put_CurrentPage(1);
}

void PrintControl::discard() noexcept {
  document_.reset();
  shown_page_ = {};
  current_page_ = 0;
}

void PrintControl::PrintDoc(Boolean dialog) {
  const auto document = document_;
  if (!document) raise(ErrorNumber::invalid_procedure_call);
  const PrintSettings settings{DocName.empty() ? document->title : DocName, paper_size_, orientation_, duplex_,
                               bool(dialog)};
  if (!platform_.printers.print(*document, settings)) raise(ErrorNumber::cancelled);
}

void PdfExport::convert(const Variant& control, const Text& file, const std::function<bool()>& is_given_up) const {
  const auto* const object = control.get_if<ObjectRef>();
  const auto* const source = object == nullptr ? nullptr : dynamic_cast<PrintControl*>(object->get());
  if (source == nullptr) raise(ErrorNumber::type_mismatch);
  const auto document = source->document() ? source->document() : std::make_shared<const Document>();
  write_pdf(*document, {Title.empty() ? document->title : Title, Author, Subject, Creator}, platform_.font_files,
            platform_.files, file, is_given_up);
}

}  // namespace talutil
