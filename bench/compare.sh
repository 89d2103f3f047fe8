#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Compares, in one run, `vantrel import` and `vantrel export` with other tools
# on the workbooks of the import and export benchmarks:
#   read:  openpyxl read-only, SheetJS (npm package xlsx on the machine's node),
#          LibreOffice's headless conversion to CSV;
#   write: libxlsxwriter, openpyxl write-only, SheetJS, LibreOffice's headless
#          conversion from the series CSV.
# It builds vantrel, installs what is missing (libxlsxwriter-dev and LibreOffice
# from apt, xlsx from npm into a scratch folder) and leaves out a tool that
# cannot be had. Wall time and peak memory come from /usr/bin/time -v; each
# figure is the median of RUNS runs (default 3). The table goes to stdout and
# to bench/RESULTS.md.
#   bash bench/compare.sh     (BUILD_DIR, RUNS, LARGE=0 to skip the 1,000,000-row sizes,
#                              TASKS="read write" or one of them)
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
root=$(cd "$here/.." && pwd)
build=${BUILD_DIR:-$root/build}
runs=${RUNS:-3}
large=${LARGE:-1}
tasks=${TASKS:-read write}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
sudo_cmd=""
[ "$(id -u)" -eq 0 ] || sudo_cmd="sudo"
apt_install() { DEBIAN_FRONTEND=noninteractive $sudo_cmd apt-get install -y -qq --no-install-recommends "$@" >/dev/null; }

load_at_start=$(cut -d' ' -f1-3 /proc/loadavg)

# ---- What the comparison needs ------------------------------------------------
cmake -S "$root" -B "$build" -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build "$build" -j"$(nproc)" --target vantrel GenericExcelVantrel >/dev/null
vantrel="$build/bin/vantrel"
command -v /usr/bin/time >/dev/null || apt_install time
pkg-config --exists xlsxwriter || apt_install libxlsxwriter-dev
cc -O2 -o "$work/xlsxwriter_write" "$here/export/xlsxwriter_write.c" $(pkg-config --cflags --libs xlsxwriter)
command -v soffice >/dev/null || apt_install libreoffice-calc-nogui || true
have_office=0
command -v soffice >/dev/null && have_office=1
have_sheetjs=0
if command -v node >/dev/null && command -v npm >/dev/null &&
    (cd "$work" && npm install --silent --no-audit --no-fund xlsx >/dev/null 2>&1); then
    have_sheetjs=1
    sheetjs_version=$(node -p "require('$work/node_modules/xlsx/package.json').version")
fi

# SheetJS: every cell of the first sheet to CSV, and the series CSV to a workbook
# in the default layout of vantrel export (title row, header row, one row a step).
cat > "$work/sheetjs_read.js" <<'JS'
const XLSX = require(process.env.SHEETJS);
const book = XLSX.readFile(process.argv[2], { dense: true });
require('fs').writeFileSync(process.argv[3], XLSX.utils.sheet_to_csv(book.Sheets[book.SheetNames[0]]));
JS
cat > "$work/sheetjs_write.js" <<'JS'
const XLSX = require(process.env.SHEETJS);
const lines = require('fs').readFileSync(process.argv[2], 'utf8').split('\n');
const titles = lines[0].split(',').slice(1);
const rows = [['Date/Time', ...titles], ['', ...titles.map(() => 'Water Level[meter]:Instantaneous')]];
for (const line of lines.slice(5)) {
  if (!line) continue;
  const fields = line.split(',');
  rows.push([new Date(fields[0].replace(' ', 'T') + 'Z'), ...fields.slice(1).map(Number)]);
}
const book = XLSX.utils.book_new();
XLSX.utils.book_append_sheet(book, XLSX.utils.aoa_to_sheet(rows, { cellDates: true, dense: true }), 'Sheet1');
XLSX.writeFile(book, process.argv[3]);
JS
export SHEETJS="$work/node_modules/xlsx"
# A program rather than a function, so that /usr/bin/time can run it.
cat > "$work/office" <<SH
#!/bin/sh
exec soffice -env:UserInstallation="file://$work/office-profile" --headless --norestore "\$@"
SH
chmod +x "$work/office"
office="$work/office"
if [ "$have_office" = 1 ]; then
    # The first start makes the profile; it is not measured.
    echo "a,b" > "$work/warm.csv"
    "$office" --convert-to xlsx --outdir "$work/warm" "$work/warm.csv" >/dev/null 2>&1 || have_office=0
    office_version=$(soffice --version 2>/dev/null | head -n1 | awk '{print $2}')
fi

# Median wall seconds and peak MB of a command over the runs and the size of its
# output in MB, "seconds megabytes size", or "failed" when a run fails or makes
# no output. The output is removed first.
measure() {
    local out=$1
    shift
    local times=() mems=()
    for _ in $(seq "$runs"); do
        rm -rf "$out"
        if ! /usr/bin/time -v -o "$work/time.txt" "$@" >/dev/null 2>"$work/stderr.txt" || [ ! -s "$out" ]; then
            echo "failed"
            return
        fi
        times+=("$(awk -F': ' '/Elapsed \(wall clock\)/ {n=split($2,p,":"); s=0; for(i=1;i<=n;i++) s=s*60+p[i]; print s}' "$work/time.txt")")
        mems+=("$(awk -F': ' '/Maximum resident set size/ {printf "%.1f", $2/1024}' "$work/time.txt")")
    done
    local mid=$(( (runs + 1) / 2 ))
    echo "$(printf '%s\n' "${times[@]}" | sort -g | sed -n "${mid}p") $(printf '%s\n' "${mems[@]}" | sort -g | sed -n "${mid}p")" \
        "$(du -s --block-size=1 "$out" | awk '{printf "%.2f", $1 / 1048576}')"
}

