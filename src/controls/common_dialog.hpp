#pragma once

#include "controls/table_object.hpp"
#include "platform/file_dialogs.hpp"

namespace talutil {

/// The file dialog control, implemented by the platform's dialogs.
class CommonDialog final : public TableObject<CommonDialog> {
 public:
  explicit CommonDialog(const Platform& platform) : TableObject(platform), dialogs_(platform.file_dialogs) {}

  /// The title of the dialog; empty, as at first, for the platform's own.
  /// @family files
  /// @see ShowOpen, ShowSave
  /// @example
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.DialogTitle = "Choose a price list"
  ///     Print d.DialogTitle
  ///     ' Choose a price list
  Text DialogTitle;

  /// The kinds of files that the dialog offers: names and patterns in turn, separated by bars; empty for all files.
  /// Several patterns of one kind are separated by semicolons.
  /// @family files
  /// @see FilterIndex
  /// @example
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.Filter = "Texts|*.txt;*.csv|All files|*.*"
  ///     d.FilterIndex = 2
  ///     Print d.Filter
  ///     ' Texts|*.txt;*.csv|All files|*.*
  Text Filter;

  /// The number of the filter, counted from 1: selected at first, then the one that the user chose.
  /// @family files
  /// @see Filter
  /// @example
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.FilterIndex = 2
  ///     Print d.FilterIndex
  ///     ' 2
  std::int32_t FilterIndex = 0;

  /// The folder in which the dialog starts; empty, as at first, for the platform's choice. The dialog does not change
  /// the process's current folder.
  /// @family files
  /// @see FileName
  /// @example
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.InitDir = folder
  ///     Print d.InitDir = folder
  ///     ' True
  Text InitDir;

  /// The file: what the dialog suggests, and afterwards the whole path of what the user chose. If the dialog is
  /// cancelled, it stays as it was.
  /// @family files
  /// @see FileTitle, ShowOpen, ShowSave
  /// @example
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.FileName = "prices.csv"
  ///     Print d.FileName
  ///     ' prices.csv
  Text FileName;

  /// The extension, without a full stop, of a name that the user types without one; empty for none.
  /// @family files
  /// @see FileName
  /// @example
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.DefaultExt = "csv"
  ///     Print d.DefaultExt
  ///     ' csv
  Text DefaultExt;

  /// Whether cancelling raises error 32755; with False, as at first, FileName just stays as it was.
  /// @family files
  /// @see ShowOpen, ShowSave
  /// @example
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     Print d.CancelError
  ///     ' False
  ///     d.CancelError = True
  ///     Print d.CancelError
  ///     ' True
  Boolean CancelError;

  /// Options of the dialog, added up: 2 asks before replacing a file, 4 hides "read-only", 2048 and 4096 accept what
  /// exists. 2048 accepts only files in existing folders, 4096 only existing files. Other flags of the platform's
  /// dialog work, too, except those for several files, a help button, and code of the caller's.
  /// @family files
  /// @see ShowOpen, ShowSave
  /// @example
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.Flags = 2 + 4
  ///     Print d.Flags
  ///     ' 6
  std::int32_t Flags = 0;

  /// The name of the file without its folder.
  /// @family files
  /// @see FileName
  /// @example
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.FileName = "C:\TAL\ORV3\prices.csv"
  ///     Print d.FileTitle
  ///     ' prices.csv
  [[nodiscard]] Text FileTitle() const;

  /// Lets the user choose a file to open; the file is in FileName and the filter in FilterIndex afterwards. It only
  /// asks: the host does the reading. If the user cancels, nothing changes. On Linux it is a question at the terminal,
  /// and without one it counts as cancelled.
  /// @raises 32755 if the user cancels and CancelError is True
  /// @raises 52 if FileName cannot be the name of a file
  /// @raises 53 if the system has no dialogs
  /// @reads DialogTitle, Filter, FilterIndex, InitDir, FileName, DefaultExt, CancelError, Flags
  /// @changes FileName, FilterIndex
  /// @family files
  /// @see ShowSave, FileName, CancelError
  /// @example windows
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.DialogTitle = "Price list"
  ///     d.CancelError = True
  ///     On Error Resume Next
  ///     ' The user presses: Escape
  ///     d.ShowOpen
  ///     Print Err.Number
  ///     ' 32755
  void ShowOpen() { show(FileDialog::Purpose::open); }

  /// Lets the user choose a file to save to; the file is in FileName and the filter in FilterIndex afterwards. It only
  /// asks: the host does the writing. If the user cancels, nothing changes. On Linux it is a question at the terminal,
  /// and without one it counts as cancelled.
  /// @raises 32755 if the user cancels and CancelError is True
  /// @raises 52 if FileName cannot be the name of a file
  /// @raises 53 if the system has no dialogs
  /// @reads DialogTitle, Filter, FilterIndex, InitDir, FileName, DefaultExt, CancelError, Flags
  /// @changes FileName, FilterIndex
  /// @family files
  /// @see ShowOpen, FileName, CancelError
  /// @example windows
  ///     Set d = CreateObject("TALUtil.CommonDialog")
  ///     d.DialogTitle = "Price list"
  ///     d.CancelError = True
  ///     On Error Resume Next
  ///     ' The user presses: Escape
  ///     d.ShowSave
  ///     Print Err.Number
  ///     ' 32755
  void ShowSave() { show(FileDialog::Purpose::save); }

 private:
  void show(FileDialog::Purpose purpose);

  FileDialogs& dialogs_;
};

template <class P>
constexpr auto members_of(std::type_identity<CommonDialog>) {
  using C = CommonDialog;
  return P::rows(P::template property<&C::DialogTitle>("DialogTitle"), P::template property<&C::Filter>("Filter"),
                 P::template property<&C::FilterIndex>("FilterIndex"), P::template property<&C::InitDir>("InitDir"),
                 P::template property<&C::FileName>("FileName"), P::template property<&C::DefaultExt>("DefaultExt"),
                 P::template property<&C::CancelError>("CancelError"), P::template property<&C::Flags>("Flags"),
                 P::template get_only<&C::FileTitle>("FileTitle"), P::template method<&C::ShowOpen>("ShowOpen"),
                 P::template method<&C::ShowSave>("ShowSave"));
}

}  // namespace talutil
