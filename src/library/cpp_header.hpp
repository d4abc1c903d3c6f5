#pragma once

#include <string>

namespace talutil {

/// The header talutil.h, with which C++ programs are bound early: both interfaces as abstract classes whose functions
/// are in the order of the vtable, the identifiers and the record that the platform does not define. It uses nothing
/// but windows.h and the language, so that it compiles with any compiler for Windows from C++11 on. Generated from the
/// interface tables alone.
[[nodiscard]] std::string cpp_header();

}  // namespace talutil
