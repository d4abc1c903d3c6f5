#pragma once

#include <array>

#include "automation/late_call.hpp"
#include "library/library.hpp"
#include "platform/win32/windows.hpp"

/// Early-bound calls: the slots of the vtables only pass on where their arguments are; everything else is here, once
/// for all of them.
namespace talutil::com {

/// How a slot passes its arguments and its result; one for all slots with the same types.
struct Signature {
  struct Passed {
    ValueType type = ValueType::none;
    Passing passing = Passing::by_value;
  };

  ValueType result = ValueType::none;
  std::size_t count = 0;
  std::array<Passed, most_parameters> parameters{};
};

/// Where a call's arguments and its result are. An argument by reference has the address that the caller passed.
struct Places {
  const void* const* arguments;
  void* result;  ///< Null for a slot without a result.
};

/// Initialises the caller's result. Returns E_POINTER, and clears the thread's error information, which may be about an
/// earlier error, if one of the caller's pointers is null.
[[nodiscard]] HRESULT check_places(const Signature& signature, const Places& places) noexcept;

/// The function behind a slot, and the object that it is called for.
struct EarlyCall {
  const LateInterface& table;
  LateCall function;
  void* target;
  const Library& library;
};

/// Converts the arguments, calls the function and stores the result and what was written back, which stays written even
/// if the call fails. The places have been checked.
[[nodiscard]] HRESULT call_early(const EarlyCall& call, const Signature& signature, const Places& places) noexcept;

}  // namespace talutil::com
