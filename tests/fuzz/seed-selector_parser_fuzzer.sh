#!/usr/bin/env bash
# Seeds: the selectors the behaviors and pages use.
set -euo pipefail
corpus=$1
i=0
while IFS= read -r selector; do
  printf '%s' "$selector" >"$corpus/seed-$i"
  i=$((i + 1))
done <<'SELECTORS'
[accesskey=='^S'],[accesskey-alt=='^S']
[id='musicselection']
th:checked
[panel]:current
li > .caption
option[check='on'],options[check='on']
widget[type='vscrollbar']
select,[type='select']
ul li:not(.x, #y):nth-child(-n+3) + li ~ li
[lang|=en][title~=two][data-path^='/m'][data-path$='.mp3'][data-path*=abc]
SELECTORS
