// Checks the registry outside Windows against a model, and damaged hives: registry_fuzz -max_len=512 -runs=100000
#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>

#include "automation/run_time_error.hpp"
#include "fuzz/input.hpp"
#include "platform/posix/posix_registry.hpp"

namespace talutil {
namespace {

using fuzz::require;
using posix::Hive;

struct Value {
  std::uint32_t type;
  std::string bytes;
};

/// Keys and values by their names in capitals.
using Model = std::map<Text, std::map<Text, Value>>;

Text folded(TextView name) { return upper_case(up_to_nul(name)); }

/// What reading gives back: texts end with one NUL.
std::string as_read(std::uint32_t type, std::string bytes) {
  if (type == Registry::text && !bytes.ends_with('\0')) bytes += '\0';
  return bytes;
}

bool is_there(const Model& model, const Text& key) {
  return key.empty() || std::ranges::any_of(model, [&](const auto& each) {
           return each.first == key || each.first.starts_with(key + u"\\");
         });
}

void check_value(Registry& registry, Registry::Handle key, const Text& name, const Value* expected) {
  std::uint32_t type = 0;
  std::uint32_t size = 0;
  const auto status = registry.query(key, name, type, size, {});
  require(status == (expected == nullptr ? Registry::not_found : Registry::ok), "a value is there or not");
  if (expected == nullptr) return;
  std::string buffer(size, 'x');
  require(type == expected->type && size == expected->bytes.size(), "type and size");
  if (size > 1) {
    require(registry.query(key, name, type, size, std::span(buffer).first(size - 1)) == Registry::more_data, "short");
  }
  require(registry.query(key, name, type, size, buffer) == Registry::ok && buffer == expected->bytes, "the bytes");
}

void check_model(fuzz::Input input) {
  Hive hive(":memory:");
  WesternCodePage page;
  posix::PosixRegistry registry(hive, page);
  Model model;
  for (int left = 8; left > 0; --left) {
    Text path = input.text(6);
    if (path.starts_with(u'\0')) path.clear();
    const Text name = input.text(4);
    const std::uint32_t type = 1 + input.byte() % 4;
    const std::string bytes = to_ansi(input.text(20));
    Text key = folded(path);
    while (key.ends_with(u'\\')) key.pop_back();
    Registry::Handle handle = 0;
    const bool is_writing = input.byte() % 2 == 0;
    const auto status = is_writing ? registry.create(Registry::current_user, path, handle)
                                   : registry.open(Registry::current_user, path, Registry::query_value, handle);
    require(status == (is_writing || is_there(model, key) ? Registry::ok : Registry::not_found), "a key is there");
    if (status != Registry::ok) continue;
    auto& values = model[key];
    if (is_writing) {
      require(registry.set(handle, name, type, bytes) == Registry::ok, "a value is set");
      values[folded(name)] = {type, as_read(type, bytes)};
    }
    const auto found = values.find(folded(name));
    check_value(registry, handle, name, found == values.end() ? nullptr : &found->second);
    registry.close(handle);
  }
}

std::string file_bytes(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

/// A hive in which bytes are changed, and which may be cut off, fails with its one error or answers.
void check_damaged(std::string_view changes) {
  static const std::string path = (std::filesystem::temp_directory_path() / "talutil-fuzz-XXXXXX").string();
  static const std::string folder = [] {
    std::string made = path;
    require(mkdtemp(made.data()) != nullptr, "a folder is made");
    return made;
  }();
  static const std::string sound = [] {
    {
      Hive hive(folder + "/sound.db");
      hive.add_key(u"HKEY_CURRENT_USER\\A");
      for (const TextView name : {u"a", u"b", u"c"}) hive.put(u"HKEY_CURRENT_USER\\A", name, {1, std::string(90, 'v')});
    }
    std::string bytes = file_bytes(folder + "/sound.db");
    std::filesystem::remove(folder + "/sound.db");
    return bytes;
  }();
  std::string bytes = sound;
  for (; changes.size() >= 3; changes.remove_prefix(3)) {
    const auto at = static_cast<std::uint8_t>(changes[0]) << 8 | static_cast<std::uint8_t>(changes[1]);
    bytes[static_cast<std::size_t>(at) % bytes.size()] = changes[2];
  }
  if (!changes.empty()) bytes.resize(bytes.size() * static_cast<std::uint8_t>(changes[0]) / 255);
  const std::string damaged = folder + "/damaged.db";
  std::ofstream(damaged, std::ios::binary) << bytes;
  try {
    Hive hive(damaged);
    (void)hive.value(u"HKEY_CURRENT_USER\\A", u"b");
    (void)hive.has_key(u"HKEY_CURRENT_USER\\B");
    (void)hive.values_below(u"HKEY_CURRENT_USER");
    hive.put(u"HKEY_CURRENT_USER\\A", u"d", {1, "x"});
  } catch (const RunTimeError& error) {
    require(error.number() == 57, "the one error");
  }
  for (const char* const end : {"", "-wal", "-shm", "-journal"}) std::filesystem::remove(damaged + end);
}

void check(fuzz::Input input) {
  const bool is_about_damage = input.byte() % 4 == 0;
  is_about_damage ? check_damaged(input.rest()) : check_model(input);
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace std::string_view_literals;
  talutil::check({data, size, u"aA\\\\b\0\u00E9\u00C9"sv});
  return 0;
}
