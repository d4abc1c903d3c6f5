#include "com/early_call.hpp"

#include <algorithm>
#include <optional>

#include "com/argument_list.hpp"
#include "com/boundary.hpp"
#include "com/module.hpp"
#include "com/recorder.hpp"
#include "com/variant_bridge.hpp"
#include "com/write_back.hpp"

namespace talutil::com {

namespace {

template <class T>
T& at(const void* place) noexcept {
  return *static_cast<T*>(const_cast<void*>(place));
}

Variant value_at(ValueType type, const void* place, const Locale& locale) {
  switch (type) {
    case ValueType::boolean:
      return Boolean::from_bits(at<VARIANT_BOOL>(place));
    case ValueType::int16:
      return at<std::int16_t>(place);
    case ValueType::int32:
      return at<std::int32_t>(place);
    case ValueType::single:
      return at<float>(place);
    case ValueType::date:
      return Date{at<DATE>(place)};
    case ValueType::text:
      return text_from(at<BSTR>(place));
    case ValueType::text_array:
      return array_from(at<SAFEARRAY*>(place), locale);
    case ValueType::system_time:
      return at<SystemTime>(place);
    case ValueType::variant:
    case ValueType::object:
      return variant_from(at<VARIANT>(place));
    case ValueType::none:
      break;
  }
  return {};
}

/// A result before the call: zero, an empty text, Empty.
void initialize(ValueType type, void* place) noexcept {
  switch (type) {
    case ValueType::boolean:
    case ValueType::int16:
      at<std::int16_t>(place) = 0;
      break;
    case ValueType::int32:
      at<std::int32_t>(place) = 0;
      break;
    case ValueType::single:
      at<float>(place) = 0;
      break;
    case ValueType::date:
      at<DATE>(place) = 0;
      break;
    case ValueType::text:
    case ValueType::text_array:
      at<void*>(place) = nullptr;
      break;
    case ValueType::system_time:
      at<SystemTime>(place) = {};
      break;
    case ValueType::variant:
    case ValueType::object:
      at<VARIANT>(place) = {};
      break;
    case ValueType::none:
      break;
  }
}

/// A result on its way to the caller: converted while that can still fail, and stored when it no longer can.
class Result {
 public:
  explicit Result(ValueType type) noexcept : type_(type) {}

  void take(Variant answer) {
    switch (type_) {
      case ValueType::text:
        // Without asking for the kind, because most results are texts.
        V_BSTR(&native_.get()) = OwnedText(*answer.get_if<Text>()).release();
        V_VT(&native_.get()) = VT_BSTR;
        break;
      case ValueType::variant:
      case ValueType::object:
        native_ = native_from(answer, ArrayStyle::of_variants);
        break;
      case ValueType::text_array:
        native_ = native_from(answer, ArrayStyle::of_texts);
        break;
      default:
        answer_ = std::move(answer);
        break;
    }
  }

  void store(void* place) noexcept {
    switch (type_) {
      case ValueType::boolean:
        at<VARIANT_BOOL>(place) = answer_.get_if<Boolean>()->bits();
        break;
      case ValueType::int16:
        at<std::int16_t>(place) = *answer_.get_if<std::int16_t>();
        break;
      case ValueType::int32:
        at<std::int32_t>(place) = *answer_.get_if<std::int32_t>();
        break;
      case ValueType::single:
        at<float>(place) = *answer_.get_if<float>();
        break;
      case ValueType::date:
        at<DATE>(place) = answer_.get_if<Date>()->days;
        break;
      case ValueType::system_time:
        at<SystemTime>(place) = *answer_.get_if<SystemTime>();
        break;
      // Exchanged, because a caller may have passed the same address for an argument, which has been written back.
      case ValueType::text:
        std::swap(at<BSTR>(place), V_BSTR(&native_.get()));
        break;
      case ValueType::text_array:
        std::swap(at<SAFEARRAY*>(place), V_ARRAY(&native_.get()));
        if (V_ARRAY(&native_.get()) == nullptr) V_VT(&native_.get()) = VT_EMPTY;
        break;
      case ValueType::variant:
      case ValueType::object:
        std::swap(at<VARIANT>(place), native_.get());
        break;
      case ValueType::none:
        break;
    }
  }

