#!/usr/bin/env bash
# Installs every Debian package OECore needs to build, test and benchmark.
# Non-interactive and idempotent: packages already present are left alone.
set -euo pipefail

packages=(
  build-essential cmake ninja-build ccache pkg-config git
  clang-format
  libtinyxml-dev
  libtbb-dev
  googletest libgtest-dev libbenchmark-dev
  clang libfuzzer-14-dev libclang-rt-14-dev
  geographiclib-tools proj-bin libproj-dev
  libnewmat10-dev
  libgdal-dev gdal-bin
)

missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed' || missing+=("$p")
done

if [ ${#missing[@]} -eq 0 ]; then
  exit 0
fi

if [ "$(id -u)" -ne 0 ]; then
  echo "setup: missing packages: ${missing[*]}; run this script as root to install them" >&2
  exit 1
fi

export DEBIAN_FRONTEND=noninteractive
apt-get update -qq
apt-get install -y -qq --no-install-recommends "${missing[@]}"
