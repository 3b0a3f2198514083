#include "html/parse/html_parser.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <initializer_list>

#include "base/text.h"
#include "html/parse/entities.h"

namespace kestrune::html::parse {
namespace {

using dom::Atom;
using dom::Element;
using dom::Ref;

bool OneOf(Atom tag, std::initializer_list<Atom> tags) {
  return std::find(tags.begin(), tags.end(), tag) != tags.end();
}

bool IsSpace(char16_t c) { return c == u' ' || c == u'\t' || c == u'\n' || c == u'\r' || c == u'\f'; }

bool IsNameChar(char16_t c) {
  return !IsSpace(c) && c != u'>' && c != u'/' && c != u'=' && c != u'<' && c != u'"' && c != u'\'';
}

// What the parser needs to know of a tag, looked up once per tag instead of in lists.
enum TagTrait : std::uint8_t {
  kVoid = 0x1,             // no content, no end tag
  kRawText = 0x2,          // content is raw text, not markup
  kDropsWhitespace = 0x4,  // whitespace between its children never shows: dropped while parsing
  kStartsBlock = 0x8,      // closes an open `p`
};

using TraitTable = std::array<std::uint8_t, dom::kAtomKnownCount>;

constexpr TraitTable MakeTraits() {
  using namespace dom;
  TraitTable traits{};
  auto mark = [&](std::initializer_list<Atom> tags, TagTrait trait) {
    for (Atom tag : tags) traits[tag] = static_cast<std::uint8_t>(traits[tag] | trait);
  };
  mark({kAtomArea, kAtomBase, kAtomBr, kAtomCol, kAtomEmbed, kAtomHr, kAtomImg, kAtomInput, kAtomLink, kAtomMeta,
        kAtomParam, kAtomSource, kAtomTrack, kAtomWbr},
       kVoid);
  mark({kAtomScript, kAtomStyle, kAtomTextarea, kAtomTitle}, kRawText);
  mark({kAtomHtml, kAtomHead, kAtomTable, kAtomThead, kAtomTbody, kAtomTfoot, kAtomTr, kAtomSelect, kAtomUl, kAtomOl,
        kAtomMenu, kAtomOptions, kAtomOptgroup, kAtomDl, kAtomColgroup},
       kDropsWhitespace);
  mark({kAtomP, kAtomDiv, kAtomUl, kAtomOl, kAtomDl, kAtomTable, kAtomH1, kAtomH2, kAtomH3, kAtomH4, kAtomH5,
        kAtomH6, kAtomPre, kAtomForm, kAtomBlockquote, kAtomSection, kAtomHeader, kAtomFooter, kAtomNav,
        kAtomAddress, kAtomFieldset, kAtomHr, kAtomMenu, kAtomCenter},
       kStartsBlock);
  return traits;
}

constexpr TraitTable kTraits = MakeTraits();

bool Has(Atom tag, TagTrait trait) { return tag < kTraits.size() && (kTraits[tag] & trait) != 0; }

// Names are short: a loop beats a call to memcmp.
bool SameName(std::u16string_view a, std::u16string_view b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (a[i] != b[i]) return false;
  }
  return true;
}

class TreeBuilder {
 public:
  TreeBuilder(std::u16string_view input, Element* container) : in_(input) {
    stack_.push_back(container);
    pending_.emplace_back();
  }

