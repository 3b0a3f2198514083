#!/usr/bin/env bash
# The Windows command line finds a device folder mapped to a removable drive letter, and lists
# exactly what the Linux command line lists from the same folder.
# Usage: cli_on_removable_drive.sh NATIVE_BUILD_DIR WIN64_BUILD_DIR
set -euo pipefail
native=$1 windows=$2
source "$(dirname "$0")/../../scripts/wine-env.sh"

work=$(mktemp -d)
trap 'wine_unmap_drive e; rm -rf "$work"' EXIT
"$native/tools/mkipod/mkipod" --demo "$work/device" >/dev/null
wine_map_removable_drive e "$work/device"

wine "$windows/src/cli/kestrune-cli.exe" devices >"$work/devices.txt"
grep -q '^E:  loaded  "Kestrune Demo": 36 tracks, 5 playlists.*(the device)' "$work/devices.txt" ||
  { echo "devices did not load E:"; cat "$work/devices.txt"; exit 1; }

wine "$windows/src/cli/kestrune-cli.exe" list --json >"$work/windows.json"
"$native/src/cli/kestrune-cli" list --json --device "$work/device" >"$work/linux.json"

python3 - "$work/windows.json" "$work/linux.json" "$work/device" <<'PY'
import json, sys
windows = json.load(open(sys.argv[1], encoding="utf-8"))
linux = json.load(open(sys.argv[2], encoding="utf-8"))
root = sys.argv[3]
assert len(windows["tracks"]) == 36, len(windows["tracks"])
for w, l in zip(windows["tracks"], linux["tracks"]):
    assert w["path"].startswith("E:\\iPod_Control\\Music\\F"), w["path"]
    assert w["path"][2:].replace("\\", "/") == l["path"][len(root):], (w["path"], l["path"])
    w.pop("path"); l.pop("path")
assert windows == linux, "the two listings differ"
print("Windows and Linux listings agree:", len(windows["tracks"]), "tracks,", len(windows["playlists"]), "playlists")
PY
