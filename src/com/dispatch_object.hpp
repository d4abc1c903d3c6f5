#pragma once

#include "automation/object.hpp"
#include "platform/win32/windows.hpp"

/// Objects on their way between automation and the library, in both directions.
namespace talutil::com {

/// A host's object, or a third-party control, as ours. An empty pointer is an empty reference. An object that cannot
/// be driven late-bound raises 13 at each use, and not before: a member may have its own way with errors.
[[nodiscard]] ObjectRef object_from(IUnknown* object);

/// An object for a host: its own where it came from one, else a dispatcher over ours. The reference is the
/// caller's to release. Raises 13 for a host's object that cannot be driven late-bound.
[[nodiscard]] IDispatch* dispatch_from(const ObjectRef& object);

}  // namespace talutil::com
