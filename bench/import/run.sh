#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The import benchmark: makes a workbook of 100,000 rows and ten items and one
# of 1,000,000 rows and five items, then times `vantrel import` (CSV to a file)
# alone and after a `vantrel inspect`, beside openpyxl's read-only reading of
# the same file. Wall time and peak memory come from /usr/bin/time -v; each
# figure is the median of RUNS runs (default 3). Writes a table to stdout and
# to bench/import/last_run.md (results.md holds the figures with their reading).
#   BUILD_DIR=/path/to/build bash bench/import/run.sh
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
root=$(cd "$here/../.." && pwd)
build=${BUILD_DIR:-$root/build}
runs=${RUNS:-3}
vantrel="$build/bin/vantrel"
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
spec='DateTimeCol=1;StartRow=4;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;'

# Median wall seconds and peak MB of a command over the runs: "seconds megabytes".
measure() {
    local times=() mems=()
    for _ in $(seq "$runs"); do
        /usr/bin/time -v -o "$work/time.txt" "$@" >/dev/null
        local wall mem
        wall=$(awk -F': ' '/Elapsed \(wall clock\)/ {n=split($2,p,":"); s=0; for(i=1;i<=n;i++) s=s*60+p[i]; print s}' "$work/time.txt")
        mem=$(awk -F': ' '/Maximum resident set size/ {printf "%.1f", $2/1024}' "$work/time.txt")
        times+=("$wall"); mems+=("$mem")
    done
    local mid=$(( (runs + 1) / 2 ))
    echo "$(printf '%s\n' "${times[@]}" | sort -g | sed -n "${mid}p") $(printf '%s\n' "${mems[@]}" | sort -g | sed -n "${mid}p")"
}

inspect_then_import() {
    "$vantrel" inspect "$1" --spec "$spec" >/dev/null && "$vantrel" import "$1" --spec "$spec" --output "$work/out.csv"
}

{
echo "# Import benchmark"
echo
echo "Machine: $(nproc) cores, $(grep -m1 'model name' /proc/cpuinfo | cut -d: -f2 | sed 's/^ //')"
echo "Command: bash bench/import/run.sh (median of $runs runs)"
echo
echo "| workbook | vantrel import | inspect + import | openpyxl read-only | import vs openpyxl |"
echo "|---|---|---|---|---|"
} > "$work/table.md"

for size in "100000 10" "1000000 5"; do
    set -- $size
    book="$work/rows$1.xlsx"
    /usr/bin/python3 "$here/make_workbook.py" "$book" "$1" "$2"
    read -r t_imp m_imp < <(measure "$vantrel" import "$book" --spec "$spec" --output "$work/out.csv")
    export -f inspect_then_import; export vantrel spec work
    read -r t_both m_both < <(measure bash -c 'inspect_then_import "$0"' "$book")
    read -r t_py m_py < <(measure /usr/bin/python3 "$here/openpyxl_read.py" "$book")
    ratio=$(awk -v a="$t_py" -v b="$t_imp" 'BEGIN { printf "%.1fx", (b > 0 ? a / b : 0) }')
    echo "| $1 rows, $2 items ($(du -h "$book" | cut -f1)) | ${t_imp} s, ${m_imp} MB | ${t_both} s, ${m_both} MB | ${t_py} s, ${m_py} MB | $ratio |" >> "$work/table.md"
done
cat "$work/table.md" | tee "$here/last_run.md"
