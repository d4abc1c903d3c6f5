#pragma once

#include <memory>
#include <type_traits>
#include <vector>

#include "automation/locale.hpp"
#include "controls/control_factory.hpp"
#include "library/components.hpp"
#include "library/shared_settings.hpp"
#include "platform/platform.hpp"

namespace talutil {

/// State of a library besides its settings: a window, or what a member remembers between calls.
class LibraryPart {
 public:
  LibraryPart() = default;
  LibraryPart(const LibraryPart&) = delete;
  LibraryPart& operator=(const LibraryPart&) = delete;
  virtual ~LibraryPart() = default;
};

/// A loaded library: the shared settings, the platform, the components window and the parts that members add. The DLL
/// has exactly one.
class Library {
 public:
  explicit Library(const Platform& platform);
  Library(const Library&) = delete;
  Library& operator=(const Library&) = delete;
  ~Library();

  /// The start-up routine, run once before the first object is handed out: loads the components window, which fills in
  /// ComputerName, then reads the screen's twips per pixel (rounded, halves to even).
  void start();

  [[nodiscard]] SharedSettings& settings() noexcept { return settings_; }
  [[nodiscard]] const Platform& platform() const noexcept { return platform_; }
  [[nodiscard]] Components& components() noexcept { return *components_; }
  [[nodiscard]] const ControlFactory& controls() const noexcept { return controls_; }

  /// The only part of its class; created on first use, with the library as its argument if it takes one.
  template <class Part>
  [[nodiscard]] Part& part() {
    for (const auto& held : parts_) {
      if (auto* const found = dynamic_cast<Part*>(held.get())) return *found;
    }
    std::unique_ptr<Part> made;
    if constexpr (std::is_constructible_v<Part, Library&>)
      made = std::make_unique<Part>(*this);
    else
      made = std::make_unique<Part>();
    Part& result = *made;
    parts_.push_back(std::move(made));
    return result;
  }

  /// The user's separators and the current year.
  [[nodiscard]] Locale locale() const;

 private:
  Platform platform_;
  SharedSettings settings_;
  ControlFactory controls_;
  std::unique_ptr<Components> components_;
  std::vector<std::unique_ptr<LibraryPart>> parts_;
};

}  // namespace talutil
