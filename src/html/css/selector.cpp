#include "html/css/selector.h"

#include <algorithm>

#include "base/text.h"
#include "html/dom/states.h"

namespace kestrune::html::css {
namespace {

using Type = Token::Type;

// Hostile selectors stay cheap to match: a bounded chain and bounded :not() nesting.
constexpr std::size_t kMaxCompounds = 16;
constexpr int kMaxNotDepth = 4;

struct StateName {
  const char16_t* name;
  std::uint32_t bits;
};

constexpr StateName kStates[] = {
    {u"link", dom::kStateLink},           {u"hover", dom::kStateHover},
    {u"active", dom::kStateActive},       {u"focus", dom::kStateFocus},
    {u"visited", dom::kStateVisited},     {u"current", dom::kStateCurrent},
    {u"checked", dom::kStateChecked},     {u"disabled", dom::kStateDisabled},
    {u"read-only", dom::kStateReadOnly},  {u"expanded", dom::kStateExpanded},
    {u"collapsed", dom::kStateCollapsed}, {u"incomplete", dom::kStateIncomplete},
    {u"animating", dom::kStateAnimating}, {u"focusable", dom::kStateFocusable},
    {u"anchor", dom::kStateAnchor},       {u"synthetic", dom::kStateSynthetic},
    {u"owns-popup", dom::kStateOwnsPopup}, {u"tab-focus", dom::kStateTabFocus},
    {u"busy", dom::kStateBusy},           {u"drag-over", dom::kStateDragOver},
    {u"drop-target", dom::kStateDropTarget}, {u"moving", dom::kStateMoving},
    {u"copying", dom::kStateCopying},     {u"drag-source", dom::kStateDragSource},
    {u"drop-marker", dom::kStateDropMarker}, {u"pressed", dom::kStatePressed},
    {u"popup", dom::kStatePopup},         {u"ltr", dom::kStateIsLtr},
    {u"rtl", dom::kStateIsRtl},
};

class SelectorParser {
 public:
  SelectorParser(const std::vector<Token>& tokens, std::size_t begin, std::size_t end, int notDepth)
      : t_(tokens), pos_(begin), end_(end), notDepth_(notDepth) {}

  std::optional<std::vector<ComplexSelector>> List() {
    std::vector<ComplexSelector> list;
    for (;;) {
      SkipSpace();
      auto selector = Complex();
      if (!selector) return std::nullopt;
      list.push_back(std::move(*selector));
      SkipSpace();
      if (pos_ >= end_) return list;
      if (!t_[pos_].Is(Type::kComma)) return std::nullopt;
      ++pos_;
    }
  }

 private:
  bool AtEnd() const { return pos_ >= end_; }
  const Token& Peek() const { return t_[pos_]; }
  void SkipSpace() {
    while (!AtEnd() && Peek().Is(Type::kWhitespace)) ++pos_;
  }

  std::optional<ComplexSelector> Complex() {
    ComplexSelector selector;
    for (;;) {
      auto compound = CompoundSelector();
      if (!compound || selector.compounds.size() >= kMaxCompounds) return std::nullopt;
      selector.compounds.push_back(std::move(*compound));
      const bool hadSpace = !AtEnd() && Peek().Is(Type::kWhitespace);
      SkipSpace();
      if (AtEnd() || Peek().Is(Type::kComma)) break;
      Combinator combinator = Combinator::kDescendant;
      if (Peek().IsDelim(u'>')) {
        combinator = Combinator::kChild;
      } else if (Peek().IsDelim(u'+')) {
        combinator = Combinator::kNextSibling;
      } else if (Peek().IsDelim(u'~')) {
        combinator = Combinator::kLaterSibling;
      } else if (!hadSpace) {
        return std::nullopt;
      }
      if (combinator != Combinator::kDescendant) {
        ++pos_;
        SkipSpace();
      }
      selector.combinators.push_back(combinator);
    }
    for (const Compound& compound : selector.compounds) selector.specificity += Specificity(compound);
    return selector;
  }

