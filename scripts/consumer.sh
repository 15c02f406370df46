#!/usr/bin/env bash
# scripts/consumer.sh [--build-dir D] -- uses the library the way a stranger would:
#   1. builds it (configured as scripts/test.sh does, so its build is reused) with the
#      Fortran module, and the reference manual (doxygen; a warning fails the build);
#   2. installs into a temporary prefix; runs the installed demonstration program; checks each
#      library's SONAME, RUNPATH and that it defines no symbol versions;
#   3. builds tests/consumer with find_package, and tests/consumer/consumer.c (C11, the
#      umbrella header, -pedantic -Werror) with pkg-config alone, and runs both;
#   4. builds examples/ (C, C++, Fortran) against the installed package and runs them, and
#      one Fortran example by hand with pkg-config's flags.
set -euo pipefail
cd "$(dirname "$0")/.."
build=build
while [ $# -gt 0 ]; do
  case "$1" in
    --build-dir) build=$2; shift 2 ;;
    *) echo "unknown argument: $1" >&2; exit 2 ;;
  esac
done
bash scripts/deps.sh cmake ninja-build g++ gfortran python3 doxygen pkgconf libgtest-dev \
  libbenchmark-dev libcli11-dev libmuparser-dev libfmt-dev
jobs=$(nproc)
[ "$jobs" -gt 2 ] && jobs=2

step() { printf '\n== %s\n' "$*"; }

step "build, Fortran module and manual ($build)"
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release -DORVQ7_SANITIZE= -DORVQ7_FORTRAN=ON
cmake --build "$build" -j "$jobs"
cmake --build "$build" --target docs

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
prefix=$work/prefix
step "install into $prefix"
cmake --install "$build" --prefix "$prefix" >/dev/null
pc=$(find "$prefix" -name orvq7maths.pc)
libdir=$(dirname "$(dirname "$pc")")
test -f "$prefix/include/OrvQ7Maths/OrvQ7Maths.h"
test -f "$prefix/include/OrvQ7Maths/fortran/orvq7maths.mod"
test -f "$prefix/share/doc/OrvQ7Maths/html/index.html"
test -f "$prefix/share/doc/OrvQ7Maths/LICENSE"
# The demonstration program runs from the install, finding the libraries beside it.
"$prefix/bin/orvq7" roots 1 -3 2 | grep -q '^root 2 '
echo "bin/orvq7 runs from the install"
version=$(sed -n 's/^Version: //p' "$pc")
major=${version%%.*}
for lib in OrvQ7Maths OrvQ7System Q7SysCOMD OrvMathematics; do
  so=$libdir/lib$lib.so.$version
  dyn=$(readelf -d "$so")
  grep -q "Library soname: \[lib$lib.so.$major\]" <<<"$dyn" || { echo "$so: SONAME" >&2; exit 1; }
  grep -q 'Library runpath: \[\$ORIGIN\]' <<<"$dyn" || { echo "$so: RUNPATH" >&2; exit 1; }
  if readelf -V "$so" | grep -q 'Version definition'; then
    echo "$so defines symbol versions" >&2
    exit 1
  fi
  [ "$(readlink "$libdir/lib$lib.so")" = "lib$lib.so.$major" ]
  echo "lib$lib.so.$version: SONAME lib$lib.so.$major, RUNPATH \$ORIGIN, no symbol versions"
done

step "consumer with find_package"
cmake -S tests/consumer -B "$work/consumer" -G Ninja -DCMAKE_PREFIX_PATH="$prefix" >/dev/null
cmake --build "$work/consumer"
"$work/consumer/consumer_c"
"$work/consumer/consumer_cpp"

step "consumer with pkg-config"
export PKG_CONFIG_PATH=$(dirname "$pc")
[ "$(pkg-config --modversion orvq7maths)" = "$version" ]
# shellcheck disable=SC2046
cc -std=c11 -Wall -Wextra -pedantic -Werror -DEXPECTED_VERSION="\"$version\"" \
  tests/consumer/consumer.c $(pkg-config --cflags --libs orvq7maths) \
  -Wl,-rpath,"$(pkg-config --variable=libdir orvq7maths)" -o "$work/consumer_pc"
"$work/consumer_pc"

step "examples against the installed package"
cmake -S examples -B "$work/examples" -G Ninja -DCMAKE_PREFIX_PATH="$prefix" >/dev/null
cmake --build "$work/examples" -j "$jobs"
ctest --test-dir "$work/examples" --output-on-failure
# shellcheck disable=SC2046
gfortran -std=f2018 examples/fortran/traceback.f90 \
  -I"$(pkg-config --variable=fmoddir orvq7maths)" $(pkg-config --libs orvq7maths) \
  -Wl,-rpath,"$(pkg-config --variable=libdir orvq7maths)" -o "$work/traceback_pc"
"$work/traceback_pc" >/dev/null
echo "Fortran example built with pkg-config's flags: ok"
step "install, consumers, examples and manual: all passed"
