#include "platform/win32/win32_password_boxes.hpp"

namespace talutil::win32 {

// The box itself is not built yet: every question is cancelled.
std::optional<Text> Win32PasswordBoxes::ask(TextView /*prompt*/, TextView /*title*/) { return std::nullopt; }

}  // namespace talutil::win32
