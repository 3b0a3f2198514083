#include "html/host/ui_thread.h"

#include <condition_variable>
#include <memory>

namespace kestrune::html::host {

UiThreadQueue::UiThreadQueue(std::function<void()> wake) : wake_(std::move(wake)), uiThread_(std::this_thread::get_id()) {}

void UiThreadQueue::Post(std::function<void()> call) {
  {
    std::lock_guard<std::mutex> lock(mutex_);
    queue_.push_back(std::move(call));
  }
  if (wake_) wake_();
}

void UiThreadQueue::Send(const std::function<void()>& call) {
  if (OnUiThread()) {
    call();
    return;
  }
  struct Done {
    std::mutex mutex;
    std::condition_variable ran;
    bool done = false;
  };
  auto done = std::make_shared<Done>();
  Post([&call, done] {
    call();
    std::lock_guard<std::mutex> lock(done->mutex);
    done->done = true;
    done->ran.notify_all();
  });
  std::unique_lock<std::mutex> lock(done->mutex);
  done->ran.wait(lock, [&] { return done->done; });
}

void UiThreadQueue::RunQueued() {
  for (;;) {
    std::function<void()> call;
    {
      std::lock_guard<std::mutex> lock(mutex_);
      if (queue_.empty()) return;
      call = std::move(queue_.front());
      queue_.pop_front();
    }
    call();
  }
}

}  // namespace kestrune::html::host
