#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Makes the data of the bridge's end-to-end tests (Debian's python3, which has
# python3-openpyxl):   make_fixtures.py [FOLDER]
#   inspection.xlsx  one sheet for each way a workbook can fail the inspection
#   import.xlsx      the layouts the import reads
#   hydrometric.csv  what `vantrel import` must print for samples/hydrometric.xlsx,
#                    worked out from the workbook with openpyxl alone
# Header rows, unless a sheet says otherwise: 1 title, 2 item type, 3 unit,
# 4 value type; data from row 5; true dates in column A.
import datetime
import os
import struct
import sys

import openpyxl

START = datetime.datetime(2024, 3, 1)
HOUR = datetime.timedelta(hours=1)
MS = datetime.timedelta(milliseconds=1)


def hours(count, start=START):
    return [start + i * HOUR for i in range(count)]


def put(ws, row, col, value):
    cell = ws.cell(row=row, column=col, value=value)
    if isinstance(value, datetime.datetime):
        cell.number_format = "yyyy-mm-dd hh:mm:ss"


def sheet(wb, title, times, items, date_col=1, first_row=5, extra=()):
    """items: (title, type, unit, value type, values); extra: (row, col, value)."""
    ws = wb.active if wb.active.title == "Sheet" else wb.create_sheet()
    ws.title = title
    if items:
        put(ws, 1, date_col, "Date/Time")
    cols = [c for c in range(1, len(items) + 2) if c != date_col]
    for col, item in zip(cols, items):
        for row, value in enumerate(item[:4], start=1):
            if value is not None:
                put(ws, row, col, value)
        for i, value in enumerate(item[4]):
            if value is not None:
                put(ws, first_row + i, col, value)
    for i, time in enumerate(times):
        put(ws, first_row + i, date_col, time)
    for row, col, value in extra:
        put(ws, row, col, value)


def level(title="Level", values=(1.5, 1.6, 1.7), value_type="Instantaneous", kind="Water Level", unit="meter"):
    return (title, kind, unit, value_type, list(values))


LEVEL = level()
FLOW = ("Flow", "Discharge", "m^3/s", "Accumulated", [10.0, 11.0, 12.0])
ONE_TWO_THREE = [1.0, 2.0, 3.0]


def inspection(path):
    wb = openpyxl.Workbook()
    texts = ["2024-03-01 00:00:00", "2024-03-01 01:00:00", "2024-03-01 02:00:00"]
    bad = ("Bad", "Flux", "meter", 1, ONE_TWO_THREE)
    sheet(wb, "fits", hours(3), [LEVEL, FLOW])                                        # 1
    sheet(wb, "one column", hours(3), [])                                              # 2
    sheet(wb, "numeric value type", hours(3), [level("Level", ONE_TWO_THREE, 1)])         # 3
    sheet(wb, "unknown type", hours(3), [level(values=ONE_TWO_THREE, kind="Flux")])    # 4
    sheet(wb, "text value", hours(3), [LEVEL, FLOW[:4] + ([1.0, "n/a", 3.0],)])        # 5: row 6
    sheet(wb, "text date", hours(3), [LEVEL], extra=[(6, 1, "yesterday")])             # 6
    sheet(wb, "falling dates", [START, START + 2 * HOUR, START + HOUR], [LEVEL])       # 7: row 7
    sheet(wb, "no date", hours(3), [LEVEL], extra=[(6, 1, 3.0e6)])                     # 8
    sheet(wb, "later by a tenth", [t + 100 * MS for t in hours(3)], [LEVEL, FLOW])     # 9
    sheet(wb, "text format short", texts, [LEVEL], extra=[(6, 1, "2024-03-01")])       # 10
    sheet(wb, "text format falling", [texts[0], texts[2], texts[1]], [LEVEL])          # 11
    sheet(wb, "value types as text", hours(3), [level("A", ONE_TWO_THREE, "1"),        # 12
          level("B", ONE_TWO_THREE, "x:mean_step_ACCUMULATED"), level("C", ONE_TWO_THREE, "5")])
    sheet(wb, "value type 6", hours(3), [level("A", ONE_TWO_THREE, "6")])              # 13
    sheet(wb, "both wrong, two runs", hours(3), [bad, bad], date_col=2)                # 14
    sheet(wb, "both wrong, right run", hours(3), [bad, bad])                           # 15
    sheet(wb, "value types 2 of 3", hours(3), [level("A", ONE_TWO_THREE), level("B", ONE_TWO_THREE),
          level("C", ONE_TWO_THREE, None)])                                           # 16
    sheet(wb, "one cell for all", hours(3), [level("A", ONE_TWO_THREE, "Accumulated"),  # 17
          ("B", None, "cm", None, ONE_TWO_THREE), ("C", None, "mm", None, ONE_TWO_THREE)])
    sheet(wb, "base moment", hours(3), [LEVEL], extra=[(5, 1, 0.0)])                   # 18
    sheet(wb, "0.4 seconds", [START, START + 400 * MS], [LEVEL])                       # 19
    sheet(wb, "0.6 seconds", [START, START + 600 * MS], [LEVEL])                       # 20
    wb.save(path)


