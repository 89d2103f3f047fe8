#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# The workbook of the command line's warning cases:   make_warnings.py BOOK
# Row 1 title, 2 item type, 3 unit; data from row 4; true dates in column A.
import datetime
import sys
import zipfile

import openpyxl

START = datetime.datetime(2024, 3, 1)


def sheet(ws, rows, hours=(0, 1, 2), unit="meter", extra=()):
    for row in (["Date/Time", "Level"], [None, "Water Level"], [None, unit]):
        ws.append(row)
    for i, hour in enumerate(hours):
        ws.append([None if hour is None else START + datetime.timedelta(hours=hour), rows[i]])
    for row, col, value in extra:
        ws.cell(row=row, column=col, value=value)


book = openpyxl.Workbook()
sheets = [book.active] + [book.create_sheet() for _ in range(9)]
sheet(sheets[0], [1.5, 1.6, 1.7])                                   # 1: fits
sheet(sheets[1], [1.5, 1.6, 1.7, 1.8], hours=(0, 1, None, 3))       # 2: blank date/time cell
sheet(sheets[2], [1.5, 1.6, 1.7], extra=[(4, 4, 9.0)])              # 3: data right of an empty column
sheet(sheets[3], [1.5, 1.6, 1.7], unit="m3/s")                      # 4: unknown unit
sheet(sheets[4], [1.5, 1e39, -1e40])                                # 5: beyond the float range
sheet(sheets[5], [1.5, 1.6, 1.7], extra=[(3, 1, -9999.0)])          # 6, 7: delete value cells differ
sheet(sheets[6], [1.5, 1.6, 1.7], extra=[(3, 1, -999.0)])
sheet(sheets[7], [1.5, 1.6, 1.7], hours=(1, 2, 3))                  # 8: an hour after sheet 1
sheet(sheets[8], [1.5, 1.6, 1.7], hours=(0, 2, 1))                  # 9: out of order
sheet(sheets[9], [1e39, -1e39, 7.25, 8.25], hours=(0, 1, 2, 3))    # 10: numbers no cell holds
book.save(sys.argv[1])

# Sheet 10 stores the numbers 7.25 and 8.25 as texts that no double holds.
with zipfile.ZipFile(sys.argv[1]) as source:
    parts = {name: source.read(name) for name in source.namelist()}
stored = parts["xl/worksheets/sheet10.xml"].replace(b"<v>7.25</v>", b"<v>1e400</v>")
parts["xl/worksheets/sheet10.xml"] = stored.replace(b"<v>8.25</v>", b"<v>NaN</v>")
with zipfile.ZipFile(sys.argv[1], "w", zipfile.ZIP_DEFLATED) as target:
    for name, data in parts.items():
        target.writestr(name, data)
