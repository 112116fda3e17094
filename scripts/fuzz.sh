#!/usr/bin/env bash
# Builds the libFuzzer targets with clang and runs each for a bounded time.
#   bash scripts/fuzz.sh [seconds-per-target]     (default 30)
# New inputs that widen coverage collect in build/fuzz/corpus/<target>; the
# committed seeds and dictionaries in fuzz/ start each run.
set -euo pipefail
cd "$(dirname "$0")/.."
seconds="${1:-30}"

cmake --preset fuzz
cmake --build --preset fuzz

for source in fuzz/*.cpp; do
    target=$(basename "$source" .cpp)
    corpus="build/fuzz/corpus/$target"
    mkdir -p "$corpus"
    args=(-max_total_time="$seconds" -timeout=10 -max_len=65536 "$corpus")
    [ -f "fuzz/$target.dict" ] && args=(-dict="fuzz/$target.dict" "${args[@]}")
    [ -d "fuzz/seeds/$target" ] && args+=("fuzz/seeds/$target")
    log="build/fuzz/$target.log"
    echo "== $target for ${seconds}s"
    if ! "build/fuzz/fuzz/$target" "${args[@]}" >"$log" 2>&1; then
        tail -n 60 "$log"
        echo "$target found a failure; the input that caused it is named above"
        exit 1
    fi
    tail -n 1 "$log"
done
