#include "com/invoke.hpp"

#include <algorithm>
#include <array>
#include <optional>

#include "com/argument_list.hpp"
#include "com/boundary.hpp"
#include "com/module.hpp"
#include "com/recorder.hpp"
#include "com/variant_bridge.hpp"
#include "com/write_back.hpp"

namespace talutil::com {

namespace {

constexpr WORD put_flags = DISPATCH_PROPERTYPUT | DISPATCH_PROPERTYPUTREF;

/// The position of each parameter's argument in the caller's list; -1 for one that was left out.
struct Placement {
  std::array<int, most_parameters> argument{};
  std::size_t count = 0;  ///< The number of parameters up to the last one given.
};

HRESULT place_arguments(const Member& member, const DISPPARAMS& given, UINT* bad_argument, Placement& placement) {
  placement.argument.fill(-1);
  const UINT positional = given.cArgs - given.cNamedArgs;
  if (given.cArgs > member.parameter_count) return DISP_E_BADPARAMCOUNT;
  // The caller's list begins with the named arguments; the positional ones follow in reverse order.
  for (UINT i = 0; i < positional; ++i) placement.argument[i] = static_cast<int>(given.cArgs - 1 - i);
  placement.count = positional;
  for (UINT i = 0; i < given.cNamedArgs; ++i) {
    const DISPID id = given.rgdispidNamedArgs[i];
    const bool is_value = member.access == Access::put && id == DISPID_PROPERTYPUT;
    const std::size_t place = is_value ? member.parameter_count - 1U : static_cast<std::size_t>(id);
    if (place >= member.parameter_count || placement.argument[place] != -1) {
      if (bad_argument != nullptr) *bad_argument = i;
      return DISP_E_PARAMNOTFOUND;
    }
    placement.argument[place] = static_cast<int>(i);
    placement.count = std::max(placement.count, place + 1);
  }
  return S_OK;
}

bool is_missing(const VARIANT& value) noexcept {
  return V_VT(&value) == VT_ERROR && V_ERROR(&value) == DISP_E_PARAMNOTFOUND;
}

/// The argument as the parameter needs it. For arrays the parameter's type decides: a script's array holds variants.
Variant argument_value(const Parameter& parameter, const VARIANT& given, const Locale& locale) {
  const VARIANT& source = resolved(given);
  const bool is_array = (V_VT(&source) & VT_ARRAY) != 0;
  if (parameter.type != ValueType::text_array || !is_array) return variant_from(source);
  const bool by_reference = (V_VT(&source) & VT_BYREF) != 0;
  if (by_reference && V_ARRAYREF(&source) == nullptr) raise(ErrorNumber::invalid_procedure_call);
  return array_from(by_reference ? *V_ARRAYREF(&source) : V_ARRAY(&source), locale);
}

/// One call: its arguments, and writing back what the member changed.
class Call {
 public:
  Call(const Member& member, const Invocation& invocation, const Placement& placement, const Locale& locale)
      : invocation_(invocation), placement_(placement), locale_(locale) {
    for (std::size_t i = 0; i < placement.count; ++i) {
      const int at = placement.argument[i];
      if (at < 0) {
        arguments_.add([] { return missing_argument; });
        continue;
      }
      if (invocation.bad_argument != nullptr) *invocation.bad_argument = static_cast<UINT>(at);
      Argument& added = arguments_.add(
          [&] { return argument_value(member.parameters()[i], invocation.parameters->rgvarg[at], locale); });
      added.same_variable_as = earlier_place_of(i, member);
    }
  }

  [[nodiscard]] std::span<Argument> arguments() noexcept { return arguments_.all(); }

  void write_back() {
    const std::span<Argument> all = arguments();
    if (std::ranges::none_of(all, &Argument::is_changed)) return;
    std::array<std::optional<WriteBack>, most_parameters> changes;
    for (std::size_t i = 0; i < all.size(); ++i) {
      if (!all[i].is_changed || placement_.argument[i] < 0 || all[i].same_variable_as >= 0) continue;
      const VARIANT& target = invocation_.parameters->rgvarg[placement_.argument[i]];
      const bool is_written = (V_VT(&target) & VT_BYREF) != 0 || system_time_of(target) != nullptr;
      if (is_written) changes[i].emplace(target, all[i].value, locale_);
    }
    for (auto& change : changes) {
      if (change) change->store();
    }
  }

