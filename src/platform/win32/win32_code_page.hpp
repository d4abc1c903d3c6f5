#pragma once

#include "platform/code_page.hpp"

namespace talutil::win32 {

/// A code page of the system, with its best fit for characters that the page lacks.
class Win32CodePage final : public CodePage {
 public:
  /// The ANSI page of the process: the system's, unless the program's manifest asks for UTF-8.
  Win32CodePage() noexcept = default;

  /// The page with a given number, regardless of the system's.
  explicit Win32CodePage(std::uint32_t number) noexcept : number_(number) {}

  [[nodiscard]] std::string bytes_of(TextView text) override;
  [[nodiscard]] Text text_of(std::string_view bytes) override;

 private:
  std::uint32_t number_ = 0;  ///< CP_ACP
};

}  // namespace talutil::win32
