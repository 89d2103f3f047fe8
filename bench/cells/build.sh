#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Compiles cells_bench against the libraries of a build of the project:
#   BUILD_DIR=/path/to/build bash bench/cells/build.sh   (prints the program's path)
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
root=$(cd "$here/../.." && pwd)
build=${BUILD_DIR:-$root/build}
cmake --build "$build" --target vantrel_workbook -j2 >/dev/null
out="$build/bench-cells"
mkdir -p "$out"
g++ -std=c++20 -O2 -Wall -Wextra -Wpedantic -Werror \
  -I"$root/src" -I"$root/platform/workbook/include" -I"$root/platform/automation/include" \
  "$here/cells_bench.cpp" -o "$out/cells_bench" \
  "$build/src/workbook/libvantrel_workbook.a" "$build/src/datetime/libvantrel_datetime.a" \
  "$build/src/module/libvantrel_strings.a" "$build/platform/workbook/libworkbook_engine.a" \
  "$build/platform/workbook/format/libworkbook_format.a" \
  -L"$build/bin" -Wl,-rpath,"$build/bin" -lautomation $(pkg-config --libs libzip) -lexpat
echo "$out/cells_bench"
