#!/usr/bin/env bash
# Builds the libFuzzer targets of tests/fuzz with clang (ASan + UBSan, the whole tree instrumented)
# in build-fuzz and runs each for the given time, one after another, starting from its checked-in
# seed corpus in tests/fuzz/corpus/<target>. New inputs go to build-fuzz/corpus/<target>; a fault
# stops the run with the input in build-fuzz/artifacts/<target>/ and a nonzero status.
#
#   bash scripts/fuzz.sh [seconds per target, default 60] [target ...]   (targets: all by default)
#
# A fault found is replayed by running its target on the file:
#   QOR_MM_BACKEND=system build-fuzz/bin/fuzz_layout build-fuzz/artifacts/layout/crash-...
set -euo pipefail
cd "$(dirname "$0")/.."
seconds=${1:-60}
shift || true
targets=("$@")
if [ ${#targets[@]} -eq 0 ]; then
  for dir in tests/fuzz/corpus/*/; do targets+=("$(basename "$dir")"); done
fi
build=build-fuzz
launcher=()
if command -v ccache > /dev/null; then
  launcher=(-DCMAKE_C_COMPILER_LAUNCHER=ccache -DCMAKE_CXX_COMPILER_LAUNCHER=ccache)
fi
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DCMAKE_C_COMPILER=clang \
  -DCMAKE_CXX_COMPILER=clang++ -DQOR_FUZZ=ON -DQOR_BUILD_TESTS=OFF -DQOR_BUILD_BENCH=OFF "${launcher[@]}" > /dev/null
cmake --build "$build" -j "$(nproc)" --target "${targets[@]/#/fuzz_}"

# The system heap, so the sanitizer sees every block; the library's routed delete may free blocks
# that libstdc++ made, which is right (see scripts/test.sh).
export QOR_MM_BACKEND=system
export ASAN_OPTIONS=alloc_dealloc_mismatch=0:detect_leaks=1
export UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1
for target in "${targets[@]}"; do
  mkdir -p "$build/corpus/$target" "$build/artifacts/$target"
  echo "== fuzz_$target: ${seconds} s"
  log="$build/fuzz_$target.log"
  status=0
  "$build/bin/fuzz_$target" -max_total_time="$seconds" -timeout=20 -rss_limit_mb=2048 -max_len=131072 \
    -print_final_stats=1 -artifact_prefix="$build/artifacts/$target/" \
    "$build/corpus/$target" "tests/fuzz/corpus/$target" > "$log" 2>&1 || status=$?
  # The last coverage line and the totals.
  { grep -E '^#[0-9]+' "$log" | tail -n 1; grep -E '^stat::(number_of_executed_units|peak_rss_mb)' "$log"; } || true
  if [ "$status" -ne 0 ]; then
    tail -n 60 "$log"
    echo "fuzz_$target found a fault: see $build/artifacts/$target/ and $log"
    exit 1
  fi
done
