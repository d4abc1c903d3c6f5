#pragma once

#include <memory>
#include <vector>

#include "automation/late_call.hpp"
#include "automation/run_time_error.hpp"
#include "platform/platform.hpp"

/// Our own controls. Each is a class with a table of its members (see member_table.hpp) and is driven
/// late-bound, exactly as another maker's would be: names are found without case, identifiers may be given
/// by the table where hosts know them, and what a control does not have raises 438.
namespace talutil {

template <class Derived>
class TableObject : public Object {
 public:
  std::int32_t member_id(TextView name) override { return late_interface<Derived>().identifier_of(name); }

  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override {
    const LateInterface& table = late_interface<Derived>();
    std::vector<Argument> given(arguments.begin(), arguments.end());
    return table.call(static_cast<Derived*>(this), table.slot_of(member, access), given, Locale{});
  }
};

/// A control whose members are not built yet: it has its place on a form and nothing else.
class ReservedControl final : public Object {
 public:
  explicit ReservedControl(const Platform& /*platform*/) {}

  std::int32_t member_id(TextView /*name*/) override { raise(ErrorNumber::member_not_supported); }
  Variant invoke(std::int32_t /*member*/, Access /*access*/, std::span<const Variant> /*arguments*/) override {
    raise(ErrorNumber::member_not_supported);
  }
};

}  // namespace talutil
