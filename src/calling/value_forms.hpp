#pragma once

#include <cstdint>
#include <string>

#include "automation/late_call.hpp"
#include "calling/json_reader.hpp"

/// Values in JSON, so that none loses anything: docs/batch.md describes the forms.
namespace talutil::calling {

/// The objects in a stream of calls, which refer to them by number.
class ObjectNumbers {
 public:
  virtual ~ObjectNumbers() = default;

  /// The object of a number; null if there is none.
  [[nodiscard]] virtual ObjectRef find(std::int32_t number) const = 0;

  /// Appends the form of an object that is not null, such as {"object": 1}.
  virtual void append(std::string& out, const ObjectRef& object) = 0;
};

/// Ends the reading of a value that a recording does not contain: {"masked": true} and {"host_object": 1}. The message
/// says which of these it was.
class UnavailableValue : public JsonError {
 public:
  using JsonError::JsonError;
};

void append_value(std::string& out, const Variant& value, ObjectNumbers& objects);

/// The same for a value whose type the interface declares: an Integer or a Single of that type is a plain number.
void append_declared(std::string& out, ValueType declared, const Variant& value, ObjectNumbers& objects);

/// Reads a value. Fails with JsonError for an unknown form and for a value that its type cannot hold. The elements of a
/// list become texts using the locale; raises the errors of that.
[[nodiscard]] Variant read_value(JsonReader& json, const ObjectNumbers& objects, const Locale& locale);

/// The same for the next argument of a call, which may also be {"same": 0}: the variable of an earlier argument.
void read_argument(JsonReader& json, const ObjectNumbers& objects, const Locale& locale,
                   std::vector<Argument>& arguments);

}  // namespace talutil::calling
