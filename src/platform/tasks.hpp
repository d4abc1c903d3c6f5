#pragma once

#include <cstddef>
#include <functional>
#include <future>

namespace talutil {

/// Runs tasks, which may be on other threads. What members do on a host's thread stays there; only programs of ours
/// may have threads, and give members nothing but this to use them.
class Tasks {
 public:
  virtual ~Tasks() = default;

  /// How many tasks run at the same time.
  [[nodiscard]] virtual std::size_t at_once() const noexcept = 0;

  /// Starts a task. What it throws comes out of the future. Everything that the task refers to must exist until it has
  /// ended, for which the future's destructor does not wait.
  [[nodiscard]] virtual std::future<void> start(std::function<void()> task) = 0;
};

/// Runs each task before `start` returns.
class SerialTasks final : public Tasks {
 public:
  [[nodiscard]] std::size_t at_once() const noexcept override { return 1; }
  [[nodiscard]] std::future<void> start(std::function<void()> task) override {
    std::packaged_task<void()> work(std::move(task));
    std::future<void> done = work.get_future();
    work();
    return done;
  }
};

}  // namespace talutil
