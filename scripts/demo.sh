#!/usr/bin/env bash
# Installs what the build needs, builds OECore and runs omb on the demo.
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
bash "$root/scripts/setup.sh"
bash "$root/scripts/build.sh" release -DCMAKE_BUILD_TYPE=Release -DOECORE_BUILD_TESTS=OFF \
  -DOECORE_BUILD_BENCHMARKS=OFF
omb="$root/build/release/tools/omb/omb"
"$omb" info
echo
"$omb" info "$root/data/demo/harbour.px" --param 'berths=depth >= 12'
echo
"$omb" expr 'kind = #berth and depth >= 9.5' kind=#berth depth=11.2
echo
"$omb" datum "$root/data/demo/harbour.px" OSGB36 Datums.Wgs84 -2,53,100 -0.1276,51.5072
echo
"$omb" project "$root/data/demo/harbour.px" BritishNationalGrid OSGB36 1.717921583,52.657570306 -0.1276,51.5072
echo
"$omb" transform --from epsg:27700 --to epsg:4326 651409.903 313177.270
"$omb" crs epsg:2154 | head -6
