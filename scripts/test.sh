#!/usr/bin/env bash
# Installs what the build needs, then runs the whole test suite: everything
# under AddressSanitizer and UndefinedBehaviorSanitizer, the .px reader under
# libFuzzer for a minute and expressions for half a minute, and the
# concurrency tests once more under ThreadSanitizer.
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
bash "$root/scripts/setup.sh"

bash "$root/scripts/build.sh" asan -DCMAKE_BUILD_TYPE=Debug -DOECORE_SANITIZE=address,undefined \
  -DOECORE_BUILD_BENCHMARKS=OFF
ASAN_OPTIONS=detect_leaks=1:strict_string_checks=1 UBSAN_OPTIONS=print_stacktrace=1 \
  ctest --test-dir "$root/build/asan" --output-on-failure --parallel "$(nproc)"

# The .px reader and the expression parser under libFuzzer, from the seeds.
bash "$root/scripts/build.sh" fuzz -DCMAKE_CXX_COMPILER=clang++ -DCMAKE_BUILD_TYPE=Debug -DOECORE_FUZZ=ON \
  -DOECORE_SANITIZE=address,undefined -DOECORE_BUILD_TESTS=OFF -DOECORE_BUILD_BENCHMARKS=OFF \
  -- --target fuzz_loadstring fuzz_expression
fuzz() {
  mkdir -p "$root/build/fuzz/$1"
  "$root/build/fuzz/tests/fuzz/fuzz_$1" -max_total_time="$2" -timeout=10 -rss_limit_mb=2048 \
    -artifact_prefix="$root/build/fuzz/" -print_final_stats=1 "$root/build/fuzz/$1" "$root/tests/fuzz/$3"
}
fuzz loadstring 60 corpus
fuzz expression 30 expressions

bash "$root/scripts/build.sh" tsan -DCMAKE_BUILD_TYPE=Debug -DOECORE_SANITIZE=thread \
  -DOECORE_BUILD_BENCHMARKS=OFF -- --target test_core_concurrency test_crs_concurrency
TSAN_OPTIONS=halt_on_error=1 ctest --test-dir "$root/build/tsan" -L concurrency --output-on-failure
