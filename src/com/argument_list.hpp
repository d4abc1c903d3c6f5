#pragma once

#include <cstddef>
#include <memory>
#include <new>
#include <span>

#include "automation/late_call.hpp"

namespace talutil::com {

/// The arguments of one call. Unlike a vector it takes no memory, and unlike an array it creates only those that are
/// there: most calls have one or two, and every call pays for the rest.
class ArgumentList {
 public:
  ArgumentList() noexcept = default;
  ArgumentList(const ArgumentList&) = delete;
  ArgumentList& operator=(const ArgumentList&) = delete;
  ~ArgumentList() { std::destroy(all().begin(), all().end()); }

  /// Adds an argument, whose value the function returns; at most `most_parameters` fit.
  template <class Make>
  Argument& add(const Make& make) {
    // Not construct_at, through which the value would be moved once more.
    auto* const added = ::new (static_cast<void*>(first() + count_)) Argument(make());
    ++count_;
    return *added;
  }

  [[nodiscard]] std::span<Argument> all() noexcept { return {first(), count_}; }

 private:
  [[nodiscard]] Argument* first() noexcept { return reinterpret_cast<Argument*>(memory_); }

  std::size_t count_ = 0;
  alignas(Argument) std::byte memory_[most_parameters * sizeof(Argument)];
};

}  // namespace talutil::com
