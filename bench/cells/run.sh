#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The cell benchmark: makes a sheet of 1,000,000 rows by 11 columns (a date
# column and ten numbers; ROWS to change), builds cells_bench against a build
# of the project and runs it RUNS times (default 3), each run in a process of
# its own. Prints the median of each figure and writes them to
# bench/cells/last_run.md (RESULTS.md holds the figures with their reading).
#   BUILD_DIR=/path/to/build bash bench/cells/run.sh
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
root=$(cd "$here/../.." && pwd)
build=${BUILD_DIR:-$root/build}
runs=${RUNS:-3}
rows=${ROWS:-1000000}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

bench=$(BUILD_DIR="$build" bash "$here/build.sh")
/usr/bin/python3 "$here/make_sheet.py" "$work/cells.xlsx" "$rows"
size=$(du -h "$work/cells.xlsx" | cut -f1)

for i in $(seq "$runs"); do
    /usr/bin/time -v -o "$work/time.$i" "$bench" "$work/cells.xlsx" > "$work/out.$i"
    awk -F': ' '/Maximum resident set size/ {printf "time_v_peak_mb %.1f\n", $2/1024}' "$work/time.$i" >> "$work/out.$i"
done
head -1 "$work/out.1" > "$work/facts"
load=$(cut -d' ' -f1-3 /proc/loadavg)

# Median of each "name value" pair over the runs.
medians=$(for i in $(seq "$runs"); do sed -n '2,$p' "$work/out.$i" | tr ' ' '\n' | paste - -; done |
    awk '{v[$1]=v[$1] " " $2; order[$1]=NR} END {for (k in v) print order[k], k, v[k]}' | sort -n |
    while read -r _ name values; do
        echo "$name $(printf '%s\n' $values | sort -g | sed -n "$(( (runs + 1) / 2 ))p")"
    done)

{
echo "# Cell benchmark"
echo
echo "Machine: $(nproc) cores, $(grep -m1 'model name' /proc/cpuinfo | cut -d: -f2 | sed 's/^ //'), shared with other work (load average $load at the end)"
echo "Command: BUILD_DIR=$build bash bench/cells/run.sh (median of $runs runs, each a process of its own)"
echo "Workbook: $rows rows x 11 columns (date/time in A, ten numbers), $size; $(cat "$work/facts")"
echo
echo "| figure | median |"
echo "|---|---|"
echo "$medians" | while read -r name value; do
    case $name in
        *_mb) echo "| $name | $value MB |" ;;
        *) echo "| $name | $value s |" ;;
    esac
done
} | tee "$work/table.md"
cp "$work/table.md" "$here/last_run.md"
