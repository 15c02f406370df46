#!/bin/sh
# check_fuzz_reach.sh FUZZDIR SYMBOLS... -- every name a library exports (the SYMBOLS lists,
# one name a line) is used by some fuzz target in FUZZDIR: no exported routine or data item
# goes unfuzzed.
set -eu
dir=$1
shift
missing=0
for list in "$@"; do
  for name in $(grep -v '^$' "$list"); do
    if ! grep -qw -- "$name" "$dir"/fuzz_*.cpp "$dir"/fuzz_*.h; then
      echo "no fuzz target uses $name (exported, listed in $list)" >&2
      missing=1
    fi
  done
done
[ "$missing" = 0 ] || exit 1
echo "every exported name is used by a fuzz target"
