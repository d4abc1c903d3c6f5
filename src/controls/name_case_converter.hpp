#pragma once

#include "controls/name_case.hpp"
#include "controls/table_object.hpp"

namespace talutil {

/// The string component that converts names to name case; members create one for each call that needs it.
class NameCaseConverter final : public TableObject<NameCaseConverter> {
 public:
  static constexpr TextView class_name = u"TALUtil.NameCaseConverter";

  explicit NameCaseConverter(const Platform& platform) : TableObject(platform) {}

  /// The text in name case; see name_case.hpp.
  [[nodiscard]] Text NameCase(const Text& Name) const { return name_case(Name); }
};

template <class P>
constexpr auto members_of(std::type_identity<NameCaseConverter>) {
  return P::rows(P::template method<&NameCaseConverter::NameCase>("NameCase", "Name"));
}

}  // namespace talutil
