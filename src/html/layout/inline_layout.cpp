#include "html/layout/inline_layout.h"

#include <algorithm>
#include <climits>
#include <optional>

#include "html/controls/control.h"
#include "html/dom/states.h"
#include "html/layout/renderer.h"

namespace kestrune::html::layout {
namespace {

using css::ComputedStyle;
using css::WhiteSpace;

enum class ItemKind : std::uint8_t { kText, kAtomic, kOpen, kClose, kBreak };

struct Item {
  ItemKind kind;
  Element* element;
  const ComputedStyle* style;
  std::u16string_view text;
  std::uint32_t offset;
};

struct Rules {
  bool collapse;  // runs of white space become one space; newlines are spaces
  bool wrap;      // lines break at spaces when they are full
  bool newlines;  // a newline ends the line
};

Rules RulesOf(WhiteSpace ws) {
  switch (ws) {
    case WhiteSpace::kNoWrap: return {true, false, false};
    case WhiteSpace::kPre: return {false, false, true};
    case WhiteSpace::kPreWrap: return {false, true, true};
    case WhiteSpace::kPreLine: return {true, true, true};
    case WhiteSpace::kNormal: break;
  }
  return {true, true, false};
}

bool IsSpace(char16_t c) { return c == u' ' || c == u'\t' || c == u'\n' || c == u'\r' || c == u'\f'; }

bool IsAtomic(const ComputedStyle& style) { return style.display != css::Display::kInline; }

// An input button shows its value; it has no child nodes for it.
const std::u16string* ButtonValue(const Element& element) {
  if (element.tag() != dom::kAtomInput || !element.nodes().empty()) return nullptr;
  const std::u16string* type = element.Attr(dom::kAtomType);
  if (!type || (*type != u"button" && *type != u"submit" && *type != u"reset")) return nullptr;
  return element.Attr(dom::kAtomValue);
}

bool IsTextControl(const Element& element) {
  const controls::Control* control = controls::ControlOf(element);
  if (!control) return false;
  const unsigned type = control->Type(element);
  return type == controls::kCtlEdit || type == controls::kCtlPassword || type == controls::kCtlTextarea;
}

constexpr int kMaxInlineDepth = 64;

void Collect(Element& parent, std::uint32_t first, std::uint32_t end, std::vector<Item>& items, std::uint32_t& offset,
             LayoutContext* ctx, int depth) {
  const auto& nodes = parent.nodes();
  end = std::min<std::uint32_t>(end, static_cast<std::uint32_t>(nodes.size()));
  for (std::uint32_t i = first; i < end; ++i) {
    dom::Node* node = nodes[i];
    if (!node->IsElement()) {
      const std::u16string_view text = static_cast<const dom::Text*>(node)->text();
      if (parent.style()) items.push_back({ItemKind::kText, &parent, parent.style().get(), text, offset});
      offset += static_cast<std::uint32_t>(text.size());
      continue;
    }
    auto& child = *static_cast<Element*>(node);
    if (LaidApart(child, ctx)) continue;
    const ComputedStyle* style = child.style().get();
    if (child.tag() == dom::kAtomBr) {
      items.push_back({ItemKind::kBreak, &child, style, {}, offset});
    } else if (IsAtomic(*style) || child.tag() == dom::kAtomImg || depth >= kMaxInlineDepth) {
      items.push_back({ItemKind::kAtomic, &child, style, {}, offset});
    } else {
      if (ctx) {
        Box& box = EnsureBox(child);
        box.flags = kBoxInline;
        box.x = box.y = box.width = box.height = 0;
        child.ClearDirty(dom::kLayoutDirty | dom::kChildLayoutDirty | dom::kPaintDirty);
      }
      items.push_back({ItemKind::kOpen, &child, style, {}, offset});
      Collect(child, 0, static_cast<std::uint32_t>(child.nodes().size()), items, offset, ctx, depth + 1);
      items.push_back({ItemKind::kClose, &child, style, {}, offset});
    }
  }
}

std::vector<Item> ItemsOf(const InlineRange& range, LayoutContext* ctx) {
  std::vector<Item> items;
  std::uint32_t offset = 0;
  if (const std::u16string* value = ButtonValue(*range.container)) {
    items.push_back({ItemKind::kText, range.container, range.container->style().get(), *value, 0});
  } else {
    Collect(*range.container, range.firstNode, range.endNode, items, offset, ctx, 0);
  }
  return items;
}

// Top and bottom of a piece of a line, from the baseline (negative: above it).
struct Extent {
  int top = 0, bottom = 0;
};

Extent TextExtent(const ComputedStyle& style, LayoutContext& ctx) {
  const FontMetrics& m = ctx.MetricsOf(style);
  const int lineHeight = ctx.LineHeightOf(style);
  const int leading = lineHeight - (m.ascent + m.descent);
  const int above = leading / 2;
  int shift = 0;
  if (style.verticalAlign == css::VerticalAlign::kSub) shift = static_cast<int>(style.fontSize * 0.2f);
  if (style.verticalAlign == css::VerticalAlign::kSuper) shift = -static_cast<int>(style.fontSize * 0.35f);
  return {shift - m.ascent - above, shift + m.descent + (leading - above)};
}

// Builds lines from items: heights always, runs and places when asked.
class LineBuilder {
 public:
  LineBuilder(Element& container, int width, bool measure, bool place, PlaceMode mode, Point origin, LayoutContext& ctx)
      : style_(*container.style()),
        width_(width),
        measure_(measure),
        place_(place),
        mode_(mode),
        origin_(origin),
        ctx_(ctx),
        strut_(TextExtent(style_, ctx)) {
    StartLine();
  }

