// Profile files, settings, the registry and addresses as both platforms have them.
#include <algorithm>

#include "platform/profile_document.hpp"
#include "tests/fakes/rows.hpp"
#include "tests/platform/real_platform.hpp"

namespace talutil::testing {
namespace {

/// Lines as people, programs and damage leave them. Deliberately not met: names that differ in the case of letters
/// beyond ASCII (the same for us, and for later versions of the platform), names that begin with a semicolon (comments
/// for us), and line breaks within arguments.
struct ProfileGenerator : Generator {
  using Choices = std::initializer_list<std::string_view>;

  std::string pick(Choices choices) { return std::string(one_of(std::vector(choices))); }
  std::string section() { return pick({"a", "A", "s p", "b]", "\xE9"}); }
  std::string item() { return pick({"x", "X", "y z", "\"q\"", "\xE9", "[k"}); }
  std::string margin() { return pick({"", "", "", " ", "\t ", "\x1A"}); }
  std::string value() {
    if (whole(0, 39) == 0) return std::string(static_cast<std::size_t>(whole(1018, 1027)), 'v');
    return pick({"", "1", "two words", "\"q\"", "'q'", "\"", "'a\"", "\" b \"", "a=b", "\x80\x9F;c", "\\\\s"});
  }

  std::string file() {
    std::string text;
    for (int lines = whole(0, 13); lines > 0; --lines) {
      const int kind = whole(0, 7);
      text += margin();
      if (kind < 2)
        text += "[" + margin() + section() + margin() + pick({"]", "]", "] x", ""});
      else if (kind == 2)
        text += pick({"; x=1", ";", "novalue", "x", "]"});
      else
        text += item() + margin() + "=" + margin() + value();
      text += margin();
      if (lines > 1 || whole(0, 1) == 0) text += pick({"\r\n", "\n", "\r", "\r\n\r\n"});
    }
    return text;
  }
};

#ifdef _WIN32
constexpr int file_count = 2000;  // The platform has functions of its own.
#else
constexpr int file_count = 100;
#endif

TEST(Profiles, AreReadAndChangedAsTheDocumentIs) {
  const Text folder = scratch_folder();
  Profiles* const profiles = &real_platform().profiles;
  ProfileGenerator generator;
  // A file of its own for each step, since the platform keeps what it has read of one.
  int count = 0;
  const auto put_file = [&](std::string_view bytes) {
    const Text path = folder + number_to_text(++count) + u".ini";
    write_bytes(path, bytes);
    return path;
  };
  for (int i = 0; i < file_count; ++i) {
    const std::string before = generator.file();
    std::string edits;
    ProfileDocument document(before);
    const Text path = put_file(before);
    const auto compare_item = [&](const Text& file, const Text& section, const Text& item) {
      Text names;
      for (const Text& name : document.item_names(section)) names.append(name).append(1, u'\0');
      const Text value = document.value(section, item).value_or(Text()).substr(0, Profiles::longest_value);
      ASSERT_EQ(to_ansi(names + value),
                to_ansi(profiles->item_names(file, section) + profiles->value(file, section, item)))
          << '[' << to_ansi(section) << "] " << to_ansi(item) << " after" << edits << " of:\n"
          << before;
    };
    const auto compare = [&](const Text& file) {
      compare_item(file, from_ansi(generator.section()), from_ansi(generator.item()));
    };
    compare(path);
    for (int left = generator.whole(1, 3); left > 0; --left) {
      const Text section = from_ansi(generator.section());
      const Text item = from_ansi(generator.item());
      const Text value = from_ansi(generator.value());
      edits += " [" + to_ansi(section) + "] " + to_ansi(item) + "=" + to_ansi(value);
      document.put(section, item, value);
      profiles->put(path, section, item, value);
      compare_item(path, section, item);
    }
    compare(put_file(document.bytes()));
    if (::testing::Test::HasFailure()) return;
    // Wine looks through the whole folder for the name of each file.
    real_platform().files.delete_files(folder + u"*.ini");
  }
}

TEST(SettingsStore, KeepsTextsByNamesWithoutCase) {
  SettingsStore* const store = &real_platform().settings_store;
  const Text application = u"Test " + scratch_folder().substr(3);
  const auto value = [&](const Text& below, const Text& section, const Text& key) {
    return store->value(application + below, section, key);
  };
  EXPECT_EQ(value(u"B", u"S", u"k"), std::nullopt);
  const Text odd = Text(u"a\0b\r\n]=", 7) + u'\xD800' + Text(2000, u'x');
  store->put(application + u"B", u"S", u"k", odd);
  store->put(application + u"B", u"s]=", u"K", u"other");
  store->put(application + u"B2", u"S", u"k", u"beside");
  store->put(application + u"B", u"", u"", u"no names");
  EXPECT_EQ(value(u"b", u"s", u"K"), odd);
  EXPECT_EQ(value(u"B", u"S", Text(u"k\0x", 3)), odd);
  EXPECT_EQ(value(u"B", u"S]=", u"k"), u"other");
  EXPECT_EQ(value(u"B", u"", u""), u"no names");
  store->put(application + u"b", u"s", u"K", u"");
  EXPECT_EQ(value(u"B", u"S", u"k"), u"");
  EXPECT_EQ(value(u"B2", u"S", u"k"), u"beside");
}

TEST(Registry, KeepsTypesAndAnswersByTheStatusOfThePlatform) {
  const auto registry = real_registry();
  const Text path = u"Software\\TALUtil\\Test";
  const auto open = [&](Registry::Handle root, const Text& name, Registry::Handle& key) {
    return registry->open(root, name, Registry::query_value | Registry::set_value, key);
  };
  Registry::Handle key = 0;
  EXPECT_EQ(open(Registry::current_user, path, key), Registry::not_found);
  EXPECT_EQ(registry->create(0x12345, path, key), Registry::invalid_handle);
  EXPECT_EQ(key, 0U);
  ASSERT_EQ(registry->create(Registry::current_user, path + u"\\Below", key), Registry::ok);
  registry->close(key);
  // The key above exists by the one below, in any case and with a separator at its end.
  ASSERT_EQ(open(Registry::current_user, u"SOFTWARE\\talutil\\TEST\\", key), Registry::ok);
  const std::tuple<TextView, std::uint32_t, std::string> values[] = {
      {u"text", Registry::text, std::string("\xE9t\xE9\0", 4)},
      {u"bytes", Registry::binary, std::string("a\0b", 3)},
      {u"number", Registry::number, std::string("\x2A\0\0\0", 4)}};
  for (const auto& [name, type, bytes] : values) {
    EXPECT_EQ(registry->set(key, Text(name), type, bytes), Registry::ok);
    std::uint32_t found = 0;
    std::uint32_t size = 9;
    EXPECT_EQ(registry->query(key, upper_case(name), found, size, {}), Registry::ok);
    EXPECT_EQ(std::pair(found, size), std::pair(type, static_cast<std::uint32_t>(bytes.size())));
    for (const std::size_t room : {bytes.size() - 1, bytes.size(), bytes.size() + 1}) {
      std::string buffer(room, '?');
      size = static_cast<std::uint32_t>(room);
      const bool fits = room >= bytes.size();
      EXPECT_EQ(registry->query(key, Text(name), found, size, buffer), fits ? Registry::ok : Registry::more_data);
      EXPECT_EQ(std::pair(found, size), std::pair(type, static_cast<std::uint32_t>(bytes.size()))) << room;
      EXPECT_EQ(buffer.substr(0, fits ? size : 0), fits ? bytes : "") << room;
    }
  }
  std::uint32_t type = 0;
  std::uint32_t size = 0;
  EXPECT_EQ(registry->query(key, u"missing", type, size, {}), Registry::not_found);
  registry->close(key);
  EXPECT_EQ(registry->query(key, u"text", type, size, {}), Registry::invalid_handle);
}

TEST(Network, WritesTheAddressesOfTheMachineWhereTheyFit) {
  const std::vector<Text> expected = machine_addresses();
  const std::size_t size = 4 + 24 * expected.size();
  for (const std::size_t room : {std::size_t{0}, size - 1, size, size + 1}) {
    std::vector<std::uint8_t> table(room, 0xEE);
    real_platform().network.read_address_table(table);
    if (room < size) {
      EXPECT_EQ(table, std::vector<std::uint8_t>(room, 0xEE)) << room;
      continue;
    }
    EXPECT_EQ(table[0], expected.size());
    for (std::size_t i = 0; i < expected.size(); ++i) EXPECT_EQ(address_at(&table[4 + 24 * i]), expected[i]);
  }
}

}  // namespace
}  // namespace talutil::testing
