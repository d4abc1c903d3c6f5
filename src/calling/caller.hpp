#pragma once

#include <string>
#include <unordered_map>

#include "automation/run_time_error.hpp"
#include "calling/request.hpp"
#include "calling/targets.hpp"

namespace talutil::calling {

/// The objects that requests have created or received, numbered from 1 in that order. Numbers are not used again.
class NumberedObjects final : public ObjectNumbers {
 public:
  [[nodiscard]] ObjectRef find(std::int32_t number) const override;
  void append(std::string& out, const ObjectRef& object) override;

  /// Gives an object a certain number, as in a recording.
  void put(std::int32_t number, ObjectRef object);

  /// Releases an object; returns false if there is no such number.
  bool release(std::int32_t number);

 private:
  std::unordered_map<std::int32_t, ObjectRef> objects_;
  std::unordered_map<const Object*, std::int32_t> numbers_;
  std::int32_t last_ = 0;
};

/// Answers calls that are written as JSON (docs/batch.md), one line each, and keeps the state from call to call. Has a
/// toolkit object, on which calls are made unless they name another. The library must outlive it.
class Caller {
 public:
  explicit Caller(Library& library);

  /// Appends the answer to a line, without a line break. Returns false if the line is no request, or names no member,
  /// class or object; the answer, which then also has the line's number, says so.
  bool answer(std::string_view line, std::size_t number, std::string& out);

  /// Objects under the numbers of a recording. An unknown class creates nothing.
  void create_as(std::int32_t number, TextView class_name);
  void release(std::int32_t number) { objects_.release(number); }
  [[nodiscard]] bool has(std::int32_t number) const { return objects_.find(number) != nullptr; }

 private:
  Variant run();
  [[nodiscard]] ObjectRef target() const;
  void put_settings(Object& target);
  Variant use(Object& target);
  void append_opening(std::string& out) const;
  void append_written_back(std::string& out);
  void append_failure(std::string& out, const RunTimeError& error);

  Library& library_;
  ObjectRef toolkit_;
  NumberedObjects objects_;
  Request request_;
  const Member* called_ = nullptr;  ///< The member whose arguments are written back; null if there is none.
};

}  // namespace talutil::calling