  void Run(const std::vector<Item>& items) {
    for (const Item& item : items) {
      switch (item.kind) {
        case ItemKind::kText: Text(item); break;
        case ItemKind::kAtomic: Atomic(item); break;
        case ItemKind::kOpen: Open(item); break;
        case ItemKind::kClose: Close(item); break;
        case ItemKind::kBreak:
          hasContent_ = true;
          EndLine();
          break;
      }
    }
    EndLine();
  }

  LinesSize size;
  std::vector<PlacedLine> lines;
  int minWidth = 0;  // the widest piece no soft wrap can split (intrinsic widths)
  bool intrinsicMode = false;

 private:
  struct PendingAtomic {
    Element* element;
    Box* box;
    int x;
    Extent extent;
    css::VerticalAlign align;
    Edges margins;
  };

  void StartLine() {
    x_ = 0;
    hasContent_ = false;
    breakable_ = false;
    extent_ = strut_;
    tallest_ = 0;
    trailingSpace_ = 0;
    segment_ = 0;
    line_ = PlacedLine{};
    atomics_.clear();
  }

  // The x after everything added so far: measures the open run when its width is still unknown.
  int X() {
    if (measure_ && !line_.runs.empty()) {
      PlacedRun& run = line_.runs.back();
      if (run.kind == PlacedRun::Kind::kText && run.width < 0) {
        run.width = ctx_.measurer().TextWidth(FontOf(*run.style), run.text);
        x_ = run.x + run.width;
      }
    }
    return x_;
  }

  PlacedRun& TextRun(const Item& item) {
    if (!line_.runs.empty()) {
      PlacedRun& last = line_.runs.back();
      if (last.kind == PlacedRun::Kind::kText && last.element == item.element && last.style == item.style) return last;
    }
    PlacedRun run;
    run.element = item.element;
    run.style = item.style;
    run.x = X();
    run.offset = item.offset;
    run.width = 0;
    line_.runs.push_back(std::move(run));
    return line_.runs.back();
  }

  // Adds text to the line: measured now when it can wrap, else when something follows it.
  void AddText(const Item& item, std::u16string_view text, bool space, bool wraps) {
    if (space && !hasContent_ && RulesOf(item.style->whiteSpace).collapse) return;
    int width = -1;
    if (measure_ && (wraps || intrinsicMode)) {
      width = space ? ctx_.SpaceWidth(*item.style) : ctx_.measurer().TextWidth(FontOf(*item.style), text);
      if (!space && wraps && breakable_ && hasContent_ && X() - trailingSpace_ + width > width_) {
        EndLine();
      }
    }
    const Extent extent = TextExtent(*item.style, ctx_);
    extent_.top = std::min(extent_.top, extent.top);
    extent_.bottom = std::max(extent_.bottom, extent.bottom);
    hasContent_ = true;
    if (measure_ || place_) {
      PlacedRun& run = TextRun(item);
      if (run.text.empty()) run.offset = item.offset + static_cast<std::uint32_t>(text.data() - item.text.data());
      run.text.append(space && RulesOf(item.style->whiteSpace).collapse ? u" " : text);
      if (width >= 0 && run.width >= 0) {
        run.width += width;
        x_ = run.x + run.width;
      } else {
        run.width = -1;
      }
    }
    if (space && wraps) {
      trailingSpace_ = width > 0 ? width : 0;
      breakable_ = true;
      segment_ = 0;
    } else {
      trailingSpace_ = 0;
      if (width > 0) segment_ += width;
      minWidth = std::max(minWidth, segment_);
    }
  }

