#pragma once

#include <functional>
#include <memory>
#include <vector>

#include "automation/numbers.hpp"
#include "tests/platform/native_platform.hpp"

/// The platform's own parts, for the tests that hold for both platforms.
namespace talutil::testing {

[[nodiscard]] NativePlatform& real_platform();
[[nodiscard]] inline Files* real_files() { return &real_platform().files; }
[[nodiscard]] inline Folders* real_folders() { return &real_platform().folders; }
[[nodiscard]] CodePage* real_code_page(std::uint32_t number);

/// Without the user's key "Software\TALUtil\Test".
[[nodiscard]] Registry* real_registry();

/// The addresses of this machine by another function of the system, in ascending order.
[[nodiscard]] std::vector<Text> machine_addresses();

/// Four bytes as an address is written.
[[nodiscard]] inline Text address_at(const std::uint8_t* bytes) {
  Text address = number_to_text(std::int32_t{bytes[0]});
  for (int i = 1; i < 4; ++i) address += u'.' + number_to_text(std::int32_t{bytes[i]});
  return address;
}

/// Calls with what local time is ahead of UTC today, in seconds: of each zone that the process can be put in.
void for_each_zone(const std::function<void(std::int64_t seconds)>& use);

/// An empty folder of this run's own, with a separator at its end, on a drive.
[[nodiscard]] Text scratch_folder();

/// A new empty file that the platform holds for hidden, and its path.
Text make_hidden_file(const Text& folder);

void set_read_only(const Text& path, bool read_only);

/// Keeps others from opening a file as long as the result lives.
[[nodiscard]] std::shared_ptr<void> lock_file(const Text& path);

/// The whole of a file, which is put in place at once, or which was there.
inline void write_bytes(const Text& path, std::string_view bytes) {
  const auto file = real_files()->open_output(path);
  file->write(bytes);
  file->close();
}

inline std::string read_bytes(const Text& path) {
  const auto file = real_files()->open_input(path);
  std::string bytes;
  char buffer[5];
  while (const std::size_t count = file->read(buffer)) bytes.append(buffer, count);
  return bytes;
}

}  // namespace talutil::testing