  void Run() {
    while (pos_ < in_.size()) {
      if (in_[pos_] == u'<' && pos_ + 1 < in_.size()) {
        const char16_t next = in_[pos_ + 1];
        if (next == u'!' || next == u'?') {
          FlushText();
          SkipMarkupDeclaration();
          continue;
        }
        if (next == u'/') {
          FlushText();
          EndTag();
          continue;
        }
        if ((next >= u'a' && next <= u'z') || (next >= u'A' && next <= u'Z')) {
          FlushText();
          StartTag();
          continue;
        }
      }
      if (in_[pos_] == u'&') {
        const std::size_t used = DecodeCharacterReference(in_, pos_, text_);
        if (used > 0) {
          pos_ += used;
          continue;
        }
      }
      if (in_[pos_] == u'\r') {
        text_.push_back(u'\n');
        pos_ += (pos_ + 1 < in_.size() && in_[pos_ + 1] == u'\n') ? 2u : 1u;
        continue;
      }
      // Plain text up to the next markup, reference or line end goes over in one piece.
      std::size_t end = pos_ + 1;
      while (end < in_.size() && in_[end] != u'<' && in_[end] != u'&' && in_[end] != u'\r') ++end;
      text_.append(in_.substr(pos_, end - pos_));
      pos_ = end;
    }
    FlushText();
    PopTo(0);
  }

  // Attributes of an `<html>` tag in a full page go to the document's root.
  bool takeHtmlAttributes = false;
  // Where the `img` elements made are listed, if anywhere.
  std::vector<Element*>* images = nullptr;

 private:
  Element* current() const { return stack_.back(); }

  // An open element's children are collected apart and handed over when it closes, in one
  // piece: one allocation for its child list instead of one per growth step.
  void Append(dom::Ref<dom::Node> node) { pending_.back().push_back(std::move(node)); }

  void PopTo(std::size_t depth) {
    while (stack_.size() > depth) {
      stack_.back()->AppendChildren(pending_.back());
      if (stack_.size() == 1) return;  // the container stays, with its children given
      stack_.pop_back();
      spare_.push_back(std::move(pending_.back()));
      pending_.pop_back();
    }
  }

  void Push(Element* element) {
    stack_.push_back(element);
    if (spare_.empty()) {
      pending_.emplace_back();
    } else {
      pending_.push_back(std::move(spare_.back()));
      spare_.pop_back();
    }
  }

  // Pages repeat a handful of names thousands of times: remember the last few. End tags only
  // look names up, so that stray ones never grow the table.
  Atom Name(std::u16string_view name, bool intern = true) {
    if (name.empty()) return dom::InternName(name);
    auto& slot = names_[(name.size() * 31 + name.front() * 7 + name.back()) % names_.size()];
    if (slot.second != dom::kAtomNone && SameName(slot.first, name)) return slot.second;
    const Atom atom = intern ? dom::InternName(name) : dom::FindName(name);
    if (atom != dom::kAtomNone) slot = {std::u16string(name), atom};
    return atom;
  }

  void FlushText() {
    if (text_.empty()) return;
    const bool dropped = Has(current()->tag(), kDropsWhitespace) && std::all_of(text_.begin(), text_.end(), IsSpace);
    // A copy, so that the buffer keeps its room for the next text.
    if (!dropped) Append(dom::Text::Create(text_));
    text_.clear();
  }

  void SkipMarkupDeclaration() {
    if (in_.compare(pos_, 4, u"<!--") == 0) {
      const std::size_t end = in_.find(u"-->", pos_ + 4);
      pos_ = end == std::u16string_view::npos ? in_.size() : end + 3;
      return;
    }
    const std::size_t end = in_.find(u'>', pos_);
    pos_ = end == std::u16string_view::npos ? in_.size() : end + 1;
  }

  std::u16string_view ReadName() {
    const std::size_t start = pos_;
    while (pos_ < in_.size() && IsNameChar(in_[pos_])) ++pos_;
    return in_.substr(start, pos_ - start);
  }

  void SkipSpace() {
    while (pos_ < in_.size() && IsSpace(in_[pos_])) ++pos_;
  }

  std::u16string ReadAttributeValue() {
    std::u16string value;
    if (pos_ >= in_.size()) return value;
    const char16_t quote = in_[pos_];
    const bool quoted = quote == u'"' || quote == u'\'';
    if (quoted) ++pos_;
    while (pos_ < in_.size()) {
      // Characters up to the end of the value or the next reference go over in one piece.
      std::size_t end = pos_;
      while (end < in_.size() && in_[end] != u'&' && !EndsValue(end, quoted, quote)) ++end;
      value.append(in_.substr(pos_, end - pos_));
      pos_ = end;
      if (pos_ >= in_.size() || in_[pos_] != u'&') break;
      const std::size_t used = DecodeCharacterReference(in_, pos_, value);
      if (used == 0) value.push_back(in_[pos_++]);
      pos_ += used;
    }
    if (quoted && pos_ < in_.size()) ++pos_;
    return value;
  }

