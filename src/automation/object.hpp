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

/// How a member of an object is used: `call` runs a method as a statement, `get` asks for a value, which may be a
/// property's or a function's answer (a caller that is bound late cannot know which), `put` gives a property its value.
enum class Access : std::uint8_t { call, get, put };

/// The dispatch identifier of an object's default member.
constexpr std::int32_t default_member = 0;

/// One use of a member, made over and over with another number in the place of an argument: what a loop over the rows
/// of a grid does. The answers of `run_text` hold until the next use.
class RepeatedUse {
 public:
  virtual ~RepeatedUse() = default;

  /// Puts a number in the place of an argument, counted from 0.
  virtual void set(std::size_t argument, std::int32_t value) = 0;

  /// Uses the member, as Object::invoke does.
  virtual Variant run() = 0;

  /// The same with the answer as a text, or as a truth; these raise what the conversions of Variant raise.
  virtual TextView run_text(const Locale& locale) = 0;
  virtual bool run_truth(const Locale& locale) = 0;
};

/// A late-bound automation object: one of our controls, or one of the host's. Members are named or given by
/// dispatch identifier.
class Object {
 public:
  Object() = default;
  Object(const Object&) = delete;
  Object& operator=(const Object&) = delete;
  virtual ~Object() = default;

  /// The dispatch identifier of a member, names compared without case. Raises 438 when there is none.
  [[nodiscard]] virtual std::int32_t member_id(TextView name) = 0;

  /// The same without an error, empty when there is none. Objects that can tell without raising one override it.
  [[nodiscard]] virtual std::optional<std::int32_t> find_member(TextView name);

  /// Uses a member. For a put the last argument is the value. Raises 438 when the object has no such member.
  virtual Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) = 0;

  /// The same use many times. The object must outlive it.
  [[nodiscard]] virtual std::unique_ptr<RepeatedUse> repeat(std::int32_t member, Access access,
                                                            std::span<const Variant> arguments);
};

using ObjectRef = std::shared_ptr<Object>;

}  // namespace talutil
