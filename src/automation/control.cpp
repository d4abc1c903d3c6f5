#include "automation/run_time_error.hpp"
#include "automation/variant.hpp"

namespace talutil {

namespace {

ObjectRef object_in(const Variant& holder) {
  const auto* const object = holder.get_if<ObjectRef>();
  if (object == nullptr) raise(ErrorNumber::object_required);
  return *object;
}

void put_member(Object& object, std::int32_t member, std::initializer_list<Variant> indexes, const Variant& value) {
  std::vector<Variant> arguments(indexes);
  arguments.push_back(value);
  object.invoke(member, Access::put, arguments);
}

}  // namespace

Control::Control(const Variant& holder) : Control(object_in(holder)) {}

Control::Control(ObjectRef object) : object_(std::move(object)) {
  if (!object_) raise(ErrorNumber::object_variable_not_set);
}

template <>
Variant Control::get(std::int32_t member, std::initializer_list<Variant> indexes) const {
  return object_->invoke(member, Access::get, std::span(indexes.begin(), indexes.size()));
}

template <>
Text Control::get(std::int32_t member, std::initializer_list<Variant> indexes) const {
  return get<Variant>(member, indexes).to_text();
}

template <>
std::int16_t Control::get(std::int32_t member, std::initializer_list<Variant> indexes) const {
  return get<Variant>(member, indexes).to_int16();
}

template <>
std::int32_t Control::get(std::int32_t member, std::initializer_list<Variant> indexes) const {
  return get<Variant>(member, indexes).to_int32();
}

template <>
double Control::get(std::int32_t member, std::initializer_list<Variant> indexes) const {
  return get<Variant>(member, indexes).to_double();
}

void Control::put(TextView member, std::initializer_list<Variant> indexes, const Variant& value) const {
  put_member(*object_, object_->member_id(member), indexes, value);
}

void Control::put(std::int32_t member, const Variant& value) const { put_member(*object_, member, {}, value); }

Variant Control::call(TextView member, std::initializer_list<Variant> arguments) const {
  const std::int32_t identifier = object_->member_id(member);
  return object_->invoke(identifier, Access::call, std::span(arguments.begin(), arguments.size()));
}

}  // namespace talutil
