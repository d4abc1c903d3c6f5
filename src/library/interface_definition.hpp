#pragma once

#include <string>

namespace talutil {

/// The interface definition (IDL) of the type library: both classes, their interfaces with a help string for
/// each member, and the published records. Made from the interface tables alone.
[[nodiscard]] std::string interface_definition();

}  // namespace talutil