  // An unquoted value ends at "/>" too: pages write <td width=10/>.
  bool EndsValue(std::size_t at, bool quoted, char16_t quote) const {
    const char16_t c = in_[at];
    if (quoted) return c == quote;
    return IsSpace(c) || c == u'>' || (c == u'/' && at + 1 < in_.size() && in_[at + 1] == u'>');
  }

  // Reads attributes up to '>' and answers whether the tag closed itself with "/>". The first
  // of two attributes of one name counts.
  bool ReadAttributes(Element& element) {
    const bool selfClosed = ReadAttributeList();
    if (!attributes_.empty()) element.TakeParsedAttributes(attributes_);
    return selfClosed;
  }

  bool ReadAttributeList() {
    attributes_.clear();
    for (;;) {
      SkipSpace();
      if (pos_ >= in_.size()) return false;
      if (in_[pos_] == u'>') {
        ++pos_;
        return false;
      }
      if (in_[pos_] == u'/') {
        ++pos_;
        SkipSpace();
        if (pos_ < in_.size() && in_[pos_] == u'>') {
          ++pos_;
          return true;
        }
        continue;
      }
      std::u16string_view name = ReadName();
      if (name.empty()) {
        ++pos_;  // a stray quote, '=' or '<' inside a tag
        continue;
      }
      SkipSpace();
      std::u16string value;
      if (pos_ < in_.size() && in_[pos_] == u'=') {
        ++pos_;
        SkipSpace();
        value = ReadAttributeValue();
      }
      const Atom atom = Name(name);
      const bool repeated = std::any_of(attributes_.begin(), attributes_.end(),
                                        [atom](const dom::Attribute& attribute) { return attribute.name == atom; });
      if (!repeated) attributes_.push_back({atom, std::move(value)});
    }
  }

  // Pops open elements until one with a tag of `targets` is closed, provided such an element is
  // open above the nearest element with a tag of `boundaries`.
  void CloseOpen(std::initializer_list<Atom> targets, std::initializer_list<Atom> boundaries) {
    for (std::size_t i = stack_.size(); i > 1; --i) {
      const Atom tag = stack_[i - 1]->tag();
      if (OneOf(tag, targets)) {
        PopTo(i - 1);
        return;
      }
      if (OneOf(tag, boundaries)) return;
    }
  }

  void CloseImplied(Atom tag) {
    using namespace dom;
    if (tag == kAtomTr) {
      CloseOpen({kAtomTr}, {kAtomTable, kAtomThead, kAtomTbody, kAtomTfoot});
    } else if (tag == kAtomTd || tag == kAtomTh) {
      CloseOpen({kAtomTd, kAtomTh}, {kAtomTr, kAtomTable});
    } else if (OneOf(tag, {kAtomThead, kAtomTbody, kAtomTfoot})) {
      CloseOpen({kAtomThead, kAtomTbody, kAtomTfoot}, {kAtomTable});
    } else if (tag == kAtomLi) {
      CloseOpen({kAtomLi}, {kAtomUl, kAtomOl, kAtomMenu});
    } else if (tag == kAtomOption || tag == kAtomOptions || tag == kAtomOptgroup) {
      CloseOpen({kAtomOption}, {kAtomSelect, kAtomOptions, kAtomOptgroup});
    } else if (tag == kAtomDt || tag == kAtomDd) {
      CloseOpen({kAtomDt, kAtomDd}, {kAtomDl});
    }
    if (Has(tag, kStartsBlock) && current()->tag() == kAtomP && stack_.size() > 1) PopTo(stack_.size() - 1);
  }

