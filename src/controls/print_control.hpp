#pragma once

#include <memory>
#include <optional>

#include "controls/table_object.hpp"
#include "documents/report_composer.hpp"
#include "platform/preview_view.hpp"

namespace talutil {

/// The print control: lays out reports on pages and shows, prints and exports them. Lengths are in twips.
///
/// Settings changed during or after the creation of a document apply to the next one.
class PrintControl final : public TableObject<PrintControl>, public PreviewPages {
 public:
  // The identifiers that hosts' report builders use for the fixed settings.
  static constexpr std::int32_t show_guides_id = 34;
  static constexpr std::int32_t text_scale_id = 57;
  static constexpr std::int32_t header_rule_id = 60;
  static constexpr std::int32_t word_wrap_id = 126;
  static constexpr std::int32_t physical_page_id = 152;

  static constexpr float smallest_zoom = 10;
  static constexpr float largest_zoom = 400;
  static constexpr std::int32_t usual_margin = 1134;  ///< 2 cm.

  explicit PrintControl(const Platform& platform);

  Text HeaderFontName = u"Courier New";
  Text FontName = u"Courier New";
  float FontSize = 10;
  Text Header;                   ///< Above every page of the next document.
  Text DocName;                  ///< The name of the print job; if empty, the header is used.
  Boolean ShowGuides;            ///< Shows the margins on the screen.
  std::int32_t HeaderRule = 1;   ///< 1 draws a rule below the header.
  Boolean PhysicalPage{true};    ///< Positions are relative to the edge of the paper, otherwise to the margins.
  Boolean WordWrap{true};        ///< Breaks flowing text between words, otherwise anywhere.
  std::int32_t TextScale = 100;  ///< The size of flowing text, in percent.
  Variant RenderObject;          ///< The grid that the next RenderControl lays out, if it can be driven.

  /// The zoom of the page shown, in percent; limited to 10 to 400.
  [[nodiscard]] float Zoom() const noexcept { return zoom_; }
  void put_Zoom(float percent);

  /// A code of the platform's printing functions: 8 is A3, 9 A4. Raises 5 for an unknown size.
  [[nodiscard]] std::int32_t PaperSize() const noexcept { return paper_size_; }
  void put_PaperSize(std::int32_t code);

  /// 0 portrait, 1 landscape. Raises 5 for other values.
  [[nodiscard]] std::int32_t Orientation() const noexcept { return orientation_; }
  void put_Orientation(std::int32_t orientation);

  /// 1 simplex, 2 vertical, 3 horizontal, 0 for the printer's default. Raises 5 for other values.
  [[nodiscard]] std::int32_t Duplex() const noexcept { return duplex_; }
  void put_Duplex(std::int32_t duplex);

  [[nodiscard]] std::int32_t PageWidth() const noexcept;
  [[nodiscard]] std::int32_t PageHeight() const noexcept;
  std::int32_t MarginLeft = usual_margin;
  std::int32_t MarginTop = usual_margin;
  std::int32_t MarginRight = usual_margin;
  std::int32_t MarginBottom = usual_margin;

  /// The page shown, counted from 1; an invalid number selects the nearest page. 0 before the first document.
  [[nodiscard]] std::int32_t CurrentPage() const noexcept { return current_page_; }
  void put_CurrentPage(std::int32_t page);
  [[nodiscard]] std::int32_t PageCount() const noexcept;

  /// Begins a document and discards the previous one. Raises 5 if the margins leave no room.
  void StartDoc();

  /// Adds flowing text; see ReportComposer.
  void put_Text(const Text& text);

  /// Adds a text in a box.
  void TextBox(const Text& text, std::int32_t left, std::int32_t top, std::int32_t width, std::int32_t height);

  /// Adds a control of the host, given by its window: if RenderObject holds a grid, that grid as it appears, otherwise
  /// a picture of the window. Clears RenderObject.
  void put_RenderControl(std::int32_t window);

  /// Ends the document and shows its first page.
  void EndDoc();

  /// Prints the document, after showing the printer dialog if requested. Raises 32755 if that is cancelled, 482 if
  /// there is no printer or printing fails, 5 if there is no document.
  void PrintDoc(Boolean dialog);

  /// Discards the document.
  void discard() noexcept;

  /// Null before the first document and after it is discarded. Whoever uses it while messages are processed must hold
  /// it, because a host may begin the next document meanwhile.
  [[nodiscard]] const std::shared_ptr<const Document>& document() const noexcept { return document_; }

  /// The size and weight of the next document's header; footers have 10 points or less.
  void set_header_style(float points, bool is_bold) noexcept {
    header_points_ = points;
    is_header_bold_ = is_bold;
  }

