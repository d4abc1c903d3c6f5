#pragma once

#include <string>

namespace talutil {

/// For whom an interface definition is written.
///
/// The compiler refuses a default on a text passed by reference, and takes the name GUID for the platform's own
/// record. What it is given for the type library differs there, and the build mends the library afterwards; what
/// it is given for the header of C++ clients has the references but no defaults, and records with a prefix, so that the
/// header can follow the platform's own.
enum class Dialect { published, type_library, header };

/// What stands for GUID until the type library is mended: a name with the same hash, so that the library's index
/// of names stays true.
inline constexpr const char* guid_stand_in = "GYID";

/// The interface definition (IDL) of the type library: both classes, their interfaces with a help string for
/// each member, and the published records. Made from the interface tables alone.
[[nodiscard]] std::string interface_definition(Dialect dialect = Dialect::published);

}  // namespace talutil
