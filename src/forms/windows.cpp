#include "automation/control.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

constexpr TextView state_item = u"WindowState";
constexpr TextView width_item = u"WindowWidth";
constexpr TextView height_item = u"WindowHeight";

constexpr double normal_state = 0;

/// Asks until the user types YES, in upper case and nothing else, or gives up. A box that is cancelled counts as one
/// that was left empty.
Boolean is_confirmed(const Platform& platform, TextView prompt, TextView title, TextView warning) {
  while (platform.input_boxes.ask(prompt, title, Entry::shown).value_or(Text()) != u"YES") {
    if (platform.message_boxes.show(warning, MessageButtons::yes_no, u"Warning") != MessageAnswer::yes) {
      return Boolean(false);
    }
  }
  return Boolean(true);
}

/// What the platform's functions that start programs answer with; empty for a code that says nothing.
TextView launch_failure(std::int32_t code) noexcept {
  switch (code) {
    case 0:
      return u"System was out of memory, executable file was corrupt, or relocations were invalid.";
    case 2:
      return u"File was not found.";
    case 3:
      return u"Path was not found.";
    case 5:
      return u"Attempt was made to dynamically link to a task, or there was a sharing or network-protection error.";
    case 6:
      return u"Library required separate data segments for each task.";
    case 8:
      return u"There was insufficient memory to start the application.";
    case 10:
      return u"Windows version was incorrect.";
    case 11:
      return u"Executable file was invalid. Either it was not a Windows application, or there was an error in the .exe "
             u"image.";
    case 12:
      return u"Application was designed for a different operating system.";
    case 13:
      return u"Application was designed for MS-DOS 4.0.";
    case 14:
      return u"Type of executable file was unknown.";
    case 15:
      return u"Attempt was made to load a real-mode application (developed for an earlier version of Windows).";
    case 16:
      return u"Attempt was made to load a second instance of an executable file containing multiple data segments that "
             u"were not marked read-only.";
    case 19:
      return u"Attempt was made to load a compressed executable file. The file must be decompressed before it can be "
             u"loaded.";
    case 20:
      return u"Dynamic-link library (DLL) file was invalid. One of the DLLs required to run this application was "
             u"corrupt.";
    case 21:
      return u"Application requires Microsoft Windows 32-bit extensions.";
    default:
      return {};
  }
}

}  // namespace

void ORVUtils::LoadWindowState(const Variant& frm, const Text& sCFGStr) {
  const Control form(frm, plain_numbers);
  const auto setting = [&](TextView item, const Text& otherwise) {
    return leading_number(GetCfgFileData(sCFGStr, Text(item), otherwise, settings().sNatNameC, Boolean(false)));
  };
  form.put(u"WindowState", setting(state_item, u"0"));
  if (!form.get(u"WindowState").equals_number(normal_state, form.locale())) return;
  // One after the other: the form may change the second when it gets the first.
  form.put(u"Width", setting(width_item, form.get<Text>(u"Width")));
  form.put(u"Height", setting(height_item, form.get<Text>(u"Height")));
}

void ORVUtils::SaveWindowState(const Variant& frm, const Text& sCFGStr) {
  const Control form(frm, plain_numbers);
  const auto save = [&](TextView item, TextView property) {
    Text value = form.get<Text>(property);
    SaveCfgFileData(sCFGStr, Text(item), value, settings().sNatNameC, Boolean(false));
  };
  save(state_item, u"WindowState");
  // The last normal size outlives the window's other states.
  if (!form.get(u"WindowState").equals_number(normal_state, form.locale())) return;
  save(width_item, u"Width");
  save(height_item, u"Height");
}

Boolean ORVUtils::CheckDeleteRecord() {
  return is_confirmed(library_.platform(), u"Type YES in uppercase characters to confirm deletion of this record",
                      u"Confirm Delete",
                      u"You must type YES in uppercase characters.  Do you wish to delete this record?");
}

Boolean ORVUtils::CheckModifyDatabase(const Text& sCaption) {
  return is_confirmed(library_.platform(), u"Type YES in uppercase characters to confirm", sCaption,
                      u"You must type YES in uppercase characters.  Do you wish to try again?");
}

void ORVUtils::DrawShellExecuteError(const std::int32_t& lRetVal) {
  const TextView message = launch_failure(lRetVal);
  if (!message.empty()) library_.platform().message_boxes.show(message, MessageButtons::ok, {});
}

}  // namespace talutil
