#!/usr/bin/python3
# SPDX-License-Identifier: MIT
"""Writes the workbook fixtures beside this script, with writers independent
of the engine: openpyxl for several_sheets, date1904, cell_kinds and
decorated_sheets, and
LibreOffice for each .fods here (flat OpenDocument, written by hand), so those
hold what only a full spreadsheet writes: shared strings, rich text runs,
formulas with their cached values, error cells, the 1904 flag. The .xlsx files
are committed; the tests never run this. With Debian's python3-openpyxl and
libreoffice-calc-nogui:

    /usr/bin/python3 tests/data/workbook/make_fixtures.py [FIXTURE...]

Names (several_sheets, ..., libreoffice_conversions) make only those."""

import datetime
import glob
import os
import subprocess
import tempfile

import sys

from openpyxl import Workbook
from openpyxl.chart import BarChart, Reference
from openpyxl.comments import Comment
from openpyxl.formatting.rule import CellIsRule
from openpyxl.styles import Font, PatternFill
from openpyxl.worksheet.datavalidation import DataValidation
from openpyxl.worksheet.table import Table
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


def decorated_sheets():
    """A first sheet dressed with everything a clear must take away, a second
    one with the same kinds of parts that must stay, and a protected third."""
    wb = Workbook()
    data = wb.active
    data.title = "Data"
    data.append(["Station", "Level", "Flow"])
    for row in range(2, 6):
        data.append(["S%d" % row, row * 1.5, row * 10])
    data["A1"].font = Font(bold=True)
    data["B2"].number_format = "0.000"
    data.column_dimensions["C"].hidden = True
    data.row_dimensions[3].hidden = True
    data.merge_cells("E1:G2")
    data["E1"] = "merged title"
    data["A2"].comment = Comment("a note on the first station", "tester")
    data["A3"].hyperlink = "https://example.org/station"
    data.add_table(Table(displayName="Readings", ref="A1:C5"))
    red = PatternFill(start_color="FFFF0000", end_color="FFFF0000", fill_type="solid")
    data.conditional_formatting.add("B2:B5", CellIsRule(operator="greaterThan", formula=["5"], fill=red))
    levels = DataValidation(type="decimal", operator="between", formula1="0", formula2="100")
    data.add_data_validation(levels)
    levels.add("B2:B5")
    bars = BarChart()
    bars.add_data(Reference(data, min_col=2, min_row=1, max_row=5), titles_from_data=True)
    data.add_chart(bars, "I2")

    other = wb.create_sheet("Other")
    other["A1"] = "kept"
    other["B1"] = "=SUM(Data!B2:B5)"
    other["A1"].comment = Comment("a note that stays", "tester")
    other["A2"].hyperlink = "https://example.org/kept"
    other.append(["Name", "Value"])
    other.append(["x", 1])
    other.add_table(Table(displayName="Kept", ref="A3:B4"))
    other.merge_cells("D1:E1")
    kept = BarChart()
    kept.add_data(Reference(other, min_col=2, min_row=3, max_row=4), titles_from_data=True)
    other.add_chart(kept, "G2")

    locked = wb.create_sheet("Locked")
    locked["A1"] = "protected"
    locked.protection.sheet = True
    wb.save(os.path.join(HERE, "decorated_sheets.xlsx"))


def libreoffice_conversions():
    # A profile of its own, so a running office or another user's settings don't interfere.
    with tempfile.TemporaryDirectory() as profile:
        subprocess.run(["soffice", "-env:UserInstallation=file://" + profile, "--headless", "--convert-to", "xlsx",
                        "--outdir", HERE] + sorted(glob.glob(os.path.join(HERE, "*.fods"))), check=True)


FIXTURES = [several_sheets, date1904, cell_kinds, decorated_sheets, libreoffice_conversions]

if __name__ == "__main__":
    wanted = sys.argv[1:] or [f.__name__ for f in FIXTURES]
    for make in FIXTURES:
        if make.__name__ in wanted:
            make()
