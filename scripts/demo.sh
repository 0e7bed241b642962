#!/usr/bin/env bash
# Installs what the build needs, builds OECore and runs omb on the demo.
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
bash "$root/scripts/setup.sh"
bash "$root/scripts/build.sh" release -DCMAKE_BUILD_TYPE=Release -DOECORE_BUILD_TESTS=OFF \
  -DOECORE_BUILD_BENCHMARKS=OFF
"$root/build/release/tools/omb/omb" info
