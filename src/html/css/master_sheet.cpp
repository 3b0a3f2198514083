#include "html/css/style_engine.h"

namespace kestrune::html::css {

// The engine's own style sheet: what every page starts from, and where the built-in controls
// are named as behaviors (a page can name others, or `none`).
const char16_t* MasterStyleSheetText() {
  return uR"CSS(
html, body, div, p, form, pre, blockquote, section, header, footer, nav, address, fieldset, center,
h1, h2, h3, h4, h5, h6, ul, ol, dl, dt, dd, menu, popup, options, frame, iframe, hr { display: block; }
head, style, script, title, meta, link, base, param { display: none; }
table { display: table; border-spacing: 2px; }
tr { display: table-row; }
td, th { display: table-cell; vertical-align: middle; padding: 1px; }
thead { display: table-header-group; }
tbody { display: table-row-group; }
tfoot { display: table-footer-group; }
caption { display: table-caption; }
col { display: table-column; }
li { display: list-item; }
input, button, select, textarea, widget, img { display: inline-block; }
body { margin: 8px; }
p, ul, ol { margin-top: 1em; margin-bottom: 1em; }
h1 { font-size: 2em; font-weight: bold; }
h2 { font-size: 1.5em; font-weight: bold; }
h3 { font-size: 1.17em; font-weight: bold; }
h4, h5, h6, b, strong, th { font-weight: bold; }
i, em { font-style: italic; }
th { text-align: center; }
pre, textarea { white-space: pre; }
a[href] { color: #0000EE; cursor: pointer; behavior: hyperlink; }
button, input[type=button], input[type=submit], input[type=reset] { behavior: button; }
input, input[type=text], input[type=password], textarea { behavior: edit; cursor: text; }
input[type=checkbox] { behavior: checkbox; cursor: default; }
input[type=radio] { behavior: radio; cursor: default; }
input[type=hidden] { display: none; behavior: none; }
select { behavior: select; }
menu { behavior: menu; }
widget[type=vscrollbar], widget[type=hscrollbar] { behavior: scrollbar; }
popup { display: none; }
popup:popup { display: block; }
option { display: block; }
option:current { background-color: highlight; color: highlighttext; }
hr { border-top: 1px solid gray; margin: 8px 0; }
input { white-space: pre; }
input:not([type]), input[type=text], input[type=password] {
  width: 150px; padding: 2px 3px; border: 1px solid #7a7a7a; background-color: window; }
textarea { width: 200px; height: 60px; padding: 2px; border: 1px solid #7a7a7a; background-color: window;
  white-space: pre-wrap; overflow: auto; }
input[type=checkbox], input[type=radio] { width: 13px; height: 13px; margin: 0 3px; }
button, input[type=button], input[type=submit], input[type=reset] {
  padding: 2px 8px; border: 1px solid #707070; border-radius: 3px; background-color: buttonface; text-align: center; }
select { border: 1px solid #7a7a7a; background-color: window; overflow-y: auto; }
widget[type=vscrollbar] { width: 16px; height: 100px; }
widget[type=hscrollbar] { height: 16px; width: 100px; }
)CSS";
}

}  // namespace kestrune::html::css
