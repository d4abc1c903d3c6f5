#include "calling/caller.hpp"

#include <algorithm>

#include "calling/call_record.hpp"
#include "calling/json_writer.hpp"
#include "library/identity.hpp"

namespace talutil::calling {

namespace {

/// Ends a line that asks for something that does not exist.
class Refusal : public std::runtime_error {
 public:
  Refusal(ErrorNumber number, const std::string& message) : std::runtime_error(message), number_(number) {}
  [[nodiscard]] ErrorNumber number() const noexcept { return number_; }

 private:
  ErrorNumber number_;
};

Refusal no_member(TextView name) {
  return {ErrorNumber::member_not_supported,
          "the object has no member \"" + to_utf8(name) + "\"; \"talutil list\" lists those of the toolkit"};
}

Refusal no_object(std::int32_t number) {
  return {ErrorNumber::object_required,
          "there is no object " + std::to_string(number) + "; \"create\" makes one and answers its number"};
}

/// Uses a control's member. Settings that a control only stores are not in its table.
Variant use_control(Object& control, TextView name, std::span<const Variant> arguments) {
  const LateInterface* const members = members_of_object(control);
  if (const auto slot = members == nullptr ? std::nullopt : slot_for(*members, name, arguments.size())) {
    if (*slot < 0) raise(ErrorNumber::member_not_supported);
    const Member& member = members->members[static_cast<std::size_t>(*slot)];
    return control.invoke(member.identifier, member.access, arguments);
  }
  const auto member = control.find_member(name);
  if (!member) throw no_member(name);
  return control.invoke(*member, arguments.empty() ? Access::get : Access::put, arguments);
}

}  // namespace

ObjectRef NumberedObjects::find(std::int32_t number) const {
  const auto found = objects_.find(number);
  return found == objects_.end() ? nullptr : found->second;
}

void NumberedObjects::append(std::string& out, const ObjectRef& object) {
  const auto [known, is_new] = numbers_.try_emplace(object.get(), last_ + 1);
  if (is_new) objects_.emplace(++last_, object);
  out += "{\"object\": ";
  append_number(out, known->second);
  out += '}';
}

void NumberedObjects::put(std::int32_t number, ObjectRef object) {
  release(number);
  numbers_.emplace(object.get(), number);
  objects_.emplace(number, std::move(object));
  last_ = std::max(last_, number);
}

bool NumberedObjects::release(std::int32_t number) {
  const auto found = objects_.find(number);
  if (found == objects_.end()) return false;
  numbers_.erase(found->second.get());
  objects_.erase(found);
  return true;
}

Caller::Caller(Library& library)
    : library_(library), toolkit_(create(library, from_utf8(identity::classes[0].program_id))) {}

bool Caller::answer(std::string_view line, std::size_t number, std::string& out) {
  const std::size_t start = out.size();
  const auto refuse = [&](ErrorNumber error, const char* message) {
    out.resize(start);
    append_opening(out);
    append_error(out,
                 RunTimeError(static_cast<std::int32_t>(error), from_utf8(message), ErrorOrigin{u"talutil", {}, 0}));
    out.pop_back();
    out += ", \"line\": ";
    append_number(out, number);
    out += "}}";
    return false;
  };
  called_ = nullptr;
  request_.clear();
  try {
    JsonReader json(line);
    read_request(json, objects_, library_.locale(), request_);
    const Variant result = run();
    append_opening(out);
    out += "\"result\": ";
    append_declared(out, called_ == nullptr ? ValueType::none : called_->result, result, objects_);
    append_written_back(out);
    out += '}';
  } catch (const JsonError& error) {
    return refuse(ErrorNumber::invalid_procedure_call, error.what());
  } catch (const Refusal& refusal) {
    return refuse(refusal.number(), refusal.what());
  } catch (...) {
    out.resize(start);
    append_failure(out, current_error());
  }
  return true;
}

void Caller::create_as(std::int32_t number, TextView class_name) {
  if (ObjectRef object = create(library_, class_name)) objects_.put(number, std::move(object));
}

ObjectRef Caller::target() const {
  if (!request_.on) return toolkit_;
  ObjectRef object = objects_.find(*request_.on);
  if (object == nullptr) throw no_object(*request_.on);
  return object;
}

Variant Caller::run() {
  if (request_.create) {
    ObjectRef object = create(library_, *request_.create);
    if (object == nullptr) {
      throw Refusal(ErrorNumber::cannot_create_object,
                    "there is no class \"" + to_utf8(*request_.create) + "\"; there are " + names_of_classes());
    }
    put_settings(*object);
    return object;
  }
  if (request_.release) {
    if (!objects_.release(*request_.release)) throw no_object(*request_.release);
    return {};
  }
  // Kept during the call, in which a callback may release it.
  const ObjectRef object = target();
  put_settings(*object);
  return request_.call ? use(*object) : Variant();
}

void Caller::put_settings(Object& target) {
  for (const auto& [name, value] : request_.settings) {
    const auto member = target.find_member(name);
    if (!member) throw no_member(name);
    target.invoke(*member, Access::put, {&value, 1});
  }
}

Variant Caller::use(Object& target) {
  const Text& name = *request_.call;
  auto* const ours = dynamic_cast<InterfaceObject*>(&target);
  if (ours == nullptr) {
    std::vector<Variant> arguments;
    for (Argument& argument : request_.arguments) arguments.push_back(std::move(argument.value));
    return use_control(target, name, arguments);
  }
  const auto slot = slot_for(ours->members(), name, request_.arguments.size());
  if (!slot) throw no_member(name);
  if (*slot >= 0) called_ = &ours->members().members[static_cast<std::size_t>(*slot)];
  return ours->call(*slot, request_.arguments);
}

/// The start of an answer: the request's identifier, if it has one.
void Caller::append_opening(std::string& out) const {
  out += '{';
  if (request_.id.empty()) return;
  out += "\"id\": ";
  out += request_.id;
  out += ", ";
}

void Caller::append_written_back(std::string& out) {
  if (called_ != nullptr) calling::append_written_back(out, *called_, request_.arguments, objects_);
}

void Caller::append_failure(std::string& out, const RunTimeError& error) {
  append_opening(out);
  append_error(out, error);
  append_written_back(out);
  out += '}';
}

}  // namespace talutil::calling
