#pragma once

#include <atomic>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "html/controls/control.h"
#include "html/css/style_engine.h"
#include "html/events/dispatcher.h"
#include "html/events/input_router.h"
#include "html/host/ui_thread.h"
#include "html/host/window_host.h"
#include "html/layout/layout_view.h"
#include "html/paint/painter.h"
#include "platform/http.h"

namespace kestrune::html::host {

// One document shown in one window: the document and its style, its layout and painting,
// event delivery and input, page loading with the program's load-data and attach-behavior
// notifications, popups, timers, HTTP requests, and the queue onto the UI thread. Everything
// but the queue's Post and Send is for the UI thread only.
class Window final : public controls::ControlHost, private layout::ImageSource {
 public:
  explicit Window(WindowHost& host);
  ~Window() override;
  Window(const Window&) = delete;
  Window& operator=(const Window&) = delete;

  dom::Document& document() { return *document_; }
  css::StyleEngine& styles() { return *styles_; }
  events::EventDispatcher& dispatcher() override { return *dispatcher_; }
  events::InputRouter& input() override { return *input_; }
  events::GeometrySource& geometry() override { return *view_; }
  layout::LayoutView& view() { return *view_; }
  UiThreadQueue& uiThread() { return *uiThread_; }
  WindowHost& host() { return host_; }

  void SetCallback(NotificationCallback callback, void* context);
  void SetViewSize(Size size);
  // Paints the area of the view (brought up to date first) onto the platform's canvas.
  paint::PaintStats Paint(paint::Canvas& canvas, const Rect& area);
  // Input from the platform: scroll bars and the wheel are the engine's; the rest is routed to
  // the elements. Popups close when the user presses outside them.
  bool MouseInput(const events::MouseInput& input);
  void SetCapture(dom::Element* element);
  void SetHttpClient(std::shared_ptr<platform::HttpClient> client) { http_ = std::move(client); }

  // Loads a page (UTF-8, or UTF-16 with its byte order mark). Its style sheets and images are
  // asked of the program first (kNotifyLoadData), then loaded by the engine relative to `url`.
  bool LoadHtml(const unsigned char* bytes, std::size_t length, std::u16string url);
  // Answers a kNotifyLoadData request (or supplies a resource at any time).
  bool DataReady(std::u16string_view uri, const unsigned char* bytes, std::size_t length);
  // A resource the page asked for (images, by combined URL), or none.
  const std::vector<unsigned char>* Resource(const std::u16string& url) const;

  // Replaces, prepends or appends an element's content, or replaces or surrounds the element,
  // with parsed HTML (the engine's insertion modes 0 to 5).
  bool SetElementHtml(dom::Element& element, std::u16string_view html, unsigned where);
  // Removes an element from the tree: its behaviors are detached; a handle may still hold it.
  void Detach(dom::Element& element);
  void SetInnerText(dom::Element& element, std::u16string_view text);

  // Brings styles, behaviors and repaint requests up to date with the document.
  void Update();
  // Update, then ask for a repaint of the element (at once when `now`).
  void Redraw(dom::Element* element, bool now);

  // Popups are shown above the page; the layout engine places them.
  bool ShowPopup(dom::Element& popup, dom::Element* anchor, Point at, unsigned placement);
  bool HidePopup(dom::Element& popup);
  dom::Element* HidePopupHolding(dom::Element& element) override;

  // HTTP: the answer arrives as a data-arrived event (group 0x80) at the initiator, on the UI
  // thread. With `into`, HTML that no handler takes becomes that element's content.
  void HttpRequest(dom::Element& initiator, std::u16string url, unsigned dataType, bool post,
                   std::vector<std::pair<std::u16string, std::u16string>> parameters, dom::Element* into = nullptr);

  // The platform host calls this on the UI thread when woken: queued calls, posted events,
  // due timers, then the document is brought up to date. Answers how long until the next timer
  // is due (the host wakes the window again then), or none when no timer runs.
  std::optional<events::Clock::duration> RunPending(events::Clock::time_point now = events::Clock::now());

  std::u16string ClipboardText() override { return host_.ClipboardText(); }
  void SetClipboardText(const std::u16string& text) override { host_.SetClipboardText(text); }

 private:
  struct Popup {
    dom::Ref<dom::Element> popup;
    dom::Ref<dom::Element> anchor;
  };
  struct PendingLoad;

  const std::vector<unsigned char>* ImageData(const std::u16string& url) override;
  unsigned CursorOf(const dom::Element& element) const;
  void SyncCapture();
  void DeliverSizeEvents();
  std::intptr_t Notify(NotificationHeader& header);
  std::optional<std::vector<unsigned char>> Fetch(const std::u16string& url, unsigned dataType, dom::Element* initiator);
  void LoadStyleSheets();
  void AddSheet(std::u16string_view text, const std::u16string& sheetUrl, int depth);
  void RequestImages(dom::Element& subtree);
  void AttachBehaviors(dom::Element& element);
  void ElementsLeaving(dom::Element& subtree);
  // Takes every child out of the element and lets it go.
  void ReleaseChildren(dom::Element& element);
  void DeliverData(dom::Ref<dom::Element> initiator, dom::Ref<dom::Element> into, std::u16string url,
                   unsigned dataType, platform::HttpResponse response);

  WindowHost& host_;
  std::unique_ptr<dom::Document> document_;
  std::unique_ptr<css::StyleEngine> styles_;
  std::unique_ptr<events::EventDispatcher> dispatcher_;
  std::unique_ptr<layout::LayoutView> view_;
  std::unique_ptr<events::InputRouter> input_;
  std::shared_ptr<UiThreadQueue> uiThread_;
  std::shared_ptr<platform::HttpClient> http_;
  struct Worker {
    std::thread thread;
    std::shared_ptr<std::atomic<bool>> done;
  };
  void JoinFinishedWorkers();
  std::vector<Worker> workers_;
  NotificationCallback callback_ = nullptr;
  void* callbackContext_ = nullptr;
  std::map<std::u16string, std::vector<unsigned char>> resources_;
  std::vector<Popup> popups_;
  PendingLoad* pendingLoad_ = nullptr;
  bool updating_ = false;
  bool captured_ = false;
  unsigned cursor_ = events::kCursorArrow;
};

}  // namespace kestrune::html::host
