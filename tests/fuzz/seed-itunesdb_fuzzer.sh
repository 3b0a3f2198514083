#!/usr/bin/env bash
# Seeds: databases mkipod writes, from the demo device to the edge cases the reader must take.
set -euo pipefail
corpus=$1
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
"$KESTRUNE_MKIPOD" --demo "$work/demo" >/dev/null
"$KESTRUNE_MKIPOD" --tracks 20 --playlists 3 --seed 7 --no-media "$work/generated" >/dev/null
"$KESTRUNE_MKIPOD" - "$work/edges" >/dev/null <<'DESCRIPTION'
device "Edges"
track id=1 title="odd" odd=1 artist="" location=":iPod_Control:Music:F00:A.mp3" media=none raw-mhod=15:9 unknown=mhzz:16
track id=1 title="dup \ud800" utf8 location="loose.mp3" media=none mhod=1:"second"
playlist name="twice" ids=1,1,99 positions
playlist name="master two" ids=1 master
dataset type=9 photo
dataset type=5 unknown=zzzz:20
DESCRIPTION
for device in demo generated edges; do
  cp "$work/$device/iPod_Control/iTunes/iTunesDB" "$corpus/seed-$device"
done
