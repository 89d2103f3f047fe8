#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Makes the workbook of the open dialog's tests (Debian's python3-openpyxl):
#   five_columns.xlsx  sheet "Gauges": titles, item types, units and value
#   types in rows 1 to 4, then five hourly rows; the date/time stands in the
#   third of five columns. D6 holds the delete value -999 plus 5e-9 and E6
#   plus 1e-7. Sheet "Empty" has no cell.
from datetime import datetime, timedelta
from pathlib import Path

import openpyxl

book = openpyxl.Workbook()
sheet = book.active
sheet.title = "Gauges"
sheet.append(["Alpha", "Beta", "Date/Time", "Delta", "Echo"])
sheet.append(["Water Level", "Discharge", None, "Rainfall", "Temperature"])
sheet.append(["meter", "liter/sec", None, "millimeter", "degree Celsius"])
sheet.append(["Instantaneous", "Accumulated", None, "Step_Accumulated", "Mean_Step_Accumulated"])
start = datetime(2024, 3, 1)
for hour in range(5):
    row = [1.5 + hour, 20.25 + hour, start + timedelta(hours=hour), 0.5 * hour, -2.0 + hour]
    sheet.append(row)
sheet["D6"] = -999 + 5e-9
sheet["E6"] = -999 + 1e-7
book.create_sheet("Empty")
book.save(Path(__file__).with_name("five_columns.xlsx"))
