#include "calling/targets.hpp"

#include <algorithm>
#include <iterator>

#include "automation/run_time_error.hpp"
#include "controls/common_dialog.hpp"
#include "controls/grid.hpp"
#include "controls/zip_controls.hpp"
#include "library/c_control_position.hpp"
#include "library/identity.hpp"
#include "library/interface_table.hpp"

namespace talutil::calling {

namespace {

template <class C>
class ObjectOfClass final : public InterfaceObject {
 public:
  explicit ObjectOfClass(Library& library) : InterfaceObject(library), object_(library) {}

  [[nodiscard]] const LateInterface& members() const override { return late_interface<C>(); }
  [[nodiscard]] void* target() noexcept override { return &object_; }

 private:
  C object_;
};

template <class C>
ObjectRef make_object(Library& library) {
  return std::make_shared<ObjectOfClass<C>>(library);
}

template <class C>
ObjectRef make_control(Library& library) {
  return std::make_shared<C>(library.platform());
}

template <class C>
const LateInterface* members_of_control(Object& object) {
  return dynamic_cast<C*>(&object) == nullptr ? nullptr : &late_interface<C>();
}

const LateInterface* members_of_interface(Object& object) {
  const auto* const ours = dynamic_cast<InterfaceObject*>(&object);
  return ours == nullptr ? nullptr : &ours->members();
}

struct Maker {
  ObjectRef (*make)(Library& library);
  const LateInterface* (*members)(Object& object);
};

// In the order of identity::classes.
constexpr Maker makers[] = {
    {&make_object<ORVUtils>, &members_of_interface},
    {&make_object<cControlPosition>, &members_of_interface},
    {&make_control<Grid>, &members_of_control<Grid>},
    {&make_control<CommonDialog>, &members_of_control<CommonDialog>},
    {&make_control<ZipControl>, &members_of_control<ZipControl>},
    {&make_control<UnzipControl>, &members_of_control<UnzipControl>},
};
static_assert(std::size(makers) == std::size(identity::classes));

std::string_view short_name(const identity::Class& known) {
  std::string_view name = known.program_id;
  name.remove_prefix(identity::library_name.size() + 1);
  return name;
}

}  // namespace

Variant InterfaceObject::invoke(std::int32_t member, Access access, std::span<const Variant> arguments) {
  std::vector<Argument> given(arguments.begin(), arguments.end());
  return call(members().slot_of(member, access), given);
}

ObjectRef create(Library& library, TextView class_name) {
  for (std::size_t i = 0; i < std::size(makers); ++i) {
    const identity::Class& known = identity::classes[i];
    if (same_name(known.program_id, class_name) || same_name(short_name(known), class_name)) {
      return makers[i].make(library);
    }
  }
  return nullptr;
}

std::string names_of_classes() {
  std::string names;
  for (const identity::Class& known : identity::classes) {
    if (!names.empty()) names += ", ";
    names += short_name(known);
  }
  return names;
}

const LateInterface* members_of_object(Object& object) {
  for (const Maker& maker : makers) {
    if (const LateInterface* const members = maker.members(object)) return members;
  }
  return nullptr;
}

const Member* member_of_object(Object& object, std::int32_t identifier, Access access) {
  const LateInterface* const members = members_of_object(object);
  const std::int32_t slot = members == nullptr ? -1 : members->slot_of(identifier, access);
  return slot < 0 ? nullptr : &members->members[static_cast<std::size_t>(slot)];
}

std::optional<std::int32_t> slot_for(const LateInterface& members, TextView name, std::size_t arguments) {
  const std::int32_t first = members.find(name);
  if (first < 0) return {};
  const Member& member = members.members[static_cast<std::size_t>(first)];
  if (member.access == Access::call) return first;
  const std::int32_t put = members.slot_of(member.identifier, Access::put);
  const std::int32_t get = members.slot_of(member.identifier, Access::get);
  const auto needed = [&](std::int32_t slot) {
    return members.members[static_cast<std::size_t>(slot)].parameter_count;
  };
  if (put < 0) return arguments == 0 || arguments <= needed(get) ? get : put;
  return arguments >= needed(put) ? put : get;
}

}  // namespace talutil::calling
