#!/usr/bin/env bash
# The GTK folder picker on a virtual X server: Escape gives nothing; typing a folder's path and
# Enter gives that folder.
# Usage: folder_picker_gtk.sh PROBE   (exit 77, skipped, without Xvfb or xdotool)
set -euo pipefail
probe=$1
command -v Xvfb >/dev/null && command -v xdotool >/dev/null || exit 77

work=$(mktemp -d)
for number in $(seq 120 160); do
  [ -e "/tmp/.X11-unix/X$number" ] || [ -e "/tmp/.X$number-lock" ] || break
done
Xvfb ":$number" -screen 0 1280x1024x24 -nolisten tcp >/dev/null 2>&1 &
xvfb=$!
trap 'kill $xvfb 2>/dev/null; rm -rf "$work"' EXIT
export DISPLAY=":$number"
for _ in $(seq 50); do xdpyinfo >/dev/null 2>&1 && break; sleep 0.1; done

# Starts the picker with a title of its own and gives its window once it is shown.
show_picker() {
  "$probe" "$1" >"$work/$1.out" 2>"$work/$1.err" &
  picker=$!
  window=$(timeout 20 xdotool search --sync --onlyvisible --name "$1" | head -1)
  xdotool windowfocus --sync "$window"
  sleep 0.5
}

show_picker "Cancel me"
xdotool key Escape
timeout 20 tail --pid="$picker" -f /dev/null || { kill "$picker"; echo "the picker did not close"; exit 1; }
[ "$(cat "$work/Cancel me.out")" = "chosen:" ] || { echo "cancelling gave: $(cat "$work/Cancel me.out")"; exit 1; }

mkdir "$work/Chosen Folder"
show_picker "Choose me"
# A slash opens the location field; no further key may come before it is there.
xdotool type "/"
sleep 1
xdotool type --delay 40 "${work#/}/Chosen Folder/"
sleep 1
xdotool key Return
sleep 0.5
# Still open when the first Enter only opened the folder: a second one selects it.
sleep 1
kill -0 "$picker" 2>/dev/null && xdotool key Return
timeout 20 tail --pid="$picker" -f /dev/null || { kill "$picker"; echo "the picker did not close"; exit 1; }
[ "$(cat "$work/Choose me.out")" = "chosen:$work/Chosen Folder" ] ||
  { echo "choosing gave: $(cat "$work/Choose me.out")"; cat "$work/Choose me.err"; exit 1; }
echo "the GTK picker gave nothing when cancelled and the typed folder when chosen"
