#include <gtest/gtest.h>

#include <vector>

#include "html/dom/node.h"

namespace kestrune::html::dom {
namespace {

// Every child's place among all nodes and among the elements, as the tree keeps them.
void ExpectNumbered(const Element& parent) {
  std::size_t elements = 0;
  for (std::size_t i = 0; i < parent.nodes().size(); ++i) {
    Node* node = parent.nodes()[i];
    EXPECT_EQ(node->nodeIndex(), i);
    EXPECT_EQ(node->parent(), &parent);
    if (Element* element = AsElement(node)) {
      EXPECT_EQ(element->elementIndex(), elements);
      EXPECT_EQ(parent.ElementAt(elements), element);
      ++elements;
    }
  }
  EXPECT_EQ(parent.elementCount(), elements);
}

TEST(DomTree, AppendingNumbersChildrenAlsoWhenOneMovesWithinItsParent) {
  Ref<Element> parent = Element::Create(kAtomTr);
  std::vector<Ref<Node>> nodes{Ref<Node>(Element::Create(kAtomTd)), Ref<Node>(Text::Create(u"x")),
                               Ref<Node>(Element::Create(kAtomTd))};
  parent->AppendChildren(nodes);
  EXPECT_TRUE(nodes.empty());
  ExpectNumbered(*parent);

  Ref<Node> first(parent->nodes()[0]);
  Ref<Element> other = Element::Create(kAtomTr);
  Ref<Node> fromElsewhere(Element::Create(kAtomTh));
  other->AppendChild(fromElsewhere);
  std::vector<Ref<Node>> more{first, Ref<Node>(Text::Create(u"y")), fromElsewhere};
  parent->AppendChildren(more);
  ASSERT_EQ(parent->nodes().size(), 5u);
  EXPECT_EQ(parent->nodes()[2], first.get());  // moved from the front to the end
  EXPECT_EQ(parent->nodes()[4], fromElsewhere.get());
  EXPECT_TRUE(other->nodes().empty());
  ExpectNumbered(*parent);
}

TEST(DomTree, ReleasingFreesAnyDepthAndKeepsHeldNodes) {
  // Built bottom up, as the parser builds: each new element takes the tree so far.
  Ref<Element> root = Element::Create(kAtomDiv);
  root->AppendChild(Text::Create(u"leaf"));
  Ref<Element> held = root;
  for (int depth = 0; depth < 200000; ++depth) {
    Ref<Element> parent = Element::Create(kAtomDiv);
    parent->AppendChild(root);
    root = parent;
  }
  ASSERT_NE(held->parent(), nullptr);
  root = {};  // frees 200,000 levels without recursion, except the held element and its text
  EXPECT_EQ(held->parent(), nullptr);
  EXPECT_EQ(held->refCount(), 1u);
  EXPECT_EQ(InnerText(*held), u"leaf");
}

}  // namespace
}  // namespace kestrune::html::dom
