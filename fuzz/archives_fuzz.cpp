// Checks what must hold for any archive: archives_fuzz -max_len=4096 -runs=1000000 CORPUS
//
// A corpus that begins with real archives finds more; fuzz/corpus.sh creates one.
#include <map>

#include "archives/archive_error.hpp"
#include "archives/entry_names.hpp"
#include "archives/split_set.hpp"
#include "archives/unpacking.hpp"
#include "automation/run_time_error.hpp"
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

/// A folder of files that are only read.
class MemoryFolder final : public Folder {
 public:
  std::map<Text, std::string> files;

  [[nodiscard]] Text path() const override { return u"C:\\"; }
  void list(const std::function<void(TextView, const FileFacts&)>& found) override {
    for (const auto& [name, bytes] : files) found(name, {.size = bytes.size()});
  }
  [[nodiscard]] std::optional<FileFacts> facts(TextView name) override {
    const auto file = files.find(Text(name));
    return file == files.end() ? std::nullopt : std::optional(FileFacts{.size = file->second.size()});
  }
  [[nodiscard]] std::unique_ptr<StoredFile> open(TextView name) override {
    const auto file = files.find(Text(name));
    if (file == files.end()) raise(ErrorNumber::file_not_found);
    return std::make_unique<MemoryFile>(file->second);
  }
  [[nodiscard]] std::unique_ptr<NewFile> create(TextView) override { raise(ErrorNumber::path_file_access); }
  [[nodiscard]] std::unique_ptr<Folder> folder(TextView, bool) override { raise(ErrorNumber::path_not_found); }
  void set_facts(TextView, const FileFacts&) override {}
  void remove(TextView) override {}
};

/// An archive that is cut into pieces is the archive; as the volumes of a set it is one or fails with its code.
void check_pieces(std::string_view bytes) {
  if (bytes.size() < 3) return;
  const std::size_t first = 1 + static_cast<std::uint8_t>(bytes[bytes.size() / 2]) % (bytes.size() - 2);
  MemoryFolder folder;
  folder.files = {{u"p.zip.001", std::string(bytes.substr(0, first))},
                  {u"p.zip.002", std::string(bytes.substr(first))},
                  {u"v.z01", std::string(bytes.substr(0, first))},
                  {u"v.zip", std::string(bytes.substr(first))}};
  const auto whole = archives::open_archive(folder, u"p.zip.001");
  require(archives::read_exactly(*whole, 0, bytes.size()) == bytes && whole->size() == bytes.size(), "the pieces");
  try {
    const archives::Archive set(archives::open_archive(folder, u"v.zip"));
    for (std::uint64_t i = 0; i < set.count(); ++i) (void)set.entry(i);
  } catch (const archives::Error& error) {
    require(error.code() != archives::Code::ok && error.code() != archives::Code::internal, "a failure has its code");
  }
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view bytes(reinterpret_cast<const char*>(data), size);
  talutil::check(bytes);
  talutil::check_pieces(bytes);
  return 0;
}