  void Text(const Item& item) {
    const Rules rules = RulesOf(item.style->whiteSpace);
    const std::u16string_view text = item.text;
    std::size_t word = 0;
    auto flush = [&](std::size_t end) {
      if (end > word) AddText(item, text.substr(word, end - word), false, rules.wrap);
    };
    for (std::size_t i = 0; i < text.size(); ++i) {
      const char16_t c = text[i];
      if (rules.newlines && c == u'\n') {
        flush(i);
        hasContent_ = true;
        EndLine();
        word = i + 1;
        lastCollapsed_ = false;
      } else if (IsSpace(c) && rules.collapse) {
        flush(i);
        if (!lastCollapsed_) AddText(item, text.substr(i, 1), true, rules.wrap);
        lastCollapsed_ = true;
        word = i + 1;
      } else if (IsSpace(c) && rules.wrap) {
        flush(i);
        AddText(item, text.substr(i, 1), true, true);
        word = i + 1;
      } else {
        lastCollapsed_ = false;
      }
    }
    flush(text.size());
  }

  void Atomic(const Item& item) {
    Element& element = *item.element;
    const ComputedStyle& style = *item.style;
    const Edges margins = Margins(style, width_);
    Box* box = nullptr;
    int outerWidth = 0, outerHeight = 0, baseline = -1;
    if (intrinsicMode) {
      const IntrinsicWidths widths = IntrinsicOf(element, ctx_);
      outerWidth = widths.max + margins.horizontal();
      minWidth = std::max(minWidth, widths.min + margins.horizontal());
    } else {
      if (!place_) {
        const int available = std::max(0, width_ - margins.horizontal());
        const bool sized = style.width.unit == css::Length::Unit::kPx || style.width.unit == css::Length::Unit::kPercent;
        const int borderWidth = sized ? ResolveWidth(style, width_, Insets(style, width_), 0) : ShrinkToFit(element, available, ctx_);
        LayoutElement(element, {borderWidth, -1, width_, -1}, ctx_);
      }
      box = BoxOf(element);
      if (!box) return;
      outerWidth = box->width + margins.horizontal();
      outerHeight = box->height + margins.vertical();
      baseline = box->baseline >= 0 ? margins.top + box->baseline : outerHeight;
    }
    const bool wraps = RulesOf(style_.whiteSpace).wrap;
    if (measure_ && wraps && hasContent_ && X() - trailingSpace_ + outerWidth > width_) EndLine();
    const int x = X();
    Extent extent{-baseline, outerHeight - baseline};
    const FontMetrics& strut = ctx_.MetricsOf(style_);
    switch (style.verticalAlign) {
      case css::VerticalAlign::kMiddle: extent.top = -(strut.ascent - strut.descent) / 2 - outerHeight / 2; break;
      case css::VerticalAlign::kTextTop: extent.top = -strut.ascent; break;
      case css::VerticalAlign::kTextBottom: extent.top = strut.descent - outerHeight; break;
      case css::VerticalAlign::kSub: extent.top += static_cast<int>(style_.fontSize * 0.2f); break;
      case css::VerticalAlign::kSuper: extent.top -= static_cast<int>(style_.fontSize * 0.35f); break;
      default: break;
    }
    extent.bottom = extent.top + outerHeight;
    const bool lineAligned = style.verticalAlign == css::VerticalAlign::kTop || style.verticalAlign == css::VerticalAlign::kBottom;
    if (lineAligned) {
      tallest_ = std::max(tallest_, outerHeight);
    } else {
      extent_.top = std::min(extent_.top, extent.top);
      extent_.bottom = std::max(extent_.bottom, extent.bottom);
    }
    hasContent_ = true;
    breakable_ = true;
    trailingSpace_ = 0;
    segment_ = 0;
    lastCollapsed_ = false;
    if (place_ && box) {
      atomics_.push_back({&element, box, x, extent, style.verticalAlign, margins});
      PlacedRun run;
      run.kind = PlacedRun::Kind::kAtomic;
      run.element = &element;
      run.style = &style;
      run.x = x;
      run.width = outerWidth;
      line_.runs.push_back(std::move(run));
    }
    x_ = x + outerWidth;
  }

