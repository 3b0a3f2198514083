#include "html/host/window.h"

#include <algorithm>

#include "base/utf.h"
#include "html/dom/states.h"
#include "html/host/url.h"
#include "html/parse/html_parser.h"

namespace kestrune::html::host {

using dom::Element;
using dom::Ref;

namespace {

// Rounds of restyling in one Update: attaching a behavior may change the document again, but
// a page that keeps doing so must not hang the window.
constexpr int kMaxUpdateRounds = 8;

}  // namespace

Window::Window(WindowHost& host)
    : host_(host),
      document_(std::make_unique<dom::Document>()),
      styles_(std::make_unique<css::StyleEngine>(*document_)),
      dispatcher_(std::make_unique<events::EventDispatcher>(*document_)),
      view_(std::make_unique<layout::LayoutView>(*document_, host.Measurer(), static_cast<layout::ImageSource&>(*this))),
      input_(std::make_unique<events::InputRouter>(*dispatcher_, *view_)),
      uiThread_(std::make_shared<UiThreadQueue>([&host] { host.RequestWakeUp(); })) {
  dispatcher_->SetWakeUp([this] { host_.RequestWakeUp(); });
  view_->SetViewSize(host.ClientSize());
  view_->SetScrollHandler([this](Element& element, unsigned cmd, int position, bool vertical) {
    events::ScrollParams params{cmd, &element, position, vertical};
    return dispatcher_->Route(&element, events::kHandleScroll, &params, params.cmd);
  });
  input_->SetCursorSource([this](const Element& element) { return CursorOf(element); });
  Update();
}

Window::~Window() {
  for (Worker& worker : workers_) worker.thread.join();
  if (document_->root()) ElementsLeaving(*document_->root());
}

void Window::SetCallback(NotificationCallback callback, void* context) {
  callback_ = callback;
  callbackContext_ = context;
}

void Window::SetViewSize(Size size) {
  view_->SetViewSize(size);
  Update();
}

paint::PaintStats Window::Paint(paint::Canvas& canvas, const Rect& area) {
  Update();
  const paint::PaintStats stats = paint::PaintView(*view_, canvas, area, dispatcher_.get());
  DeliverSizeEvents();
  return stats;
}

// Size events go to the handlers of elements whose boxes changed size; posted, since layout
// runs in the middle of painting or of a geometry question.
void Window::DeliverSizeEvents() {
  for (Ref<Element>& element : view_->TakeResized()) {
    dispatcher_->PostTask([this, element] { dispatcher_->DeliverToElement(*element, events::kHandleSize, nullptr); });
  }
}

unsigned Window::CursorOf(const Element& element) const {
  using css::Cursor;
  for (const Element* e = &element; e; e = e->parent()) {
    if (!e->style()) continue;
    switch (e->style()->cursor) {
      case Cursor::kAuto: return events::kCursorArrow;
      case Cursor::kDefault: return events::kCursorArrow;
      case Cursor::kPointer: return events::kCursorHand;
      case Cursor::kText: return events::kCursorIBeam;
      case Cursor::kWait: return events::kCursorWait;
      case Cursor::kMove: return events::kCursorSizeAll;
      case Cursor::kCrosshair: return events::kCursorCross;
      case Cursor::kHelp: return events::kCursorHelp;
      case Cursor::kNotAllowed: return events::kCursorNo;
      case Cursor::kEResize:
      case Cursor::kColResize: return events::kCursorSizeWe;
      case Cursor::kNResize:
      case Cursor::kRowResize: return events::kCursorSizeNs;
    }
  }
  return events::kCursorArrow;
}

bool Window::MouseInput(const events::MouseInput& input) {
  Update();
  // A press outside every shown popup closes them, as a click outside a menu does.
  if (input.cmd == events::kMouseDown && !popups_.empty() && !input_->capture()) {
    Element* hit = input.target ? input.target : view_->HitTest(input.pos);
    const bool inside = std::any_of(popups_.begin(), popups_.end(), [&](const Popup& p) {
      return hit && (hit == p.popup.get() || p.popup->IsAncestorOf(hit));
    });
    if (!inside) {
      const std::vector<Popup> shown = popups_;
      for (const Popup& p : shown) HidePopup(*p.popup);
    }
  }
  bool handled = false;
  if (!input.target && view_->ScrollBarInput(input)) {
    handled = true;
  } else {
    handled = input_->Mouse(input);
    if (!handled && input.cmd == events::kMouseWheel) {
      Element* target = input.target ? input.target : view_->HitTest(input.pos);
      handled = view_->Wheel(target, input.wheelDelta);
    }
  }
  if (input_->cursor() != cursor_) {
    cursor_ = input_->cursor();
    host_.SetCursor(cursor_);
  }
  SyncCapture();
  Update();
  return handled;
}

void Window::SetCapture(Element* element) {
  if (element) input_->SetCapture(element);
  else input_->ReleaseCapture();
  SyncCapture();
}

void Window::SyncCapture() {
  const bool captured = input_->capture() != nullptr;
  if (captured == captured_) return;
  captured_ = captured;
  host_.SetMouseCapture(captured);
}

const std::vector<unsigned char>* Window::ImageData(const std::u16string& url) {
  if (const auto* data = Resource(url)) return data;
  return Resource(CombineUrl(document_->url(), url));
}

std::intptr_t Window::Notify(NotificationHeader& header) {
  if (callback_ == nullptr) return 0;
  header.window = this;
  return callback_(kWmNotify, 0, reinterpret_cast<std::intptr_t>(&header), callbackContext_);
}

void Window::AttachBehaviors(Element& element) {
  // Held, so that the names stay while handlers run (and may restyle the element). An element
  // that left the document while behaviors were being attached lost its style there.
  const std::shared_ptr<const css::ComputedStyle> style = element.style();
  if (!style) return;
  const std::vector<std::string>& names = css::BehaviorNames(*style);
  if (dom::RareData* rare = element.rareIfAny()) {
    dom::NodeVector<dom::AttachedHandler> gone;
    for (const dom::AttachedHandler& handler : rare->handlers) {
      if (!handler.behavior.empty() && std::find(names.begin(), names.end(), handler.behavior) == names.end()) {
        gone.push_back(handler);
      }
    }
    for (const dom::AttachedHandler& handler : gone) dispatcher_->DetachHandler(element, handler.proc, handler.tag);
  }
  for (const std::string& name : names) {
    const dom::RareData* rare = element.rareIfAny();
    if (rare && std::any_of(rare->handlers.begin(), rare->handlers.end(),
                            [&](const dom::AttachedHandler& h) { return h.behavior == name; })) {
      continue;
    }
    // The program's behaviors of a name come first; the engine's own control otherwise.
    AttachBehaviorNotification notification{{this, 0, kNotifyAttachBehavior}, &element, name.c_str(), nullptr, nullptr, 0};
    Notify(notification.header);
    if (notification.elementProc != nullptr) {
      dispatcher_->AttachHandler(element, {notification.elementProc, notification.elementTag, notification.elementEvents, name});
    } else if (auto control = controls::MakeBuiltInControl(name, *this)) {
      controls::AttachControl(element, std::move(control), name, *dispatcher_);
    }
  }
}

void Window::ElementsLeaving(Element& subtree) {
  input_->ForgetInside(subtree);
  popups_.erase(std::remove_if(popups_.begin(), popups_.end(),
                               [&](const Popup& p) { return p.popup.get() == &subtree || subtree.IsAncestorOf(p.popup.get()); }),
                popups_.end());
  for (Element* element = &subtree; element; element = dom::NextElementInOrder(element, &subtree)) {
    if (dom::RareData* rare = element->rareIfAny(); rare && !rare->handlers.empty()) dispatcher_->DetachAll(*element, false);
    // Behaviors come back with a fresh style if a held element returns to the document.
    if (element->style() && element->style()->behaviors) element->SetStyle(nullptr);
  }
  if (document_->root()) dispatcher_->DropTimersOutside(*document_->root());
}

void Window::Update() {
  if (updating_) return;
  updating_ = true;
  for (int round = 0; round < kMaxUpdateRounds; ++round) {
    css::StyleChanges changes;
    styles_->Update(&changes);
    if (changes.empty()) break;
    for (const Ref<Element>& element : changes.behaviors) AttachBehaviors(*element);
    // Behaviors that draw or animate learn when their container is shown or hidden.
    for (int shown = 0; shown < 2; ++shown) {
      for (const Ref<Element>& container : shown ? changes.shown : changes.hidden) {
        for (Element* element = container.get(); element; element = dom::NextElementInOrder(element, container.get())) {
          const dom::RareData* rare = element->rareIfAny();
          if (!rare || rare->handlers.empty()) continue;
          events::BehaviorEventParams params{events::kVisualStatusChanged, element, container.get(),
                                             static_cast<std::uintptr_t>(shown)};
          dispatcher_->DeliverToElement(*element, events::kHandleBehaviorEvent, &params);
        }
      }
    }
  }
  updating_ = false;
  for (const Rect& area : view_->TakeDamage()) host_.Invalidate(&area);
  DeliverSizeEvents();
}

void Window::Redraw(Element* element, bool now) {
  Update();
  if (element) {
    if (auto area = view_->Location(*element, events::kViewRelative | events::kBorderBox)) host_.Invalidate(&*area);
  } else {
    host_.Invalidate(nullptr);
  }
  if (now) host_.UpdateNow();
}

bool Window::SetElementHtml(Element& element, std::u16string_view html, unsigned where) {
  Element* parent = element.parent();
  if (where >= 3 && parent == nullptr) return false;
  if (where > 5) return false;
  Ref<Element> hold(&element);
  // Content that is replaced goes first: its memory is then warm for the new nodes, and the new
  // nodes are still in the cache when they are inserted and styled.
  if (where == 0) ReleaseChildren(element);
  std::vector<Element*> images;
  auto nodes = parse::ParseFragment(html, where >= 3 ? parent->tag() : element.tag(), &images);
  for (Element* image : images) RequestImages(*image);
  switch (where) {
    case 1:
      for (std::size_t i = 0; i < nodes.size(); ++i) element.InsertNodeAt(i, nodes[i]);
      break;
    case 0:
    case 2:
      element.AppendChildren(nodes);
      break;
    default: {
      std::size_t at = element.nodeIndex() + (where == 5 ? 1 : 0);
      for (auto& node : nodes) parent->InsertNodeAt(at++, node);
      if (where == 3) Detach(element);
      break;
    }
  }
  Update();
  return true;
}

void Window::Detach(Element& element) {
  Element* parent = element.parent();
  if (parent == nullptr) return;
  Ref<Element> hold(&element);
  parent->RemoveChild(&element);
  ElementsLeaving(element);
  Update();
}

void Window::ReleaseChildren(Element& element) {
  for (Ref<dom::Node>& old : element.RemoveAllChildren()) {
    if (Element* gone = dom::AsElement(old.get())) ElementsLeaving(*gone);
    old = {};  // freed at once, while its nodes are still in the cache
  }
}

void Window::SetInnerText(Element& element, std::u16string_view text) {
  ReleaseChildren(element);
  if (!text.empty()) element.AppendChild(dom::Text::Create(std::u16string(text)));
  Update();
}

bool Window::ShowPopup(Element& popup, Element* anchor, Point at, unsigned placement) {
  if (popup.document() != document_.get()) return false;
  HidePopup(popup);
  popups_.push_back({Ref<Element>(&popup), Ref<Element>(anchor)});
  popup.SetState(popup.state() | dom::kStatePopup);
  if (anchor) anchor->SetState(anchor->state() | dom::kStateOwnsPopup);
  Update();
  view_->PlacePopup(popup, anchor, at, placement);
  dispatcher_->PostEvent(&popup, events::kPopupReady, anchor ? anchor : &popup, 0);
  Update();
  return true;
}

bool Window::HidePopup(Element& popup) {
  auto found = std::find_if(popups_.begin(), popups_.end(), [&](const Popup& p) { return p.popup.get() == &popup; });
  if (found == popups_.end()) return false;
  const Popup gone = *found;
  popups_.erase(found);
  // Where it was is repainted before it goes.
  if (auto area = view_->Location(popup, events::kViewRelative | events::kMarginBox)) host_.Invalidate(&*area);
  popup.SetState(popup.state() & ~dom::kStatePopup);
  if (gone.anchor) gone.anchor->SetState(gone.anchor->state() & ~dom::kStateOwnsPopup);
  dispatcher_->PostEvent(&popup, events::kPopupDismissed, gone.anchor ? gone.anchor.get() : &popup, 0);
  Update();
  return true;
}

Element* Window::HidePopupHolding(Element& element) {
  for (const Popup& p : popups_) {
    if (p.popup.get() == &element || p.popup->IsAncestorOf(&element)) {
      const Popup held = p;
      HidePopup(*held.popup);
      return held.anchor.get();
    }
  }
  return nullptr;
}

void Window::HttpRequest(Element& initiator, std::u16string url, unsigned dataType, bool post,
                         std::vector<std::pair<std::u16string, std::u16string>> parameters, Element* into) {
  if (!http_) http_ = platform::MakeSystemHttpClient();
  platform::HttpRequest request{url, post, std::move(parameters)};
  std::weak_ptr<UiThreadQueue> queue = uiThread_;
  JoinFinishedWorkers();
  auto done = std::make_shared<std::atomic<bool>>(false);
  std::thread thread([this, client = http_, request = std::move(request), queue, done, held = Ref<Element>(&initiator),
                      target = Ref<Element>(into), dataType]() mutable {
    platform::HttpResponse response = client->Fetch(request);
    if (auto ui = queue.lock()) {
      // The element references move with the call: they are released on the UI thread only.
      auto call = std::make_shared<std::function<void()>>();
      *call = [this, held = std::move(held), target = std::move(target), url = request.url, dataType,
               response = std::move(response)]() mutable {
        DeliverData(std::move(held), std::move(target), std::move(url), dataType, std::move(response));
      };
      ui->Post([call] { (*call)(); });
    }
    *done = true;
  });
  workers_.push_back({std::move(thread), std::move(done)});
}

void Window::JoinFinishedWorkers() {
  auto finished = std::stable_partition(workers_.begin(), workers_.end(), [](const Worker& w) { return !*w.done; });
  for (auto it = finished; it != workers_.end(); ++it) it->thread.join();
  workers_.erase(finished, workers_.end());
}

void Window::DeliverData(Ref<Element> initiator, Ref<Element> into, std::u16string url, unsigned dataType,
                         platform::HttpResponse response) {
  const bool ok = response.completed && response.status >= 200 && response.status < 300;
  const unsigned status = ok ? 0u : (response.completed ? response.status : 1u);
  events::DataArrivedParams params{initiator.get(), response.body.data(), static_cast<unsigned>(response.body.size()),
                                   dataType, status, url.c_str()};
  const bool handled = dispatcher_->DeliverToElement(*initiator, events::kHandleDataArrived, &params);
  if (!handled && ok && into && dataType == events::kDataHtml) {
    const std::string bytes(response.body.begin(), response.body.end());
    SetElementHtml(*into, DecodeUtf8(bytes), 0);
  }
  Update();
}

std::optional<events::Clock::duration> Window::RunPending(events::Clock::time_point now) {
  uiThread_->RunQueued();
  JoinFinishedWorkers();
  Update();  // size events of the last layout are posted with the rest
  dispatcher_->RunPosted();
  dispatcher_->RunDueTimers(now);
  const bool animating = view_->Animate(now);
  Update();
  auto next = dispatcher_->NextTimer();
  // A smooth scroll under way wants the next frame soon.
  if (animating) next = std::min(next.value_or(events::Clock::time_point::max()), now + std::chrono::milliseconds(16));
  if (!next) return std::nullopt;
  return std::max(events::Clock::duration::zero(), *next - now);
}

}  // namespace kestrune::html::host
