#pragma once

#include "automation/late_call.hpp"
#include "platform/win32/windows.hpp"

/// Late binding by our own hand: the platform's ITypeInfo::Invoke refuses a script's variables where a typed
/// reference is due.
namespace talutil::com {

/// IDispatch::GetIDsOfNames over a member table; the names after the first are parameters of the member.
[[nodiscard]] HRESULT find_identifiers(const LateInterface& table, wchar_t** names, UINT count, DISPID* ids) noexcept;

struct Invocation {
  DISPID member;
  WORD flags;
  DISPPARAMS* parameters;
  VARIANT* result;
  EXCEPINFO* exception;
  UINT* bad_argument;
};

/// IDispatch::Invoke over a member table. Arguments of any type are coerced to the parameter's; what the member wrote
/// back goes to the caller's variables, also when it failed, and only where it changed.
[[nodiscard]] HRESULT invoke(const LateInterface& table, void* target, const Locale& locale,
                             const Invocation& invocation) noexcept;

}  // namespace talutil::com