  void Open(const Item& item) {
    const Edges b = BorderWidths(*item.style), p = Padding(*item.style, width_), m = Margins(*item.style, width_);
    const int left = b.left + p.left + m.left;
    if (measure_ || place_) open_.push_back({item.element, X() + m.left});
    x_ = X() + left;
    if (left > 0) lastCollapsed_ = false;
  }

  void Close(const Item& item) {
    const Edges b = BorderWidths(*item.style), p = Padding(*item.style, width_), m = Margins(*item.style, width_);
    const int right = b.right + p.right + m.right;
    x_ = X() + right;
    if (!open_.empty() && open_.back().element == item.element) {
      if (place_) line_.fragments.push_back({item.element, open_.back().left, x_ - m.right});
      open_.pop_back();
    }
  }

  void EndLine() {
    lastCollapsed_ = false;
    if (!hasContent_) {
      StartLine();
      for (InlineFragment& fragment : open_) fragment.left = 0;
      return;
    }
    const bool needWidth = measure_ && (mode_ == PlaceMode::kMeasureAll || style_.textAlign != css::TextAlign::kLeft ||
                                        !open_.empty() || intrinsicMode);
    const int lineWidth = std::max(0, (needWidth ? X() : x_) - trailingSpace_);
    if (!line_.runs.empty() && trailingSpace_ > 0) {
      PlacedRun& last = line_.runs.back();
      if (last.kind == PlacedRun::Kind::kText && !last.text.empty() && last.text.back() == u' ') {
        last.text.pop_back();
        if (last.width > 0) last.width -= trailingSpace_;
      }
    }
    int height = extent_.bottom - extent_.top;
    if (tallest_ > height) height = tallest_;
    const int baseline = -extent_.top;
    const int top = size.height;
    size.height += height;
    size.lastBaseline = top + baseline;
    size.width = std::max(size.width, lineWidth);
    if (place_) {
      int shift = 0;
      const int free = width_ - lineWidth;
      if (measure_ && free > 0 && style_.textAlign == css::TextAlign::kRight) shift = free;
      if (measure_ && free > 0 && style_.textAlign == css::TextAlign::kCenter) shift = free / 2;
      for (const InlineFragment& open : open_) line_.fragments.push_back({open.element, open.left, X()});
      for (PlacedRun& run : line_.runs) {
        run.x += shift;
        if (run.kind == PlacedRun::Kind::kText) {
          const FontMetrics& m = ctx_.MetricsOf(*run.style);
          run.top = top + baseline - m.ascent;
          run.height = m.ascent + m.descent;
        }
      }
      for (InlineFragment& fragment : line_.fragments) {
        fragment.left += shift;
        fragment.right += shift;
      }
      for (const PendingAtomic& atomic : atomics_) PlaceAtomic(atomic, top, height, baseline, shift);
      line_.top = top;
      line_.height = height;
      line_.baseline = top + baseline;
      lines.push_back(std::move(line_));
    }
    StartLine();
    for (InlineFragment& fragment : open_) fragment.left = 0;
  }

  void PlaceAtomic(const PendingAtomic& a, int top, int height, int baseline, int shift) {
    int y = top + baseline + a.extent.top;
    if (a.align == css::VerticalAlign::kTop) y = top;
    if (a.align == css::VerticalAlign::kBottom) y = top + height - (a.extent.bottom - a.extent.top);
    for (PlacedRun& run : line_.runs) {
      if (run.element == a.element && run.kind == PlacedRun::Kind::kAtomic) {
        run.top = y;
        run.height = a.extent.bottom - a.extent.top;
      }
    }
    PlaceChild(*a.element, *a.box, origin_.x + a.x + shift + a.margins.left, origin_.y + y + a.margins.top, width_, -1);
  }

