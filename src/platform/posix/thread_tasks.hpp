#pragma once

#include <condition_variable>
#include <deque>
#include <future>
#include <mutex>
#include <thread>
#include <vector>

#include "platform/tasks.hpp"

namespace talutil::posix {

/// Runs tasks on as many threads as this process may use processors, in the order in which they were started. The
/// threads begin with the first task; the destructor waits for all tasks.
class ThreadTasks final : public Tasks {
 public:
  /// @param count the number of threads; 0 for one per processor
  explicit ThreadTasks(std::size_t count = 0);
  ThreadTasks(const ThreadTasks&) = delete;
  ThreadTasks& operator=(const ThreadTasks&) = delete;
  ~ThreadTasks() override;

  [[nodiscard]] std::size_t at_once() const noexcept override { return count_; }
  [[nodiscard]] std::unique_ptr<StartedTask> start(std::function<void()> task) override;

 private:
  void run_all();

  std::size_t count_;
  std::mutex mutex_;
  std::condition_variable has_work_;
  std::deque<std::packaged_task<void()>> waiting_;
  bool is_over_ = false;
  std::vector<std::thread> threads_;
};

}  // namespace talutil::posix
