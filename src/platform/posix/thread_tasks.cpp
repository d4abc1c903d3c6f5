#include "platform/posix/thread_tasks.hpp"

#include <algorithm>
#include <utility>

namespace talutil::posix {

namespace {

class ThreadTask final : public StartedTask {
 public:
  explicit ThreadTask(std::future<void> end) noexcept : end_(std::move(end)) {}
  void wait() noexcept override { end_.wait(); }
  void finish() override { end_.get(); }

 private:
  std::shared_future<void> end_;
};

}  // namespace

ThreadTasks::ThreadTasks(std::size_t count)
    : count_(count != 0 ? count : std::max<std::size_t>(1, std::thread::hardware_concurrency())) {}

ThreadTasks::~ThreadTasks() {
  {
    const std::lock_guard lock(mutex_);
    is_over_ = true;
  }
  has_work_.notify_all();
  for (std::thread& thread : threads_) thread.join();
}

std::unique_ptr<StartedTask> ThreadTasks::start(std::function<void()> task) {
  while (threads_.size() < count_) threads_.emplace_back([this] { run_all(); });
  std::packaged_task<void()> work(std::move(task));
  auto started = std::make_unique<ThreadTask>(work.get_future());
  {
    const std::lock_guard lock(mutex_);
    waiting_.push_back(std::move(work));
  }
  has_work_.notify_one();
  return started;
}

void ThreadTasks::run_all() {
  for (;;) {
    std::unique_lock lock(mutex_);
    has_work_.wait(lock, [this] { return is_over_ || !waiting_.empty(); });
    if (waiting_.empty()) return;
    std::packaged_task<void()> work = std::move(waiting_.front());
    waiting_.pop_front();
    lock.unlock();
    work();
  }
}

}  // namespace talutil::posix
