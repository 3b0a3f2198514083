#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "html/dom/atoms.h"
#include "html/dom/handle.h"

namespace kestrune::html::css {
struct ComputedStyle;
}

namespace kestrune::html::dom {

class Element;
class Document;

// Nodes are reference counted: the parent holds one reference per child and every handle the
// program keeps holds one more, so an element stays valid after it leaves the tree.
class Node {
 public:
  Node(const Node&) = delete;
  Node& operator=(const Node&) = delete;

  bool IsElement() const { return isElement_; }
  Element* parent() const { return parent_; }
  // Position among all child nodes of the parent (text included).
  std::uint32_t nodeIndex() const { return nodeIndex_; }

  void AddRef() { ++refs_; }
  // Frees the node, and every child no one else holds, when the last reference goes. Works
  // without recursion, so arbitrarily deep trees are freed safely.
  void Release();
  std::uint32_t refCount() const { return refs_; }

 protected:
  explicit Node(bool isElement) : isElement_(isElement) {}
  ~Node() = default;

 private:
  friend class Element;
  union {
    Element* parent_ = nullptr;
    Node* nextDoomed_;  // once released: the next node Release frees
  };
  std::uint32_t refs_ = 0;
  std::uint32_t nodeIndex_ = 0;
  bool isElement_;
};

// Owning pointer that holds one reference.
template <typename T>
class Ref {
 public:
  Ref() = default;
  explicit Ref(T* node) : node_(node) {
    if (node_) node_->AddRef();
  }
  Ref(const Ref& other) : Ref(other.node_) {}
  Ref(Ref&& other) noexcept : node_(std::exchange(other.node_, nullptr)) {}
  template <typename U>
  Ref(Ref<U>&& other) noexcept : node_(other.Leak()) {}
  template <typename U>
  Ref(const Ref<U>& other) : Ref(other.get()) {}
  Ref& operator=(Ref other) noexcept {
    std::swap(node_, other.node_);
    return *this;
  }
  ~Ref() {
    if (node_) node_->Release();
  }
  T* get() const { return node_; }
  T* operator->() const { return node_; }
  T& operator*() const { return *node_; }
  explicit operator bool() const { return node_ != nullptr; }
  bool operator==(const Ref& other) const { return node_ == other.node_; }
  // Takes over a reference someone else already counted.
  static Ref Adopt(T* node) {
    Ref ref;
    ref.node_ = node;
    return ref;
  }
  // Gives up the reference without releasing it.
  T* Leak() { return std::exchange(node_, nullptr); }

 private:
  T* node_ = nullptr;
};

// A text node keeps its characters right behind itself: one allocation per text.
class Text : public Node {
 public:
  static Ref<Text> Create(std::u16string_view text);
  std::u16string_view text() const { return {reinterpret_cast<const char16_t*>(this + 1), length_}; }

 private:
  friend class Node;
  explicit Text(std::size_t length) : Node(false), length_(length) {}
  ~Text() = default;
  static void Destroy(Text* text);
  std::size_t length_;
};

// Nodes and their lists of children and attributes come from a pool of their own (node.cpp).
void* AllocateNodeMemory(std::size_t size);
void FreeNodeMemory(void* memory, std::size_t size) noexcept;

template <typename T>
struct NodeAllocator {
  using value_type = T;
  NodeAllocator() = default;
  template <typename U>
  NodeAllocator(const NodeAllocator<U>&) {}
  T* allocate(std::size_t count) { return static_cast<T*>(AllocateNodeMemory(count * sizeof(T))); }
  void deallocate(T* memory, std::size_t count) noexcept { FreeNodeMemory(memory, count * sizeof(T)); }
  friend bool operator==(const NodeAllocator&, const NodeAllocator&) { return true; }
};

template <typename T>
using NodeVector = std::vector<T, NodeAllocator<T>>;

struct Attribute {
  Atom name;
  std::u16string value;
};

// Room for data the layers above attach to an element (layout box, control state, parsed
// inline style); the dom only owns and frees it.
class Extension {
 public:
  static void* operator new(std::size_t size) { return AllocateNodeMemory(size); }
  static void operator delete(void* memory, std::size_t size) { FreeNodeMemory(memory, size); }
  virtual ~Extension() = default;
};

struct AttachedHandler {
  ElementEventProc proc = nullptr;
  void* tag = nullptr;
  unsigned subscription = 0;
  std::string behavior;  // the `behavior` name it was attached for; empty when attached by hand
};

// Data few elements have, kept out of line so that a big table stays small.
struct RareData {
  static void* operator new(std::size_t size) { return AllocateNodeMemory(size); }
  static void operator delete(void* memory, std::size_t size) { FreeNodeMemory(memory, size); }

