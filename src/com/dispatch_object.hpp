#pragma once

#include "automation/object.hpp"
#include "platform/win32/windows.hpp"

/// Conversion of objects between automation and the library, in both directions.
namespace talutil::com {

/// Wraps a host's object or a third-party control as one of our objects. A null pointer becomes a null reference. An
/// object that cannot be driven late-bound raises 13 on each use, not before, because a member may have its own way of
/// handling errors.
[[nodiscard]] ObjectRef object_from(IUnknown* object);

/// An object for a host: the host's own if it came from there, otherwise a dispatcher for our object. The caller must
/// release the reference. Raises 13 for a host's object that cannot be driven late-bound.
[[nodiscard]] IDispatch* dispatch_from(const ObjectRef& object);

/// The address by which a host knows its object; null for one of our objects.
[[nodiscard]] const void* identity_of_host_object(const ObjectRef& object) noexcept;

}  // namespace talutil::com
