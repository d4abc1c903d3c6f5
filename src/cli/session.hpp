#pragma once

#include <optional>

#include "automation/late_call.hpp"
#include "cli/reading_progress.hpp"
#include "library/interface_table.hpp"
#include "library/library.hpp"
#include "platform/posix/posix_platform.hpp"

namespace talutil::cli {

/// A started library with one toolkit object, called late-bound like scripts do.
class Session {
 public:
  /// Uses the given code page or, without one, that of the environment.
  explicit Session(std::optional<std::uint32_t> code_page = {})
      : platform_(code_page ? *code_page : posix::chosen_code_page()) {
    platform_.files.set_progress(reading_progress());
    library_.start();
  }

  [[nodiscard]] static const LateInterface& members() { return late_interface<ORVUtils>(); }
  [[nodiscard]] ORVUtils& utils() noexcept { return utils_; }
  [[nodiscard]] posix::PosixPlatform& platform() noexcept { return platform_; }
  [[nodiscard]] Library& library() noexcept { return library_; }
  [[nodiscard]] Locale locale() const { return library_.locale(); }
  [[nodiscard]] SharedSettings& settings() noexcept { return library_.settings(); }

  /// Raises the member's errors as RunTimeError.
  Variant call(const Member& member, std::span<Argument> arguments) {
    return call(member, arguments, library_.locale());
  }

  /// The same for many calls: asking for the locale asks for the time.
  Variant call(const Member& member, std::span<Argument> arguments, const Locale& locale) {
    const auto slot = static_cast<std::int32_t>(&member - members().members.data());
    return members().call(&utils_, slot, arguments, locale);
  }

 private:
  posix::PosixPlatform platform_;
  Library library_{platform_.platform()};
  ORVUtils utils_{library_};
};

}  // namespace talutil::cli
