#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Makes hydrometric.xlsx, the sample workbook of the README: two sheets of
# hourly gauge readings sharing one time axis, with header rows for the item
# title, item type, unit and value type above the data. Run with Debian's
# python3 (it needs python3-openpyxl).
import datetime
import math
import sys

import openpyxl

HEADERS = ["Title", "Item type", "Unit", "Value type"]
START = datetime.datetime(2024, 3, 1, 0, 0, 0)
STEPS = 48


def sheet(wb, name, items, first):
    ws = wb.create_sheet(name) if not first else wb.active
    ws.title = name
    # Rows 1-4 are the header rows; the date/time column heads them with its caption.
    ws.cell(row=1, column=1, value="Date/Time")
    for col, item in enumerate(items, start=2):
        for row, text in enumerate(item[:4], start=1):
            ws.cell(row=row, column=col, value=text)
    for step in range(STEPS):
        row = 5 + step
        cell = ws.cell(row=row, column=1, value=START + datetime.timedelta(hours=step))
        cell.number_format = "yyyy-mm-dd hh:mm:ss"
        for col, item in enumerate(items, start=2):
            ws.cell(row=row, column=col, value=round(item[4](step), 3))
    ws.column_dimensions["A"].width = 20


def main(path):
    wb = openpyxl.Workbook()
    sheet(wb, "River gauges", [
        ("Ardmore level", "Water Level", "meter", "Instantaneous",
         lambda t: 2.10 + 0.35 * math.sin(t / 7.0)),
        ("Ardmore flow", "Discharge", "meter^3/sec", "Instantaneous",
         lambda t: 14.2 + 3.1 * math.sin(t / 7.0 + 0.4)),
        ("Bellow Bridge level", "Water Level", "meter", "Instantaneous",
         lambda t: 1.45 + 0.22 * math.sin(t / 6.0)),
    ], first=True)
    sheet(wb, "Weather", [
        ("Ardmore rain", "Rainfall", "millimeter", "Step_Accumulated",
         lambda t: max(0.0, 1.8 * math.sin(t / 4.0))),
        ("Ardmore air temperature", "Temperature", "degree Celsius", "Instantaneous",
         lambda t: 6.5 + 4.0 * math.sin((t - 9) / 24.0 * 2 * math.pi)),
    ], first=False)
    wb.save(path)


if __name__ == "__main__":
    main(sys.argv[1] if len(sys.argv) > 1 else "hydrometric.xlsx")
