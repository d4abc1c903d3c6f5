#pragma once

#include "controls/control.hpp"

namespace talutil {

/// The file dialog control, as far as forms set it up when they load. Showing it is not built yet.
class CommonDialog final : public TableObject<CommonDialog> {
 public:
  explicit CommonDialog(const Platform& /*platform*/) {}

  Text DialogTitle;
  Text Filter;
};

template <class P>
constexpr auto members_of(std::type_identity<CommonDialog>) {
  return P::rows(P::template property<&CommonDialog::DialogTitle>("DialogTitle", "The title of the dialog."),
                 P::template property<&CommonDialog::Filter>(
                     "Filter", "Names and patterns of the files to choose from, each followed by a bar."));
}

}  // namespace talutil