  std::vector<std::pair<std::u16string, std::u16string>> runtimeStyle;  // set by the program
  NodeVector<AttachedHandler> handlers;
  std::unique_ptr<Extension> parsedInlineStyle;
  std::unique_ptr<Extension> control;
};

enum DirtyBit : std::uint16_t {
  kStyleDirty = 0x1,         // this element's style must be recomputed
  kSubtreeStyleDirty = 0x2,  // ... and so must every descendant's
  kChildStyleDirty = 0x4,    // some descendant has one of the bits above
  kLayoutDirty = 0x8,
  kChildLayoutDirty = 0x10,
  kPaintDirty = 0x20,
  kChildPaintDirty = 0x40,
};

class Element : public Node {
 public:
  static void* operator new(std::size_t size);
  static void operator delete(void* memory, std::size_t size);
  static Ref<Element> Create(Atom tag);

  Atom tag() const { return tag_; }

  // Attributes, in document order; names are atoms (lower case).
  const NodeVector<Attribute>& attributes() const { return attributes_; }
  const std::u16string* Attr(Atom name) const;
  bool HasAttr(Atom name) const { return Attr(name) != nullptr; }
  void SetAttr(Atom name, std::u16string value);
  bool RemoveAttr(Atom name);
  // Only for the parser: adds the attributes of a tag (names not repeated) whose names the
  // element lacks, without change notices; the list is left empty with its room.
  void TakeParsedAttributes(std::vector<Attribute>& attributes);

  std::uint32_t state() const { return state_; }
  void SetState(std::uint32_t state);

  // Children: all nodes, and the element children alone (the ones the engine interface counts).
  const NodeVector<Node*>& nodes() const { return children_; }
  std::size_t elementCount() const { return children_.size() - textChildren_; }
  Element* ElementAt(std::size_t index) const;
  // Index among the parent's element children; 0 without a parent.
  std::size_t elementIndex() const;

  void AppendChild(Ref<Node> child);
  // Appends the nodes, in order, as one change; the list is left empty (with its room).
  void AppendChildren(std::vector<Ref<Node>>& nodes);
  // Inserts before the element child at elementIndex (appends when past the end).
  void InsertElementAt(std::size_t elementIndex, Ref<Node> child);
  void InsertNodeAt(std::size_t nodeIndex, Ref<Node> child);
  Ref<Node> RemoveChild(Node* child);
  std::vector<Ref<Node>> RemoveAllChildren();
  // Reorders the element children in [first, last) as `order` (the same elements) lists them;
  // text nodes keep their places.
  void ReorderElements(std::size_t first, const std::vector<Element*>& order);

  // The document whose tree holds this element, or none.
  Document* document() const;
  bool IsAncestorOf(const Node* node) const;

  // Style and layout hooks.
  const std::shared_ptr<const css::ComputedStyle>& style() const { return style_; }
  void SetStyle(std::shared_ptr<const css::ComputedStyle> style) { style_ = std::move(style); }
  std::uint16_t dirty() const { return dirty_; }
  void ClearDirty(std::uint16_t bits) { dirty_ = static_cast<std::uint16_t>(dirty_ & ~bits); }
  void MarkStyleDirty(bool subtree);
  void MarkLayoutDirty();
  void MarkPaintDirty();
  std::unique_ptr<Extension>& layoutData() { return layout_; }
  Extension* layoutDataIfAny() const { return layout_.get(); }

  RareData& rare();
  RareData* rareIfAny() const { return rare_.get(); }

 private:
  friend class Node;
  friend class Document;
  explicit Element(Atom tag) : Node(true), tag_(tag) {}
  ~Element() = default;
  void Adopt(Node* child);
  void Renumber(std::size_t fromNode);
  void MarkUp(std::uint16_t childBit);
  void ChildrenChanged();
  void AttributeChanged(Atom name);

  // What walks of the tree read comes first, in the first cache line with the node's own fields.
  Atom tag_;
  std::uint32_t state_ = 0;
  std::uint32_t textChildren_ = 0;
  std::uint32_t elementIndex_ = 0;
  std::uint16_t dirty_ = kStyleDirty | kLayoutDirty | kPaintDirty;
  NodeVector<Node*> children_;
  NodeVector<Attribute> attributes_;
  std::shared_ptr<const css::ComputedStyle> style_;
  std::unique_ptr<RareData> rare_;
  std::unique_ptr<Extension> layout_;
  Document* document_ = nullptr;  // set on a document's root only
};

inline Element* AsElement(Node* node) { return node && node->IsElement() ? static_cast<Element*>(node) : nullptr; }
inline Text* AsText(Node* node) { return node && !node->IsElement() ? static_cast<Text*>(node) : nullptr; }

// The element after `current` in document order within the subtree of `root` (which itself is
// never returned), or none. Walks without recursion or allocation.
Element* NextElementInOrder(const Element* current, const Element* root);

// Text content of a subtree, text nodes in document order.
std::u16string InnerText(const Element& element);

}  // namespace kestrune::html::dom
