#!/usr/bin/env bash
# scripts/memcheck.sh [--build-dir D] [program...]
# Runs the test programs under valgrind memcheck: every gtest program of the build (the unit
# programs, the thread programs and the host program; all of them, no subset), built without
# sanitizers as scripts/test.sh builds them (its build directory is reused). An invalid read
# or write, a use of an uninitialised value, or a definite leak fails the run; the log of a
# failing program is in <build>/memcheck/<program>.log.
set -euo pipefail
cd "$(dirname "$0")/.."
build=build
programs=()
while [ $# -gt 0 ]; do
  case "$1" in
    --build-dir) build=$2; shift 2 ;;
    -*) echo "unknown argument: $1" >&2; exit 2 ;;
    *) programs+=("$1"); shift ;;
  esac
done
bash scripts/deps.sh cmake ninja-build g++ libgtest-dev valgrind
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release -DORVQ7_SANITIZE= >/dev/null
cmake --build "$build" -j 2
if [ ${#programs[@]} -eq 0 ]; then
  while IFS= read -r p; do programs+=("$(basename "$p")"); done \
    < <(find "$build/tests" -maxdepth 1 -type f -executable -name 'test_*' | sort)
fi
mkdir -p "$build/memcheck"
failed=0
for p in "${programs[@]}"; do
  log=$build/memcheck/$p.log
  start=$SECONDS
  if valgrind --tool=memcheck --error-exitcode=99 --leak-check=full \
      --errors-for-leak-kinds=definite --show-leak-kinds=definite --num-callers=30 \
      --suppressions=tests/valgrind.supp \
      --log-file="$log" "$build/tests/$p" --gtest_brief=1 >"$build/memcheck/$p.out" 2>&1; then
    echo "$p: clean ($((SECONDS - start)) s)"
  else
    failed=1
    echo "$p: FAILED ($((SECONDS - start)) s)" >&2
    grep -E '^==[0-9]+== (Invalid|Conditional|Use of|.*definitely lost|ERROR SUMMARY)' "$log" \
      | head -n 20 >&2 || tail -n 20 "$build/memcheck/$p.out" >&2
  fi
done
[ "$failed" = 0 ] || { echo "memcheck found errors" >&2; exit 1; }
echo "memcheck: all ${#programs[@]} programs clean"
