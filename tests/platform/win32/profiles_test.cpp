#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <random>
#include <string>

#include "platform/profile_document.hpp"
#include "platform/win32/win32_settings.hpp"
#include "platform/win32/windows.hpp"

namespace talutil {
namespace {

/// A file of its own for each step, since the platform keeps what it has read of one.
class TemporaryFile {
 public:
  explicit TemporaryFile(std::string_view bytes) {
    static int count = 0;
    std::array<char, MAX_PATH> folder{};
    GetTempPathA(folder.size(), folder.data());
    path_ = folder.data() + std::string("talutil-profile-") + std::to_string(++count) + ".ini";
    std::FILE* const file = std::fopen(path_.c_str(), "wb");
    std::fwrite(bytes.data(), 1, bytes.size(), file);
    std::fclose(file);
  }
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;
  ~TemporaryFile() { std::remove(path_.c_str()); }

  [[nodiscard]] Text path() const { return from_ansi(path_); }

 private:
  std::string path_;
};

/// Lines as people, programs and damage leave them. Deliberately not met: names that differ in the case of letters
/// beyond ASCII (the same for us, and for later versions of the platform), names that begin with a semicolon (comments
/// for us), and line breaks within arguments.
class Generator {
 public:
  explicit Generator(unsigned seed) : random_(seed) {}

  template <std::size_t N>
  std::string pick(const std::array<const char*, N>& choices) {
    return choices[random_() % N];
  }
  std::string section() { return pick(sections); }
  std::string item() { return pick(items); }
  std::string value() { return random_() % 40 == 0 ? std::string(1018 + random_() % 10, 'v') : pick(values); }
  unsigned below(unsigned limit) { return static_cast<unsigned>(random_() % limit); }

  std::string file() {
    std::string text;
    for (unsigned lines = below(14); lines > 0; --lines) {
      text += pick(margins);
      switch (below(8)) {
        case 0:
        case 1:
          text += "[" + pick(margins) + section() + pick(margins) + pick(closings);
          break;
        case 2:
          text += pick(oddities);
          break;
        default:
          text += item() + pick(margins) + "=" + pick(margins) + value();
      }
      text += pick(margins) + (lines == 1 && below(2) == 0 ? "" : pick(line_ends));
    }
    return text;
  }

 private:
  static constexpr std::array<const char*, 5> sections{"a", "A", "s p", "b]", "\xE9"};
  static constexpr std::array<const char*, 6> items{"x", "X", "y z", "\"q\"", "\xE9", "[k"};
  static constexpr std::array<const char*, 11> values{"",     "1",       "two words", "\"q\"",      "'q'",  "\"",
                                                      "'a\"", "\" b \"", "a=b",       "\x80\x9F;c", "\\\\s"};
  static constexpr std::array<const char*, 6> margins{"", "", "", " ", "\t ", "\x1A"};
  static constexpr std::array<const char*, 4> closings{"]", "]", "] x", ""};
  static constexpr std::array<const char*, 4> line_ends{"\r\n", "\n", "\r", "\r\n\r\n"};
  static constexpr std::array<const char*, 5> oddities{"; x=1", ";", "novalue", "x", "]"};

  std::mt19937 random_;
};

std::string value_of(const ProfileDocument& document, const Text& section, const Text& item) {
  return to_ansi(document.value(section, item).value_or(Text()).substr(0, Profiles::longest_value));
}

std::string value_of(const Text& file, const Text& section, const Text& item) {
  return to_ansi(win32::Win32Profiles().value(file, section, item));
}

std::string names_of(const ProfileDocument& document, const Text& section) {
  Text names;
  for (const Text& name : document.item_names(section)) names.append(name).append(1, u'|');
  return to_ansi(names);
}

std::string names_of(const Text& file, const Text& section) {
  Text names = win32::Win32Profiles().item_names(file, section);
  std::ranges::replace(names, u'\0', u'|');
  return to_ansi(names);
}

TEST(Profiles, AgreeWithThePlatformOnTwoThousandFilesAndEdits) {
  for (unsigned seed = 0; seed < 2000; ++seed) {
    Generator generator(seed);
    const std::string before = generator.file();
    ProfileDocument document(before);
    const TemporaryFile file(before);
    const auto compare = [&](const Text& path, const char* when) {
      const Text section = from_ansi(generator.section());
      const Text item = from_ansi(generator.item());
      ASSERT_EQ(names_of(document, section) + value_of(document, section, item),
                names_of(path, section) + value_of(path, section, item))
          << when << ", seed " << seed << ", [" << to_ansi(section) << "] " << to_ansi(item) << ":\n"
          << before;
    };
    compare(file.path(), "as generated");
    for (unsigned edits = 1 + generator.below(3); edits > 0; --edits) {
      const Text section = from_ansi(generator.section());
      const Text item = from_ansi(generator.item());
      const Text value = from_ansi(generator.value());
      document.put(section, item, value);
      win32::Win32Profiles().put(file.path(), section, item, value);
      ASSERT_EQ(value_of(document, section, item), value_of(file.path(), section, item))
          << "after [" << to_ansi(section) << "] " << to_ansi(item) << "=" << to_ansi(value) << ", seed " << seed
          << ":\n"
          << before;
    }
    const TemporaryFile written(document.bytes());
    compare(written.path(), "edited by us, read by the platform");
    if (HasFatalFailure()) return;
  }
}

}  // namespace
}  // namespace talutil
