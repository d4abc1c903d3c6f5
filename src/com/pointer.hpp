#pragma once

#include <utility>

namespace talutil::com {

/// An owned, counted reference to an interface.
template <class Interface>
class Pointer {
 public:
  Pointer() = default;
  Pointer(const Pointer& other) noexcept : pointer_(other.pointer_) {
    if (pointer_ != nullptr) pointer_->AddRef();
  }
  Pointer(Pointer&& other) noexcept : pointer_(std::exchange(other.pointer_, nullptr)) {}
  Pointer& operator=(Pointer other) noexcept {
    std::swap(pointer_, other.pointer_);
    return *this;
  }
  ~Pointer() {
    if (pointer_ != nullptr) pointer_->Release();
  }

  /// Adds a reference of our own to the caller's pointer.
  static Pointer shared(Interface* pointer) noexcept {
    if (pointer != nullptr) pointer->AddRef();
    Pointer result;
    result.pointer_ = pointer;
    return result;
  }

  [[nodiscard]] Interface* get() const noexcept { return pointer_; }
  [[nodiscard]] Interface* operator->() const noexcept { return pointer_; }
  [[nodiscard]] explicit operator bool() const noexcept { return pointer_ != nullptr; }
  [[nodiscard]] Interface* release() noexcept { return std::exchange(pointer_, nullptr); }

  /// For functions that return a reference through an argument.
  [[nodiscard]] Interface** receive() noexcept {
    *this = Pointer();
    return &pointer_;
  }
  [[nodiscard]] void** receive_untyped() noexcept { return reinterpret_cast<void**>(receive()); }

 private:
  Interface* pointer_ = nullptr;
};

}  // namespace talutil::com
