#include "platform/win32/win32_registry.hpp"

#include "platform/win32/handle.hpp"
#include "platform/win32/win32_code_page.hpp"

namespace talutil::win32 {

namespace {

HKEY native(Registry::Handle key) noexcept { return reinterpret_cast<HKEY>(key); }

}  // namespace

std::int32_t Win32Registry::open(Handle root, const Text& path, std::uint32_t access, Handle& key) {
  HKEY opened = nullptr;
  const LSTATUS status = RegOpenKeyExW(native(root), wide(path), 0, access, &opened);
  if (status == ERROR_SUCCESS) key = reinterpret_cast<Handle>(opened);
  return status;
}

std::int32_t Win32Registry::create(Handle root, const Text& path, Handle& key) {
  HKEY opened = nullptr;
  const LSTATUS status = RegCreateKeyExW(native(root), wide(path), 0, nullptr, REG_OPTION_NON_VOLATILE, all_but_links,
                                         nullptr, &opened, nullptr);
  if (status == ERROR_SUCCESS) key = reinterpret_cast<Handle>(opened);
  return status;
}

void Win32Registry::close(Handle key) noexcept { RegCloseKey(native(key)); }

std::int32_t Win32Registry::query(Handle key, const Text& name, std::uint32_t& type, std::uint32_t& size,
                                  std::span<char> buffer) {
  DWORD found_type = 0;
  auto found_size = static_cast<DWORD>(buffer.size());
  auto* const bytes = buffer.empty() ? nullptr : reinterpret_cast<BYTE*>(buffer.data());
  const LSTATUS status =
      RegQueryValueExA(native(key), Win32CodePage().bytes_of(name).c_str(), nullptr, &found_type, bytes, &found_size);
  type = found_type;
  size = found_size;
  return status;
}

std::int32_t Win32Registry::set(Handle key, const Text& name, std::uint32_t type, std::string_view data) {
  return RegSetValueExA(native(key), Win32CodePage().bytes_of(name).c_str(), 0, type,
                        reinterpret_cast<const BYTE*>(data.data()), static_cast<DWORD>(data.size()));
}

void Win32Network::read_address_table(std::span<std::uint8_t> buffer) {
  // Few hosts need this, and the library is slow to load.
  using Function = DWORD(WINAPI*)(void*, ULONG*, BOOL);
  const auto get = late_function<Function>(L"iphlpapi.dll", "GetIpAddrTable");
  auto size = static_cast<ULONG>(buffer.size());
  if (get != nullptr) get(buffer.data(), &size, TRUE);
}

}  // namespace talutil::win32
