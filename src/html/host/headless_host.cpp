#include "html/host/headless_host.h"

#include <algorithm>

#include "html/host/window.h"

namespace kestrune::html::host {

void HeadlessHost::Invalidate(const Rect* area) {
  ++invalidations_;
  invalid_.push_back(area ? *area : Rect{0, 0, size_.width, size_.height});
}

void HeadlessHost::UpdateNow() {
  ++immediateUpdates_;
  if (canvas_ && window_) PaintInvalid();
}

void HeadlessHost::PaintInvalid() {
  if (!canvas_ || !window_ || invalid_.empty()) return;
  Rect area = invalid_.front();
  for (const Rect& r : invalid_) {
    area = {std::min(area.left, r.left), std::min(area.top, r.top), std::max(area.right, r.right), std::max(area.bottom, r.bottom)};
  }
  invalid_.clear();
  window_->Paint(*canvas_, area);
}

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
