#!/usr/bin/env bash
# Configures and builds one flavour of the tree into build/<name>.
#   scripts/build.sh <name> [cmake options...] [-- build options...]
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
name=$1
shift
configure=()
while [ $# -gt 0 ] && [ "$1" != "--" ]; do
  configure+=("$1")
  shift
done
[ $# -gt 0 ] && shift
cmake -S "$root" -B "$root/build/$name" -G Ninja "${configure[@]}" >/dev/null
cmake --build "$root/build/$name" --parallel "$(nproc)" "$@"
