#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Writes the LibreOffice-made fixtures of the engine's tests: each .fods here
# (flat OpenDocument, written by hand) converted to .xlsx by LibreOffice, so
# the workbooks hold what only a full spreadsheet writes: shared strings, rich
# text runs, formulas with their cached values, error cells, the 1904 flag.
# The .xlsx files are committed beside this script; the tests never run it.
#
#   apt-get install -y --no-install-recommends libreoffice-calc-nogui
#   tests/data/workbook/make_libreoffice_fixtures.sh
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
profile=$(mktemp -d)
trap 'rm -rf "$profile"' EXIT
# A profile of its own, so a running office or another user's settings don't interfere.
soffice -env:UserInstallation="file://$profile" --headless --convert-to xlsx --outdir "$here" \
  "$here/libreoffice_kinds.fods" "$here/libreoffice_1904.fods"
