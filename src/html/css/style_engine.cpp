#include "html/css/style_engine.h"

#include <algorithm>

#include "base/text.h"

namespace kestrune::html::css {
namespace {

struct ParsedInlineStyle : dom::Extension {
  std::vector<Declaration> declarations;
};

std::shared_ptr<const StyleSheet> MasterSheet() {
  static const std::shared_ptr<const StyleSheet> sheet =
      std::make_shared<const StyleSheet>(ParseStyleSheet(MasterStyleSheetText()));
  return sheet;
}

const std::vector<Declaration>& InlineDeclarations(dom::Element& element) {
  static const std::vector<Declaration> kNone;
  const std::u16string* text = element.Attr(dom::kAtomStyle);
  if (text == nullptr) return kNone;
  dom::RareData& rare = element.rare();
  if (!rare.parsedInlineStyle) {
    auto parsed = std::make_unique<ParsedInlineStyle>();
    parsed->declarations = ParseDeclarationBlock(*text);
    rare.parsedInlineStyle = std::move(parsed);
  }
  return static_cast<const ParsedInlineStyle&>(*rare.parsedInlineStyle).declarations;
}

std::vector<Declaration> RuntimeDeclarations(const dom::RareData& rare) {
  std::vector<Declaration> out;
  for (const auto& [name, value] : rare.runtimeStyle) {
    std::vector<Token> tokens = Tokenize(value);
    while (!tokens.empty() && tokens.back().Is(Token::Type::kWhitespace)) tokens.pop_back();
    if (!tokens.empty() && tokens.front().Is(Token::Type::kWhitespace)) tokens.erase(tokens.begin());
    ExpandDeclaration(name, tokens, false, out);
  }
  return out;
}

std::vector<std::u16string> Words(std::u16string_view text) {
  std::vector<std::u16string> words;
  std::size_t at = 0;
  while (at < text.size()) {
    while (at < text.size() && (text[at] == u' ' || text[at] == u'\t' || text[at] == u'\n' || text[at] == u'\r')) ++at;
    std::size_t end = at;
    while (end < text.size() && !(text[end] == u' ' || text[end] == u'\t' || text[end] == u'\n' || text[end] == u'\r')) ++end;
    if (end > at) words.emplace_back(text.substr(at, end - at));
    at = end;
  }
  return words;
}

}  // namespace

bool IsShown(const ComputedStyle& style) {
  return style.display != Display::kNone && style.visibility == Visibility::kVisible;
}

std::size_t StyleEngine::KeyHash::operator()(const std::vector<std::uintptr_t>& key) const {
  std::uint64_t hash = 1469598103934665603ull;
  for (std::uintptr_t part : key) hash = (hash ^ part) * 1099511628211ull;
  return static_cast<std::size_t>(hash ^ (hash >> 32));
}

StyleEngine::StyleEngine(dom::Document& document) : document_(document), master_(MasterSheet()) { Reindex(); }

void StyleEngine::ClearPageSheets() {
  pageSheets_.clear();
  Reindex();
}

void StyleEngine::AddPageSheet(StyleSheet sheet) {
  pageSheets_.push_back(std::move(sheet));
  Reindex();
}

void StyleEngine::CollectStructural(const std::vector<ComplexSelector>& selectors) {
  for (const ComplexSelector& selector : selectors) {
    for (const Compound& compound : selector.compounds) {
      for (const PseudoTest& pseudo : compound.pseudos) {
        using Kind = PseudoTest::Kind;
        if (pseudo.kind == Kind::kNot) {
          CollectStructural(pseudo.negated);
          continue;
        }
        if (pseudo.kind == Kind::kState || pseudo.kind == Kind::kEnabled || pseudo.kind == Kind::kRoot) continue;
        const bool known = std::any_of(structural_.begin(), structural_.end(), [&](const StructuralTest& t) {
          return t.pseudo.kind == pseudo.kind && t.pseudo.a == pseudo.a && t.pseudo.b == pseudo.b;
        });
        if (!known) structural_.push_back({pseudo});
      }
    }
  }
}

void StyleEngine::IndexSheet(const StyleSheet& sheet, std::uint8_t origin) {
  for (const Rule& rule : sheet.rules) {
    CollectStructural(rule.selectors);
    for (const ComplexSelector& selector : rule.selectors) {
      CollectFeatures(selector, document_.features());
      const Compound& subject = selector.compounds.back();
      const IndexedRule indexed{&selector, &rule, nextOrder_++, origin};
      if (!subject.ids.empty()) byId_[subject.ids.front()].push_back(indexed);
      else if (!subject.classes.empty()) byClass_[subject.classes.front()].push_back(indexed);
      else if (subject.tag != dom::kAtomNone) byTag_[subject.tag].push_back(indexed);
      else universal_.push_back(indexed);
    }
  }
}

void StyleEngine::Reindex() {
  byId_.clear();
  byClass_.clear();
  byTag_.clear();
  universal_.clear();
  nextOrder_ = 0;
  structural_.clear();
  document_.features() = dom::StyleFeatures{};
  IndexSheet(*master_, 0);
  for (const StyleSheet& sheet : pageSheets_) IndexSheet(sheet, 1);
  std::sort(document_.features().attributes.begin(), document_.features().attributes.end());
  signatures_ = !document_.features().siblingCombinators && structural_.size() <= 64;
  if (document_.root()) document_.root()->MarkStyleDirty(true);
}

void StyleEngine::CollectMatches(const dom::Element& element) {
  matched_.clear();
  auto consider = [&](const std::vector<IndexedRule>& rules) {
    for (const IndexedRule& rule : rules) {
      if (Matches(*rule.selector, element)) matched_.push_back(&rule);
    }
  };
  if (!byId_.empty()) {
    if (const std::u16string* id = element.Attr(dom::kAtomId)) {
      auto found = byId_.find(*id);
      if (found != byId_.end()) consider(found->second);
    }
  }
  if (!byClass_.empty()) {
    if (const std::u16string* classes = element.Attr(dom::kAtomClass)) {
      for (const std::u16string& word : Words(*classes)) {
        auto found = byClass_.find(word);
        if (found != byClass_.end()) consider(found->second);
      }
    }
  }
  auto byTag = byTag_.find(element.tag());
  if (byTag != byTag_.end()) consider(byTag->second);
  consider(universal_);
  std::sort(matched_.begin(), matched_.end(), [](const IndexedRule* a, const IndexedRule* b) {
    if (a->origin != b->origin) return a->origin < b->origin;
    if (a->selector->specificity != b->selector->specificity) return a->selector->specificity < b->selector->specificity;
    return a->order < b->order;
  });
  // A rule can be reached twice (two classes of one element naming the same rule).
  matched_.erase(std::unique(matched_.begin(), matched_.end()), matched_.end());
}

// A signature starts with the parent's chain, the tag, the tested states and the structural
// results; the values of the tested attributes follow.
constexpr std::size_t kSignatureHead = 4;

std::uint32_t StyleEngine::ChainOf(const dom::Element& element, std::uint32_t parentChain) {
  const dom::StyleFeatures& features = document_.features();
  signature_.clear();
  signature_.push_back(parentChain);
  signature_.push_back(element.tag());
  signature_.push_back(element.state() & features.states);
  std::uint64_t bits = 0;
  if (element.parent()) {
    for (std::size_t i = 0; i < structural_.size(); ++i) {
      if (MatchesPseudo(structural_[i].pseudo, element)) bits |= std::uint64_t{1} << i;
    }
  }
  signature_.push_back(bits);
  lastValues_.resize(features.attributes.size());
  for (std::size_t i = 0; i < features.attributes.size(); ++i) {
    const std::u16string* value = element.attributes().empty() ? nullptr : element.Attr(features.attributes[i]);
    if (value == nullptr) {
      signature_.push_back(0);
      continue;
    }
    auto& [lastValue, lastId] = lastValues_[i];
    if (lastId == 0 || lastValue != *value) {
      lastValue = *value;
      lastId = values_.try_emplace(*value, static_cast<std::uint32_t>(values_.size() + 1)).first->second;
    }
    signature_.push_back(lastId);
  }
  return chains_.IdOf(signature_.data());
}

std::shared_ptr<const ComputedStyle> StyleEngine::Compute(dom::Element& element,
                                                          const std::shared_ptr<const ComputedStyle>& parent,
                                                          std::uint32_t chain) {
  const dom::RareData* rare = element.rareIfAny();
  const bool personal = element.HasAttr(dom::kAtomStyle) || (rare && !rare->runtimeStyle.empty());
  const std::pair<std::uintptr_t, std::uint32_t> chainKey{reinterpret_cast<std::uintptr_t>(parent.get()), chain};
  if (!personal && chain != 0) {
    if (chain < byChain_.size() && byChain_[chain].style && byChain_[chain].parent == parent.get()) {
      ++lastShared_;
      return byChain_[chain].style;
    }
    auto found = byChainElsewhere_.find(chainKey);
    if (found != byChainElsewhere_.end()) {
      ++lastShared_;
      return found->second;
    }
  }
  CollectMatches(element);
  if (!personal && chain == 0) {
    key_.assign(1, reinterpret_cast<std::uintptr_t>(parent.get()));
    for (const IndexedRule* rule : matched_) key_.push_back(reinterpret_cast<std::uintptr_t>(rule));
    auto found = shared_.find(key_);
    if (found != shared_.end()) {
      ++lastShared_;
      return found->second;
    }
  }

  // Cascade order: normal declarations by origin, specificity and order; then the inline style;
  // then important ones the same way; then what the program set.
  std::vector<const Declaration*> ordered;
  const std::vector<Declaration>& inlineStyle = InlineDeclarations(element);
  for (int important = 0; important < 2; ++important) {
    for (const IndexedRule* rule : matched_) {
      for (const Declaration& declaration : rule->rule->declarations) {
        if (declaration.important == (important == 1)) ordered.push_back(&declaration);
      }
    }
    for (const Declaration& declaration : inlineStyle) {
      if (declaration.important == (important == 1)) ordered.push_back(&declaration);
    }
  }
  const std::vector<Declaration> runtime = rare ? RuntimeDeclarations(*rare) : std::vector<Declaration>{};
  for (const Declaration& declaration : runtime) ordered.push_back(&declaration);

  auto style = std::make_shared<ComputedStyle>(ComputedStyle::InheritFrom(*parent));
  // The font size first: em lengths of every other property depend on it.
  for (const Declaration* declaration : ordered) {
    if (declaration->id == PropertyId::kFontSize) ApplyDeclaration(*declaration, *style, *parent);
  }
  for (const Declaration* declaration : ordered) {
    if (declaration->id != PropertyId::kFontSize) ApplyDeclaration(*declaration, *style, *parent);
  }
  for (Border& border : style->border) {
    if (border.currentColor) border.color = style->color;
  }
  std::shared_ptr<const ComputedStyle> result = std::move(style);
  if (!personal && chain != 0) {
    if (chain >= byChain_.size()) byChain_.resize(std::max<std::size_t>(chain + 1, byChain_.size() * 2));
    if (!byChain_[chain].style) {
      byChain_[chain] = {parent.get(), result};
    } else {
      byChainElsewhere_.emplace(chainKey, result);
    }
  } else if (!personal) {
    shared_.emplace(key_, result);
  }
  return result;
}

void StyleEngine::Visit(dom::Element& element, const std::shared_ptr<const ComputedStyle>& parent,
                        std::uint32_t parentChain, bool force, StyleChanges* changes, bool reported) {
  const std::uint16_t dirty = element.dirty();
  bool forceChildren = force || (dirty & dom::kSubtreeStyleDirty);
  const bool recompute = force || (dirty & (dom::kStyleDirty | dom::kSubtreeStyleDirty));
  const bool descend = forceChildren || (dirty & dom::kChildStyleDirty);
  const std::uint32_t chain = signatures_ && (recompute || descend) ? ChainOf(element, parentChain) : 0;
  if (recompute) {
    std::shared_ptr<const ComputedStyle> old = element.style();
    std::shared_ptr<const ComputedStyle> fresh = Compute(element, parent, chain);
    ++lastComputed_;
    if (old != fresh) {
      if (!old || !(*old == *fresh)) {
        // A change that leaves the boxes as they are (colours, states' backgrounds) only repaints.
        if (!old || !old->LayoutEqual(*fresh)) element.MarkLayoutDirty();
        element.MarkPaintDirty();
      }
      if (!old || !old->InheritedEqual(*fresh)) forceChildren = true;
      if (changes && (old ? BehaviorNames(*old) != BehaviorNames(*fresh) : !BehaviorNames(*fresh).empty())) {
        changes->behaviors.emplace_back(&element);
      }
      if (changes && old && !reported && IsShown(*old) != IsShown(*fresh)) {
        (IsShown(*fresh) ? changes->shown : changes->hidden).emplace_back(&element);
        reported = true;
      }
      element.SetStyle(std::move(fresh));
    }
  }
  // Text nodes are not looked at: a cell that holds only text has no children to visit.
  if ((forceChildren || (dirty & dom::kChildStyleDirty)) && element.elementCount() > 0) {
    for (dom::Node* node : element.nodes()) {
      if (node->IsElement()) Visit(*static_cast<dom::Element*>(node), element.style(), chain, forceChildren, changes, reported);
    }
  }
  element.ClearDirty(dom::kStyleDirty | dom::kSubtreeStyleDirty | dom::kChildStyleDirty);
}

void StyleEngine::Update(StyleChanges* changes) {
  lastComputed_ = 0;
  lastShared_ = 0;
  dom::Element* root = document_.root();
  if (!root || !(root->dirty() & (dom::kStyleDirty | dom::kSubtreeStyleDirty | dom::kChildStyleDirty))) return;
  static const std::shared_ptr<const ComputedStyle> kInitial = std::make_shared<const ComputedStyle>();
  chains_.Reset(kSignatureHead + document_.features().attributes.size());
  Visit(*root, kInitial, 0, false, changes, false);
  shared_.clear();
  byChain_.clear();
  byChainElsewhere_.clear();
  values_.clear();
  lastValues_.clear();
}

}  // namespace kestrune::html::css
