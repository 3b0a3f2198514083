#!/usr/bin/env bash
# Builds and runs every test: the native suite under AddressSanitizer and UBSan, the Windows
# suite and scenarios under Wine, the 32-bit Windows build (compiled only; it cannot run here),
# and every fuzzer for a minute. Installs what is missing first.
# Usage: test.sh [--no-fuzz]
set -euo pipefail
top=$(cd "$(dirname "$0")/.." && pwd)
cd "$top"
fuzz=1
[ "${1:-}" = "--no-fuzz" ] && fuzz=0

stage() { printf '\n=== %s\n' "$*"; }

scripts/setup.sh

stage "native tests (AddressSanitizer, UndefinedBehaviorSanitizer)"
cmake --preset linux-asan >/dev/null
cmake --build --preset linux-asan
ctest --preset linux-asan

stage "Windows x86_64 tests under Wine"
cmake --preset win64 >/dev/null
cmake --build --preset win64
source scripts/wine-env.sh
trap wine_env_stop EXIT
ctest --preset win64
for scenario in tests/wine/*.sh; do
  stage "Wine scenario $(basename "$scenario" .sh)"
  "$scenario" "$top/build/linux-asan" "$top/build/win64"
done

stage "Windows i686 build"
cmake --preset win32 >/dev/null
cmake --build --preset win32

if [ "$fuzz" = 1 ]; then
  stage "fuzzing"
  cmake --preset linux-fuzz >/dev/null
  cmake --build --preset linux-fuzz
  scripts/fuzz.sh "${KESTRUNE_FUZZ_SECONDS:-60}"
fi

stage "all tests passed"
