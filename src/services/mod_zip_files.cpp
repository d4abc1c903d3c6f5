#include "services/mod_zip_files.hpp"

#include <array>

#include "automation/control.hpp"
#include "automation/run_time_error.hpp"
#include "controls/zip_controls.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

/// Indexed by result code. Users and their support know this wording, including its misspellings and spacing.
constexpr std::array<TextView, 22> explanations = {
    u"ZE_OK    Successful operation",
    u"ZE_BUSY  Busy, can 't enter now - You tried to initiate another zip action within the same thread of "
    u"execution before the last operation completes.",
    u"ZE_EOF   Unexpected end of ZIP file",
    u"ZE_FORM  ZIP file structure invalid - The internal organization of the existing ZIP file has been "
    u"damaged. Try fixing the ZIP file.  Be sure to make a backup copy first.",
    u"ZE_MEM   Out of memory - Too many applications running.  Close some applications and try again.",
    u"ZE_LOGIC    Internal logic error - Contact Support immediately if this error occurs.",
    u"ZE_BIG   Entry too big to split - This error will never occur.  It is documented for backward "
    u"compatibility only.",
    u"ZE_NOTE     Invalid comment format - The comment size is too large or not properly formatted for use in "
    u"a ZIP file.  Comments must be less than 64K in length.",
    u"ZE_TEST     ZIP file invalid or insufficient memory - While testing the ZIP file, an internal error "
    u"occurred.  Try fixing the ZIP file.  Be sure to make a backup copy first.",
    u"ZE_ABORT    Application canceled operation - The user has canceled the zip operation.",
    u"ZE_TEMP  Temporary file failure - When DynaZip attempted to create a temporary copy of an existing ZIP "
    u"file an error occurred.  This error could be caused by specifying a non existant path or drive letter "
    u"in the ZIPFile property.  It can also be caused if the ZIPFile is target to a locked or restricted "
    u"directory or to a file by the same name that is locked or restricted.  Check ReadOnly attributes and "
    u"the possibility of other applications accessing the ZIP file or the directory that contains the ZIP "
    u"file.",
    u"ZE_READ  Input file read failure - This error occurs when a file read operation is performed on a ZIP "
    u"file that is locked or restricted by another process.",
    u"ZE_NONE      Nothing to do - The ItemList that you specified doesn't match any files to be zipped.",
    u"ZE_NAME  Missing or empty ZIP file - You have specified a ZIPFile name that does not exist.  Be sure to "
    u"use full paths with drive letters or UNC paths when specifying the ZIPFile name.",
    u"ZE_WRITE Output file write failure, possible disk full - This error can occur when a file write "
    u"operation is performed on a ZIP file that is locked or restricted by another process.",
    u"ZE_CREAT Could not create output file - This error can occur when the target ZIP file or the directory "
    u"to contain the ZIP file is locked or restricted by another.",
    u"ZE_PARMS     Invalid combination of control parameters - You have specified an inappropriate "
    u"combination of properties or have omitted a property setting that is required for a particular "
    u"operation.",
    u"ZE_INCOMPLETE    Could not complete operation - At a critical point within a zip operation, the process "
    u"could not complete.  You should retry the same zip operation and if the problem persists contact "
    u"Support immediately.",
    u"ZE_OPEN  File not found or no read permission - The ZIP file that you specified could be found but is "
    u"locked or unavailable.  Perhaps the SECURITY permissions are restricting access to the ZIP file or the "
    u"directory that contains the file is locked or restricted.  It is also possible that the file "
    u"specification is confused with another open or restricted file because the file spec contains a space "
    u"and is not surrounded with double quote characters.",
    u"ZE_MEDIA Media error, disk not ready, or hardware error - During a multi-volume operation, the media "
    u"was found to be corrupted beyond repair or perhaps the user simply opened the drive door during a "
    u"format or wipe operation.  Try replacing the media.",
    u"ZE_MVPARMS   Invalid combination of multi-volume control parameters",
    u"ZE_MVUSAGE   Improper use of a multi-volume ZIP file - You tried to use a Multi-Volume ZIP file like a "
    u"non-multi-volume ZIP file. For example, you can not grow an existing multi-volume ZIP file."};

// Our own control receives the same identifiers as a third-party control in its place would. All settings are cleared,
// one by one, because a control keeps those of its last action.
using Identifiers = std::initializer_list<std::int32_t>;

void put_all(const Control& control, Identifiers members, const Variant& value) {
  for (const std::int32_t member : members) control.put(member, value);
}

