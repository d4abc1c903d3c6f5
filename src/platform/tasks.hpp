#pragma once

#include <cstddef>
#include <exception>
#include <functional>
#include <memory>
#include <utility>

namespace talutil {

/// A task that was started. Its destructor does not wait for its end.
class StartedTask {
 public:
  virtual ~StartedTask() = default;

  /// Waits for the end of the task, however it ends.
  virtual void wait() noexcept = 0;

  /// Waits for the end of the task and throws what it threw.
  virtual void finish() = 0;
};

/// A task that has ended before anyone waits for it. (A `std::future` would bring all of the run time's threads along.)
class EndedTask final : public StartedTask {
 public:
  /// @param failure what the task threw; null if it succeeded
  explicit EndedTask(std::exception_ptr failure) noexcept : failure_(std::move(failure)) {}
  void wait() noexcept override {}
  void finish() override {
    if (failure_) std::rethrow_exception(failure_);
  }

 private:
  std::exception_ptr failure_;
};

/// Runs tasks, which may be on other threads. What members do on a host's thread stays there; only our own programs
/// may have threads, and give members nothing but this to use them.
class Tasks {
 public:
  virtual ~Tasks() = default;

  /// How many tasks run at the same time.
  [[nodiscard]] virtual std::size_t at_once() const noexcept = 0;

  /// Starts a task. Everything that it refers to must exist until it has ended.
  [[nodiscard]] virtual std::unique_ptr<StartedTask> start(std::function<void()> task) = 0;
};

/// Runs each task before `start` returns.
class SerialTasks final : public Tasks {
 public:
  [[nodiscard]] std::size_t at_once() const noexcept override { return 1; }
  [[nodiscard]] std::unique_ptr<StartedTask> start(std::function<void()> task) override {
    std::exception_ptr failure;
    try {
      task();
    } catch (...) {
      failure = std::current_exception();
    }
    return std::make_unique<EndedTask>(std::move(failure));
  }
};

}  // namespace talutil
