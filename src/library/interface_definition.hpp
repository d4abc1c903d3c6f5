#pragma once

#include <string>
#include <string_view>

#include "automation/member_table.hpp"

namespace talutil {

/// The purpose for which an interface definition is written.
///
/// The IDL compiler rejects a default value for a text passed by reference, and takes the name GUID for the platform's
/// own record. Its input for the type library therefore differs in these places, and the build patches the library
/// afterwards.
enum class Dialect { published, type_library };

/// The name that replaces GUID until the type library is patched. It has the same hash, so that the library's index of
/// names stays valid.
inline constexpr const char* guid_stand_in = "GYID";

/// The interface definition (IDL) of the type library: both classes, their interfaces with a help string per member,
/// and the published records. Generated from the interface tables; the help strings are the first sentences of the
/// members' texts.
[[nodiscard]] std::string interface_definition(Dialect dialect = Dialect::published);

/// What C calls a type of the interface; "void" for none.
/// @param array what an array of texts is called, on which the languages differ
[[nodiscard]] std::string_view automation_type(ValueType type, std::string_view array);

}  // namespace talutil
