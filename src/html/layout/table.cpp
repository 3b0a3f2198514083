#include <algorithm>
#include <climits>
#include <numeric>

#include "base/text.h"
#include "html/dom/states.h"
#include "html/layout/renderers.h"

namespace kestrune::html::layout {
namespace {

using css::ComputedStyle;
using css::Display;
using css::Length;

constexpr int kMaxColumns = 1000;

dom::Atom Atom(const char* name) { return dom::InternName(std::string_view(name)); }

int Span(const Element& cell) {
  static const dom::Atom colspan = Atom("colspan");
  const std::u16string* value = cell.Attr(colspan);
  if (!value) return 1;
  const auto span = ParseDecimal(*value);
  return span ? static_cast<int>(std::clamp<std::int64_t>(*span, 1, kMaxColumns)) : 1;
}

// A width given by the style or, in old pages, by the `width` attribute.
Length WidthOf(const Element& element) {
  const Length& width = element.style()->width;
  if (width.unit != Length::Unit::kAuto) return width;
  static const dom::Atom attribute = Atom("width");
  if (const std::u16string* value = element.Attr(attribute)) {
    if (!value->empty() && value->back() == u'%') {
      if (auto percent = ParseDecimal(std::u16string_view(*value).substr(0, value->size() - 1))) {
        return {static_cast<float>(*percent), Length::Unit::kPercent};
      }
    } else if (auto px = ParseDecimal(*value)) {
      return Length::Px(static_cast<float>(*px));
    }
  }
  return width;
}

struct Row {
  Element* element;
  Element* group;  // its row group, or none
  bool header;
};

struct Structure {
  std::vector<Row> rows;
  std::vector<Element*> groups;
  std::vector<Element*> columns;  // `col` elements, in order
  Element* caption = nullptr;
};

Structure StructureOf(Element& table, LayoutContext* ctx) {
  Structure s;
  static const dom::Atom fixedRows = Atom("fixedrows");
  std::size_t headerRows = 0;
  if (const std::u16string* value = table.Attr(fixedRows)) headerRows = static_cast<std::size_t>(std::max<std::int64_t>(0, ParseDecimal(*value).value_or(0)));
  auto addRow = [&](Element& row, Element* group, bool header) {
    s.rows.push_back({&row, group, header || s.rows.size() < headerRows});
  };
  for (dom::Node* node : table.nodes()) {
    Element* child = dom::AsElement(node);
    if (!child || LaidApart(*child, ctx)) continue;
    const Display display = child->style()->display;
    if (display == Display::kTableCaption) {
      if (!s.caption) s.caption = child;
    } else if (display == Display::kTableColumn) {
      s.columns.push_back(child);
    } else if (display == Display::kTableRowGroup || display == Display::kTableHeaderGroup ||
               display == Display::kTableFooterGroup) {
      s.groups.push_back(child);
      for (dom::Node* inner : child->nodes()) {
        Element* row = dom::AsElement(inner);
        if (!row || LaidApart(*row, ctx)) continue;
        if (row->tag() == dom::kAtomCol) s.columns.push_back(row);
        else addRow(*row, child, display == Display::kTableHeaderGroup);
      }
    } else {
      addRow(*child, nullptr, false);
    }
  }
  return s;
}

template <typename F>
void ForEachCell(Element& row, LayoutContext* ctx, F&& f) {
  for (dom::Node* node : row.nodes()) {
    Element* cell = dom::AsElement(node);
    if (cell && !LaidApart(*cell, ctx)) f(*cell);
  }
}

struct Column {
  int min = 0, max = 0;
  int fixed = -1;       // a px width (border box of the cells)
  float percent = -1;
  float flex = 0;
};

int CellBorderWidth(const Element& cell, const Length& width, int base) {
  const ComputedStyle& style = *cell.style();
  const Edges insets = Insets(style, base);
  const int value = Px(width, base);
  return style.boxSizing == css::BoxSizing::kBorderBox ? std::max(value, insets.horizontal()) : value + insets.horizontal();
}

// What each column asks for: from the first row (and `col`) in a fixed table, from every cell
// otherwise.
std::vector<Column> ColumnsOf(const Structure& s, const ComputedStyle& style, int base, LayoutContext& ctx) {
  std::size_t count = 0;
  for (const Row& row : s.rows) {
    std::size_t cells = 0;
    ForEachCell(*row.element, nullptr, [&](Element& cell) { cells += static_cast<std::size_t>(Span(cell)); });
    count = std::max(count, cells);
  }
  count = std::min<std::size_t>(std::max(count, s.columns.size()), kMaxColumns);
  std::vector<Column> columns(count);
  auto ask = [&](Element& cell, std::size_t at, int span, bool measure) {
    const Length width = WidthOf(cell);
    if (span == 1) {
      Column& column = columns[at];
      if (width.unit == Length::Unit::kPx) column.fixed = std::max(column.fixed, CellBorderWidth(cell, width, base));
      if (width.unit == Length::Unit::kPercent) column.percent = std::max(column.percent, width.value);
      if (IsFlexible(width)) column.flex = std::max(column.flex, width.value);
    }
    if (!measure) return;
    const IntrinsicWidths widths = IntrinsicOf(cell, ctx);
    int min = widths.min, max = widths.max;
    if (width.unit == Length::Unit::kPx) min = max = std::max(min, CellBorderWidth(cell, width, base));
    if (span == 1) {
      columns[at].min = std::max(columns[at].min, min);
      columns[at].max = std::max(columns[at].max, max);
      return;
    }
    // A spanning cell spreads what its columns lack evenly over them.
    int haveMin = 0, haveMax = 0;
    for (int k = 0; k < span; ++k) {
      haveMin += columns[at + static_cast<std::size_t>(k)].min;
      haveMax += columns[at + static_cast<std::size_t>(k)].max;
    }
    for (int k = 0; k < span; ++k) {
      Column& column = columns[at + static_cast<std::size_t>(k)];
      if (min > haveMin) column.min += (min - haveMin) / span;
      if (max > haveMax) column.max += (max - haveMax) / span;
      column.max = std::max(column.max, column.min);
    }
  };
  for (std::size_t k = 0; k < s.columns.size() && k < count; ++k) {
    const Length width = WidthOf(*s.columns[k]);
    if (width.unit == Length::Unit::kPx) columns[k].fixed = static_cast<int>(width.value);
    if (width.unit == Length::Unit::kPercent) columns[k].percent = width.value;
    if (IsFlexible(width)) columns[k].flex = width.value;
  }
  const bool fixed = style.tableLayoutFixed;
  for (std::size_t r = 0; r < s.rows.size(); ++r) {
    if (fixed && r > 0) break;
    std::size_t at = 0;
    ForEachCell(*s.rows[r].element, nullptr, [&](Element& cell) {
      if (at >= count) return;
      const int span = static_cast<int>(std::min<std::size_t>(static_cast<std::size_t>(Span(cell)), count - at));
      ask(cell, at, span, !fixed);
      at += static_cast<std::size_t>(span);
    });
  }
  return columns;
}

// Column widths (border boxes of their cells) that fill `available` when they can.
std::vector<int> Distribute(const std::vector<Column>& columns, int available, bool fixed) {
  std::vector<int> widths(columns.size(), 0);
  int used = 0;
  float flex = 0;
  std::vector<std::size_t> open;  // columns that take a share of what is left
  for (std::size_t k = 0; k < columns.size(); ++k) {
    const Column& c = columns[k];
    if (c.fixed >= 0) widths[k] = std::max(c.fixed, fixed ? 0 : c.min);
    else if (c.percent >= 0) widths[k] = std::max(static_cast<int>(static_cast<float>(available) * c.percent / 100), fixed ? 0 : c.min);
    else if (c.flex > 0) flex += c.flex;
    else open.push_back(k);
    if (c.fixed < 0 && c.percent < 0) widths[k] = fixed ? 0 : c.min;
    used += widths[k];
  }
  int free = std::max(0, available - used);
  if (flex > 0) {
    for (std::size_t k = 0; k < columns.size(); ++k) {
      if (columns[k].flex <= 0 || columns[k].fixed >= 0 || columns[k].percent >= 0) continue;
      const int share = static_cast<int>(static_cast<float>(free) * columns[k].flex / flex + 0.5f);
      const int give = std::min(free, share);
      widths[k] += give;
      free -= give;
      flex -= columns[k].flex;
    }
    return widths;
  }
  if (open.empty() || free == 0) return widths;
  if (fixed) {
    for (std::size_t i = 0; i < open.size(); ++i) {
      const int give = free / static_cast<int>(open.size() - i);
      widths[open[i]] += give;
      free -= give;
    }
    return widths;
  }
  // Automatic: towards each column's max-content first, then what remains in proportion.
  long long want = 0;
  for (std::size_t k : open) want += std::max(0, columns[k].max - widths[k]);
  for (std::size_t k : open) {
    const int lack = std::max(0, columns[k].max - widths[k]);
    const int give = want <= free ? lack : static_cast<int>(static_cast<long long>(free) * lack / std::max(1LL, want));
    widths[k] += give;
  }
  int rest = free - static_cast<int>(std::min<long long>(want, free));
  long long weight = 0;
  for (std::size_t k : open) weight += std::max(1, columns[k].max);
  for (std::size_t i = 0; i < open.size() && rest > 0; ++i) {
    const long long share = std::max(1, columns[open[i]].max);
    const int give = i + 1 == open.size() ? rest : static_cast<int>(static_cast<long long>(rest) * share / std::max(1LL, weight));
    widths[open[i]] += give;
    rest -= give;
    weight -= share;
  }
  return widths;
}

class Table final : public Renderer {
 public:
  void Layout(Element& table, Box& box, const BoxInput& input, LayoutContext& ctx) const override {
    const ComputedStyle& style = *table.style();
    const Edges insets = Insets(style, input.cbWidth);
    const int contentWidth = ContentWidth(box, insets);
    const int spacing = static_cast<int>(style.borderSpacing + 0.5f);
    const Structure s = StructureOf(table, &ctx);
    const std::vector<Column> columns = ColumnsOf(s, style, contentWidth, ctx);
    const int gaps = spacing * static_cast<int>(columns.size() + 1);
    std::vector<int> widths = Distribute(columns, std::max(0, contentWidth - gaps), style.tableLayoutFixed);
    // Rows that did not change keep their cells while the columns and the spacing stay.
    widths.push_back(spacing);
    const bool sameColumns = box.extras && box.extras->columns == widths;
    box.Extras().columns = widths;
    widths.pop_back();
    const bool scrolls = box.scroll() != nullptr;

    int y = insets.top;
    if (s.caption) {
      LayoutElement(*s.caption, {contentWidth, -1, contentWidth, -1}, ctx);
      PlaceChild(*s.caption, *BoxOf(*s.caption), insets.left, y, contentWidth, -1);
      y += BoxOf(*s.caption)->height;
    }
    y += spacing;
    Element* group = nullptr;
    int groupTop = 0;
    std::vector<std::pair<Element*, int>> cells;  // a row's, reused from row to row
    auto closeGroup = [&](int bottom) {
      if (!group) return;
      Box& groupBox = EnsureBox(*group);
      groupBox.flags = 0;
      groupBox.x = insets.left;
      groupBox.y = groupTop;
      groupBox.width = contentWidth;
      groupBox.height = std::max(0, bottom - groupTop);
      group->ClearDirty(dom::kLayoutDirty | dom::kChildLayoutDirty | dom::kPaintDirty);
      group = nullptr;
    };
    for (const Row& row : s.rows) {
      if (row.group != group) {
        closeGroup(y - spacing);
        group = row.group;
        groupTop = y - spacing;
      }
      const int originX = row.group ? 0 : insets.left;
      const int originY = row.group ? groupTop : 0;
      const int height = LayoutRow(*row.element, widths, spacing, contentWidth, sameColumns, cells, ctx);
      Box& rowBox = *BoxOf(*row.element);
      PlaceChild(*row.element, rowBox, originX, y - originY, contentWidth, -1);
      rowBox.Set(kBoxPinned, scrolls && row.header);
      if (scrolls && row.header) box.Extras().headerHeight = y + height - insets.top;
      y += height + spacing;
      if (y > input.stopBelow) {
        box.Set(kBoxPartial, true);
        break;
      }
    }
    closeGroup(y - spacing);
    box.Set(kBoxSortedChildren, s.caption == nullptr && s.groups.empty());
    box.contentHeight = y - insets.top;
    box.height = ResolveHeight(style, input, insets, box.contentHeight + (box.scroll() && box.scroll()->horizontal ? kScrollBarSize : 0));
  }

