#!/usr/bin/env bash
# Seeds: the real interface package, and one with files around every size boundary (empty,
# unpadded, padded, the mini stream's last size, a stream of its own sectors).
set -euo pipefail
corpus=$1
top=$(cd "$(dirname "$0")/../.." && pwd)
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
"$KESTRUNE_UIPACK" "$top/resources/ui" "$corpus/seed-resources" >/dev/null
mkdir -p "$work/sizes/styles"
: >"$work/sizes/empty.htm"
head -c 504 /dev/urandom >"$work/sizes/main.htm"
head -c 761 /dev/urandom >"$work/sizes/styles/main.css"
head -c 4080 /dev/urandom >"$work/sizes/mini.png"
head -c 5000 /dev/urandom >"$work/sizes/large.png"
"$KESTRUNE_UIPACK" "$work/sizes" "$corpus/seed-sizes" >/dev/null
