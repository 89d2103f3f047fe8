#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Makes the workbooks of the bridge's end-to-end tests (run with Debian's
# python3, which has python3-openpyxl):
#   inspection.xlsx  one sheet for each way a workbook can fail the inspection
#   import.xlsx      the layouts the import reads
# Header rows, unless a sheet says otherwise: 1 title, 2 item type, 3 unit,
# 4 value type; data from row 5; true dates in column A.
import datetime
import os
import sys

import openpyxl

START = datetime.datetime(2024, 3, 1, 0, 0, 0)
HOUR = datetime.timedelta(hours=1)
DATE_FORMAT = "yyyy-mm-dd hh:mm:ss"


def hours(count, start=START):
    return [start + i * HOUR for i in range(count)]


def put(ws, row, col, value):
    cell = ws.cell(row=row, column=col, value=value)
    if isinstance(value, datetime.datetime):
        cell.number_format = DATE_FORMAT
    return cell


def standard(ws, times, items, date_col=1, first_row=5):
    """items: (title, type, unit, value type, values); headers in rows 1-4."""
    put(ws, 1, date_col, "Date/Time")
    col = 1
    for item in items:
        if col == date_col:
            col += 1
        for row, text in enumerate(item[:4], start=1):
            if text is not None:
                put(ws, row, col, text)
        for i, value in enumerate(item[4]):
            if value is not None:
                put(ws, first_row + i, col, value)
        col += 1
    for i, time in enumerate(times):
        put(ws, first_row + i, date_col, time)


def new_sheet(wb, title):
    if len(wb.worksheets) == 1 and wb.active.title == "Sheet":
        ws = wb.active
        ws.title = title
        return ws
    return wb.create_sheet(title)


LEVEL = ("Level", "Water Level", "meter", "Instantaneous", [1.5, 1.6, 1.7])
FLOW = ("Flow", "Discharge", "m^3/s", "Accumulated", [10.0, 11.0, 12.0])


def inspection(path):
    wb = openpyxl.Workbook()
    # 1: fits
    standard(new_sheet(wb, "fits"), hours(3), [LEVEL, FLOW])
    # 2: one used column
    ws = new_sheet(wb, "one column")
    for i, t in enumerate(hours(3)):
        put(ws, 5 + i, 1, t)
    # 3: value type as a plain number
    standard(new_sheet(wb, "numeric value type"), hours(3),
             [("Level", "Water Level", "meter", 1, [1.0, 2.0, 3.0])])
    # 4: an item type that the catalogue doesn't know
    standard(new_sheet(wb, "unknown type"), hours(3),
             [("Level", "Flux", "meter", "Instantaneous", [1.0, 2.0, 3.0])])
    # 5: text among the values (row 6)
    standard(new_sheet(wb, "text value"), hours(3), [LEVEL, ("Flow", "Discharge", "m^3/s", "Accumulated", [1.0, "n/a", 3.0])])
    # 6: text in the date column (row 6)
    ws = new_sheet(wb, "text date")
    standard(ws, hours(3), [LEVEL])
    put(ws, 6, 1, "yesterday")
    # 7: dates that fall at row 7
    standard(new_sheet(wb, "falling dates"), [START, START + 2 * HOUR, START + HOUR], [LEVEL])
    # 8: a number too big to be a date (row 6)
    ws = new_sheet(wb, "no date")
    standard(ws, hours(3), [LEVEL])
    put(ws, 6, 1, 3.0e6)
    # 9: the times of sheet 1, a tenth of a second later
    tenth = datetime.timedelta(milliseconds=100)
    standard(new_sheet(wb, "later by a tenth"), [t + tenth for t in hours(3)], [LEVEL, FLOW])
    # 10: dates as text by the format YYYY-MM-DD HH:mm:ss, one too short (row 6)
    ws = new_sheet(wb, "text format short")
    standard(ws, [t.strftime("%Y-%m-%d %H:%M:%S") for t in hours(3)], [LEVEL])
    put(ws, 6, 1, "2024-03-01")
    # 11: dates as text that fall at row 7
    standard(new_sheet(wb, "text format falling"),
             ["2024-03-01 00:00:00", "2024-03-01 02:00:00", "2024-03-01 01:00:00"], [LEVEL])
    # 12: value types as text: a number, a name in any case behind a prefix, 5
    standard(new_sheet(wb, "value types as text"), hours(3), [
        ("A", "Water Level", "meter", "1", [1.0, 2.0, 3.0]),
        ("B", "Water Level", "meter", "x:mean_step_ACCUMULATED", [1.0, 2.0, 3.0]),
        ("C", "Water Level", "meter", "5", [1.0, 2.0, 3.0])])
    # 13: the value type 6
    standard(new_sheet(wb, "value type 6"), hours(3), [("A", "Water Level", "meter", "6", [1.0, 2.0, 3.0])])
    # 14: date/time in column B; both runs have a bad type and a bad value type
    bad = ("Bad", "Flux", "meter", 1, [1.0, 2.0, 3.0])
    standard(new_sheet(wb, "both wrong, two runs"), hours(3), [bad, bad], date_col=2)
    # 15: the same with the date/time first
    standard(new_sheet(wb, "both wrong, right run"), hours(3), [bad, bad])
    # 16: two value type cells over three columns
    standard(new_sheet(wb, "value types 2 of 3"), hours(3), [
        ("A", "Water Level", "meter", "Instantaneous", [1.0, 2.0, 3.0]),
        ("B", "Water Level", "meter", "Instantaneous", [1.0, 2.0, 3.0]),
        ("C", "Water Level", "meter", None, [1.0, 2.0, 3.0])])
    # 17: one value type cell serves three columns; the type cell too
    standard(new_sheet(wb, "one cell for all"), hours(3), [
        ("A", "Water Level", "meter", "Accumulated", [1.0, 2.0, 3.0]),
        ("B", None, "cm", None, [1.0, 2.0, 3.0]),
        ("C", None, "mm", None, [1.0, 2.0, 3.0])])
    # 18: the first date is the base moment 0.0
    ws = new_sheet(wb, "base moment")
    standard(ws, hours(3), [LEVEL])
    put(ws, 5, 1, 0.0)
    # 19: two true dates 0.4 s apart (rows 5, 6), then 0.6 s
    standard(new_sheet(wb, "0.4 seconds"), [START, START + datetime.timedelta(milliseconds=400)], [LEVEL])
    standard(new_sheet(wb, "0.6 seconds"), [START, START + datetime.timedelta(milliseconds=600)], [LEVEL])
    wb.save(path)


