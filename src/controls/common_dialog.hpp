#pragma once

#include "controls/table_object.hpp"
#include "platform/file_dialogs.hpp"

namespace talutil {

/// The file dialog control, implemented by the platform's dialogs.
class CommonDialog final : public TableObject<CommonDialog> {
 public:
  explicit CommonDialog(const Platform& platform) : TableObject(platform), dialogs_(platform.file_dialogs) {}

  Text DialogTitle;
  Text Filter;
  std::int32_t FilterIndex = 0;
  Text InitDir;
  Text FileName;
  Text DefaultExt;
  Boolean CancelError;
  std::int32_t Flags = 0;

  /// FileName without its folder.
  [[nodiscard]] Text FileTitle() const;

  /// Show the dialog and store the chosen file in FileName and the filter in FilterIndex. If the dialog is cancelled,
  /// nothing changes, and with CancelError 32755 is raised. Raise 52 if FileName is not a valid file name.
  void ShowOpen() { show(FileDialog::Purpose::open); }
  void ShowSave() { show(FileDialog::Purpose::save); }

 private:
  void show(FileDialog::Purpose purpose);

  FileDialogs& dialogs_;
};

template <class P>
constexpr auto members_of(std::type_identity<CommonDialog>) {
  using C = CommonDialog;
  return P::rows(
      P::template property<&C::DialogTitle>("DialogTitle", "The title of the dialog."),
      P::template property<&C::Filter>("Filter", "Names and patterns of the files in turn, with bars between."),
      P::template property<&C::FilterIndex>("FilterIndex", "The chosen filter, counted from 1."),
      P::template property<&C::InitDir>("InitDir", "The folder that the dialog starts in."),
      P::template property<&C::FileName>("FileName", "The file: proposed before, chosen after."),
      P::template property<&C::DefaultExt>("DefaultExt", "The extension of a name that has none."),
      P::template property<&C::CancelError>("CancelError", "Cancelling raises 32755."),
      P::template property<&C::Flags>("Flags", "2 asks before replacing, 2048 and 4096 want what exists."),
      P::template get_only<&C::FileTitle>("FileTitle", "The file's name without its folder."),
      P::template method<&C::ShowOpen>("ShowOpen", "Lets the user choose a file to open."),
      P::template method<&C::ShowSave>("ShowSave", "Lets the user choose a file to save to."));
}

}  // namespace talutil
