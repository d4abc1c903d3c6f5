#pragma once

#include "automation/late_call.hpp"
#include "library/library.hpp"

/// What calls are made on: objects of the classes that hosts create, and their members by name.
namespace talutil::calling {

/// An object of a class in the type library: unlike controls, its members write arguments back.
class InterfaceObject : public Object {
 public:
  [[nodiscard]] virtual const LateInterface& members() const = 0;
  [[nodiscard]] virtual void* target() noexcept = 0;

  std::int32_t member_id(TextView name) override { return members().identifier_of(name); }
  std::optional<std::int32_t> find_member(TextView name) override { return members().find_identifier(name); }
  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override;

  Variant call(std::int32_t slot, std::span<Argument> arguments) {
    return members().call(target(), slot, arguments, library_.locale());
  }

 protected:
  explicit InterfaceObject(Library& library) noexcept : library_(library) {}

 private:
  Library& library_;
};

/// Creates an object of a class in identity::classes, named with or without "TALUtil." and in any case. Null for
/// another name. The library must outlive it.
[[nodiscard]] ObjectRef create(Library& library, TextView class_name);

/// The names of the classes, for messages: "ORVUtils, cControlPosition, ...".
[[nodiscard]] std::string names_of_classes();

/// The members of an object of one of these classes; null for another.
[[nodiscard]] const LateInterface* members_of_object(Object& object);

/// The member that such an object's identifier and access lead to; null if there is none, or for another object.
[[nodiscard]] const Member* member_of_object(Object& object, std::int32_t identifier, Access access);

/// The slot that a call with this number of arguments uses: a property with fewer arguments than its value needs is
/// read, otherwise put. -1 if the property allows only the other, nothing for an unknown name.
[[nodiscard]] std::optional<std::int32_t> slot_for(const LateInterface& members, TextView name, std::size_t arguments);

}  // namespace talutil::calling
