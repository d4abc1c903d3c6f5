#pragma once

#include <cstdint>
#include <initializer_list>
#include <variant>

struct talutil_library;

/// What the generated functions of the C library share.
namespace talutil::capi {

/// An argument as C passes it.
using Given = std::variant<const char*, std::int16_t, std::int32_t, float, bool>;

/// Where a value goes; nowhere for a null pointer, or without any.
using Place = std::variant<std::monostate, char**, std::int16_t*, std::int32_t*, float*, bool*>;

/// Where an argument's value goes after the call.
struct After {
  std::size_t argument;
  Place place;
};

/// Calls a slot of the toolkit. Returns 0, or the number of the run-time error, whose description the handle keeps.
std::int32_t call(talutil_library* library, std::int32_t slot, std::initializer_list<Given> given,
                  std::initializer_list<After> written_back = {}, Place result = {}) noexcept;

}  // namespace talutil::capi
