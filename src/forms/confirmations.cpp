#include <algorithm>

#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

/// Asks until the user types YES, in upper case and nothing else, or gives up. Cancelling the box counts as an empty
/// answer.
Boolean is_confirmed(const Platform& platform, TextView prompt, TextView title, TextView warning) {
  while (platform.input_boxes.ask(prompt, title, Entry::shown).value_or(Text()) != u"YES") {
    if (platform.message_boxes.show(warning, MessageButtons::yes_no, u"Warning") != MessageAnswer::yes) {
      return Boolean(false);
    }
  }
  return Boolean(true);
}

/// Return codes of the platform's functions for starting programs, with the texts that users know. Other codes show
/// nothing.
constexpr struct {
  std::int32_t code;
  TextView text;
} launch_failures[] = {
    {0, u"System was out of memory, executable file was corrupt, or relocations were invalid."},
    {2, u"File was not found."},
    {3, u"Path was not found."},
    {5, u"Attempt was made to dynamically link to a task, or there was a sharing or network-protection error."},
    {6, u"Library required separate data segments for each task."},
    {8, u"There was insufficient memory to start the application."},
    {10, u"Windows version was incorrect."},
    {11,
     u"Executable file was invalid. Either it was not a Windows application, or there was an error in the .exe "
     u"image."},
    {12, u"Application was designed for a different operating system."},
    {13, u"Application was designed for MS-DOS 4.0."},
    {14, u"Type of executable file was unknown."},
    {15, u"Attempt was made to load a real-mode application (developed for an earlier version of Windows)."},
    {16,
     u"Attempt was made to load a second instance of an executable file containing multiple data segments that "
     u"were not marked read-only."},
    {19,
     u"Attempt was made to load a compressed executable file. The file must be decompressed before it can be "
     u"loaded."},
    {20,
     u"Dynamic-link library (DLL) file was invalid. One of the DLLs required to run this application was "
     u"corrupt."},
    {21, u"Application requires Microsoft Windows 32-bit extensions."},
};

}  // namespace

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
  const auto* const failure =
      std::ranges::find_if(launch_failures, [&](const auto& row) { return row.code == lRetVal; });
  if (failure == std::end(launch_failures)) return;
  library_.platform().message_boxes.show(failure->text, MessageButtons::ok, {});
}

}  // namespace talutil
