#!/usr/bin/env bash
# Seeds: sheets like the pages', shorthands, flexible lengths, and recovery cases.
set -euo pipefail
corpus=$1
printf '@import "more.css"; body { margin: 0; font: italic bold 12px/1.5 "Segoe UI", Arial } #MainForm { flow: horizontal; width: 1*; height: 100%%; border: 1px solid #ccc; border-radius: 4px 2px; background: #fff url(img/bg.png) no-repeat right top } tr:current td, tr:checked > td { color: rgb(10, 20, 30); behavior: grid sortable-grid } input[type=checkbox] { behavior: checkbox } @media screen { li:nth-child(2n+1) { visibility: hidden !important } }' >"$corpus/seed-sheet"
printf 'div { color: red; width: ; height: 5px } }} span::before { color: blue } @font-face { x: y } div {{ broken } p { margin: 1px 2px 3px 4px 5px } @media { @media { a { b: c } }' >"$corpus/seed-broken"
