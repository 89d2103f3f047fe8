#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Makes five_columns.xlsx (Debian's python3-openpyxl): sheet "Gauges" with titles,
# item types, units and value types in rows 1 to 4, five hours with the date/time
# in column 3, -999 plus 5e-9 in D6 and plus 1e-7 in E6; sheet "Empty" has no cell.
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
for hour in range(5):
    sheet.append([1.5 + hour, 20.25 + hour, datetime(2024, 3, 1) + timedelta(hours=hour), 0.5 * hour, hour - 2.0])
sheet["D6"] = -999 + 5e-9
sheet["E6"] = -999 + 1e-7
book.create_sheet("Empty")
book.save(Path(__file__).with_name("five_columns.xlsx"))
