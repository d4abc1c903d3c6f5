#include "controls/common_dialog.hpp"

namespace talutil {

Text CommonDialog::FileTitle() const { return FileName.substr(FileName.find_last_of(u"\\/") + 1); }

void CommonDialog::show(FileDialog::Purpose purpose) {
  const auto chosen = dialogs_.choose({.purpose = purpose,
                                       .title = DialogTitle,
                                       .folder = InitDir,
                                       .file_name = FileName,
                                       .filter = Filter,
                                       .filter_index = FilterIndex,
                                       .default_extension = DefaultExt,
                                       .flags = Flags});
  if (chosen) {
    FileName = chosen->path;
    FilterIndex = chosen->filter_index;
  } else if (CancelError) {
    raise(ErrorNumber::cancelled);
  }
}

}  // namespace talutil
