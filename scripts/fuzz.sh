#!/usr/bin/env bash
# Runs every libFuzzer target of the linux-fuzz build for a while (60 s each unless given), two
# at a time. A target's corpus starts from what tests/fuzz/seed-NAME.sh writes, if there is one.
# Usage: fuzz.sh [SECONDS]
set -euo pipefail
top=$(cd "$(dirname "$0")/.." && pwd)
seconds=${1:-60}
build="$top/build/linux-fuzz"
export KESTRUNE_MKIPOD="$build/tools/mkipod/mkipod"
export KESTRUNE_UIPACK="$build/tools/uipack/uipack"

run_one() {
  local fuzzer=$1 seconds=$2 top=$3
  local name corpus
  name=$(basename "$fuzzer")
  corpus="$top/build/fuzz-corpus/$name"
  mkdir -p "$corpus"
  if [ -x "$top/tests/fuzz/seed-$name.sh" ]; then "$top/tests/fuzz/seed-$name.sh" "$corpus"; fi
  cd "$top/build/fuzz-corpus"
  if "$fuzzer" -max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 -print_final_stats=1 \
       "$corpus" >"$name.log" 2>&1; then
    echo "fuzz: $name ran $(grep -o 'stat::number_of_executed_units: *[0-9]*' "$name.log" | grep -o '[0-9]*$') inputs, no failure"
  else
    echo "fuzz: $name FAILED"; tail -40 "$name.log"; return 1
  fi
}
export -f run_one

find "$build/tests/fuzz" -maxdepth 1 -name '*_fuzzer' -type f -executable | sort |
  xargs -P 2 -I{} bash -c 'run_one "$@"' _ {} "$seconds" "$top"
