#pragma once

#include <deque>
#include <functional>
#include <mutex>
#include <thread>

namespace kestrune::html::host {

// The way onto the UI thread: the engine is not thread safe, so a worker hands it calls. `Send`
// waits until the call has run (in the order workers send them); `Post` does not wait. The UI
// thread runs what is queued from RunQueued, which its host calls when woken.
class UiThreadQueue {
 public:
  // `wake` is called from any thread and must make the UI thread call RunQueued soon.
  explicit UiThreadQueue(std::function<void()> wake);

  void Post(std::function<void()> call);
  // On the UI thread itself the call runs at once.
  void Send(const std::function<void()>& call);
  void RunQueued();
  bool OnUiThread() const { return std::this_thread::get_id() == uiThread_; }

 private:
  std::function<void()> wake_;
  std::thread::id uiThread_;
  std::mutex mutex_;
  std::deque<std::function<void()>> queue_;
};

}  // namespace kestrune::html::host
