#include "html/dom/document.h"

namespace kestrune::html::dom {

Document::Document() { SetRoot(Element::Create(kAtomHtml)); }

Document::~Document() {
  if (root_) root_->document_ = nullptr;
}

void Document::SetRoot(Ref<Element> root) {
  if (root_) root_->document_ = nullptr;
  root_ = std::move(root);
  if (root_) {
    root_->document_ = this;
    root_->MarkStyleDirty(true);
  }
}

}  // namespace kestrune::html::dom