 private:
  /// The index of the earlier argument that is the same variable, if both may be written to; otherwise -1.
  [[nodiscard]] std::int8_t earlier_place_of(std::size_t place, const Member& member) const {
    const auto variable_at = [&](std::size_t i) -> const void* {
      const Parameter& parameter = member.parameters()[i];
      const bool is_variant = parameter.type == ValueType::variant && parameter.passing == Passing::written_back;
      const int at = placement_.argument[i];
      return is_variant && at >= 0 ? variable_of(invocation_.parameters->rgvarg[at]) : nullptr;
    };
    const void* const variable = variable_at(place);
    for (std::size_t i = 0; variable != nullptr && i < place; ++i) {
      if (variable_at(i) == variable) return static_cast<std::int8_t>(i);
    }
    return -1;
  }

  const Invocation& invocation_;
  const Placement& placement_;
  const Locale& locale_;
  ArgumentList arguments_;
};

HRESULT check_required(const Member& member, const Invocation& invocation, const Placement& placement) {
  for (std::size_t i = 0; i < member.parameter_count; ++i) {
    const int at = placement.argument[i];
    if (member.parameters()[i].is_optional || (at >= 0 && !is_missing(invocation.parameters->rgvarg[at]))) continue;
    if (at >= 0 && invocation.bad_argument != nullptr) *invocation.bad_argument = static_cast<UINT>(at);
    return DISP_E_PARAMNOTOPTIONAL;
  }
  return S_OK;
}

/// The slot for a member and the way it is used; -1 if there is none.
std::int32_t slot_for(const LateInterface& table, DISPID member, WORD flags) noexcept {
  if ((flags & put_flags) == 0) return table.slot_of(member, Access::get);
  const std::int32_t slot = table.slot_of(member, Access::put);
  // Putting by reference is allowed only for a property that stores an object.
  const bool by_reference_only = (flags & put_flags) == DISPATCH_PROPERTYPUTREF;
  if (slot < 0 || !by_reference_only) return slot;
  return table.members[static_cast<std::size_t>(slot)].parameters()[0].type == ValueType::variant ? slot : -1;
}

}  // namespace

HRESULT find_identifiers(const LateInterface& table, wchar_t** names, UINT count, DISPID* ids) noexcept {
  if (names == nullptr || ids == nullptr || count == 0) return E_POINTER;
  std::fill_n(ids, count, DISPID_UNKNOWN);
  const auto name_at = [names](UINT i) {
    return names[i] == nullptr ? TextView() : win32::view(names[i], std::char_traits<wchar_t>::length(names[i]));
  };
  const std::int32_t slot = table.find(name_at(0));
  if (slot < 0) return DISP_E_UNKNOWNNAME;
  const Member& member = table.members[static_cast<std::size_t>(slot)];
  ids[0] = member.identifier;
  HRESULT result = S_OK;
  for (UINT i = 1; i < count; ++i) {
    const auto parameters = member.parameters();
    const auto found = std::ranges::find_if(
        parameters, [&](const Parameter& parameter) { return same_name(parameter.name, name_at(i)); });
    if (found == parameters.end())
      result = DISP_E_UNKNOWNNAME;
    else
      ids[i] = static_cast<DISPID>(found - parameters.begin());
  }
  return result;
}

HRESULT invoke(const LateInterface& table, void* target, const Locale& locale, const Invocation& invocation) noexcept {
  const DISPPARAMS* const given = invocation.parameters;
  if (given == nullptr || (given->cArgs != 0 && given->rgvarg == nullptr) || given->cNamedArgs > given->cArgs ||
      (given->cNamedArgs != 0 && given->rgdispidNamedArgs == nullptr)) {
    return E_POINTER;
  }
  const std::int32_t slot = slot_for(table, invocation.member, invocation.flags);
  if (slot < 0) return DISP_E_MEMBERNOTFOUND;
  const Member& member = table.members[static_cast<std::size_t>(slot)];
  const FloatingPointSettings settings;
  try {
    Placement placement;
    HRESULT result = place_arguments(member, *given, invocation.bad_argument, placement);
    if (SUCCEEDED(result)) result = check_required(member, invocation, placement);
    if (FAILED(result)) return result;

    Call call(member, invocation, placement, locale);
    OwnedVariant answer;
    try {
      answer = native_from(recorded(
                               module_recorder(), target, member, [&] { return call.arguments(); },
                               [&] { return table.call(target, slot, call.arguments(), locale); }),
                           ArrayStyle::of_variants);
    } catch (...) {
      call.write_back();
      throw;
    }
    call.write_back();
    if (invocation.result != nullptr) *invocation.result = answer.release();
    return S_OK;
  } catch (...) {
    return report_current_exception(invocation.exception);
  }
}

}  // namespace talutil::com