  IntrinsicWidths Intrinsic(Element& table, LayoutContext& ctx) const override {
    const ComputedStyle& style = *table.style();
    const Structure s = StructureOf(table, nullptr);
    IntrinsicWidths result;
    const std::vector<Column> columns = ColumnsOf(s, style, 0, ctx);
    for (const Column& column : columns) {
      const int fixed = std::max(column.fixed, 0);
      result.min += std::max(column.min, fixed);
      result.max += std::max(column.max, fixed);
    }
    const int gaps = static_cast<int>(style.borderSpacing + 0.5f) * static_cast<int>(columns.size() + 1);
    const int insets = Insets(style, 0).horizontal();
    return {result.min + gaps + insets, result.max + gaps + insets};
  }

 private:
  // Lays the row's cells out in their columns; a row that did not change keeps its boxes.
  static int LayoutRow(Element& row, const std::vector<int>& widths, int spacing, int width, bool sameColumns,
                       std::vector<std::pair<Element*, int>>& cells, LayoutContext& ctx) {
    Box& rowBox = EnsureBox(row);
    if (sameColumns && !(row.dirty() & (dom::kLayoutDirty | dom::kChildLayoutDirty)) && !rowBox.Has(kBoxHidden) &&
        rowBox.width == width && rowBox.cbWidth == width) {
      return rowBox.height;
    }
    rowBox.flags = 0;
    rowBox.width = width;
    rowBox.cbWidth = width;
    const ComputedStyle& style = *row.style();
    int height = std::max(0, Px(style.height, -1, 0));
    int x = spacing;
    std::size_t column = 0;
    cells.clear();  // with their widths
    ForEachCell(row, &ctx, [&](Element& cell) {
      const std::size_t span = std::min<std::size_t>(static_cast<std::size_t>(Span(cell)), widths.size() - std::min(column, widths.size()));
      int cellWidth = 0;
      for (std::size_t k = 0; k < span; ++k) cellWidth += widths[column + k] + (k > 0 ? spacing : 0);
      LayoutElement(cell, {cellWidth, -1, width, -1}, ctx);
      Box& cellBox = *BoxOf(cell);
      PlaceChild(cell, cellBox, x, 0, width, -1);
      // A cell kept from before is already as tall as its row was: its own height counts.
      const ComputedStyle& cellStyle = *cell.style();
      const Edges insets = Insets(cellStyle, width);
      height = std::max(height, ResolveHeight(cellStyle, {cellWidth, -1, width, -1}, insets, cellBox.contentHeight));
      cells.emplace_back(&cell, cellWidth);
      x += cellWidth + spacing;
      column += span;
    });
    // Every cell is as tall as its row. Lines move down inside a cell from LinesOrigin when
    // they are placed; other content is laid out again in the row's height.
    for (const auto& [cell, cellWidth] : cells) {
      Box& cellBox = *BoxOf(*cell);
      const bool lines = cellBox.Has(kBoxInlineContent) && !(cellBox.extras && !cellBox.extras->segments.empty());
      if (!lines && cellBox.height != height && !cellBox.Has(kBoxScroller)) {
        LayoutElement(*cell, {cellWidth, height, width, -1}, ctx);
      }
      cellBox.height = height;
    }
    rowBox.height = height;
    row.ClearDirty(dom::kLayoutDirty | dom::kChildLayoutDirty | dom::kPaintDirty);
    return height;
  }
};

}  // namespace

const Renderer& TableRenderer() {
  static const Table renderer;
  return renderer;
}

}  // namespace kestrune::html::layout
