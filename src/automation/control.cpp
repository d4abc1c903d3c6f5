#include <algorithm>
#include <array>

#include "automation/run_time_error.hpp"
#include "automation/variant.hpp"

namespace talutil {

namespace {

ObjectRef object_in(const Variant& holder) {
  const auto* const object = holder.get_if<ObjectRef>();
  if (object == nullptr) raise(ErrorNumber::object_required);
  return *object;
}

}  // namespace

Control::Control(const Variant& holder) : Control(object_in(holder)) {}

Control::Control(ObjectRef object) : object_(std::move(object)) {
  if (!object_) raise(ErrorNumber::object_variable_not_set);
}

std::int32_t Control::identifier_of(TextView member) const {
  // A member uses few names, so that a search costs less than a hash.
  const auto known = std::ranges::find_if(known_, [&](const Known& entry) { return entry.name == member; });
  if (known != known_.end()) return known->identifier;
  const std::int32_t identifier = object_->member_id(member);
  known_.push_back({Text(member), identifier});
  return identifier;
}

bool Control::answers(TextView member) const {
  try {
    static_cast<void>(identifier_of(member));
    return true;
  } catch (const RunTimeError&) {
    return false;
  }
}

void Control::put(TextView member, std::initializer_list<Variant> indexes, Variant value) const {
  constexpr std::size_t most_indexes = 4;
  if (indexes.size() > most_indexes) raise(ErrorNumber::wrong_argument_count);
  std::array<Variant, most_indexes + 1> arguments;
  *std::ranges::copy(indexes, arguments.begin()).out = std::move(value);
  object_->invoke(identifier_of(member), Access::put, std::span(arguments).first(indexes.size() + 1));
}

void Control::put(std::int32_t member, Variant value) const { object_->invoke(member, Access::put, {&value, 1}); }

Variant Control::call(TextView member, std::initializer_list<Variant> arguments) const {
  return object_->invoke(identifier_of(member), Access::call, {arguments.begin(), arguments.size()});
}

}  // namespace talutil
