#pragma once

#include <cstdint>
#include <initializer_list>
#include <memory>
#include <optional>
#include <span>

#include "automation/locale.hpp"
#include "automation/text.hpp"

namespace talutil {

class Variant;

/// How a member of an object is used: `call` runs a method as a statement; `get` reads a value, from a property or a
/// function (a late-bound caller cannot know which); `put` sets a property.
enum class Access : std::uint8_t { call, get, put };

/// The dispatch identifier of an object's default member.
constexpr std::int32_t default_member = 0;

/// A use of a member that is repeated with different numbers as arguments, as in a loop over the rows of a grid.
/// Results of `run_text` are valid until the next use.
class RepeatedUse {
 public:
  virtual ~RepeatedUse() = default;

  /// Replaces an argument, counted from 0, by a number.
  virtual void set(std::size_t argument, std::int32_t value) = 0;

  /// Uses the member as Object::invoke does.
  virtual Variant run() = 0;

  /// The same with the result as a text or a truth value; these raise the errors of Variant's conversions.
  virtual TextView run_text(const Locale& locale) = 0;
  virtual bool run_truth(const Locale& locale) = 0;
};

/// A late-bound automation object: one of our controls, or one of the host's. Members are identified by name or
/// dispatch identifier.
class Object {
 public:
  Object() = default;
  Object(const Object&) = delete;
  Object& operator=(const Object&) = delete;
  virtual ~Object() = default;

  /// The dispatch identifier of a member, ignoring case. Raises 438 if there is none.
  [[nodiscard]] virtual std::int32_t member_id(TextView name) = 0;

  /// The same, but returns nothing if there is none. Override this if it is possible without an exception.
  [[nodiscard]] virtual std::optional<std::int32_t> find_member(TextView name);

  /// Uses a member. For a put, the value is the last argument. Raises 438 if the object has no such member.
  virtual Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) = 0;

  /// Prepares a repeated use. The object must outlive it.
  [[nodiscard]] virtual std::unique_ptr<RepeatedUse> repeat(std::int32_t member, Access access,
                                                            std::span<const Variant> arguments);
};

using ObjectRef = std::shared_ptr<Object>;

}  // namespace talutil