  void StartTag() {
    ++pos_;
    const Atom tag = Name(ReadName());
    if (tag == dom::kAtomHtml && takeHtmlAttributes) {
      Element* root = stack_.front();
      while (root->parent()) root = root->parent();
      ReadAttributes(*root);
      return;
    }
    CloseImplied(tag);
    Ref<Element> element = Element::Create(tag);
    const bool selfClosed = ReadAttributes(*element);
    Element* raw = element.get();
    if (tag == dom::kAtomImg && images) images->push_back(raw);
    if (IsRawTextElement(tag) && !selfClosed) {
      ReadRawText(*raw);
      // Scripts are never run; they are not kept either.
      if (tag != dom::kAtomScript) Append(std::move(element));
      return;
    }
    Append(std::move(element));
    if (selfClosed || IsVoidElement(tag)) return;
    if (stack_.size() <= kMaxDepth) Push(raw);
  }

  void ReadRawText(Element& element) {
    const std::u16string& name = dom::NameOf(element.tag());
    std::size_t end = pos_;
    for (;;) {
      end = in_.find(u"</", end);
      if (end == std::u16string_view::npos) {
        end = in_.size();
        break;
      }
      if (EqualsIgnoringAsciiCase(in_.substr(end + 2, name.size()), name)) break;
      end += 2;
    }
    std::u16string content(in_.substr(pos_, end - pos_));
    pos_ = end;
    if (pos_ < in_.size()) {
      const std::size_t close = in_.find(u'>', pos_);
      pos_ = close == std::u16string_view::npos ? in_.size() : close + 1;
    }
    if (element.tag() == dom::kAtomTextarea || element.tag() == dom::kAtomTitle) {
      std::u16string decoded;
      for (std::size_t i = 0; i < content.size();) {
        const std::size_t used = content[i] == u'&' ? DecodeCharacterReference(content, i, decoded) : 0;
        if (used == 0) decoded.push_back(content[i++]);
        i += used;
      }
      content = std::move(decoded);
    }
    if (!content.empty()) element.AppendChild(dom::Text::Create(std::move(content)));
  }

  void EndTag() {
    pos_ += 2;
    const std::u16string_view name = ReadName();
    const std::size_t close = in_.find(u'>', pos_);
    pos_ = close == std::u16string_view::npos ? in_.size() : close + 1;
    const Atom tag = Name(name, false);
    if (tag == dom::kAtomNone) return;
    for (std::size_t i = stack_.size(); i > 1; --i) {
      if (stack_[i - 1]->tag() == tag) {
        PopTo(i - 1);
        return;
      }
    }
    // A stray end tag closes nothing.
  }

  std::u16string_view in_;
  std::size_t pos_ = 0;
  std::u16string text_;
  std::vector<Element*> stack_;
  std::vector<std::vector<dom::Ref<dom::Node>>> pending_;  // children of each open element so far
  std::vector<std::vector<dom::Ref<dom::Node>>> spare_;    // emptied lists, kept for their room
  std::array<std::pair<std::u16string, Atom>, 32> names_{};
  std::vector<dom::Attribute> attributes_;  // of the tag being read; kept for its room
};

}  // namespace

bool IsVoidElement(dom::Atom tag) { return Has(tag, kVoid); }

bool IsRawTextElement(dom::Atom tag) { return Has(tag, kRawText); }

void ParseDocument(std::u16string_view html, dom::Document& document) {
  Ref<Element> root = Element::Create(dom::kAtomHtml);
  TreeBuilder builder(html, root.get());
  builder.takeHtmlAttributes = true;
  builder.Run();
  document.SetRoot(std::move(root));
}

std::vector<Ref<dom::Node>> ParseFragment(std::u16string_view html, dom::Atom contextTag,
                                          std::vector<dom::Element*>* images) {
  Ref<Element> holder = Element::Create(contextTag);
  TreeBuilder builder(html, holder.get());
  builder.images = images;
  builder.Run();
  return holder->RemoveAllChildren();
}

}  // namespace kestrune::html::parse
