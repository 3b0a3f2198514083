#pragma once

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>

#include "html/host/window_host.h"

namespace kestrune::html::host {

// A window host without a window: it counts repaint requests, keeps a clipboard, and lets the
// UI thread (the test, a scenario) run the engine's pending work when woken, so that pages,
// input and workers can be exercised without any display.
class HeadlessHost final : public WindowHost {
 public:
  void Invalidate(const Rect*) override { ++invalidations_; }
  void UpdateNow() override { ++immediateUpdates_; }
  void RequestWakeUp() override;
  std::u16string ClipboardText() override { return clipboard_; }
  void SetClipboardText(const std::u16string& text) override { clipboard_ = text; }

  // Runs the window's pending work until nothing is left; with a timeout, first waits up to
  // that long for a wake-up from another thread. Answers whether a wake-up came.
  bool Pump(Window& window, std::chrono::milliseconds wait = std::chrono::milliseconds(0));

  int invalidations() const { return invalidations_; }
  int immediateUpdates() const { return immediateUpdates_; }

 private:
  int invalidations_ = 0;
  int immediateUpdates_ = 0;
  std::u16string clipboard_;
  std::mutex mutex_;
  std::condition_variable woken_;
  bool wakeUp_ = false;
};

}  // namespace kestrune::html::host
