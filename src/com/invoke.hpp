#pragma once

#include "automation/late_call.hpp"
#include "platform/win32/windows.hpp"

/// Our own implementation of late binding: the platform's ITypeInfo::Invoke rejects a script's variables for typed
/// reference parameters.
namespace talutil::com {

/// Implements IDispatch::GetIDsOfNames for a member table; the names after the first are parameters of the member.
[[nodiscard]] HRESULT find_identifiers(const LateInterface& table, wchar_t** names, UINT count, DISPID* ids) noexcept;

struct Invocation {
  DISPID member;
  WORD flags;
  DISPPARAMS* parameters;
  VARIANT* result;
  EXCEPINFO* exception;
  UINT* bad_argument;
};

/// Implements IDispatch::Invoke for a member table. Arguments of any type are coerced to the parameter's type. What the
/// member wrote back is stored in the caller's variables, even if it failed, but only if it changed.
[[nodiscard]] HRESULT invoke(const LateInterface& table, void* target, const Locale& locale,
                             const Invocation& invocation) noexcept;

}  // namespace talutil::com
