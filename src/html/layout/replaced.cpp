#include "base/text.h"
#include "html/layout/renderers.h"

namespace kestrune::html::layout {
namespace {

using css::Length;

// A size the page gives in the `width` or `height` attribute, in px.
int AttributePx(const Element& element, const char* name) {
  const std::u16string* value = element.Attr(dom::InternName(std::string_view(name)));
  if (!value) return -1;
  const auto px = ParseDecimal(*value);
  return px && *px >= 0 && *px < (1 << 20) ? static_cast<int>(*px) : -1;
}

Size NaturalSize(const Element& element, LayoutContext& ctx) {
  const std::u16string* src = element.Attr(dom::kAtomSrc);
  if (!src) return {};
  const std::shared_ptr<const Image> image = ctx.images().Get(*src);
  return image ? image->size : Size{};
}

class Replaced final : public Renderer {
 public:
  void Layout(Element& element, Box& box, const BoxInput& input, LayoutContext& ctx) const override {
    const css::ComputedStyle& style = *element.style();
    const Edges insets = Insets(style, input.cbWidth);
    const Size natural = NaturalSize(element, ctx);
    const int contentWidth = std::max(0, box.width - insets.horizontal());
    int height = AttributePx(element, "height");
    if (height < 0 && natural.width > 0) height = natural.height * contentWidth / natural.width;
    if (height < 0) height = natural.height;
    box.contentHeight = height;
    box.height = ResolveHeight(style, input, insets, height);
  }

  IntrinsicWidths Intrinsic(Element& element, LayoutContext& ctx) const override {
    int width = AttributePx(element, "width");
    if (width < 0) {
      const Size natural = NaturalSize(element, ctx);
      const int height = AttributePx(element, "height");
      width = height >= 0 && natural.height > 0 ? natural.width * height / natural.height : natural.width;
    }
    const int insets = Insets(*element.style(), 0).horizontal();
    return {width + insets, width + insets};
  }
};

}  // namespace

const Renderer& ReplacedRenderer() {
  static const Replaced renderer;
  return renderer;
}

}  // namespace kestrune::html::layout