void reset_zip(const Control& control, const Text& password) {
  using Zip = ZipControl;
  control.put(Zip::action, 0);
  control.put(Zip::encrypt, Boolean(false));
  put_all(control, {3, 18, 15, 33, 30, 6, 26, 12, 13, 16, 24, 29, 14, 36, 28, 17, 23, 10, 9, 7}, Boolean(false));
  control.put(Zip::recurse, Boolean(true));
  put_all(control, {19, 21}, Boolean(false));
  put_all(control, {20, 22, 27, 25, 2, 31, 11, 1, 42}, u"");
  control.put(Zip::multi_volume, 0);
  control.put(8, 0);
  control.put(Zip::level, Zip::default_level);
  control.put(Zip::volume_size, Zip::default_volume_size);
  put_all(control, {32, 44}, 0);
  control.put(Zip::password, password);
  control.put(Zip::encrypt, Boolean(true));
}

void reset_unzip(const Control& control, const Text& password) {
  using Unzip = UnzipControl;
  control.put(Unzip::action, 0);
  put_all(control, {5, 19, 20, 18, 8, 22, 10, 11, 12, 9}, Boolean(false));
  put_all(control, {6, 7, 15, 13, 14}, Boolean(true));
  put_all(control, {21, 4, 2, 17, 31, 32, 1}, u"");
  put_all(control, {24, 16, 23, 33, 30, 27, 25, 26, 43}, 0);
  control.put(28, std::int16_t{0});
  control.put(Unzip::largest_ratio, Unzip::default_largest_ratio);
  control.put(29, 0);
  control.put(Unzip::password, password);
  put_all(control, {37, 42}, 0);
}

/// Reads the result twice, as hosts expect.
void show_result_of(const Control& control, std::int32_t member, MessageBoxes& boxes) {
  static_cast<void>(control.get<std::int16_t>(member));
  ModZipFiles::show_result(control.get<std::int16_t>(member), boxes);
}

}  // namespace

void ModZipFiles::show_result(std::int16_t code, MessageBoxes& boxes) {
  if (code <= 0) return;
  const auto row = static_cast<std::size_t>(code);
  Text message = u"ORV Zipping Error: ";
  if (row < explanations.size()) message += explanations[row];
  message +=
      u"  If this error occurred during a backup operation, your data is safe.  The data is copied to a temporary "
      u"folder before a zip operation is attempted.";
  boxes.show(message, MessageButtons::ok, {});
}

void ModZipFiles::zip(const Control& control, MessageBoxes& boxes, const Text& archive, const Text& items,
                      std::int16_t multi_volume) const {
  reset_zip(control, password_);
  if (multi_volume == 1) control.put(ZipControl::multi_volume, 1);
  control.put(ZipControl::archive_name, archive);
  control.put(ZipControl::item_list, items);
  control.put(ZipControl::action, ZipControl::add);
  show_result_of(control, ZipControl::result, boxes);
}

void ModZipFiles::unzip(const Control& control, MessageBoxes& boxes, const Text& archive, const Text& destination,
                        const Text& items, Boolean overwrite) const {
  using Unzip = UnzipControl;
  reset_unzip(control, password_);
  control.put(Unzip::archive_name, archive);
  control.put(Unzip::action, Unzip::look);
  if (control.get<std::int16_t>(Unzip::result) == 0) {
    control.put(Unzip::archive_name, archive);
    control.put(Unzip::destination, destination);
    control.put(Unzip::item_list, items);
    control.put(Unzip::overwrite, overwrite);
    control.put(Unzip::action, Unzip::extract);
  }
  show_result_of(control, Unzip::result, boxes);
}

void ORVUtils::CallZIPFiles(const Text& sZipName, const Text& sItems, const std::int16_t& iMultiVolume,
                            const Text& sEncryptionPassword, const Boolean& /*bUseFilePath*/) {
  auto& zip_files = library_.part<ModZipFiles>();
  // First, so that it is kept even if there is no control.
  zip_files.set_password(sEncryptionPassword);
  const Control control(library_.components().control(u"ZipCtrl"), locale());
  zip_files.zip(control, library_.platform().message_boxes, sZipName, sItems, iMultiVolume);
}

void ORVUtils::CallUnZIPFiles(const Text& sUnZipName, const Text& sDestPath, const Text& sItems,
                              const Boolean& bOverWrite) {
  const Control control(library_.components().control(u"UnZipCtrl"), locale());
  library_.part<ModZipFiles>().unzip(control, library_.platform().message_boxes, sUnZipName, sDestPath, sItems,
                                     bOverWrite);
}

}  // namespace talutil
