// What the fuzzers check of any input is checked of generated ones in every build, on Windows too. Each of these is
// LLVMFuzzerTestOneInput of the source of its name; an input that breaks it ends the program with the reason.
#include <gtest/gtest.h>

#include <random>
#include <vector>

extern "C" {
int archives_fuzz(const std::uint8_t* data, std::size_t size);
int case_fuzz(const std::uint8_t* data, std::size_t size);
int cipher_fuzz(const std::uint8_t* data, std::size_t size);
int dates_fuzz(const std::uint8_t* data, std::size_t size);
int json_fuzz(const std::uint8_t* data, std::size_t size);
int numbers_fuzz(const std::uint8_t* data, std::size_t size);
int profiles_fuzz(const std::uint8_t* data, std::size_t size);
int text_files_fuzz(const std::uint8_t* data, std::size_t size);
int text_fuzz(const std::uint8_t* data, std::size_t size);
}

namespace talutil::testing {
namespace {

TEST(GeneratedInputs, HoldWhatTheFuzzersCheck) {
  const std::tuple<int (*)(const std::uint8_t*, std::size_t), std::size_t, int> fuzzers[] = {
      {&archives_fuzz, 512, 200}, {&case_fuzz, 512, 2000},      {&cipher_fuzz, 512, 200},
      {&dates_fuzz, 24, 20'000},  {&json_fuzz, 64, 2000},       {&numbers_fuzz, 16, 20'000},
      {&profiles_fuzz, 512, 500}, {&text_files_fuzz, 64, 2000}, {&text_fuzz, 128, 50'000},
  };
  std::mt19937 random(20090305);
  for (const auto& [fuzzer, longest, count] : fuzzers) {
    for (int i = 0; i < count; ++i) {
      std::vector<std::uint8_t> bytes(random() % (longest + 1));
      for (std::uint8_t& byte : bytes) byte = static_cast<std::uint8_t>(random());
      fuzzer(bytes.data(), bytes.size());
    }
  }
}

}  // namespace
}  // namespace talutil::testing
