#!/usr/bin/env bash
# Installs what is needed, builds, and runs the bridge on the sample workbook.
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
build=${BUILD_DIR:-$root/build}
"$root/scripts/install-packages.sh"
"$root/scripts/build.sh"
spec='DateTimeCol=1;StartRow=5;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;ExcelSheet=1,2;'
echo "vantrel import samples/hydrometric.xlsx --spec '$spec'"
"$build/bin/vantrel" import "$root/samples/hydrometric.xlsx" --spec "$spec"
