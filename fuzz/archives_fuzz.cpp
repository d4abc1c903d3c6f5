// Checks what must hold for any archive: archives_fuzz -max_len=4096 -runs=1000000 CORPUS
//
// A corpus that begins with real archives finds more; fuzz/archives_corpus.sh creates one.
#include "archives/archive_error.hpp"
#include "archives/entry_names.hpp"
#include "archives/unpacking.hpp"
#include "fuzz/input.hpp"
#include "tests/archives/memory_file.hpp"

namespace talutil {
namespace {

using archives::testing::MemoryFile;
using fuzz::require;

void require_safe(const std::vector<Text>& parts) {
  require(!parts.empty(), "a name has a part");
  for (const Text& part : parts) {
    require(!part.empty() && part != u".." && part != u"." && part.find_first_of(u"/\\:") == Text::npos &&
                part.find(u'\0') == Text::npos,
            "a part stays in its folder");
  }
}

void check(std::string_view bytes) {
  std::uint64_t unpacked = 0;
  archives::Progress progress([&](std::uint64_t done, std::uint64_t total, TextView) {
    unpacked = done;
    require(done <= total, "no more is unpacked than was announced");
    return true;
  });
  try {
    archives::Archive archive(std::make_unique<MemoryFile>(std::string(bytes)));
    for (std::uint64_t i = 0; i < archive.count(); ++i) {
      if (const auto parts = archives::safe_parts(archive.entry(i).name)) require_safe(*parts);
    }
    // Slightly more than deflate can produce, so that a run does not take seconds.
    archives::UnpackingOptions options;
    options.password = u"p";
    options.largest_total = bytes.size() * 1100 + 1'000'000;
    archive.test(options, {}, progress);
    require(unpacked <= options.largest_total, "the limit holds");
  } catch (const archives::Error& error) {
    require(error.code() != archives::Code::ok && error.code() != archives::Code::internal, "a failure has its code");
  }
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  talutil::check(std::string_view(reinterpret_cast<const char*>(data), size));
  return 0;
}
