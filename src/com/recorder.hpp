#pragma once

#include <chrono>
#include <memory>
#include <mutex>
#include <optional>
#include <unordered_map>

#include "calling/call_record.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::com {

/// Appends the calls of hosts to a file, a line each (docs/batch.md), if the user has switched that on. Several
/// processes may append to the same file: every line is one write. Whatever fails here ends the recording and is never
/// noticed by the host.
class Recorder final : public calling::ObjectNumbers {
 public:
  /// Starts recording to the file that the environment variable TALUTIL_RECORD names or, without one, the value Record
  /// of the user's key Software\TALUtil. Null if neither does, or the file cannot be opened.
  [[nodiscard]] static std::unique_ptr<Recorder> start() noexcept;

  explicit Recorder(HANDLE file) noexcept : file_(file) {}
  Recorder(const Recorder&) = delete;
  Recorder& operator=(const Recorder&) = delete;
  ~Recorder() override;

  /// Notes an object that a host has created, and the end of one of our objects. Its identity is an address: that of a
  /// control's IDispatch, or of the object behind an interface.
  void created(std::string_view class_name, const void* identity) noexcept;
  void released(const void* identity) noexcept;

  /// The number of one of our objects; 0 if it has none, as toolkits.
  [[nodiscard]] std::int32_t number_of(const void* identity);

  /// Gives one of our objects a number unless it has one.
  void give_number(const void* identity) noexcept;

  [[nodiscard]] ObjectRef find(std::int32_t /*number*/) const override { return nullptr; }
  void append(std::string& out, const ObjectRef& object) override;

  void write(const std::string& line) noexcept;
  void stop() noexcept;

 private:
  struct Known {
    std::int32_t number;
    bool is_ours;
  };

  [[nodiscard]] Known known(const void* identity, bool is_ours);

  std::recursive_mutex mutex_;
  HANDLE file_;
  std::unordered_map<const void*, Known> objects_;
  std::int32_t last_ = 0;
};

/// One call while it is recorded. Arguments are asked for here, so that nothing that fails meanwhile reaches the host.
class RecordedCall {
 public:
  template <class Arguments>
  RecordedCall(Recorder& recorder, const void* identity, const Member& member, const Arguments& arguments) noexcept
      : recorder_(recorder) {
    protect([&] { begin(identity, member, arguments()); });
    start_ = std::chrono::steady_clock::now();
  }

  template <class Arguments>
  void succeed(const Variant& result, const Arguments& arguments) noexcept {
    const auto time = std::chrono::steady_clock::now() - start_;
    if (record_) protect([&] { record_->succeed(result, arguments()), write(time); });
  }

  /// Takes the error that is being handled.
  template <class Arguments>
  void fail(const Arguments& arguments) noexcept {
    const auto time = std::chrono::steady_clock::now() - start_;
    const RunTimeError error = current_error();
    if (record_) protect([&] { record_->fail(error, arguments()), write(time); });
  }

 private:
  void begin(const void* identity, const Member& member, std::span<const Argument> arguments);
  void write(std::chrono::steady_clock::duration time);

  template <class Work>
  void protect(const Work& work) noexcept {
    try {
      work();
    } catch (...) {
      recorder_.stop();
    }
  }

  Recorder& recorder_;
  std::optional<calling::CallRecord> record_;
  std::chrono::steady_clock::time_point start_;
};

/// Makes a call of one of our objects, recorded or not. `arguments` gives the arguments, before and after it.
template <class Arguments, class Use>
auto recorded(Recorder* recorder, const void* identity, const Member& member, const Arguments& arguments,
              const Use& use) -> decltype(use()) {
  if (recorder == nullptr) return use();
  using Result = decltype(use());
  RecordedCall call(*recorder, identity, member, arguments);
  try {
    if constexpr (std::is_void_v<Result>) {
      use();
      call.succeed({}, arguments);
    } else {
      Result result = use();
      call.succeed(result, arguments);
      return result;
    }
  } catch (...) {
    call.fail(arguments);
    throw;
  }
}

}  // namespace talutil::com
