#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Makes three_sheets.xlsx: an old table on sheet 1 that an export replaces, a
# formula on sheet 2 and a chart over sheet 2's cells on sheet 3.
# Run with Debian's python3 (python3-openpyxl): /usr/bin/python3 make_three_sheets.py [OUT]
import os
import sys

from openpyxl import Workbook
from openpyxl.chart import LineChart, Reference

book = Workbook()
first = book.active
first.title = "Export"
for row in range(1, 40):
    for col in range(1, 12):
        first.cell(row=row, column=col, value=f"old {row}/{col}")
first["A1"].number_format = "0.000"
data = book.create_sheet("Data")
data.append(["x", "y", None, "sum"])
for x in range(1, 11):
    data.append([x, x ** 2] + (["=SUM(B2:B11)", "=Export!B3*2"] if x == 1 else []))
data.move_range("C2:D2", cols=1)
charts = book.create_sheet("Chart")
charts["A1"] = "=Data!D2"
chart = LineChart()
chart.title = "y over x"
chart.add_data(Reference(data, min_col=2, min_row=1, max_row=11), titles_from_data=True)
chart.set_categories(Reference(data, min_col=1, min_row=2, max_row=11))
charts.add_chart(chart, "C3")
book.save(sys.argv[1] if len(sys.argv) > 1 else os.path.join(os.path.dirname(os.path.abspath(__file__)), "three_sheets.xlsx"))
