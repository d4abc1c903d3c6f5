#include "infoforms/shortcut_keys.hpp"

#include <algorithm>

namespace talutil {

namespace {

// A heading of the list of shortcut keys with its entries, one per line: an action, " = " (missing in a few) and keys.
struct ShortcutSection {
  TextView heading;
  bool is_menu = false;  ///< A menu of the screen above, rather than a screen.
  TextView entries;
};

// The host application's users know these texts, including the blank after F12.
constexpr ShortcutSection sections[] = {
    {u"GENERAL", false,
     u"Copy Text CTRL+C\n"
     u"Cut Text CTRL+X\n"
     u"Paste Text CTRL+V\n"
     u"TICK Button = F9\n"
     u"Get Data Button = F9\n"
     u"Cross Button = ESC (Unless otherwise specified below)\n"
     u"Message Center to Employee = F12 \n"
     u"Message Center to Customer = SHIFT+F12\n"
     u"Job History Screen = F7"},
    {u"GRIDS", false,
     u"Move to first column = CTRL+HOME\n"
     u"Move to last column = CTRL+END\n"
     u"Highlight rows from selected row to last row = CTRL+PageDown\n"
     u"Highlight rows from selected row to first row = CTRL+PageUp"},
    {u"BOOKING SCREEN", false, {}},
    {u"Data Entry Screen Menu", true,
     u"New Booking = CTRL+N\n"
     u"Open Booking = CTRL+O\n"
     u"Save Booking = CTRL+S\n"
     u"Cancel Booking = CTRL+DELETE\n"
     u"Copy Booking to Another Day = CTRL+D\n"
     u"Move Booking = CTRL+M\n"
     u"Split Booking = CTRL+SHIFT+S\n"
     u"Repeat Booking = CTRL+R\n"
     u"Reserve Time = CTRL+T\n"
     u"Exit = ALT+F4"},
    {u"Databases Menu", true,
     u"Customers = CTRL+SHIFT+C\n"
     u"Properties = CTRL+SHIFT+P\n"
     u"Employees = CTRL+SHIFT+E\n"
     u"Contacts = CTRL+SHIFT+N\n"
     u"Suppliers = CTRL+SHIFT+U\n"
     u"Services = CTRL+SHIFT+V\n"
     u"Job Types = CTRL+SHIFT+J\n"
     u"Suburbs = CTRL+SHIFT+B\n"
     u"Public Holidays = CTRL+SHIFT+H\n"
     u"Vehicles = CTRL+SHIFT+L\n"
     u"Price Lists = CTRL+SHIFT+R\n"
     u"Branches = CTRL+SHIFT+X"},
    {u"Edit Menu", true,
     u"Undo = CTRL+Z\n"
     u"Redo = CTRL+Y\n"
     u"Select All = CTRL+A\n"
     u"Find Booking = CTRL+F\n"
     u"Find Next = F3\n"
     u"Go To Date = CTRL+G\n"
     u"Go To Today = CTRL+SHIFT+T\n"
     u"Clear Selection = CTRL+SHIFT+A"},
    {u"Views Menu", true,
     u"Day View = CTRL+1\n"
     u"Week View = CTRL+2\n"
     u"Month View = CTRL+3\n"
     u"Employee View = CTRL+4\n"
     u"Area View = CTRL+5\n"
     u"Waiting List = CTRL+W\n"
     u"Unconfirmed Bookings = CTRL+U\n"
     u"Previous Day = CTRL+LEFT\n"
     u"Next Day = CTRL+RIGHT\n"
     u"Previous Week = CTRL+UP\n"
     u"Next Week = CTRL+DOWN\n"
     u"Refresh Screen = F5"},
    {u"Reports Menu", true,
     u"Daily Run Sheet = CTRL+SHIFT+D\n"
     u"Weekly Roster = CTRL+SHIFT+W\n"
     u"Sales Report = CTRL+SHIFT+F1\n"
     u"Bank Summary Report = CTRL+SHIFT+F2\n"
     u"Bad Debts Report = CTRL+SHIFT+F3\n"
     u"Cancelled Bookings Report = CTRL+SHIFT+F4\n"
     u"Employee Hours Report = CTRL+SHIFT+F5\n"
     u"Outstanding Quotes Report = CTRL+SHIFT+F6\n"
     u"Suburb Summary Report = CTRL+SHIFT+F7\n"
     u"Repeat Customers Report = CTRL+SHIFT+F8"},
    {u"Reports/Forms Menu", true,
     u"Job Sheet = CTRL+J\n"
     u"Invoice = CTRL+I\n"
     u"Quote = CTRL+Q\n"
     u"Receipt = CTRL+E\n"
     u"Customer Statement = CTRL+SHIFT+M\n"
     u"Service Agreement = CTRL+SHIFT+G\n"
     u"Envelope = CTRL+SHIFT+Y\n"
     u"Address Labels = CTRL+L"},
    {u"Messaging Menu", true,
     u"Send SMS to Employee = CTRL+F12\n"
     u"Send SMS to Customer = ALT+F12\n"
     u"Send E-mail to Customer = CTRL+SHIFT+F12\n"
     u"Message History = CTRL+H\n"
     u"Messages Waiting = CTRL+SHIFT+I\n"
     u"Call Back List = CTRL+K\n"
     u"Send Reminders = CTRL+SHIFT+K"},
    {u"Options Menu", true,
     u"ORV User Options = CTRL+F4\n"
     u"ORV Branch Options = CTRL+F5\n"
     u"Screen Colours = CTRL+F6\n"
     u"Printer Options = CTRL+F7\n"
     u"Message Templates = CTRL+F8\n"
     u"Change Password = CTRL+F9\n"
     u"Lock Screen = CTRL+F10\n"
     u"Log Off = CTRL+F11"},
    {u"Help Menu", true,
     u"ORV Help PDF = F1\n"
     u"Shortcut Keys List = SHIFT+F1\n"
     u"Command Line Switches = CTRL+F1\n"
     u"System Information = CTRL+F2\n"
     u"About ORV = CTRL+F3"},
    {u"NEW PROPERTY DETAILS SCREEN", false, {}},
    {u"File Menu", true,
     u"Save Property = CTRL+S\n"
     u"Save and New Property = CTRL+SHIFT+S\n"
     u"Clear Screen = CTRL+N\n"
     u"Print Property Card = CTRL+P\n"
     u"Exit = ALT+F4"},
    {u"Search Menu", true,
     u"Search Suburb = F2\n"
     u"Search Street = F3\n"
     u"Search Customer = F4\n"
     u"Search Map Reference = F6\n"
     u"Check for Duplicates = CTRL+F"},
    {u"Services Menu", true,
     u"Add Service = CTRL+A\n"
     u"Remove Service = CTRL+DELETE\n"
     u"Service Prices = CTRL+R\n"
     u"Service Notes = CTRL+T\n"
     u"Service Intervals = CTRL+I"},
    {u"OPEN PROPERTY DETAILS", false, {}},
    {u"File Menu", true,
     u"Save Changes = CTRL+S\n"
     u"Undo Changes = CTRL+Z\n"
     u"Delete Property = CTRL+DELETE\n"
     u"Merge Properties = CTRL+M\n"
     u"Print Property Card = CTRL+P\n"
     u"Exit = ALT+F4"},
    {u"Search Menu", true,
     u"Previous Property = F2\n"
     u"Next Property = F3\n"
     u"Search Customer = F4\n"
     u"Search Job History = CTRL+F7\n"
     u"Search Invoices = F6"},
    {u"Services Menu", true,
     u"Add Service = CTRL+A\n"
     u"Change Service = CTRL+E\n"
     u"Remove Service = CTRL+R\n"
     u"Book Service = CTRL+B\n"
     u"Quote Service = CTRL+Q\n"
     u"Service History = CTRL+H"},
    {u"Report Menu", true,
     u"Property History Report = CTRL+SHIFT+H\n"
     u"Property Statement = CTRL+SHIFT+S\n"
     u"Property Map = CTRL+SHIFT+M\n"
     u"Access Instructions = CTRL+SHIFT+A"},
    {u"Messages Menu", true,
     u"SMS to Owner = CTRL+F12\n"
     u"SMS to Tenant = ALT+F12\n"
     u"E-mail to Owner = CTRL+SHIFT+F12\n"
     u"Message History = CTRL+G"},
    {u"SEARCH PROPERTY LIST", false, {}},
    {u"File Menu", true,
     u"Open Property = CTRL+O\n"
     u"New Property = CTRL+N\n"
     u"Print List = CTRL+P\n"
     u"Export List = CTRL+E\n"
     u"Exit = ALT+F4"},
    {u"Search Menu", true,
     u"Search by Address = F2\n"
     u"Search by Customer = F3\n"
     u"Search by Telephone = F4\n"
     u"Search by Map Reference = F5\n"
     u"Search by Job Number = F6\n"
     u"Search Again = CTRL+F\n"
     u"Clear Search = CTRL+L"},
    {u"Report Menu", true,
     u"Address Labels = CTRL+A\n"
     u"Property List Report = CTRL+R"},
    {u"MESSAGE CENTER", false, {}},
    {u"SMS Options", true,
     u"Send SMS = CTRL+S\n"
     u"Choose SMS Template = CTRL+T\n"
     u"Add Employee = CTRL+E\n"
     u"Add Customer = CTRL+U\n"
     u"Send SMS Later = CTRL+L\n"
     u"SMS Credit Left = CTRL+K\n"
     u"SMS Sent Today = CTRL+D\n"
     u"SMS Replies = CTRL+R\n"
     u"Check Length of SMS = F2"},
    {u"E-mail Options", true,
     u"Send E-mail = CTRL+M\n"
     u"Choose E-mail Template = CTRL+SHIFT+T\n"
     u"Attach File = CTRL+A\n"
     u"Attach Job Sheet = CTRL+J\n"
     u"Attach Invoice = CTRL+I\n"
     u"Add Copy To = CTRL+SHIFT+C\n"
     u"Check Spelling = F4\n"
     u"E-mails Sent Today = CTRL+SHIFT+D\n"
     u"E-mail Signature = CTRL+G"},
    {u"Message Menu", true,
     u"New Message = CTRL+N\n"
     u"Delete Message = CTRL+DELETE\n"
     u"Print Message = CTRL+P\n"
     u"Message History = CTRL+H\n"
     u"Exit = ALT+F4"},
    {u"PRECONSTRUCTION JOB SCREEN", false, {}},
    {u"File Menu", true,
     u"New Preconstruction Job = CTRL+N\n"
     u"Open Preconstruction Job = CTRL+O\n"
     u"Save Job = CTRL+S\n"
     u"Delete Job = CTRL+DELETE\n"
     u"Print Job = CTRL+P\n"
     u"Exit = ALT+F4"},
    {u"Search Menu", true,
     u"Search Builder = F2\n"
     u"Search Site Address = F3\n"
     u"Search Plan Number = F4\n"
     u"Search Supervisor = F6"},
    {u"Services Menu", true,
     u"Add Stage = CTRL+A\n"
     u"Remove Stage = CTRL+R\n"
     u"Book Stage = CTRL+B\n"
     u"Stage Completed = CTRL+T\n"
     u"Certificate of Treatment = CTRL+E"},
    {u"Report Menu", true,
     u"Stages Due Report = CTRL+SHIFT+D\n"
     u"Builder Summary Report = CTRL+SHIFT+B\n"
     u"Certificates Issued Report = CTRL+SHIFT+E"},
    {u"Messages Menu", true,
     u"SMS to Supervisor = CTRL+F12\n"
     u"E-mail to Builder = CTRL+SHIFT+F12"},
    {u"JOB DETAILS SCREEN", false, {}},
    {u"File Menu", true,
     u"Save Job = CTRL+S\n"
     u"Save and Close Job = CTRL+SHIFT+S\n"
     u"Cancel Job = CTRL+DELETE\n"
     u"Copy Job = CTRL+D\n"
     u"Print Job Sheet = CTRL+P\n"
     u"Exit = ALT+F4"},
    {u"Search Menu", true,
     u"Search Customer = F2\n"
     u"Search Property = F3\n"
     u"Search Employee = F4\n"
     u"Previous Job = F5\n"
     u"Next Job = F6"},
    {u"Services Menu", true,
     u"Add Service = CTRL+A\n"
     u"Remove Service = CTRL+R\n"
     u"Change Price = CTRL+E\n"
     u"Add Material = CTRL+M\n"
     u"Start Job = CTRL+B\n"
     u"Finish Job = CTRL+F\n"
     u"Job Duration = CTRL+T"},
    {u"Report Menu", true,
     u"Invoice Job = CTRL+I\n"
     u"Quote Job = CTRL+Q\n"
     u"Receipt for Job = CTRL+U\n"
     u"Job History Report = CTRL+H"},
    {u"Messages Menu", true,
     u"SMS Job to Employee = CTRL+F12\n"
     u"SMS Arrival Time to Customer = ALT+F12\n"
     u"E-mail Invoice to Customer = CTRL+SHIFT+F12\n"
     u"Call Back = CTRL+K"},
    {u"SEARCH CONTACTS SCREEN", false, {}},
    {u"File Menu", true,
     u"Open Contact = CTRL+O\n"
     u"New Contact = CTRL+N\n"
     u"Delete Contact = CTRL+DELETE\n"
     u"Print Contacts = CTRL+P\n"
     u"Export Contacts = CTRL+E\n"
     u"Exit = ALT+F4"},
    {u"Search Menu", true,
     u"Search by Name = F2\n"
     u"Search by Company = F3\n"
     u"Search by Telephone = F4\n"
     u"Search by E-mail = F5\n"
     u"Search by Suburb = F6\n"
     u"Search Again = CTRL+F\n"
     u"Clear Search = CTRL+L"},
    {u"Messages Menu", true,
     u"SMS to Contact = CTRL+F12\n"
     u"E-mail to Contact = CTRL+SHIFT+F12\n"
     u"Telephone Contact = CTRL+T"},
};

/// Converts plain ASCII text to rich text, in which three characters must be escaped.
void append_escaped(Text& rich, TextView text) {
  for (const char16_t unit : text) {
    if (unit == u'\\' || unit == u'{' || unit == u'}') rich += u'\\';
    rich += unit;
  }
}

}  // namespace

Text shortcut_keys_rich_text() {
  Text rich = u"{\\rtf1\\ansi\\deff0{\\fonttbl{\\f0\\fmodern Courier New;}}\r\n\\pard\\f0 ";
  bool is_first = true;
  for (const ShortcutSection& section : sections) {
    if (!is_first) rich += u"\\par\r\n";
    is_first = false;
    // Sizes are in half points.
    rich += section.is_menu ? u"\\ul\\fs20 " : u"\\ul\\b\\fs24 ";
    append_escaped(rich, section.heading);
    rich += u"\\ulnone\\b0\\fs20\\par\r\n";
    for (std::size_t at = 0; at < section.entries.size();) {
      const std::size_t end = std::min(section.entries.find(u'\n', at), section.entries.size());
      append_escaped(rich, section.entries.substr(at, end - at));
      rich += u"\\par\r\n";
      at = end + 1;
    }
  }
  return rich + u"}";
}

}  // namespace talutil
