#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "cli/files.hpp"
#include "platform/code_page.hpp"

/// The encodings of inputs and outputs: UTF-8, UTF-16, or a code page.
namespace talutil::cli {

/// An encoding as named by an option: "utf-8", "utf-16" or a code page's number. Anything else is a usage error that
/// names the option.
struct Encoding {
  enum class Kind : std::uint8_t { utf8, utf16_low_first, utf16_high_first, page };

  Kind kind = Kind::utf8;
  std::uint32_t page = 0;
};
[[nodiscard]] Encoding encoding_named(const std::string& name, const std::string& option);

/// What is known of an input's encoding beforehand.
struct InputEncoding {
  std::string name;  ///< As given by --encoding; if empty, it is found out.
  std::optional<std::uint32_t>
      page;  ///< The code page of an input that is not UTF-8; if none, that of the environment.
};

/// Turns bytes into text piece by piece. Unless the encoding is named: a byte order mark decides; an input with a NUL
/// in every other byte is UTF-16; otherwise it is UTF-8 as long as it fits, and if it does not fit from the first
/// character beyond ASCII on, it is in the code page, which is said on standard error. An input that is neither fails,
/// with the line.
class Decoder {
 public:
  /// @param source the input's name in warnings; failures do not name it
  Decoder(std::string source, const InputEncoding& encoding);

  /// Appends the text of some bytes. A character that is not complete waits for the next bytes.
  void decode(std::string_view bytes, bool is_last, Text& text);

 private:
  void begin(std::string_view bytes);
  std::size_t decode_utf8(std::string_view bytes, bool is_last, Text& text);
  std::size_t decode_utf16(std::string_view bytes, bool is_last, Text& text) const;
  std::size_t decode_page(std::string_view bytes, bool is_last, Text& text);
  void use_page(std::string_view bytes_before);
  void make_table();
  [[nodiscard]] std::string line_of(std::string_view bytes_before) const;

  std::string source_;
  InputEncoding wanted_;
  Encoding encoding_;
  bool has_begun_ = false;
  bool is_certain_ = false;  ///< Named, or by a mark.
  bool has_wide_ = false;    ///< Has had a character beyond ASCII.
  std::uint64_t lines_ = 0;
  std::string waiting_;
  std::unique_ptr<CodePage> page_;
  std::array<char16_t, 256> table_{};  ///< Of a page with one byte a character.
  bool has_table_ = false;
};

/// Turns text into bytes.
class Encoder {
 public:
  explicit Encoder(Encoding encoding);

  /// What the output begins with: UTF-16 has a byte order mark.
  [[nodiscard]] std::string_view mark() const noexcept;
  void append(std::string& bytes, TextView text);

  /// Whether a text had characters that the code page lacks and has substitutes for.
  [[nodiscard]] bool is_lossy() const noexcept { return is_lossy_; }

 private:
  void append_code(std::string& bytes, char16_t unit);

  Encoding encoding_;
  std::unique_ptr<CodePage> page_;
  std::vector<bool> is_held_;  ///< By code unit: known to be on the page.
  bool is_lossy_ = false;
};

/// The whole text of an input.
[[nodiscard]] Text read_text(const std::string& path, const InputEncoding& encoding);

}  // namespace talutil::cli
