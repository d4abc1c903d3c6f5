#include "platform/posix/posix_registry.hpp"

#include <algorithm>
#include <array>

#include "automation/run_time_error.hpp"

namespace talutil::posix {

namespace {

struct Root {
  Registry::Handle handle;
  TextView name;
};

constexpr std::array<Root, 4> roots = {{
    {0x80000000, u"HKEY_CLASSES_ROOT"},
    {Registry::current_user, u"HKEY_CURRENT_USER"},
    {0x80000002, u"HKEY_LOCAL_MACHINE"},
    {0x80000003, u"HKEY_USERS"},
}};

/// The full name of a key, without separators at either end; empty for an unknown root.
Text full_name(Registry::Handle root, TextView path) {
  const auto* const found = std::ranges::find(roots, root, &Root::handle);
  if (found == roots.end()) return {};
  Text name(found->name);
  path = up_to_nul(path);
  while (path.ends_with(u'\\')) path.remove_suffix(1);
  return path.empty() ? name : name + u"\\" + Text(path);
}

/// The status of some work on the hive, whose own failures raise errors.
template <class Work>
std::int32_t status_of(Work work) {
  try {
    return work();
  } catch (const RunTimeError&) {
    return PosixRegistry::unavailable;
  }
}

}  // namespace

Registry::Handle PosixRegistry::add(Text path) {
  opened_.emplace(next_, std::move(path));
  return next_++;
}

std::int32_t PosixRegistry::open(Handle root, const Text& path, std::uint32_t /*access*/, Handle& key) {
  Text name = full_name(root, path);
  if (name.empty()) return invalid_handle;
  return status_of([&] {
    const bool is_root = name.find(u'\\') == Text::npos;
    if (!is_root && !hive_.has_key(name)) return not_found;
    key = add(std::move(name));
    return ok;
  });
}

std::int32_t PosixRegistry::create(Handle root, const Text& path, Handle& key) {
  Text name = full_name(root, path);
  if (name.empty()) return invalid_handle;
  return status_of([&] {
    hive_.add_key(name);
    key = add(std::move(name));
    return ok;
  });
}

void PosixRegistry::close(Handle key) noexcept { opened_.erase(key); }

std::int32_t PosixRegistry::query(Handle key, const Text& name, std::uint32_t& type, std::uint32_t& size,
                                  std::span<char> buffer) {
  const auto path = opened_.find(key);
  if (path == opened_.end()) return invalid_handle;
  return status_of([&] {
    const auto value = hive_.value(path->second, up_to_nul(name));
    if (!value) return not_found;
    const bool is_text = value->type == text;
    const std::string bytes = is_text ? code_page_.bytes_of(from_utf16_bytes(value->data)) + '\0' : value->data;
    type = value->type;
    size = static_cast<std::uint32_t>(bytes.size());
    if (buffer.empty()) return ok;
    if (buffer.size() < bytes.size()) return more_data;
    std::ranges::copy(bytes, buffer.begin());
    return ok;
  });
}

std::int32_t PosixRegistry::set(Handle key, const Text& name, std::uint32_t type, std::string_view data) {
  const auto path = opened_.find(key);
  if (path == opened_.end()) return invalid_handle;
  Hive::Value value{type, std::string(data)};
  if (type == text) {
    // The last NUL ends the text; others are part of it.
    if (data.ends_with('\0')) data.remove_suffix(1);
    value.data = to_utf16_bytes(code_page_.text_of(data));
  }
  return status_of([&] {
    hive_.put(path->second, up_to_nul(name), value);
    return ok;
  });
}

}  // namespace talutil::posix