  static std::uint32_t Specificity(const Compound& compound) {
    std::uint32_t value = static_cast<std::uint32_t>(compound.ids.size()) << 16;
    value += static_cast<std::uint32_t>(compound.classes.size() + compound.attributes.size()) << 8;
    for (const PseudoTest& pseudo : compound.pseudos) {
      if (pseudo.kind != PseudoTest::Kind::kNot) {
        value += 1 << 8;
        continue;
      }
      std::uint32_t most = 0;
      for (const ComplexSelector& inner : pseudo.negated) most = std::max(most, inner.specificity);
      value += most;
    }
    if (compound.tag != dom::kAtomNone) value += 1;
    return value;
  }

  std::optional<Compound> CompoundSelector() {
    Compound compound;
    bool any = false;
    if (!AtEnd() && Peek().Is(Type::kIdent)) {
      compound.tag = dom::InternName(Peek().text);
      ++pos_;
      any = true;
    } else if (!AtEnd() && Peek().IsDelim(u'*')) {
      ++pos_;
      any = true;
    }
    for (;;) {
      if (AtEnd()) break;
      const Token& token = Peek();
      if (token.Is(Type::kHash)) {
        compound.ids.push_back(token.text);
        ++pos_;
      } else if (token.IsDelim(u'.')) {
        ++pos_;
        if (AtEnd() || !Peek().Is(Type::kIdent)) return std::nullopt;
        compound.classes.push_back(Peek().text);
        ++pos_;
      } else if (token.Is(Type::kLeftBracket)) {
        ++pos_;
        auto test = Attribute();
        if (!test) return std::nullopt;
        compound.attributes.push_back(std::move(*test));
      } else if (token.Is(Type::kColon)) {
        ++pos_;
        auto pseudo = Pseudo();
        if (!pseudo) return std::nullopt;
        compound.pseudos.push_back(std::move(*pseudo));
      } else {
        break;
      }
      any = true;
    }
    if (!any) return std::nullopt;
    return compound;
  }

  std::optional<AttributeTest> Attribute() {
    AttributeTest test;
    SkipSpace();
    if (AtEnd() || !Peek().Is(Type::kIdent)) return std::nullopt;
    test.name = dom::InternName(Peek().text);
    ++pos_;
    SkipSpace();
    if (AtEnd()) return std::nullopt;
    if (Peek().Is(Type::kRightBracket)) {
      ++pos_;
      return test;
    }
    if (!Peek().Is(Type::kDelim)) return std::nullopt;
    const char16_t first = Peek().delim;
    ++pos_;
    if (first == u'=') {
      test.op = AttributeTest::Op::kEquals;
      if (!AtEnd() && Peek().IsDelim(u'=')) {
        test.op = AttributeTest::Op::kEqualsExact;
        ++pos_;
      }
    } else {
      if (AtEnd() || !Peek().IsDelim(u'=')) return std::nullopt;
      ++pos_;
      switch (first) {
        case u'^': test.op = AttributeTest::Op::kPrefix; break;
        case u'$': test.op = AttributeTest::Op::kSuffix; break;
        case u'*': test.op = AttributeTest::Op::kContains; break;
        case u'~': test.op = AttributeTest::Op::kWord; break;
        case u'|': test.op = AttributeTest::Op::kDash; break;
        default: return std::nullopt;
      }
    }
    SkipSpace();
    if (AtEnd()) return std::nullopt;
    if (Peek().Is(Type::kString) || Peek().Is(Type::kIdent)) {
      test.value = Peek().text;
    } else if (Peek().Is(Type::kNumber)) {
      test.value = Peek().text;
    } else {
      return std::nullopt;
    }
    ++pos_;
    SkipSpace();
    if (AtEnd() || !Peek().Is(Type::kRightBracket)) return std::nullopt;
    ++pos_;
    return test;
  }