table="$work/table.md"
ours_time=""
# One row of the table: task, tool, the result of measure.
row() {
    local task=$1 tool=$2 result=$3
    if [ "$result" = failed ]; then
        echo "| $task | $tool | failed | | | |" >> "$table"
        echo "$task, $tool: failed: $(tail -n 3 "$work/stderr.txt")" >&2
        return
    fi
    set -- $result
    local ratio
    if [ -z "$ours_time" ]; then
        ours_time=$1
        ratio="1.00 (us)"
    else
        ratio=$(awk -v a="$1" -v b="$ours_time" 'BEGIN { printf "%.2f", (b > 0 ? a / b : 0) }')
    fi
    echo "| $task | $tool | $1 s | $2 MB | $3 MB | $ratio |" >> "$table"
    echo "$task, $tool: $1 s, $2 MB" >&2
}

# ---- Reading: the import benchmark's workbooks ----------------------------------
spec='DateTimeCol=1;StartRow=4;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;'
sizes="100000:10"
[ "$large" = 1 ] && sizes="$sizes 1000000:5"
: > "$table"
for size in $sizes; do
    case " $tasks " in *" read "*) ;; *) break ;; esac
    rows=${size%%:*} items=${size##*:}
    book="$work/read$rows.xlsx"
    /usr/bin/python3 "$here/import/make_workbook.py" "$book" "$rows" "$items"
    task="read $rows rows x $items items ($(du -h "$book" | cut -f1))"
    ours_time=""
    row "$task" "vantrel import (CSV)" "$(measure "$work/out.csv" "$vantrel" import "$book" --spec "$spec" --output "$work/out.csv")"
    row "$task" "openpyxl read-only" "$(measure "$work/py.txt" bash -c '/usr/bin/python3 "$0" "$1" > "$2"' "$here/import/openpyxl_read.py" "$book" "$work/py.txt")"
    [ "$have_sheetjs" = 1 ] &&
        row "$task" "SheetJS $sheetjs_version (CSV)" "$(measure "$work/js.csv" node "$work/sheetjs_read.js" "$book" "$work/js.csv")"
    if [ "$have_office" = 1 ]; then
        cp "$book" "$work/office-in.xlsx"
        row "$task" "LibreOffice $office_version headless (CSV)" \
            "$(measure "$work/office-out/office-in.csv" "$office" --convert-to csv --outdir "$work/office-out" "$work/office-in.xlsx")"
    fi
done

# ---- Writing: the export benchmark's series -------------------------------------
for size in $sizes; do
    case " $tasks " in *" write "*) ;; *) break ;; esac
    steps=${size%%:*} items=${size##*:}
    /usr/bin/python3 "$here/export/make_series.py" "$work/series.csv" "$steps" "$items"
    task="write $steps steps x $items items"
    ours_time=""
    row "$task" "vantrel export (from CSV)" "$(measure "$work/ours.xlsx" "$vantrel" export "$work/series.csv" "$work/ours.xlsx" --spec "")"
    row "$task" "libxlsxwriter" "$(measure "$work/lxw.xlsx" "$work/xlsxwriter_write" "$work/lxw.xlsx" "$steps" "$items")"
    row "$task" "libxlsxwriter, constant memory" "$(measure "$work/lxc.xlsx" "$work/xlsxwriter_write" "$work/lxc.xlsx" "$steps" "$items" constant)"
    row "$task" "openpyxl write-only" "$(measure "$work/py.xlsx" /usr/bin/python3 "$here/export/openpyxl_write.py" "$work/py.xlsx" "$steps" "$items")"
    [ "$have_sheetjs" = 1 ] &&
        row "$task" "SheetJS $sheetjs_version (from CSV)" "$(measure "$work/js.xlsx" node "$work/sheetjs_write.js" "$work/series.csv" "$work/js.xlsx")"
    if [ "$have_office" = 1 ]; then
        row "$task" "LibreOffice $office_version headless (from CSV)" \
            "$(measure "$work/office-out/series.xlsx" "$office" --convert-to xlsx --outdir "$work/office-out" "$work/series.csv")"
    fi
done

{
echo "# vantrel beside other workbook tools"
echo
echo "Machine: $(nproc) cores, $(grep -m1 'model name' /proc/cpuinfo | cut -d: -f2 | sed 's/^ //'), $(free -g | awk '/Mem:/ {print $2}') GiB, $(. /etc/os-release && echo "$PRETTY_NAME")"
echo "Date: $(date -u '+%Y-%m-%d %H:%M UTC'); load average at the start: $load_at_start (the machine may be shared)"
echo "Command: ${TASKS:+TASKS=\"$TASKS\" }${LARGE:+LARGE=$LARGE }bash bench/compare.sh (median of $runs runs each)"
echo
echo "Ratio is the tool's median wall time over vantrel's on the same task: above 1, vantrel is faster."
echo "Reading means every cell of the first sheet: vantrel import and SheetJS print CSV, LibreOffice"
echo "converts to CSV, openpyxl walks the cells. Writing makes a new workbook of the default export"
echo "layout; vantrel export, SheetJS and LibreOffice read the series from its CSV first, libxlsxwriter"
echo "and openpyxl compute the same values in the program. Output size is the size of the file the tool"
echo "wrote (openpyxl's reading writes only a count). A tool that could not be installed is left out."
echo
echo "| task | tool | median wall time | peak memory | output size | ratio to vantrel |"
echo "|---|---|---|---|---|---|"
cat "$table"
} | tee "$here/RESULTS.md"
