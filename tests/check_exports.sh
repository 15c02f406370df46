#!/bin/sh
# check_exports.sh LIB SYMBOLS -- the defined dynamic symbols of LIB must be exactly the
# names listed in SYMBOLS (one a line): nothing missing, nothing extra.
set -eu
lib=$1
expected=$2
actual=$(mktemp)
want=$(mktemp)
trap 'rm -f "$actual" "$want"' EXIT
nm -D --defined-only "$lib" | awk '{print $NF}' | sort -u >"$actual"
grep -v '^$' "$expected" | sort -u >"$want"
if ! diff -u "$want" "$actual"; then
  echo "exports of $lib differ from $expected ('-' missing, '+' extra)" >&2
  exit 1
fi
echo "$(wc -l <"$want") symbols, as listed"
