#!/usr/bin/env bash
# The Windows command line exports a device on a removable drive letter into the folder stored
# in the registry, with the same layout and bytes as the Linux command line, and writes its
# playlists with Windows paths.
# Usage: cli_export_on_removable_drive.sh NATIVE_BUILD_DIR WIN64_BUILD_DIR
set -euo pipefail
native=$1 windows=$2
source "$(dirname "$0")/../../scripts/wine-env.sh"

work=$(mktemp -d)
key='HKCU\Software\Kestrune'
cleanup() {
  wine reg delete "$key" /f >/dev/null 2>&1 || true
  wine_unmap_drive e
  rm -rf "$work" "$WINEPREFIX/drive_c/kestrune-export"
}
trap cleanup EXIT
"$native/tools/mkipod/mkipod" --demo "$work/device" >/dev/null
wine_map_removable_drive e "$work/device"

# The folder and the layout come from the registry, as the window stores them.
wine reg add "$key" /v OuputPath /t REG_SZ /d 'C:\kestrune-export' /f >/dev/null 2>&1
wine reg add "$key" /v Organized /t REG_SZ /d true /f >/dev/null 2>&1
wine "$windows/src/cli/kestrune-cli.exe" export --all --playlists-m3u >"$work/windows.txt"
grep -q 'copied 36, already present 0, failed 0' "$work/windows.txt" ||
  { echo "the Windows export did not copy every track"; cat "$work/windows.txt"; exit 1; }

"$native/src/cli/kestrune-cli" export --device "$work/device" --out "$work/linux" --organized --all \
  --playlists-m3u >/dev/null

python3 - "$WINEPREFIX/drive_c/kestrune-export" "$work/linux" <<'PY'
import hashlib, os, sys
def tree(root):
    found = {}
    for folder, _, files in os.walk(root):
        for name in files:
            path = os.path.join(folder, name)
            if name.endswith(".m3u8"):
                continue
            found[os.path.relpath(path, root)] = hashlib.sha256(open(path, "rb").read()).hexdigest()
    return found
windows, linux = tree(sys.argv[1]), tree(sys.argv[2])
assert len(windows) == 36, len(windows)
assert windows == linux, "the two exports differ"
playlist = open(os.path.join(sys.argv[1], "Playlists", "Favourites.m3u8"), encoding="utf-8").read().split("\n")
assert playlist[0] == "#EXTM3U" and playlist[1] == "#PLAYLIST:Favourites", playlist[:2]
assert playlist[3].startswith("..\\") and "/" not in playlist[3], playlist[3]
for entry in playlist[3::2]:
    if entry:
        assert os.path.isfile(os.path.join(sys.argv[1], "Playlists", entry.replace("\\", os.sep))), entry
print("Windows and Linux exports agree:", len(windows), "files; playlists use Windows paths")
PY
