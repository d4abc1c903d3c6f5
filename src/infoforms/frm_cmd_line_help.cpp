#include "infoforms/frm_cmd_line_help.hpp"

#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

using Help = FrmCmdLineHelp;
using namespace part_follows;

constexpr FormPart parts[] = {
    {.id = Help::Grid1,
     .kind = PartKind::table,
     .follows = width | height,
     .place = {7, 7, 486, 122},
     .caption = u"Command line switches"},
    {.id = Help::examples_label,
     .kind = PartKind::label,
     .follows = bottom,
     .place = {7, 134, 80, 9},
     .caption = u"&Examples:"},
    {.id = Help::rtbExamples, .kind = PartKind::rich_text, .follows = width | bottom, .place = {7, 145, 486, 68}},
};

constexpr FormDescription description{.parts = parts, .width = 500, .height = 220, .is_resizable = true};

struct Switch {
  TextView command;
  TextView description;
};

// Row 8 continues the description above it.
constexpr Switch rows[] = {
    {u"Command", u"Description"},
    {u"RM", u"Starts ORV with no booking screen"},
    {u"CONFIG", u"Runs the Database Configuration Program"},
    {u"DATE-DD/MM/YYYY", u"Starts ORV with the Booking Screen set to DATE"},
    {u"HELP", u"Shows command line switches then exits"},
    {u"DEBUG", u"Activates debug mode for this run"},
    {u"EVENTLOG", u"Activates the event log for this run"},
    {u"SHOWTIMEOUT [Time in seconds]", u"Enable the Options tab on the Branch login"},
    {u"", u"  Preload the requested time out time if specified"},
    {u"SINEMP [EmployeeID:MonthView]",
     u"Activates single employee view mode with employeeID and month view 1 or 2 or 3"},
};

constexpr TextView examples =
    u"Examples on how run ORV with command line options,\r\n"
    u"\"C:\\Program Files\\TAL\\ORV3\\ORV.EXE\" DEBUG\r\n"
    u"\"C:\\Program Files\\TAL\\ORV3\\ORV.EXE\" CONFIG\r\n"
    u"\"C:\\Program Files\\TAL\\ORV3\\ORV.EXE\" SHOWTIMEOUT\r\n"
    u"\"C:\\Program Files\\TAL\\ORV3\\ORV.EXE\" SHOWTIMEOUT 200\r\n"
    u"\"C:\\Program Files\\TAL\\ORV3\\ORV.EXE\" SINEMP 120000002:1";

}  // namespace

FrmCmdLineHelp::FrmCmdLineHelp(Library& library) : Form(library, description), grid_(library.platform()) {}

void FrmCmdLineHelp::fill(FormView& view) {
  constexpr std::int32_t command_width = 3300;
  constexpr std::int32_t description_width = 6500;
  grid_.put_Cols(2);
  grid_.put_Rows(static_cast<std::int32_t>(std::size(rows)));
  grid_.put_FixedRows(1);
  grid_.put_ColWidth(0, command_width);
  grid_.put_ColWidth(1, description_width);
  for (std::int32_t row = 0; row < grid_.Rows(); ++row) {
    grid_.put_cell(row, 0, rows[row].command);
    grid_.put_cell(row, 1, rows[row].description);
  }
  view.set_caption(u"Command Line Help");
  view.set_table(Grid1, grid_, -1);
  view.set_text(rtbExamples, examples);
}

void ORVUtils::ShowCmdLineHelp() { library_.part<FrmCmdLineHelp>().show(); }

}  // namespace talutil
