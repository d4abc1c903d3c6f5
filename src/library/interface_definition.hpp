#pragma once

#include <string>

namespace talutil {

/// For whom an interface definition is written. The compiler refuses a default on a text passed by reference;
/// in its dialect such a parameter is by value, and the build mends the type library afterwards.
enum class Dialect { published, compiler };

/// The interface definition (IDL) of the type library: both classes, their interfaces with a help string for
/// each member, and the published records. Made from the interface tables alone.
[[nodiscard]] std::string interface_definition(Dialect dialect = Dialect::published);

}  // namespace talutil
