#include "automation/checked.hpp"
#include "automation/control.hpp"
#include "controls/print_control.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "preview/frm_print_preview.hpp"
#include "preview/paper_choices.hpp"

namespace talutil {

namespace {

struct MonthEndReport {
  TextView caption;
  TextView path;
};

// Where hosts expect the files.
constexpr MonthEndReport month_end_reports[] = {
    {u"BankSummaryReport", u"C:\\TAL\\ORV3\\DATA\\MONTHLYREPORTS\\BankSummaryReport.pdf"},
    {u"SalesReport", u"C:\\TAL\\ORV3\\DATA\\MONTHLYREPORTS\\SalesReport.pdf"},
    {u"BadDebtsReport", u"C:\\TAL\\ORV3\\DATA\\MONTHLYREPORTS\\BadDebtsReport.pdf"},
};

/// The settings that all reports share.
struct CommonSettings {
  TextView caption;
  std::int16_t direction;
  const Text& report_name;
  const Text& export_name;
};

void set_up(FrmPrintPreview& form, const Control& print, const CommonSettings& settings) {
  print.put(PrintControl::show_guides_id, Boolean(false));
  print.put(PrintControl::header_rule_id, std::int16_t{1});
  print.put(PrintControl::physical_page_id, Boolean(true));
  print.put(PrintControl::word_wrap_id, Boolean(true));
  print.put(PrintControl::text_scale_id, std::int16_t{100});
  if (settings.direction == 1) print.put(u"Orientation", std::int16_t{0});
  if (settings.direction == 2) print.put(u"Orientation", std::int16_t{1});
  form.set_caption_text(Text(settings.caption));
  form.set_report_name(settings.report_name);
  form.set_export_folder(settings.export_name);
}

/// Any other text leaves the setting from the previous report.
void choose(const Control& print, const PaperChoices& paper, const Text& setting) {
  for (const PaperChoice& choice : paper.choices) {
    if (setting == choice.setting) print.put(paper.property, choice.code);
  }
}

bool is_unassigned(const Variant& value) { return value.is(Variant::Kind::empty); }

/// Each part is preceded by two blanks.
Text grid_header(const Text& report, const Variant& from, const Variant& to, const Locale& locale) {
  const Text name = u"  " + report;
  if (from.equals_text(u"DateTimeOnly", locale))
    return name + u"  " + format_date(to.to_date(locale), u"DD/MM/YYYY HH:MM");
  if (is_unassigned(from) || is_unassigned(to)) return name;
  return name + u"  " + format_date(from.to_date(locale), u"DD/MM/YYYY") + u" To " +
         format_date(to.to_date(locale), u"DD/MM/YYYY");
}

/// Begins a report on A4 with its name as the header.
Control begin_plain_report(FrmPrintPreview& form, std::int16_t zoom, const CommonSettings& settings) {
  Control print = form.print_control();
  print.put(u"Zoom", static_cast<double>(zoom));
  print.put(u"PaperSize", paper_a4);
  set_up(form, print, settings);
  print.put(u"Header", u"  " + settings.report_name);
  print.call(u"StartDoc");
  return print;
}

}  // namespace

void ORVUtils::GridPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                const Text& sReportName, const Text& sCsvName, const Variant& ctlGrid,
                                const Variant& vStDate, const Variant& vEnDate, const Text& fWindowCaption) {
  FrmPrintPreview& form = library_.part<FrmPrintPreview>();
  const bool is_unattended = settings().AutomatedEndOfMonth.is_exactly_true();
  {
    const FrmPrintPreview::Building building(form, is_unattended);
    const Control print = form.print_control();
    print.put(u"HeaderFontName", u"Courier New");
    print.put(u"FontName", u"Courier New");
    print.put(u"Zoom", static_cast<double>(iZoomLevel));
    choose(print, duplex_choices, settings().sGridPaperDuplex);
    choose(print, size_choices, settings().sGridPaperSize);
    set_up(form, print, {fWindowCaption, iPrintDirection, sReportName, sCsvName});
    print.put(u"Header", grid_header(sReportName, vStDate, vEnDate, locale()));

    const Control grid(ctlGrid, locale());
    print.call(u"StartDoc");
    // Our print control lays out the grid by querying it; a third-party one only gets its window.
    if (print.answers(u"RenderObject")) print.put(u"RenderObject", grid.object());
    print.put(u"RenderControl", grid.get<std::int32_t>(u"hwnd"));
    print.call(u"EndDoc");
  }
  if (!is_unattended) return form.show_modal();
  for (const MonthEndReport& report : month_end_reports) {
    if (fWindowCaption == report.caption) form.ExportToPDF(Text(report.path), Boolean(false));
  }
  form.unload();
}

void ORVUtils::TextBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlTextBox) {
  FrmPrintPreview& form = library_.part<FrmPrintPreview>();
  {
    const FrmPrintPreview::Building building(form, false);
    const Control print = begin_plain_report(form, iZoomLevel, {{}, iPrintDirection, sReportName, sCsvName});
    print.put(u"Text", Control(ctlTextBox, locale()).get<Text>(u"Text"));
    print.call(u"EndDoc");
  }
  form.show_modal();
}

void ORVUtils::ListBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlListBox) {
  constexpr std::int32_t height = 567;  // 1 cm.
  constexpr double pitch = 680.4;       // Fractions are lost by rounding at every line.
  FrmPrintPreview& form = library_.part<FrmPrintPreview>();
  {
    const FrmPrintPreview::Building building(form, false);
    const Control print = begin_plain_report(form, iZoomLevel, {{}, iPrintDirection, sReportName, sCsvName});
    const Control list(ctlListBox, locale());
    const auto count = list.get<std::int32_t>(u"ListCount");
    const auto left = print.get<std::int32_t>(u"MarginLeft");
    const auto top = print.get<std::int32_t>(u"MarginTop");
    const auto right = print.get<std::int32_t>(u"MarginRight");
    const std::int32_t width = print.get<std::int32_t>(u"PageWidth") - (left + right);
    std::int32_t y = 0;
    for (std::int32_t i = 0; i < count; ++i) {
      print.call(u"TextBox", {list.get<Text>(u"List", {i}), left, checked_add(top, y), width, height});
      y = round_to<std::int32_t>(y + pitch);
    }
    print.call(u"EndDoc");
  }
  form.show_modal();
}

}  // namespace talutil