  std::optional<PseudoTest> Pseudo() {
    if (AtEnd()) return std::nullopt;
    const Token& token = Peek();
    PseudoTest pseudo;
    if (token.Is(Type::kIdent)) {
      ++pos_;
      const std::u16string name = Lower(token.text);
      for (const StateName& state : kStates) {
        if (name == state.name) {
          pseudo.state = state.bits;
          return pseudo;
        }
      }
      using Kind = PseudoTest::Kind;
      if (name == u"enabled") pseudo.kind = Kind::kEnabled;
      else if (name == u"first-child") pseudo.kind = Kind::kFirstChild;
      else if (name == u"last-child") pseudo.kind = Kind::kLastChild;
      else if (name == u"only-child") pseudo.kind = Kind::kOnlyChild;
      else if (name == u"root") pseudo.kind = Kind::kRoot;
      else if (name == u"empty") pseudo.kind = Kind::kEmpty;
      else return std::nullopt;
      return pseudo;
    }
    if (!token.Is(Type::kFunction)) return std::nullopt;
    const std::u16string name = Lower(token.text);
    ++pos_;
    const std::size_t close = MatchingParen();
    if (close >= end_) return std::nullopt;
    const std::size_t argsBegin = pos_;
    pos_ = close + 1;
    if (name == u"not") {
      if (notDepth_ >= kMaxNotDepth) return std::nullopt;
      auto inner = SelectorParser(t_, argsBegin, close, notDepth_ + 1).List();
      if (!inner) return std::nullopt;
      pseudo.kind = PseudoTest::Kind::kNot;
      pseudo.negated = std::move(*inner);
      return pseudo;
    }
    if (name == u"nth-child" || name == u"nth-last-child") {
      pseudo.kind = name == u"nth-child" ? PseudoTest::Kind::kNthChild : PseudoTest::Kind::kNthLastChild;
      if (!ParseNth(argsBegin, close, pseudo.a, pseudo.b)) return std::nullopt;
      return pseudo;
    }
    return std::nullopt;
  }

  std::size_t MatchingParen() const {
    int depth = 1;
    for (std::size_t i = pos_; i < end_; ++i) {
      if (t_[i].Is(Type::kFunction) || t_[i].Is(Type::kLeftParen)) ++depth;
      if (t_[i].Is(Type::kRightParen) && --depth == 0) return i;
    }
    return end_;
  }

  static std::u16string Lower(std::u16string_view text) {
    std::u16string out(text);
    for (char16_t& c : out) c = AsciiLower(c);
    return out;
  }

  // an+b as the tokenizer splits it: "odd", "3", "2n", "2n+1" (dimension, number), "2n-1"
  // (dimension with unit "n-1"), "-n+3" (ident, number), "+ n" ...
  bool ParseNth(std::size_t begin, std::size_t end, int& a, int& b) const {
    std::u16string text;
    for (std::size_t i = begin; i < end; ++i) {
      const Token& token = t_[i];
      switch (token.type) {
        case Type::kWhitespace: break;
        case Type::kIdent: text += Lower(token.text); break;
        case Type::kDelim: text.push_back(token.delim); break;
        case Type::kNumber:
        case Type::kDimension: {
          const double number = token.number;
          if (number > 1e6 || number < -1e6 || number != static_cast<int>(number)) return false;
          if (number >= 0 && !text.empty() && text.back() != u'+' && text.back() != u'-') text.push_back(u'+');
          text += FormatDecimal(static_cast<std::int64_t>(number));
          if (token.type == Type::kDimension) text += Lower(token.text);
          break;
        }
        default: return false;
      }
    }
    if (text == u"odd") text = u"2n+1";
    if (text == u"even") text = u"2n";
    const std::size_t n = text.find(u'n');
    auto parseInt = [](std::u16string_view part, int fallback) -> std::optional<int> {
      if (part.empty()) return fallback;
      if (part == u"+") return fallback;
      if (part == u"-") return -fallback;
      if (part[0] == u'+') part.remove_prefix(1);
      auto value = ParseDecimal(part);
      if (!value || *value > 1000000 || *value < -1000000) return std::nullopt;
      return static_cast<int>(*value);
    };
    if (n == std::u16string::npos) {
      auto value = parseInt(text, 0);
      if (!value || text.empty()) return false;
      a = 0;
      b = *value;
      return true;
    }
    auto first = parseInt(std::u16string_view(text).substr(0, n), 1);
    auto second = parseInt(std::u16string_view(text).substr(n + 1), 0);
    if (!first || !second) return false;
    a = *first;
    b = *second;
    return true;
  }

