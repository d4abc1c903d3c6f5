#pragma once

#include "com/com_object.hpp"
#include "library/c_control_position.hpp"
#include "library/identity.hpp"
#include "library/interface_table.hpp"

/// The classes that hosts create.
namespace talutil::com {

template <>
struct ClassTraits<ORVUtils> {
  static constexpr GUID class_id = guid_of(identity::orv_utils_class);
  static constexpr GUID interface_id = guid_of(identity::orv_utils_interface);
};

template <>
struct ClassTraits<cControlPosition> {
  static constexpr GUID class_id = guid_of(identity::control_position_class);
  static constexpr GUID interface_id = guid_of(identity::control_position_interface);
};

}  // namespace talutil::com