  const ComputedStyle& style_;
  int width_;
  bool measure_;
  bool place_;
  PlaceMode mode_;
  Point origin_;
  LayoutContext& ctx_;
  Extent strut_;

  int x_ = 0;
  bool hasContent_ = false;
  bool breakable_ = false;
  bool lastCollapsed_ = false;
  Extent extent_;
  int tallest_ = 0;
  int trailingSpace_ = 0;
  int segment_ = 0;
  PlacedLine line_;
  std::vector<PendingAtomic> atomics_;
  std::vector<InlineFragment> open_;
};

bool AnyWraps(const std::vector<Item>& items) {
  return std::any_of(items.begin(), items.end(), [](const Item& item) {
    return item.kind == ItemKind::kText && RulesOf(item.style->whiteSpace).wrap;
  });
}

// The lines of a container holding nothing but text that never wraps nor breaks (the cells of
// a big table, mostly): one line in the container's own font. What the builder would find,
// without items or a builder; text of white space alone is left to the builder.
std::optional<LinesSize> UnwrappedTextLine(const InlineRange& range, LayoutContext& ctx) {
  const Element& container = *range.container;
  const auto& nodes = container.nodes();
  const ComputedStyle* style = container.style().get();
  if (!style || style->whiteSpace != WhiteSpace::kNoWrap || nodes.empty() || range.firstNode != 0 ||
      range.endNode < nodes.size()) {
    return std::nullopt;
  }
  bool shows = false;
  for (const dom::Node* node : nodes) {
    if (node->IsElement()) return std::nullopt;
    const std::u16string_view text = static_cast<const dom::Text*>(node)->text();
    shows = shows || std::any_of(text.begin(), text.end(), [](char16_t c) { return !IsSpace(c); });
  }
  if (!shows) return std::nullopt;
  const Extent extent = TextExtent(*style, ctx);
  return LinesSize{extent.bottom - extent.top, -extent.top, 0};
}

}  // namespace

LinesSize InlineLayout::Measure(const InlineRange& range, int width, LayoutContext& ctx) {
  if (const std::optional<LinesSize> line = UnwrappedTextLine(range, ctx)) return *line;
  const std::vector<Item> items = ItemsOf(range, &ctx);
  LineBuilder builder(*range.container, width, AnyWraps(items), false, PlaceMode::kPaint, {}, ctx);
  builder.Run(items);
  // An empty text field is still one line high.
  if (builder.size.height == 0 && IsTextControl(*range.container)) {
    const Extent strut = TextExtent(*range.container->style(), ctx);
    builder.size.height = strut.bottom - strut.top;
    builder.size.lastBaseline = -strut.top;
  }
  return builder.size;
}

std::vector<PlacedLine> InlineLayout::Place(const InlineRange& range, int width, Point origin, PlaceMode mode,
                                            LayoutContext& ctx) {
  const std::vector<Item> items = ItemsOf(range, nullptr);
  LineBuilder builder(*range.container, width, true, true, mode, origin, ctx);
  builder.Run(items);
  return std::move(builder.lines);
}

IntrinsicWidths InlineLayout::Intrinsic(const InlineRange& range, LayoutContext& ctx) {
  const std::vector<Item> items = ItemsOf(range, nullptr);
  LineBuilder builder(*range.container, INT_MAX / 4, true, false, PlaceMode::kMeasureAll, {}, ctx);
  builder.intrinsicMode = true;
  builder.Run(items);
  return {builder.minWidth, std::max(builder.minWidth, builder.size.width)};
}

bool InlineLayout::HasContent(const InlineRange& range) {
  const std::vector<Item> items = ItemsOf(range, nullptr);
  for (const Item& item : items) {
    if (item.kind == ItemKind::kAtomic || item.kind == ItemKind::kBreak) return true;
    if (item.kind != ItemKind::kText) continue;
    if (!RulesOf(item.style->whiteSpace).collapse && !item.text.empty()) return true;
    if (std::any_of(item.text.begin(), item.text.end(), [](char16_t c) { return !IsSpace(c); })) return true;
  }
  return ButtonValue(*range.container) != nullptr;
}

}  // namespace kestrune::html::layout
