#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# `vantrel export` and libxlsxwriter's default, side by side: RUNS runs each,
# taking turns, on STEPS time steps x ITEMS items (the series of make_series.py).
# Prints every run's wall seconds and peak KB, the medians and both file sizes.
#   bash bench/export/vs_xlsxwriter.sh [STEPS] [ITEMS]     (BUILD_DIR, RUNS)
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
build=${BUILD_DIR:-$here/../../build}
steps=${1:-100000}
items=${2:-10}
runs=${RUNS:-3}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cc -O2 -o "$work/xlsxwriter_write" "$here/xlsxwriter_write.c" $(pkg-config --cflags --libs xlsxwriter)
python3 "$here/make_series.py" "$work/series.csv" "$steps" "$items"
for _ in $(seq "$runs"); do
    rm -f "$work/v.xlsx" "$work/x.xlsx"
    /usr/bin/time -f "vantrel %e %M" "$build/bin/vantrel" export "$work/series.csv" "$work/v.xlsx" --spec "" 2>&1 | tail -n1
    /usr/bin/time -f "xlsxwriter %e %M" "$work/xlsxwriter_write" "$work/x.xlsx" "$steps" "$items" 2>&1 | tail -n1
done | tee "$work/runs.txt"
mid=$(((runs + 1) / 2))
for tool in vantrel xlsxwriter; do
    echo "median $tool: $(awk -v t=$tool '$1 == t {print $2}' "$work/runs.txt" | sort -g | sed -n "${mid}p") s"
done
echo "sizes: vantrel $(stat -c %s "$work/v.xlsx") bytes, libxlsxwriter $(stat -c %s "$work/x.xlsx") bytes"
