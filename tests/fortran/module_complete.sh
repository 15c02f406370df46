#!/bin/sh
# module_complete.sh MODULE.f90 LIB... -- every routine that LIB exports (a defined text
# symbol of its dynamic table) has an interface bind(C, name="<routine>") in MODULE.f90.
set -eu
module=$1
shift
missing=0
count=0
for lib in "$@"; do
  for name in $(nm -D --defined-only "$lib" | awk '$2 == "T" || $2 == "W" || $2 == "i" {print $3}'); do
    count=$((count + 1))
    if ! grep -q "bind(C, name=\"$name\")" "$module"; then
      echo "no interface for $name ($(basename "$lib"))" >&2
      missing=$((missing + 1))
    fi
  done
done
[ "$count" -gt 0 ] || { echo "no routines found" >&2; exit 1; }
[ "$missing" -eq 0 ] || exit 1
echo "$count routines, each with its interface"
