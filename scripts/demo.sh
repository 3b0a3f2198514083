#!/usr/bin/env bash
# Builds the program, writes the demo device with mkipod, and lists it with the command line.
# Installs what is missing first.
set -euo pipefail
top=$(cd "$(dirname "$0")/.." && pwd)
cd "$top"
scripts/setup.sh native
cmake --preset linux-release >/dev/null
cmake --build --preset linux-release --target kestrune-cli mkipod
rm -rf build/demo-ipod
build/linux-release/tools/mkipod/mkipod --demo build/demo-ipod
build/linux-release/src/cli/kestrune-cli list --device build/demo-ipod
