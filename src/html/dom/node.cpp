#include "html/dom/node.h"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <new>

#include "base/size_class_pool.h"
#include "html/dom/document.h"

namespace kestrune::html::dom {
namespace {

// Nodes come and go by the hundred thousand when a big table is replaced: they are kept in a
// pool of their own sizes. Like the rest of the engine it serves the UI thread only. It lives
// until the process ends, so that nodes freed late (by statics) still have it.
SizeClassPool& NodeMemory() {
  static auto* pool = new SizeClassPool();
  return *pool;
}

bool Contains(const std::vector<Atom>& atoms, Atom atom) {
  return std::find(atoms.begin(), atoms.end(), atom) != atoms.end();
}

}  // namespace

void* AllocateNodeMemory(std::size_t size) { return NodeMemory().Allocate(size); }
void FreeNodeMemory(void* memory, std::size_t size) noexcept { NodeMemory().Deallocate(memory, size); }

void Node::Release() {
  if (--refs_ > 0) return;
  // Nodes to free are chained in the place of their parent pointer, which they no longer
  // need: freeing a table of any size or depth takes no memory of its own.
  nextDoomed_ = nullptr;
  Node* doomed = this;
  while (doomed) {
    Node* node = doomed;
    doomed = node->nextDoomed_;
    node->parent_ = nullptr;
    if (node->isElement_) {
      auto* element = static_cast<Element*>(node);
      for (Node* child : element->children_) {
        if (--child->refs_ == 0) {
          child->nextDoomed_ = doomed;
          doomed = child;
        } else {
          child->parent_ = nullptr;
        }
      }
      element->children_.clear();
      delete element;
    } else {
      Text::Destroy(static_cast<Text*>(node));
    }
  }
}

void* Element::operator new(std::size_t size) { return AllocateNodeMemory(size); }
void Element::operator delete(void* memory, std::size_t size) { FreeNodeMemory(memory, size); }

Ref<Text> Text::Create(std::u16string_view text) {
  static_assert(sizeof(Text) % alignof(char16_t) == 0);
  void* memory = AllocateNodeMemory(sizeof(Text) + text.size() * sizeof(char16_t));
  Text* node = ::new (memory) Text(text.size());
  std::copy(text.begin(), text.end(), reinterpret_cast<char16_t*>(node + 1));
  return Ref<Text>(node);
}

void Text::Destroy(Text* text) {
  const std::size_t size = sizeof(Text) + text->length_ * sizeof(char16_t);
  text->~Text();
  FreeNodeMemory(text, size);
}

Ref<Element> Element::Create(Atom tag) { return Ref<Element>(new Element(tag)); }

const std::u16string* Element::Attr(Atom name) const {
  for (const Attribute& attribute : attributes_) {
    if (attribute.name == name) return &attribute.value;
  }
  return nullptr;
}

void Element::TakeParsedAttributes(std::vector<Attribute>& attributes) {
  if (attributes_.empty()) {
    attributes_.assign(std::make_move_iterator(attributes.begin()), std::make_move_iterator(attributes.end()));
  } else {
    for (Attribute& attribute : attributes) {
      if (!HasAttr(attribute.name)) attributes_.push_back(std::move(attribute));
    }
  }
  attributes.clear();
}

void Element::SetAttr(Atom name, std::u16string value) {
  for (Attribute& attribute : attributes_) {
    if (attribute.name == name) {
      if (attribute.value == value) return;
      attribute.value = std::move(value);
      AttributeChanged(name);
      return;
    }
  }
  attributes_.push_back({name, std::move(value)});
  AttributeChanged(name);
}

bool Element::RemoveAttr(Atom name) {
  auto found = std::find_if(attributes_.begin(), attributes_.end(),
                            [name](const Attribute& attribute) { return attribute.name == name; });
  if (found == attributes_.end()) return false;
  attributes_.erase(found);
  AttributeChanged(name);
  return true;
}

void Element::AttributeChanged(Atom name) {
  if (name == kAtomStyle && rare_) rare_->parsedInlineStyle.reset();
  if (const Document* document = this->document()) {
    const StyleFeatures& features = document->features();
    if (Contains(features.attributesOutsideSubject, name)) {
      (features.siblingCombinators && parent() ? parent() : this)->MarkStyleDirty(true);
    } else if (name == kAtomStyle || Contains(features.attributes, name)) {
      MarkStyleDirty(false);
    }
  }
  MarkPaintDirty();
}

void Element::SetState(std::uint32_t state) {
  const std::uint32_t changed = state_ ^ state;
  if (changed == 0) return;
  state_ = state;
  if (const Document* document = this->document()) {
    const StyleFeatures& features = document->features();
    if (changed & features.statesOutsideSubject) {
      (features.siblingCombinators && parent() ? parent() : this)->MarkStyleDirty(true);
    } else if (changed & features.states) {
      MarkStyleDirty(false);
    }
  }
  MarkPaintDirty();
}

Element* Element::ElementAt(std::size_t index) const {
  if (index >= elementCount()) return nullptr;
  if (textChildren_ == 0) return static_cast<Element*>(children_[index]);
  for (Node* node : children_) {
    if (node->IsElement() && static_cast<Element*>(node)->elementIndex_ == index) return static_cast<Element*>(node);
  }
  return nullptr;
}

std::size_t Element::elementIndex() const { return parent() ? elementIndex_ : 0; }

void Element::Adopt(Node* child) {
  child->parent_ = this;
  if (!child->IsElement()) {
    ++textChildren_;
  } else {
    static_cast<Element*>(child)->MarkStyleDirty(true);
  }
}

void Element::Renumber(std::size_t fromNode) {
  std::uint32_t elements = 0;
  for (std::size_t back = fromNode; back > 0; --back) {
    Node* previous = children_[back - 1];
    if (previous->IsElement()) {
      elements = static_cast<Element*>(previous)->elementIndex_ + 1;
      break;
    }
  }
  for (std::size_t i = fromNode; i < children_.size(); ++i) {
    Node* node = children_[i];
    node->nodeIndex_ = static_cast<std::uint32_t>(i);
    if (node->IsElement()) static_cast<Element*>(node)->elementIndex_ = elements++;
  }
}

void Element::ChildrenChanged() {
  const Document* document = this->document();
  if (document && (document->features().structural || document->features().siblingCombinators)) {
    MarkStyleDirty(true);
  }
  MarkLayoutDirty();
  MarkPaintDirty();
}

void Element::AppendChild(Ref<Node> child) { InsertNodeAt(children_.size(), std::move(child)); }

void Element::AppendChildren(std::vector<Ref<Node>>& nodes) {
  if (nodes.empty()) return;
  children_.reserve(children_.size() + nodes.size());
  // Numbered as they come; a node moved from this element itself renumbers from its old place.
  std::size_t renumberFrom = children_.size() + nodes.size();
  auto elements = static_cast<std::uint32_t>(elementCount());
  for (Ref<Node>& child : nodes) {
    if (!child) continue;
    if (Element* oldParent = child->parent()) {
      if (oldParent == this) renumberFrom = std::min<std::size_t>(renumberFrom, child->nodeIndex_);
      oldParent->RemoveChild(child.get());
    }
    Node* node = child.Leak();
    node->nodeIndex_ = static_cast<std::uint32_t>(children_.size());
    if (node->IsElement()) static_cast<Element*>(node)->elementIndex_ = elements++;
    children_.push_back(node);
    Adopt(node);
  }
  nodes.clear();
  if (renumberFrom < children_.size()) Renumber(renumberFrom);
  ChildrenChanged();
}

void Element::InsertElementAt(std::size_t elementIndex, Ref<Node> child) {
  if (!child) return;
  // Moving within this element: take it out first so that the index means the final place.
  if (child->parent() == this) RemoveChild(child.get());
  std::size_t at = children_.size();
  if (elementIndex < elementCount()) at = ElementAt(elementIndex)->nodeIndex();
  InsertNodeAt(at, std::move(child));
}

void Element::InsertNodeAt(std::size_t nodeIndex, Ref<Node> child) {
  if (!child) return;
  if (Element* oldParent = child->parent()) oldParent->RemoveChild(child.get());
  nodeIndex = std::min(nodeIndex, children_.size());
  Node* node = child.Leak();
  children_.insert(children_.begin() + static_cast<std::ptrdiff_t>(nodeIndex), node);
  Adopt(node);
  Renumber(nodeIndex);
  ChildrenChanged();
}

Ref<Node> Element::RemoveChild(Node* child) {
  if (child == nullptr || child->parent_ != this) return {};
  const std::size_t at = child->nodeIndex_;
  children_.erase(children_.begin() + static_cast<std::ptrdiff_t>(at));
  child->parent_ = nullptr;
  if (!child->IsElement()) --textChildren_;
  Renumber(at);
  ChildrenChanged();
  return Ref<Node>::Adopt(child);
}

std::vector<Ref<Node>> Element::RemoveAllChildren() {
  std::vector<Ref<Node>> removed;
  removed.reserve(children_.size());
  for (Node* child : children_) {
    child->parent_ = nullptr;
    removed.push_back(Ref<Node>::Adopt(child));
  }
  children_.clear();
  textChildren_ = 0;
  ChildrenChanged();
  return removed;
}

void Element::ReorderElements(std::size_t first, const std::vector<Element*>& order) {
  std::vector<std::size_t> slots;
  for (std::size_t i = 0; i < children_.size() && slots.size() < order.size(); ++i) {
    Node* node = children_[i];
    if (node->IsElement() && static_cast<Element*>(node)->elementIndex_ >= first) slots.push_back(i);
  }
  if (slots.size() != order.size()) return;
  for (std::size_t k = 0; k < slots.size(); ++k) {
    if (order[k]->parent_ != this) return;
  }
  for (std::size_t k = 0; k < slots.size(); ++k) children_[slots[k]] = order[k];
  if (!slots.empty()) Renumber(slots.front());
  ChildrenChanged();
}

Document* Element::document() const {
  const Element* top = this;
  while (top->parent()) top = top->parent();
  return top->document_;
}

bool Element::IsAncestorOf(const Node* node) const {
  for (const Element* up = node ? node->parent() : nullptr; up; up = up->parent()) {
    if (up == this) return true;
  }
  return false;
}

void Element::MarkUp(std::uint16_t childBit) {
  for (Element* up = this; up && !(up->dirty_ & childBit); up = up->parent()) {
    up->dirty_ = static_cast<std::uint16_t>(up->dirty_ | childBit);
  }
}

void Element::MarkStyleDirty(bool subtree) {
  dirty_ = static_cast<std::uint16_t>(dirty_ | kStyleDirty | (subtree ? kSubtreeStyleDirty : 0));
  if (parent()) parent()->MarkUp(kChildStyleDirty);
}

void Element::MarkLayoutDirty() {
  dirty_ = static_cast<std::uint16_t>(dirty_ | kLayoutDirty);
  if (parent()) parent()->MarkUp(kChildLayoutDirty);
}

void Element::MarkPaintDirty() {
  dirty_ = static_cast<std::uint16_t>(dirty_ | kPaintDirty);
  if (parent()) parent()->MarkUp(kChildPaintDirty);
}

RareData& Element::rare() {
  if (!rare_) rare_ = std::make_unique<RareData>();
  return *rare_;
}

namespace {

Element* FirstElementFrom(const Element& parent, std::size_t nodeIndex) {
  if (parent.elementCount() == 0) return nullptr;  // without touching its text nodes
  const auto& nodes = parent.nodes();
  for (std::size_t i = nodeIndex; i < nodes.size(); ++i) {
    if (nodes[i]->IsElement()) return static_cast<Element*>(nodes[i]);
  }
  return nullptr;
}

}  // namespace

Element* NextElementInOrder(const Element* current, const Element* root) {
  if (Element* child = FirstElementFrom(*current, 0)) return child;
  for (const Element* e = current; e && e != root; e = e->parent()) {
    if (e->parent() == nullptr) return nullptr;
    if (Element* sibling = FirstElementFrom(*e->parent(), e->nodeIndex() + 1)) return sibling;
  }
  return nullptr;
}

std::u16string InnerText(const Element& element) {
  std::u16string text;
  std::vector<const Node*> pending(element.nodes().rbegin(), element.nodes().rend());
  while (!pending.empty()) {
    const Node* node = pending.back();
    pending.pop_back();
    if (!node->IsElement()) {
      text += static_cast<const Text*>(node)->text();
    } else {
      const auto& children = static_cast<const Element*>(node)->nodes();
      pending.insert(pending.end(), children.rbegin(), children.rend());
    }
  }
  return text;
}

}  // namespace kestrune::html::dom
