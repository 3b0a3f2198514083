#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "html/dom/node.h"

namespace kestrune::html::dom {

// What the style sheets of a document test, so that a change restyles only what it can affect:
// a state or attribute that only subject compounds test restyles the element alone; one that an
// ancestor or sibling compound tests restyles the element's subtree (or its parent's, when
// sibling combinators exist).
struct StyleFeatures {
  std::uint32_t states = 0;
  std::uint32_t statesOutsideSubject = 0;
  std::vector<Atom> attributes;
  std::vector<Atom> attributesOutsideSubject;
  bool siblingCombinators = false;
  bool structural = false;  // :first-child, :nth-child, :empty ... depend on the siblings
};

class Document {
 public:
  Document();
  ~Document();
  Document(const Document&) = delete;
  Document& operator=(const Document&) = delete;

  Element* root() const { return root_.get(); }
  void SetRoot(Ref<Element> root);

  StyleFeatures& features() { return features_; }
  const StyleFeatures& features() const { return features_; }

  // The URL the document was loaded from; empty for a page given from memory.
  const std::u16string& url() const { return url_; }
  void SetUrl(std::u16string url) { url_ = std::move(url); }

 private:
  Ref<Element> root_;
  StyleFeatures features_;
  std::u16string url_;
};

}  // namespace kestrune::html::dom
