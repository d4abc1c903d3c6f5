#pragma once

#include <array>
#include <memory>

#include "automation/late_call.hpp"
#include "automation/run_time_error.hpp"
#include "platform/platform.hpp"

/// Our own controls. Each is a class with a table of its members (see member_table.hpp) and is driven late-bound,
/// exactly like a third-party control: names are found regardless of case, the table may specify identifiers that hosts
/// know, and missing members raise 438.
namespace talutil {

template <class Derived>
class TableObject : public Object {
 public:
  std::int32_t member_id(TextView name) override { return late_interface<Derived>().identifier_of(name); }
  std::optional<std::int32_t> find_member(TextView name) override {
    return late_interface<Derived>().find_identifier(name);
  }

  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override {
    const LateInterface& table = late_interface<Derived>();
    std::array<Argument, most_parameters> given;
    if (arguments.size() > given.size()) raise(ErrorNumber::wrong_argument_count);
    for (std::size_t i = 0; i < arguments.size(); ++i) given[i].value = arguments[i];
    return table.call(static_cast<Derived*>(this), table.slot_of(member, access),
                      std::span(given).first(arguments.size()), locale_);
  }

 protected:
  /// Values are converted using the locale.
  explicit TableObject(const Locale& locale) : locale_(locale) {}

  /// Values are converted using the user's separators.
  explicit TableObject(const Platform& platform) : TableObject(platform.computer.locale()) {}

  [[nodiscard]] const Locale& locale() const noexcept { return locale_; }

 private:
  Locale locale_;
};

}  // namespace talutil
