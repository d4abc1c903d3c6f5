#include <array>
#include <string>

#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

constexpr std::int32_t other_type = -1;

/// A key below the current user's hive; closes itself. A key that could not be opened is used all the same: the calls
/// on it fail, and their status is the one that hosts see.
class OpenKey {
 public:
  OpenKey(Registry& registry, const Text& path, std::uint32_t access) : registry_(registry) {
    registry_.open(Registry::current_user, path, access, handle_);
  }
  OpenKey(const OpenKey&) = delete;
  OpenKey& operator=(const OpenKey&) = delete;
  ~OpenKey() { registry_.close(handle_); }

  [[nodiscard]] Registry::Handle get() const noexcept { return handle_; }

 private:
  Registry& registry_;
  Registry::Handle handle_ = 0;
};

/// Reads a value of type 1 or 4. Leaves `value` unchanged if there is no such value; sets it to Empty if it cannot be
/// read.
std::int32_t read_value(const Platform& platform, Registry::Handle key, const Text& name, Variant& value) {
  Registry& registry = platform.registry;
  std::uint32_t type = 0;
  std::uint32_t size = 0;
  std::int32_t status = registry.query(key, name, type, size, {});
  if (status != Registry::ok) return status;
  if (type == Registry::text) {
    std::string bytes(size, '\0');
    if (size > 0) status = registry.query(key, name, type, size, bytes);
    // The stored NUL is not part of the text.
    const std::string_view stored = std::string_view(bytes).substr(0, size > 0 ? size - 1 : 0);
    value = status == Registry::ok ? Variant(platform.code_page.text_of(stored)) : Variant();
    return status;
  }
  if (type != Registry::number) return other_type;
  std::array<char, sizeof(std::int32_t)> bytes{};
  status = registry.query(key, name, type, size, bytes);
  if (status != Registry::ok) return status;
  std::uint32_t number = 0;
  for (std::size_t i = 0; i < bytes.size(); ++i) {
    number |= static_cast<std::uint32_t>(static_cast<std::uint8_t>(bytes[i])) << (8 * i);
  }
  value = static_cast<std::int32_t>(number);
  return status;
}

std::string number_bytes(std::int32_t number) {
  std::string bytes;
  for (std::size_t i = 0; i < sizeof number; ++i) {
    bytes += static_cast<char>(static_cast<std::uint32_t>(number) >> (8 * i));
  }
  return bytes;
}

}  // namespace

std::int32_t ORVUtils::REGISTRY_QueryValue(const Text& sKeyName, const Text& sValueName) {
  const Platform& platform = library_.platform();
  const OpenKey key(platform.registry, sKeyName, Registry::query_value);
  Variant ignored;
  return read_value(platform, key.get(), sValueName, ignored);
}

Text ORVUtils::REGISTRY_ReturnValue(const Text& sKeyName, const Text& sValueName) {
  const Platform& platform = library_.platform();
  const OpenKey key(platform.registry, sKeyName, Registry::query_value);
  Variant value;
  const std::int32_t status = read_value(platform, key.get(), sValueName, value);
  return status == Registry::not_found ? Text() : value.to_text(locale());
}

void ORVUtils::REGISTRY_SetKeyValue(const Text& sKeyName, const Text& sValueName, const Variant& vValueSetting,
                                    const std::int32_t& lValueType) {
  Registry& registry = library_.platform().registry;
  const OpenKey key(registry, sKeyName, Registry::set_value);
  const auto type = static_cast<std::uint32_t>(lValueType);
  if (type == Registry::text) {
    const std::string bytes = library_.platform().code_page.bytes_of(vValueSetting.to_text(locale()));
    registry.set(key.get(), sValueName, type, bytes + '\0');
  } else if (type == Registry::number) {
    registry.set(key.get(), sValueName, type, number_bytes(vValueSetting.to_int32(locale())));
  }
}

void ORVUtils::REGISTRY_CreateNewKey(const Text& sNewKeyName, const std::int32_t& lPredefinedKey) {
  Registry& registry = library_.platform().registry;
  Registry::Handle key = 0;
  // Accepts any root, unlike the other three members, which are limited to the current user.
  registry.create(static_cast<std::uint32_t>(lPredefinedKey), sNewKeyName, key);
  registry.close(key);
}

}  // namespace talutil