  const std::vector<Token>& t_;
  std::size_t pos_;
  std::size_t end_;
  int notDepth_;
};

bool HasWord(std::u16string_view list, std::u16string_view word) {
  if (word.empty()) return false;
  std::size_t at = 0;
  while (at < list.size()) {
    while (at < list.size() && (list[at] == u' ' || list[at] == u'\t' || list[at] == u'\n' || list[at] == u'\r')) ++at;
    std::size_t end = at;
    while (end < list.size() && !(list[end] == u' ' || list[end] == u'\t' || list[end] == u'\n' || list[end] == u'\r')) ++end;
    if (list.substr(at, end - at) == word) return true;
    at = end;
  }
  return false;
}

bool AttributeMatches(const AttributeTest& test, const dom::Element& element) {
  const std::u16string* value = element.Attr(test.name);
  if (value == nullptr) return false;
  const std::u16string_view v(*value);
  const std::u16string_view want(test.value);
  using Op = AttributeTest::Op;
  switch (test.op) {
    case Op::kExists: return true;
    case Op::kEquals: return EqualsIgnoringAsciiCase(v, want);
    case Op::kEqualsExact: return v == want;
    case Op::kPrefix: return !want.empty() && v.substr(0, want.size()) == want;
    case Op::kSuffix: return !want.empty() && v.size() >= want.size() && v.substr(v.size() - want.size()) == want;
    case Op::kContains: return !want.empty() && v.find(want) != std::u16string_view::npos;
    case Op::kWord: return HasWord(v, want);
    case Op::kDash: return v == want || (v.size() > want.size() && v.substr(0, want.size()) == want && v[want.size()] == u'-');
  }
  return false;
}

bool NthMatches(int a, int b, std::size_t indexFromOne) {
  const long long position = static_cast<long long>(indexFromOne);
  if (a == 0) return position == b;
  const long long diff = position - b;
  return diff % a == 0 && diff / a >= 0;
}

bool PseudoMatches(const PseudoTest& pseudo, const dom::Element& element) {
  using Kind = PseudoTest::Kind;
  const dom::Element* parent = element.parent();
  switch (pseudo.kind) {
    case Kind::kState: return (element.state() & pseudo.state) == pseudo.state;
    case Kind::kEnabled: return (element.state() & dom::kStateDisabled) == 0;
    case Kind::kFirstChild: return parent && element.elementIndex() == 0;
    case Kind::kLastChild: return parent && element.elementIndex() + 1 == parent->elementCount();
    case Kind::kOnlyChild: return parent && parent->elementCount() == 1;
    case Kind::kNthChild: return parent && NthMatches(pseudo.a, pseudo.b, element.elementIndex() + 1);
    case Kind::kNthLastChild:
      return parent && NthMatches(pseudo.a, pseudo.b, parent->elementCount() - element.elementIndex());
    case Kind::kRoot: return !parent && element.document() != nullptr;
    case Kind::kEmpty: return element.nodes().empty();
    case Kind::kNot: return !MatchesAny(pseudo.negated, element);
  }
  return false;
}

bool CompoundMatches(const Compound& compound, const dom::Element& element) {
  if (compound.tag != dom::kAtomNone && compound.tag != element.tag()) return false;
  if (!compound.ids.empty()) {
    const std::u16string* id = element.Attr(dom::kAtomId);
    for (const auto& want : compound.ids) {
      if (id == nullptr || *id != want) return false;
    }
  }
  if (!compound.classes.empty()) {
    const std::u16string* classes = element.Attr(dom::kAtomClass);
    for (const auto& want : compound.classes) {
      if (classes == nullptr || !HasWord(*classes, want)) return false;
    }
  }
  for (const AttributeTest& test : compound.attributes) {
    if (!AttributeMatches(test, element)) return false;
  }
  for (const PseudoTest& pseudo : compound.pseudos) {
    if (!PseudoMatches(pseudo, element)) return false;
  }
  return true;
}

const dom::Element* PreviousSibling(const dom::Element& element) {
  const dom::Element* parent = element.parent();
  if (!parent || element.elementIndex() == 0) return nullptr;
  return parent->ElementAt(element.elementIndex() - 1);
}

// Matches compounds [0, index] with compounds[index] on `element`, right to left.
bool MatchFrom(const ComplexSelector& selector, std::size_t index, const dom::Element& element) {
  if (!CompoundMatches(selector.compounds[index], element)) return false;
  if (index == 0) return true;
  switch (selector.combinators[index - 1]) {
    case Combinator::kChild:
      return element.parent() && MatchFrom(selector, index - 1, *element.parent());
    case Combinator::kDescendant:
      for (const dom::Element* up = element.parent(); up; up = up->parent()) {
        if (MatchFrom(selector, index - 1, *up)) return true;
      }
      return false;
    case Combinator::kNextSibling: {
      const dom::Element* previous = PreviousSibling(element);
      return previous && MatchFrom(selector, index - 1, *previous);
    }
    case Combinator::kLaterSibling:
      for (const dom::Element* previous = PreviousSibling(element); previous; previous = PreviousSibling(*previous)) {
        if (MatchFrom(selector, index - 1, *previous)) return true;
      }
      return false;
  }
  return false;
}

void AddAtom(std::vector<dom::Atom>& atoms, dom::Atom atom) {
  if (std::find(atoms.begin(), atoms.end(), atom) == atoms.end()) atoms.push_back(atom);
}

void CollectCompound(const Compound& compound, bool subject, dom::StyleFeatures& features) {
  auto addAttribute = [&](dom::Atom atom) {
    AddAtom(features.attributes, atom);
    if (!subject) AddAtom(features.attributesOutsideSubject, atom);
  };
  if (!compound.ids.empty()) addAttribute(dom::kAtomId);
  if (!compound.classes.empty()) addAttribute(dom::kAtomClass);
  for (const AttributeTest& test : compound.attributes) addAttribute(test.name);
  for (const PseudoTest& pseudo : compound.pseudos) {
    using Kind = PseudoTest::Kind;
    switch (pseudo.kind) {
      case Kind::kState:
      case Kind::kEnabled: {
        const std::uint32_t bits = pseudo.kind == Kind::kState ? pseudo.state : dom::kStateDisabled;
        features.states |= bits;
        if (!subject) features.statesOutsideSubject |= bits;
        break;
      }
      case Kind::kNot:
        for (const ComplexSelector& inner : pseudo.negated) {
          for (std::size_t i = 0; i < inner.compounds.size(); ++i) {
            CollectCompound(inner.compounds[i], subject && i + 1 == inner.compounds.size(), features);
          }
          if (!inner.combinators.empty()) {
            for (Combinator c : inner.combinators) {
              if (c == Combinator::kNextSibling || c == Combinator::kLaterSibling) features.siblingCombinators = true;
            }
          }
        }
        break;
      case Kind::kRoot: break;
      default: features.structural = true; break;
    }
  }
}

}  // namespace

std::optional<std::vector<ComplexSelector>> ParseSelectorList(const std::vector<Token>& tokens, std::size_t begin,
                                                              std::size_t end) {
  return SelectorParser(tokens, begin, std::min(end, tokens.size()), 0).List();
}

std::optional<std::vector<ComplexSelector>> ParseSelectorList(std::u16string_view text) {
  const std::vector<Token> tokens = Tokenize(text);
  return ParseSelectorList(tokens, 0, tokens.size());
}

bool MatchesPseudo(const PseudoTest& pseudo, const dom::Element& element) { return PseudoMatches(pseudo, element); }

bool Matches(const ComplexSelector& selector, const dom::Element& element) {
  return !selector.compounds.empty() && MatchFrom(selector, selector.compounds.size() - 1, element);
}

bool MatchesAny(const std::vector<ComplexSelector>& selectors, const dom::Element& element) {
  return std::any_of(selectors.begin(), selectors.end(),
                     [&](const ComplexSelector& selector) { return Matches(selector, element); });
}

void CollectFeatures(const ComplexSelector& selector, dom::StyleFeatures& features) {
  for (std::size_t i = 0; i < selector.compounds.size(); ++i) {
    CollectCompound(selector.compounds[i], i + 1 == selector.compounds.size(), features);
  }
  for (Combinator combinator : selector.combinators) {
    if (combinator == Combinator::kNextSibling || combinator == Combinator::kLaterSibling) {
      features.siblingCombinators = true;
    }
  }
}

}  // namespace kestrune::html::css
