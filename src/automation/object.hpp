#pragma once

#include <cstdint>
#include <initializer_list>
#include <memory>
#include <span>

#include "automation/text.hpp"

namespace talutil {

class Variant;

/// How a member of an object is used.
enum class Access : std::uint8_t { call, get, put };

/// The dispatch identifier of an object's default member.
constexpr std::int32_t default_member = 0;

/// A late-bound automation object: a control of ours, or one of the host's. Members are named or given by
/// dispatch identifier.
class Object {
 public:
  Object() = default;
  Object(const Object&) = delete;
  Object& operator=(const Object&) = delete;
  virtual ~Object() = default;

  /// The dispatch identifier of a member, names compared without case. Raises 438 when there is none.
  [[nodiscard]] virtual std::int32_t member_id(TextView name) = 0;

  /// Uses a member. For a put the last argument is the value. Raises 438 when the object has no such member.
  virtual Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) = 0;
};

using ObjectRef = std::shared_ptr<Object>;

}  // namespace talutil
