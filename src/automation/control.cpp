#include "automation/control.hpp"

#include <algorithm>
#include <array>

#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

ObjectRef object_in(const Variant& holder) {
  const auto* const object = holder.get_if<ObjectRef>();
  if (object == nullptr) raise(ErrorNumber::object_required);
  return *object;
}

/// Calls Object::invoke each time.
class PlainRepeatedUse final : public RepeatedUse {
 public:
  PlainRepeatedUse(Object& object, std::int32_t member, Access access, std::span<const Variant> arguments)
      : object_(object), member_(member), access_(access), arguments_(arguments.begin(), arguments.end()) {}

  void set(std::size_t argument, std::int32_t value) override { arguments_.at(argument) = value; }
  Variant run() override { return object_.invoke(member_, access_, arguments_); }
  TextView run_text(const Locale& locale) override {
    answer_ = run();
    if (!answer_.is(Variant::Kind::text)) answer_ = answer_.to_text(locale);
    return *answer_.get_if<Text>();
  }
  bool run_truth(const Locale& locale) override { return bool(run().to_boolean(locale)); }

 private:
  Object& object_;
  std::int32_t member_;
  Access access_;
  std::vector<Variant> arguments_;
  Variant answer_;
};

}  // namespace

std::optional<std::int32_t> Object::find_member(TextView name) {
  try {
    return member_id(name);
  } catch (const RunTimeError&) {
    return {};
  }
}

std::unique_ptr<RepeatedUse> Object::repeat(std::int32_t member, Access access, std::span<const Variant> arguments) {
  return std::make_unique<PlainRepeatedUse>(*this, member, access, arguments);
}

Control::Control(const Variant& holder, const Locale& locale) : Control(object_in(holder), locale) {}

Control::Control(ObjectRef object, const Locale& locale) : object_(std::move(object)), locale_(locale) {
  if (!object_) raise(ErrorNumber::object_variable_not_set);
}

const Control::Known* Control::find_known(TextView member) const noexcept {
  // A member uses few names, so a linear search costs less than hashing.
  const auto known = std::ranges::find(known_, member, &Known::name);
  return known == known_.end() ? nullptr : &*known;
}

std::int32_t Control::identifier_of(TextView member) const {
  if (const Known* const known = find_known(member)) return known->identifier;
  const std::int32_t identifier = object_->member_id(member);
  known_.push_back({Text(member), identifier});
  return identifier;
}

bool Control::answers(TextView member) const {
  if (find_known(member) != nullptr) return true;
  const auto identifier = object_->find_member(member);
  if (identifier) known_.push_back({Text(member), *identifier});
  return identifier.has_value();
}

void Control::put(TextView member, std::initializer_list<Variant> indexes, Variant value) const {
  constexpr std::size_t most_indexes = 4;
  if (indexes.size() > most_indexes) raise(ErrorNumber::wrong_argument_count);
  std::array<Variant, most_indexes + 1> arguments;
  *std::ranges::copy(indexes, arguments.begin()).out = std::move(value);
  object_->invoke(identifier_of(member), Access::put, std::span(arguments).first(indexes.size() + 1));
}

std::unique_ptr<RepeatedUse> Control::repeated_get(TextView member, std::initializer_list<Variant> indexes) const {
  return object_->repeat(identifier_of(member), Access::get, {indexes.begin(), indexes.size()});
}

std::unique_ptr<RepeatedUse> Control::repeated_put(TextView member, std::initializer_list<Variant> arguments) const {
  return object_->repeat(identifier_of(member), Access::put, {arguments.begin(), arguments.size()});
}

void Control::put(std::int32_t member, Variant value) const { object_->invoke(member, Access::put, {&value, 1}); }

Variant Control::call(TextView member, std::initializer_list<Variant> arguments) const {
  return object_->invoke(identifier_of(member), Access::call, {arguments.begin(), arguments.size()});
}

}  // namespace talutil
