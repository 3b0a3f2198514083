#pragma once

#include <cstdint>
#include <memory>
#include <unordered_map>
#include <vector>

#include "html/css/computed_style.h"
#include "html/css/key_table.h"
#include "html/css/stylesheet.h"
#include "html/dom/document.h"

namespace kestrune::html::css {

const char16_t* MasterStyleSheetText();

// What a restyle changed that the host acts on.
struct StyleChanges {
  std::vector<dom::Ref<dom::Element>> behaviors;  // the `behavior` list changed
  std::vector<dom::Ref<dom::Element>> shown;      // went from hidden (display or visibility) to shown
  std::vector<dom::Ref<dom::Element>> hidden;     // ... and back
  bool empty() const { return behaviors.empty() && shown.empty() && hidden.empty(); }
};

// Whether the style lets the element be seen (it may still be inside a hidden parent).
bool IsShown(const ComputedStyle& style);

// The cascade for one document: the engine's own sheet, then the page's sheets in order, then
// each element's `style` attribute, then the styles the program sets (which win over every
// sheet). Restyling follows the dirty bits, so it costs what the change can affect.
class StyleEngine {
 public:
  explicit StyleEngine(dom::Document& document);
  StyleEngine(const StyleEngine&) = delete;
  StyleEngine& operator=(const StyleEngine&) = delete;

  void ClearPageSheets();
  void AddPageSheet(StyleSheet sheet);

  // Recomputes every style the dirty bits ask for and reports what the host must act on (the
  // elements are held, so that the caller can attach and detach safely).
  void Update(StyleChanges* changes = nullptr);

  // Number of style computations of the last Update, and how many were shared with an
  // element computed before (tests and benchmarks read these).
  std::size_t lastComputed() const { return lastComputed_; }
  std::size_t lastShared() const { return lastShared_; }

 private:
  struct IndexedRule {
    const ComplexSelector* selector;
    const Rule* rule;
    std::uint32_t order;
    std::uint8_t origin;  // 0 the engine's sheet, 1 the page's
  };
  struct KeyHash {
    std::size_t operator()(const std::vector<std::uintptr_t>& key) const;
  };
  struct PairHash {
    std::size_t operator()(const std::pair<std::uintptr_t, std::uint32_t>& key) const {
      return std::hash<std::uintptr_t>{}(key.first) * 31 + key.second;
    }
  };
  // A structural pseudo-class some selector tests (its result is part of an element's signature).
  struct StructuralTest {
    PseudoTest pseudo;
  };

  void Reindex();
  void IndexSheet(const StyleSheet& sheet, std::uint8_t origin);
  // `reported`: an ancestor's visibility change was reported in this pass already.
  void Visit(dom::Element& element, const std::shared_ptr<const ComputedStyle>& parent, std::uint32_t parentChain,
             bool force, StyleChanges* changes, bool reported);
  std::shared_ptr<const ComputedStyle> Compute(dom::Element& element, const std::shared_ptr<const ComputedStyle>& parent,
                                               std::uint32_t chain);
  std::uint32_t ChainOf(const dom::Element& element, std::uint32_t parentChain);
  void CollectStructural(const std::vector<ComplexSelector>& selectors);
  void CollectMatches(const dom::Element& element);

  dom::Document& document_;
  std::shared_ptr<const StyleSheet> master_;
  std::vector<StyleSheet> pageSheets_;
  std::unordered_map<std::u16string, std::vector<IndexedRule>> byId_;
  std::unordered_map<std::u16string, std::vector<IndexedRule>> byClass_;
  std::unordered_map<dom::Atom, std::vector<IndexedRule>> byTag_;
  std::vector<IndexedRule> universal_;
  std::vector<const IndexedRule*> matched_;
  std::vector<std::uintptr_t> key_;
  std::unordered_map<std::vector<std::uintptr_t>, std::shared_ptr<const ComputedStyle>, KeyHash> shared_;

  // Matched rules depend only on what selectors test of the element and its ancestors. An
  // element's signature holds exactly that (tag, tested states and attribute values, results of
  // the structural pseudo-classes); equal chains of signatures from the root match the same
  // rules, so alike cousins (the cells of many rows) are matched once. Not used when sibling
  // combinators exist, since then siblings would count too.
  bool signatures_ = true;
  std::vector<StructuralTest> structural_;
  KeyTable chains_;  // ids of (parent's chain, signature)
  std::vector<std::uint64_t> signature_;
  std::unordered_map<std::u16string, std::uint32_t> values_;
  // The last value met of each attribute in features().attributes, with its id: rows of a table
  // repeat them.
  std::vector<std::pair<std::u16string, std::uint32_t>> lastValues_;
  // The style computed for a chain, with the parent style it was computed under; a chain met
  // under another parent style (an ancestor with a style attribute) keeps its style apart.
  struct ChainStyle {
    const ComputedStyle* parent = nullptr;
    std::shared_ptr<const ComputedStyle> style;
  };
  std::vector<ChainStyle> byChain_;
  std::unordered_map<std::pair<std::uintptr_t, std::uint32_t>, std::shared_ptr<const ComputedStyle>, PairHash> byChainElsewhere_;
  std::uint32_t nextOrder_ = 0;
  std::size_t lastComputed_ = 0;
  std::size_t lastShared_ = 0;
};

}  // namespace kestrune::html::css
