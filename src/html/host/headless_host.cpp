#include "html/host/headless_host.h"

#include "html/host/window.h"

namespace kestrune::html::host {

void HeadlessHost::RequestWakeUp() {
  std::lock_guard<std::mutex> lock(mutex_);
  wakeUp_ = true;
  woken_.notify_all();
}

bool HeadlessHost::Pump(Window& window, std::chrono::milliseconds wait) {
  bool woke;
  {
    std::unique_lock<std::mutex> lock(mutex_);
    woke = woken_.wait_for(lock, wait, [this] { return wakeUp_; });
    wakeUp_ = false;
  }
  window.RunPending();
  return woke;
}

}  // namespace kestrune::html::host