def import_book(path):
    wb = openpyxl.Workbook()
    sheet(wb, "both sides", hours(4), [                                                # 1
        ("West", "Water Level", "cm", "Instantaneous", [0.1, None, 3.25, "abc"]),
        ("East", "Discharge", "l/s", "Mean_Step_Accumulated", [1e-3, 2.0, 3.0, 4.0]),
        ("North", "Rainfall", "MILLIMETER", "step_accumulated", [5.0, 6.0, 7.0, 8.0])], date_col=2)
    sheet(wb, "shared header", hours(2), [                                             # 2
        ("Gauge", "Water Level[meter]:Mean_Step_Accumulated", None, None, [1.0, 2.0]),
        ("Pipe", "Discharge[l/s]:1", None, None, [3.0, 4.0])])
    sheet(wb, "delete value row", hours(3), [level(values=[-999.0, 2.0, -999.0])],     # 3
          first_row=6, extra=[(5, 1, -999.0)])
    sheet(wb, "time of day", ["06:00:00", "06:30:00", "07:00:15"], [level(values=ONE_TWO_THREE)])  # 4
    sheet(wb, "equal times", [START, START + HOUR, START + HOUR], [LEVEL])             # 5
    sheet(wb, "no rows", [], [LEVEL, FLOW])                                            # 6
    sheet(wb, "first of two", hours(3), [level("S1 a", [1.0, 2.0, 3.0]),               # 7
          level("S1 b", [4.0, 5.0, 6.0]), level("S1 c", [7.0, 8.0, 9.0])])
    sheet(wb, "second of two", hours(3), [                                             # 8
        ("S2 a", "Rainfall", "mm", "Accumulated", [10.0, 11.0, 12.0]),
        ("S2 b", "Rainfall", "mm", "Accumulated", [13.0, 14.0, 15.0])])
    sheet(wb, "delete value word", hours(2), [level(values=[-9999.0, 2.0])],            # 9
          first_row=6, extra=[(5, 1, "none")])
    sheet(wb, "first time unreadable", ["bad", "2024-03-01 01:00:00", "2024-03-01 02:00:00"], [LEVEL])  # 10
    wb.save(path)


def shortest(x):
    """The fewest decimals that give the same 32-bit float back."""
    f32 = lambda v: struct.unpack("f", struct.pack("f", v))[0]
    for decimals in range(12):
        text = "%.*f" % (decimals, f32(x))
        if f32(float(text)) == f32(x):
            return "0" if text in ("-0", "0") else text
    raise ValueError(x)


def dates_book(path, epoch=None):
    """Split date and time columns, midnight, days that don't exist; 1904 too."""
    wb = openpyxl.Workbook()
    if epoch:
        wb.epoch = epoch
    day = [datetime.date(2024, 3, 1)] * 2 + [datetime.date(2024, 3, 2)]
    times = [datetime.time(0), datetime.time(12), datetime.time(23, 59, 59, 600000)]
    sheet(wb, "date, item, time", day, [level()], extra=[(5 + i, 3, t) for i, t in enumerate(times)])  # 1
    sheet(wb, "time only", times, [level()])                                                           # 2
    sheet(wb, "no such day", ["2012-04-30", "2012-04-31"], [level(values=(1, 2))])                    # 3
    sheet(wb, "text times", ["00:00:00", "12:00:00"], [level(values=(1, 2))], extra=[(5, 3, "2024-03-01"), (6, 3, "2024-03-01")])  # 4
    wb.save(path)


def sample_csv(sample, path):
    columns, times = [], None
    for ws in openpyxl.load_workbook(sample).worksheets:
        rows = list(ws.iter_rows(values_only=True))
        times = times or [r[0] for r in rows[4:]]
        columns += [[r[c] for r in rows] for c in range(1, len(rows[0]))]
    lines = [name + "," + ",".join(c[i] for c in columns)
             for i, name in enumerate(["title", "item type", "unit", "value type"])] + ["delete value,-9999"]
    lines += [t.strftime("%Y-%m-%d %H:%M:%S,") + ",".join(shortest(c[4 + i]) for c in columns)
              for i, t in enumerate(times)]
    with open(path, "w", newline="") as f:
        f.write("\n".join(lines) + "\n")


if __name__ == "__main__":
    here = os.path.dirname(os.path.abspath(__file__))
    folder = sys.argv[1] if len(sys.argv) > 1 else here
    inspection(os.path.join(folder, "inspection.xlsx"))
    import_book(os.path.join(folder, "import.xlsx"))
    dates_book(os.path.join(folder, "dates.xlsx"))
    dates_book(os.path.join(folder, "dates1904.xlsx"), openpyxl.utils.datetime.CALENDAR_MAC_1904)
    sample_csv(os.path.join(here, "../../../samples/hydrometric.xlsx"), os.path.join(folder, "hydrometric.csv"))
