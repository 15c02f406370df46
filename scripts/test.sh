#!/usr/bin/env bash
# scripts/test.sh [--sanitize address,undefined|thread] [--label L] [--build-dir D]
# Installs what is missing, builds the libraries and the tests, and runs every test (or the
# tests labelled L).
set -euo pipefail
cd "$(dirname "$0")/.."
sanitize=""
label=""
build=""
while [ $# -gt 0 ]; do
  case "$1" in
    --sanitize) sanitize=$2; shift 2 ;;
    --label) label=$2; shift 2 ;;
    --build-dir) build=$2; shift 2 ;;
    *) echo "unknown argument: $1" >&2; exit 2 ;;
  esac
done
[ -n "$build" ] || build="build${sanitize:+-${sanitize//,/-}}"
bash scripts/deps.sh
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release -DORVQ7_SANITIZE="$sanitize" \
  -DORVQ7_BUILD_TESTS=ON
cmake --build "$build" -j "$(nproc)"
args=(--test-dir "$build" --output-on-failure -j "$(nproc)")
[ -n "$label" ] && args+=(-L "$label")
runner=()
# ThreadSanitizer needs the address layout it expects: run without address randomisation.
if [ "$sanitize" = thread ] && setarch "$(uname -m)" -R true 2>/dev/null; then
  runner=(setarch "$(uname -m)" -R)
fi
"${runner[@]}" ctest "${args[@]}"
