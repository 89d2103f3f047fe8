#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The export benchmark: 100,000 time steps by ten float items written to a new
# workbook by `vantrel export` (the series read from the CSV form that import
# prints), beside openpyxl's write-only mode and a small libxlsxwriter program
# writing the same cells. Wall time and peak memory come from /usr/bin/time -v;
# each figure is the median of RUNS runs (default 3). Installs
# libxlsxwriter-dev when it is missing. Writes a table to stdout and to
# bench/export/last_run.md (results.md holds the figures with their reading).
#   BUILD_DIR=/path/to/build bash bench/export/run.sh
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
root=$(cd "$here/../.." && pwd)
build=${BUILD_DIR:-$root/build}
runs=${RUNS:-3}
steps=${STEPS:-100000}
items=${ITEMS:-10}
vantrel="$build/bin/vantrel"
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

if ! pkg-config --exists xlsxwriter; then
    apt-get install -y libxlsxwriter-dev >/dev/null
fi
cc -O2 -o "$work/xlsxwriter_write" "$here/xlsxwriter_write.c" $(pkg-config --cflags --libs xlsxwriter)

# Median wall seconds and peak MB of a command over the runs: "seconds megabytes".
# The output workbook is removed before each run, so every run makes a new one.
measure() {
    local out=$1
    shift
    local times=() mems=()
    for _ in $(seq "$runs"); do
        rm -f "$out"
        /usr/bin/time -v -o "$work/time.txt" "$@" >/dev/null
        test -s "$out"
        local wall mem
        wall=$(awk -F': ' '/Elapsed \(wall clock\)/ {n=split($2,p,":"); s=0; for(i=1;i<=n;i++) s=s*60+p[i]; print s}' "$work/time.txt")
        mem=$(awk -F': ' '/Maximum resident set size/ {printf "%.1f", $2/1024}' "$work/time.txt")
        times+=("$wall"); mems+=("$mem")
    done
    local mid=$(( (runs + 1) / 2 ))
    echo "$(printf '%s\n' "${times[@]}" | sort -g | sed -n "${mid}p") $(printf '%s\n' "${mems[@]}" | sort -g | sed -n "${mid}p")"
}

/usr/bin/python3 "$here/make_series.py" "$work/series.csv" "$steps" "$items"
read -r t_ours m_ours < <(measure "$work/ours.xlsx" "$vantrel" export "$work/series.csv" "$work/ours.xlsx" --spec "")
size_ours=$(du -h "$work/ours.xlsx" | cut -f1)
read -r t_lxw m_lxw < <(measure "$work/lxw.xlsx" "$work/xlsxwriter_write" "$work/lxw.xlsx" "$steps" "$items")
size_lxw=$(du -h "$work/lxw.xlsx" | cut -f1)
read -r t_lxc m_lxc < <(measure "$work/lxc.xlsx" "$work/xlsxwriter_write" "$work/lxc.xlsx" "$steps" "$items" constant)
read -r t_py m_py < <(measure "$work/py.xlsx" /usr/bin/python3 "$here/openpyxl_write.py" "$work/py.xlsx" "$steps" "$items")
size_py=$(du -h "$work/py.xlsx" | cut -f1)
ratio() { awk -v a="$1" -v b="$2" 'BEGIN { printf "%.2fx", (b > 0 ? a / b : 0) }'; }

{
echo "# Export benchmark"
echo
echo "Machine: $(nproc) cores, $(grep -m1 'model name' /proc/cpuinfo | cut -d: -f2 | sed 's/^ //'), $(free -g | awk '/Mem:/ {print $2}') GiB"
echo "Command: bash bench/export/run.sh (median of $runs runs; $steps time steps by $items float items)"
echo
echo "| writer | wall time | peak memory | file | vantrel export is faster by |"
echo "|---|---|---|---|---|"
echo "| vantrel export (CSV read included) | ${t_ours} s | ${m_ours} MB | $size_ours | |"
echo "| libxlsxwriter | ${t_lxw} s | ${m_lxw} MB | $size_lxw | $(ratio "$t_lxw" "$t_ours") |"
echo "| libxlsxwriter, constant memory | ${t_lxc} s | ${m_lxc} MB | | $(ratio "$t_lxc" "$t_ours") |"
echo "| openpyxl write-only | ${t_py} s | ${m_py} MB | $size_py | $(ratio "$t_py" "$t_ours") |"
} | tee "$here/last_run.md"
