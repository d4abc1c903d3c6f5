// What must hold for any archive: archives_fuzz -max_len=4096 -runs=1000000 CORPUS
//
// A corpus that begins with real archives finds more: fuzz/archives_corpus.sh makes one.
#include "archives/archive_error.hpp"
#include "archives/entry_names.hpp"
#include "archives/unpacking.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

using fuzz::require;

class MemoryFile final : public StoredFile {
 public:
  explicit MemoryFile(std::string_view bytes) : bytes_(bytes) {}
  [[nodiscard]] std::uint64_t size() const noexcept override { return bytes_.size(); }
  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    if (offset >= bytes_.size()) return 0;
    return bytes_.copy(buffer.data(), buffer.size(), static_cast<std::size_t>(offset));
  }

 private:
  std::string_view bytes_;
};

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
    archives::Archive archive(std::make_unique<MemoryFile>(bytes));
    for (std::uint64_t i = 0; i < archive.count(); ++i) {
      if (const auto parts = archives::safe_parts(archive.entry(i).name)) require_safe(*parts);
    }
    // A little more than deflate can give, so that a run does not take seconds.
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
