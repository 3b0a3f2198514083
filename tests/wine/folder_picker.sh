#!/usr/bin/env bash
# The Windows folder picker under Wine, answered with keys: Escape gives nothing; moving to the
# Documents folder below the desktop and pressing Enter gives its path.
# Usage: folder_picker.sh NATIVE_BUILD_DIR WIN64_BUILD_DIR
set -euo pipefail
windows=$2
source "$(dirname "$0")/../../scripts/wine-env.sh"
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

# Shows the picker, waits for its window, focuses it and sends the keys; prints the answer.
answer_picker() {
  wine "$windows/tests/platform/folder_picker_probe.exe" "Select a target folder below:" >"$work/out" 2>/dev/null &
  local picker=$!
  local window
  window=$(timeout 30 xdotool search --sync --onlyvisible --name "Browse for Folder" | head -1)
  xdotool windowfocus --sync "$window"
  sleep 0.5
  xdotool key "$@"
  wait "$picker"
  tr -d '\r' <"$work/out"
}

cancelled=$(answer_picker Escape)
[ "$cancelled" = "chosen:" ] || { echo "cancelling gave: $cancelled"; exit 1; }
chosen=$(answer_picker Down Down Return)
[[ "$chosen" =~ ^chosen:C:\\users\\[^\\]+\\Documents\\?$ ]] || { echo "choosing gave: $chosen"; exit 1; }
echo "the Windows picker gave nothing when cancelled and $chosen when chosen"
