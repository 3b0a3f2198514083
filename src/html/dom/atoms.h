#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace kestrune::html::dom {

// Tag and attribute names are interned once so that matching and lookups compare integers.
// The table is process-wide and, like the rest of the engine, used from the UI thread only.
using Atom = std::uint32_t;

// Names the engine itself looks at; interned in this order when the table is made.
enum KnownAtom : Atom {
  kAtomNone = 0,
  kAtomHtml, kAtomHead, kAtomBody, kAtomTitle, kAtomMeta, kAtomLink, kAtomStyle, kAtomScript,
  kAtomDiv, kAtomSpan, kAtomP, kAtomA, kAtomImg, kAtomBr, kAtomHr, kAtomInput, kAtomButton,
  kAtomTextarea, kAtomSelect, kAtomOption, kAtomOptions, kAtomOptgroup, kAtomTable,
  kAtomThead, kAtomTbody, kAtomTfoot, kAtomTr, kAtomTd, kAtomTh, kAtomCol, kAtomColgroup,
  kAtomCaption, kAtomUl, kAtomOl, kAtomLi, kAtomDl, kAtomDt, kAtomDd, kAtomMenu, kAtomPopup,
  kAtomWidget, kAtomText, kAtomPre, kAtomForm, kAtomFrame, kAtomIframe, kAtomH1, kAtomH2,
  kAtomH3, kAtomH4, kAtomH5, kAtomH6, kAtomBase, kAtomArea, kAtomEmbed, kAtomParam,
  kAtomSource, kAtomTrack, kAtomWbr, kAtomLabel, kAtomSection, kAtomHeader, kAtomFooter,
  kAtomNav, kAtomBlockquote, kAtomAddress, kAtomFieldset, kAtomCenter,
  // attributes
  kAtomId, kAtomClass, kAtomType, kAtomName, kAtomValue, kAtomHref, kAtomSrc, kAtomRel,
  kAtomTarget, kAtomChecked, kAtomDisabled, kAtomSelected, kAtomMultiple, kAtomReadonly,
  kAtomSize, kAtomMaxlength,
  kAtomKnownCount
};

// The atom of a name; names are folded to ASCII lower case first (tags and attribute names
// are case-insensitive).
Atom InternName(std::u16string_view name);
Atom InternName(std::string_view asciiName);

// The atom of a name if it was ever interned, else kAtomNone; never grows the table.
Atom FindName(std::u16string_view name);

const std::u16string& NameOf(Atom atom);

}  // namespace kestrune::html::dom
