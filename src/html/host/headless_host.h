#pragma once

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>
#include <vector>

#include "html/host/window_host.h"
#include "html/paint/canvas.h"

namespace kestrune::html::host {

// A window host without a window: it notes repaint requests, keeps a clipboard, lets the UI
// thread (the test, a scenario) run the engine's pending work when woken, and paints onto a
// canvas when given one, so that pages, input, painting and workers can be exercised without
// any display. Text is measured with FixedMetrics unless another measurer is given.
class HeadlessHost final : public WindowHost {
 public:
  HeadlessHost() = default;
  explicit HeadlessHost(const layout::TextMeasurer& measurer, Size size = {900, 623}) : measurer_(&measurer), size_(size) {}

  void Invalidate(const Rect* area) override;
  // With a canvas to render to, paints what is invalid at once.
  void UpdateNow() override;
  void RequestWakeUp() override;
  const layout::TextMeasurer& Measurer() override { return measurer_ ? *measurer_ : WindowHost::Measurer(); }
  Size ClientSize() const override { return size_; }
  void SetCursor(unsigned cursorType) override { cursor_ = cursorType; }
  void SetMouseCapture(bool captured) override { captured_ = captured; }
  std::u16string ClipboardText() override { return clipboard_; }
  void SetClipboardText(const std::u16string& text) override { clipboard_ = text; }

  // Where "redraw at once" paints: the window and the canvas (none: nowhere).
  void RenderTo(Window* window, paint::Canvas* canvas) {
    window_ = window;
    canvas_ = canvas;
  }
  // Paints the invalid area onto the canvas given to RenderTo and forgets it.
  void PaintInvalid();

  // Runs the window's pending work until nothing is left; with a timeout, first waits up to
  // that long for a wake-up from another thread. Answers whether a wake-up came.
  bool Pump(Window& window, std::chrono::milliseconds wait = std::chrono::milliseconds(0));

  int invalidations() const { return invalidations_; }
  int immediateUpdates() const { return immediateUpdates_; }
  // The areas asked to be repainted since the last paint (or ForgetInvalid).
  const std::vector<Rect>& invalidated() const { return invalid_; }
  void ForgetInvalid() { invalid_.clear(); }
  unsigned cursor() const { return cursor_; }
  bool captured() const { return captured_; }

 private:
  const layout::TextMeasurer* measurer_ = nullptr;
  Size size_{900, 623};
  int invalidations_ = 0;
  int immediateUpdates_ = 0;
  std::vector<Rect> invalid_;
  Window* window_ = nullptr;
  paint::Canvas* canvas_ = nullptr;
  unsigned cursor_ = 0;
  bool captured_ = false;
  std::u16string clipboard_;
  std::mutex mutex_;
  std::condition_variable woken_;
  bool wakeUp_ = false;
};

}  // namespace kestrune::html::host
