#!/usr/bin/env bash
# Seeds: the pages and fragments the program writes, and the broken forms the parser must take.
set -euo pipefail
corpus=$1
row='<tr><td>1</td><td><input type="checkbox" action="musicselection" id="musicselection">Title</td><td>3:07</td><td>Artist</td><td>Album</td><td>Genre</td><td/>'
printf '%s%s%s' "$row" "$row" "$row" >"$corpus/seed-rows"
printf '<!DOCTYPE html><html lang=en><head><link rel="stylesheet" href="styles/main.css"><style>p > a { color: red }</style></head><body><div id=MainForm><select id=PlayLists><OPTION plid=0>All<option selected>One</select><ul><li>a<li>b</ul><p>x<p>y &amp; &#65; &#x1F600; &bogus; <a href=#top>top</a></div><script>if (a<b) x();</script><textarea>&lt;b&gt;</textarea></body></html>' >"$corpus/seed-page"
printf '</b><div><span>x</div></span><table><tr><td>1</tr><tr><td>2</table><!-- unclosed <p <input type=checkbox checked value=\x27a\x27 data-x=1/>' >"$corpus/seed-broken"