 private:
  ValueType type_;
  Variant answer_;  ///< A number or record, which is the same on both sides.
  OwnedVariant native_;
};

/// The type of a caller's variable that is written back, other than a variant and a record.
VARTYPE variable_type(ValueType type) noexcept {
  switch (type) {
    case ValueType::boolean:
      return VT_BOOL;
    case ValueType::int16:
      return VT_I2;
    case ValueType::int32:
      return VT_I4;
    case ValueType::single:
      return VT_R4;
    case ValueType::date:
      return VT_DATE;
    case ValueType::text_array:
      return VT_ARRAY | VT_BSTR;
    default:
      return VT_BSTR;
  }
}

/// The arguments of one call, and writing back what the member changed.
class EarlyArguments {
 public:
  EarlyArguments(const Signature& signature, const Places& places, const Locale& locale)
      : signature_(signature), places_(places), locale_(locale) {
    for (std::size_t i = 0; i < signature.count; ++i) {
      const Signature::Passed& passed = signature.parameters[i];
      Argument& added = list_.add([&] { return value_at(passed.type, places.arguments[i], locale); });
      if (is_variable(i)) added.same_variable_as = earlier_place_of(i);
    }
  }

  [[nodiscard]] std::span<Argument> all() noexcept { return list_.all(); }

  void write_back() {
    const std::span<Argument> arguments = all();
    if (std::ranges::none_of(arguments, &Argument::is_changed)) return;
    std::array<VARIANT, most_parameters> variables{};
    std::array<std::optional<WriteBack>, most_parameters> changes;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
      if (is_written(i)) prepare(i, variables[i], changes[i]);
    }
    for (std::size_t i = 0; i < arguments.size(); ++i) {
      if (changes[i])
        changes[i]->store();
      else if (is_written(i))
        at<SystemTime>(places_.arguments[i]) = *arguments[i].value.get_if<SystemTime>();
    }
  }

 private:
  [[nodiscard]] bool is_variable(std::size_t i) const noexcept {
    const Signature::Passed& passed = signature_.parameters[i];
    return passed.type == ValueType::variant && passed.passing == Passing::written_back;
  }

  [[nodiscard]] bool is_written(std::size_t i) noexcept {
    return all()[i].is_changed && all()[i].same_variable_as < 0 &&
           signature_.parameters[i].passing == Passing::written_back;
  }

  /// The address of the caller's variable behind a variant, which may itself refer to one.
  [[nodiscard]] const void* variable_at(std::size_t i) const noexcept {
    const void* const end = variable_of(at<VARIANT>(places_.arguments[i]));
    return end == nullptr ? places_.arguments[i] : end;
  }

  /// The index of the earlier argument that is the same variable; -1 if there is none.
  [[nodiscard]] std::int8_t earlier_place_of(std::size_t place) const noexcept {
    for (std::size_t i = 0; i < place; ++i) {
      if (is_variable(i) && variable_at(i) == variable_at(place)) return static_cast<std::int8_t>(i);
    }
    return -1;
  }

  /// Converts a change; a record needs no conversion.
  void prepare(std::size_t i, VARIANT& variable, std::optional<WriteBack>& change) {
    const ValueType type = signature_.parameters[i].type;
    if (type == ValueType::system_time) return;
    if (type == ValueType::variant) {
      change.emplace(&at<VARIANT>(places_.arguments[i]), all()[i].value, locale_);
      return;
    }
    V_VT(&variable) = static_cast<VARTYPE>(VT_BYREF | variable_type(type));
    V_BYREF(&variable) = const_cast<void*>(places_.arguments[i]);
    change.emplace(variable, all()[i].value, locale_);
  }

  const Signature& signature_;
  const Places& places_;
  const Locale& locale_;
  ArgumentList list_;
};

/// The member behind a function. Searches the table: only recordings need it.
const Member& member_of(const LateInterface& table, LateCall function) noexcept {
  const auto found = std::ranges::find(table.calls, function);
  return table.members[static_cast<std::size_t>(found - table.calls.begin())];
}

Variant use(const EarlyCall& call, EarlyArguments& arguments, const Locale& locale) {
  Recorder* const recorder = module_recorder();
  if (recorder == nullptr) return call.function(call.target, arguments.all(), locale);
  return recorded(
      recorder, call.target, member_of(call.table, call.function), [&] { return arguments.all(); },
      [&] { return call.function(call.target, arguments.all(), locale); });
}

}  // namespace

HRESULT check_places(const Signature& signature, const Places& places) noexcept {
  bool is_complete = signature.result == ValueType::none || places.result != nullptr;
  if (is_complete) initialize(signature.result, places.result);
  for (std::size_t i = 0; i < signature.count; ++i) is_complete = is_complete && places.arguments[i] != nullptr;
  if (is_complete) return S_OK;
  SetErrorInfo(0, nullptr);
  return E_POINTER;
}

HRESULT call_early(const EarlyCall& call, const Signature& signature, const Places& places) noexcept {
  return guarded([&] {
    const Locale locale = call.library.locale();
    EarlyArguments arguments(signature, places, locale);
    Result result(signature.result);
    try {
      result.take(use(call, arguments, locale));
    } catch (...) {
      arguments.write_back();
      throw;
    }
    arguments.write_back();
    result.store(places.result);
  });
}

}  // namespace talutil::com
