#!/usr/bin/python3
# SPDX-License-Identifier: MIT
"""Writes the workbook fixtures of the engine's tests with openpyxl, a reader
and writer independent of the engine. Run with Debian's /usr/bin/python3:

    /usr/bin/python3 tests/data/workbook/make_fixtures.py

The .xlsx files are committed beside this script; the tests never run it.
openpyxl can't store a formula's cached value, so formulas are left to the
corpus of real workbooks."""

import datetime
import os

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


if __name__ == "__main__":
    several_sheets()
    date1904()
