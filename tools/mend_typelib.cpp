// Patches, in place, the type library that the IDL compiler has written:
//
// - a text parameter with a default was declared by value, because the compiler rejects a default on one
//   passed by reference; here it becomes `[in, out, optional, defaultvalue(...)] BSTR*`, as published;
// - the record GUID had another name, because the compiler takes that one for the platform's own record;
// - the time of the build is removed, so that the same sources always result in exactly the same library.
//
// The file is in the MSFT format: a header, an offset per type, and a directory of segments.
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string>
#include <string_view>

#include "library/c_control_position.hpp"
#include "library/interface_definition.hpp"
#include "library/interface_table.hpp"

namespace {

constexpr std::uint32_t format_signature = 0x5446534d;  // "MSFT"
constexpr std::size_t type_count_offset = 0x20;
constexpr std::size_t header_size = 0x54;
constexpr std::size_t segment_entry_size = 16;
constexpr std::size_t name_segment = 7;
constexpr std::size_t type_description_segment = 9;
constexpr std::size_t custom_data_segment = 11;

constexpr std::uint32_t text_by_value = 0x80080008;      // VT_BSTR, as a parameter's own type
constexpr std::uint32_t pointer_to_simple = 0x4008001a;  // VT_PTR to VT_BSTR, in the type descriptions
constexpr std::uint32_t in_optional_default = 0x31;
constexpr std::uint32_t out = 0x02;

struct Segment {
  std::size_t offset;
  std::size_t size;
};

class TypeLibrary {
 public:
  explicit TypeLibrary(std::string bytes) : bytes_(std::move(bytes)) {
    if (bytes_.size() < header_size || word(0) != format_signature) throw std::runtime_error("not a type library");
  }

  [[nodiscard]] std::uint32_t word(std::size_t offset) const {
    if (offset + 4 > bytes_.size()) throw std::runtime_error("cut short");
    std::uint32_t value = 0;
    std::memcpy(&value, bytes_.data() + offset, 4);
    return value;
  }

  void put_word(std::size_t offset, std::uint32_t value) { std::memcpy(bytes_.data() + offset, &value, 4); }

  [[nodiscard]] Segment segment(std::size_t index) const {
    const std::size_t entry = header_size + 4 * word(type_count_offset) + index * segment_entry_size;
    return {word(entry), word(entry + 4)};
  }

  /// Returns the number of parameters turned into references.
  int pass_default_texts_by_reference() {
    const std::uint32_t reference = text_reference();
    int mended = 0;
    for (std::size_t at = 0; at + 12 <= bytes_.size(); at += 4) {
      if (word(at) != text_by_value || word(at + 8) != in_optional_default) continue;
      put_word(at, reference);
      put_word(at + 8, in_optional_default | out);
      ++mended;
    }
    return mended;
  }

  /// The stand-in has the same hash as the real name, so only the name has to be overwritten.
  void name_guid_record() {
    const auto [offset, size] = segment(name_segment);
    const std::string_view stand_in = talutil::guid_stand_in;
    const std::size_t at = bytes_.find(stand_in, offset);
    if (at >= offset + size) throw std::runtime_error("no record " + std::string(stand_in) + " among the names");
    bytes_.replace(at, stand_in.size(), "GUID");
  }

  void remove_build_time() {
    const auto [offset, size] = segment(custom_data_segment);
    const std::string_view note = " at ";
    const auto first = bytes_.begin() + static_cast<std::ptrdiff_t>(offset);
    const auto last = first + static_cast<std::ptrdiff_t>(size);
    const auto found = std::search(first, last, note.begin(), note.end());
    const auto line_end = std::find(found, last, '\n');
    if (line_end == last) throw std::runtime_error("no build time where it was expected");
    std::fill(found, line_end, ' ');
    // The same time follows as a number: its type (VT_UI4), then the seconds, at the next multiple of four.
    const auto stamp = offset + (static_cast<std::size_t>(line_end + 1 - first) + 3) / 4 * 4;
    if ((word(stamp) & 0xffff) != 0x13) throw std::runtime_error("no time stamp behind the build time");
    std::fill_n(bytes_.begin() + static_cast<std::ptrdiff_t>(stamp) + 2, 4, '\0');
  }

  [[nodiscard]] const std::string& bytes() const noexcept { return bytes_; }

 private:
  /// The offset, within the type descriptions, of the pointer to a text; parameters refer to it by this offset.
  [[nodiscard]] std::uint32_t text_reference() const {
    const auto [offset, size] = segment(type_description_segment);
    for (std::size_t at = 0; at + 8 <= size; at += 8) {
      if (word(offset + at) == pointer_to_simple && word(offset + at + 4) == text_by_value) {
        return static_cast<std::uint32_t>(at);
      }
    }
    throw std::runtime_error("no pointer to a text among the types");
  }

  std::string bytes_;
};

int count_default_texts() {
  int count = 0;
  for (const talutil::Member& member : talutil::described<talutil::ORVUtils>) {
    for (const talutil::Parameter& parameter : member.parameters()) {
      if (parameter.is_optional && parameter.type == talutil::ValueType::text) ++count;
    }
  }
  return count;
}

}  // namespace

int main(int argc, char** argv) try {
  if (argc != 2) throw std::runtime_error("usage: mend_typelib FILE");
  std::ifstream input(argv[1], std::ios::binary);
  TypeLibrary library(std::string(std::istreambuf_iterator<char>(input), {}));
  const int mended = library.pass_default_texts_by_reference();
  if (mended != count_default_texts()) throw std::runtime_error("found " + std::to_string(mended) + " default texts");
  library.name_guid_record();
  library.remove_build_time();
  std::ofstream(argv[1], std::ios::binary) << library.bytes();
  return 0;
} catch (const std::exception& error) {
  std::fprintf(stderr, "mend_typelib: %s: %s\n", argc > 1 ? argv[1] : "", error.what());
  return 1;
}
