#!/usr/bin/python3
# SPDX-License-Identifier: MIT
"""Writes the workbook fixtures beside this script, with writers independent
of the engine: openpyxl for several_sheets, date1904 and cell_kinds, and
LibreOffice for each .fods here (flat OpenDocument, written by hand), so those
hold what only a full spreadsheet writes: shared strings, rich text runs,
formulas with their cached values, error cells, the 1904 flag. The .xlsx files
are committed; the tests never run this. With Debian's python3-openpyxl and
libreoffice-calc-nogui:

    /usr/bin/python3 tests/data/workbook/make_fixtures.py"""

import datetime
import glob
import os
import subprocess
import tempfile

from openpyxl import Workbook
from openpyxl.chart import BarChart, Reference
from openpyxl.utils.datetime import CALENDAR_MAC_1904

HERE = os.path.dirname(os.path.abspath(__file__))


def several_sheets():
    """Three worksheets around a chart sheet; texts, numbers, booleans, dates."""
    wb = Workbook()
    alpha = wb.active
    alpha.title = "Alpha"
    alpha.append(["Name", "Value", "Flag"])
    alpha.append(["first", 1.5, True])
    alpha.append(["second", -2.25, False])
    alpha.append(["first", 1e-300, True])  # a repeated text shares its string
    alpha["A6"] = "Grüße, 東京"

    chart = wb.create_chartsheet("Chart")
    bars = BarChart()
    bars.add_data(Reference(alpha, min_col=2, min_row=1, max_row=4), titles_from_data=True)
    chart.add_chart(bars)

    beta = wb.create_sheet("Beta")  # its used range starts at C3
    beta["C3"] = "top left"
    beta["E7"] = 42
    beta["D5"] = 0.1

    gamma = wb.create_sheet("Gamma")  # dates under several number formats
    when = datetime.datetime(2024, 2, 29, 13, 45, 30)
    formats = ["yyyy-mm-dd", "dd.mm.yyyy hh:mm", "h:mm:ss", "mm-dd-yy", "[h]:mm"]
    for row, code in enumerate(formats, start=1):
        cell = gamma.cell(row=row, column=1, value=when)
        cell.number_format = code
        gamma.cell(row=row, column=2, value=code)
    gamma["A7"] = datetime.date(1900, 1, 1)
    gamma["A7"].number_format = "yyyy-mm-dd"
    wb.save(os.path.join(HERE, "several_sheets.xlsx"))


def date1904():
    """The 1904 date system, with one date and one plain number."""
    wb = Workbook()
    wb.epoch = CALENDAR_MAC_1904
    ws = wb.active
    ws.title = "Mac"
    ws["A1"] = datetime.datetime(2024, 2, 29)
    ws["A1"].number_format = "yyyy-mm-dd"
    ws["B1"] = 7
    wb.save(os.path.join(HERE, "date1904.xlsx"))


def cell_kinds():
    """What a write through the engine can't make: texts that read as numbers
    (a put text is taken as typed), error cells and booleans beside numbers."""
    wb = Workbook()
    ws = wb.active
    ws.title = "Kinds"
    ws.append([1.5, "abc", "12.5", True, "#N/A", "xyz"])
    ws["A2"] = False  # an empty cell between a boolean and a division error
    ws["C2"] = "#DIV/0!"
    wb.save(os.path.join(HERE, "cell_kinds.xlsx"))


def libreoffice_conversions():
    # A profile of its own, so a running office or another user's settings don't interfere.
    with tempfile.TemporaryDirectory() as profile:
        subprocess.run(["soffice", "-env:UserInstallation=file://" + profile, "--headless", "--convert-to", "xlsx",
                        "--outdir", HERE] + sorted(glob.glob(os.path.join(HERE, "*.fods"))), check=True)


if __name__ == "__main__":
    several_sheets()
    date1904()
    cell_kinds()
    libreoffice_conversions()
