#include "platform/win32/windows_version.hpp"

#include "automation/numbers.hpp"

namespace talutil::win32 {

Text windows_name(const RegisteredVersion& registered) {
  constexpr TextView ten = u"Windows 10";
  constexpr double first_build_of_eleven = 22000;
  Text name = registered.product;
  if (name.starts_with(ten) && leading_number(registered.build) >= first_build_of_eleven) {
    name.replace(0, ten.size(), u"Windows 11");
  }
  return name;
}

Text windows_version(const RegisteredVersion& registered) {
  Text version = registered.version;
  if (registered.major > 0) version = number_to_text(registered.major) + u'.' + number_to_text(registered.minor);
  if (!registered.build.empty()) version += u", build " + registered.build;
  if (!registered.build.empty() && registered.revision > 0) version += u'.' + number_to_text(registered.revision);
  if (!registered.release.empty()) version += u", version " + registered.release;
  if (!registered.service_pack.empty()) version += u", " + registered.service_pack;
  return version;
}

}  // namespace talutil::win32