  /// The widths of characters that its documents are laid out with.
  [[nodiscard]] FontMetrics& metrics() noexcept { return *metrics_; }

  [[nodiscard]] const Page* shown_page() const override { return current_page_ < 1 ? nullptr : &shown_page_; }
  [[nodiscard]] float zoom_percent() const override { return zoom_; }
  [[nodiscard]] std::optional<TwipsRectangle> guides() const override;

 private:
  [[nodiscard]] ReportComposer& composer();
  [[nodiscard]] FontStyle text_font() const;

  const Platform& platform_;
  std::shared_ptr<FontMetrics> metrics_;  ///< Documents hold it, too.
  std::optional<ReportComposer> composer_;
  std::shared_ptr<const Document> document_;
  Page shown_page_;
  float header_points_ = 10;
  bool is_header_bold_ = false;
  float zoom_ = 100;
  std::int32_t paper_size_ = 9;
  std::int32_t orientation_ = 0;
  std::int32_t duplex_ = 0;
  std::int32_t current_page_ = 0;
};

/// Exports a print control's document to PDF.
class PdfExport final : public TableObject<PdfExport> {
 public:
  explicit PdfExport(const Platform& platform) : TableObject(platform), platform_(platform) {}

  Text Title;  ///< Empty for the document's own title.
  Text Author = u"TALUtil";
  Text Subject = u"ORV PDF Data";
  Text Creator = u"TALUtil print preview";

  /// Writes the document of a print control to a file. If that fails, an existing file stays as it was. Raises 13 for
  /// another kind of object, and the errors of writing a file.
  void ConvertDocument(const Variant& control, const Text& file) const { convert(control, file, nullptr); }

  /// Like ConvertDocument; raises 32755 if the user gives up, which is asked before each page.
  void convert(const Variant& control, const Text& file, const std::function<bool()>& is_given_up) const;

 private:
  const Platform& platform_;
};

template <class P>
constexpr auto members_of(std::type_identity<PrintControl>) {
  using C = PrintControl;
  return P::rows(
      P::template property<&C::HeaderFontName>("HeaderFontName"), P::template property<&C::FontName>("FontName"),
      P::template property<&C::FontSize>("FontSize"), P::template property<&C::Header>("Header"),
      P::template property<&C::DocName>("DocName"),
      P::template property<&C::ShowGuides>({"ShowGuides", C::show_guides_id}),
      P::template property<&C::HeaderRule>({"HeaderRule", C::header_rule_id}),
      P::template property<&C::PhysicalPage>({"PhysicalPage", C::physical_page_id}),
      P::template property<&C::WordWrap>({"WordWrap", C::word_wrap_id}),
      P::template property<&C::TextScale>({"TextScale", C::text_scale_id}),
      P::template property<&C::RenderObject>("RenderObject"), P::template accessors<&C::Zoom, &C::put_Zoom>("Zoom"),
      P::template accessors<&C::PaperSize, &C::put_PaperSize>("PaperSize"),
      P::template accessors<&C::Orientation, &C::put_Orientation>("Orientation"),
      P::template accessors<&C::Duplex, &C::put_Duplex>("Duplex"), P::template get_only<&C::PageWidth>("PageWidth"),
      P::template get_only<&C::PageHeight>("PageHeight"), P::template property<&C::MarginLeft>("MarginLeft"),
      P::template property<&C::MarginTop>("MarginTop"), P::template property<&C::MarginRight>("MarginRight"),
      P::template property<&C::MarginBottom>("MarginBottom"),
      P::template accessors<&C::CurrentPage, &C::put_CurrentPage>("CurrentPage"),
      P::template get_only<&C::PageCount>("PageCount"), P::template method<&C::StartDoc>("StartDoc"),
      P::template setter<&C::put_Text>("Text"),
      P::template method<&C::TextBox>("TextBox", "Text", "Left", "Top", "Width", "Height"),
      P::template setter<&C::put_RenderControl>("RenderControl"), P::template method<&C::EndDoc>("EndDoc"),
      P::template method<&C::PrintDoc>("PrintDoc", optional("Dialog", 0)));
}

template <class P>
constexpr auto members_of(std::type_identity<PdfExport>) {
  using C = PdfExport;
  return P::rows(P::template property<&C::Title>("Title"), P::template property<&C::Author>("Author"),
                 P::template property<&C::Subject>("Subject"), P::template property<&C::Creator>("Creator"),
                 P::template method<&C::ConvertDocument>("ConvertDocument", "Control", "FileName"));
}

}  // namespace talutil
