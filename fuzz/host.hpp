#pragma once

#include <memory>
#include <string_view>

#include "library/orv_utils.hpp"

namespace talutil {
class CodePage;
class Files;
}  // namespace talutil

namespace talutil::fuzz {

/// A library on a platform without a machine. In a source of its own, because the platform takes long to compile.
class Host {
 public:
  Host();
  Host(const Host&) = delete;
  Host& operator=(const Host&) = delete;
  ~Host();

  [[nodiscard]] ORVUtils& utils() noexcept;
  [[nodiscard]] SharedSettings& settings() noexcept;
  [[nodiscard]] Files& files() noexcept;
  [[nodiscard]] CodePage& code_page() noexcept;

  void put_file(const Text& path, std::string_view bytes);

 private:
  struct Parts;
  std::unique_ptr<Parts> parts_;
};

}  // namespace talutil::fuzz