def import_book(path):
    wb = openpyxl.Workbook()
    # 1: data on both sides of the date/time column B, with odd cells
    ws = new_sheet(wb, "both sides")
    standard(ws, hours(4), [
        ("West", "Water Level", "cm", "Instantaneous", [0.1, None, 3.25, "abc"]),
        ("East", "Discharge", "l/s", "Mean_Step_Accumulated", [1e-3, 2.0, 3.0, 4.0]),
        ("North", "Rainfall", "MILLIMETER", "step_accumulated", [5.0, 6.0, 7.0, 8.0])], date_col=2)
    # 2: one header row holding Type[Unit]:ValueType
    ws = new_sheet(wb, "shared header")
    standard(ws, hours(2), [
        ("Gauge", "Water Level[meter]:Mean_Step_Accumulated", None, None, [1.0, 2.0]),
        ("Pipe", "Discharge[l/s]:1", None, None, [3.0, 4.0])])
    # 3: the delete value in row 5 of the date/time column, data from row 6
    ws = new_sheet(wb, "delete value row")
    standard(ws, hours(3), [("Level", "Water Level", "meter", "Instantaneous", [-999.0, 2.0, -999.0])], first_row=6)
    put(ws, 5, 1, -999.0)
    # 4: times of day as text, the date from GlobalDate
    ws = new_sheet(wb, "time of day")
    standard(ws, ["06:00:00", "06:30:00", "07:00:15"], [("Level", "Water Level", "meter", "Instantaneous", [1.0, 2.0, 3.0])])
    # 5: two rows with the same time
    standard(new_sheet(wb, "equal times"), [START, START + HOUR, START + HOUR], [LEVEL])
    # 6: header rows and no data rows
    ws = new_sheet(wb, "no rows")
    standard(ws, [], [LEVEL, FLOW])
    # 7, 8: two sheets on one time axis, three items and two
    standard(new_sheet(wb, "first of two"), hours(3), [
        ("S1 a", "Water Level", "meter", "Instantaneous", [1.0, 2.0, 3.0]),
        ("S1 b", "Water Level", "meter", "Instantaneous", [4.0, 5.0, 6.0]),
        ("S1 c", "Water Level", "meter", "Instantaneous", [7.0, 8.0, 9.0])])
    standard(new_sheet(wb, "second of two"), hours(3), [
        ("S2 a", "Rainfall", "mm", "Accumulated", [10.0, 11.0, 12.0]),
        ("S2 b", "Rainfall", "mm", "Accumulated", [13.0, 14.0, 15.0])])
    # 9: a delete value row whose cell is a word
    ws = new_sheet(wb, "delete value word")
    standard(ws, hours(2), [("Level", "Water Level", "meter", "Instantaneous", [-9999.0, 2.0])], first_row=6)
    put(ws, 5, 1, "none")
    # 10: the first row's time doesn't parse
    ws = new_sheet(wb, "first time unreadable")
    standard(ws, ["bad", "2024-03-01 01:00:00", "2024-03-01 02:00:00"], [LEVEL])
    wb.save(path)


if __name__ == "__main__":
    folder = sys.argv[1] if len(sys.argv) > 1 else os.path.dirname(os.path.abspath(__file__))
    inspection(os.path.join(folder, "inspection.xlsx"))
    import_book(os.path.join(folder, "import.xlsx"))
