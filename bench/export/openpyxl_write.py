#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# The benchmark's cells written by openpyxl in write-only mode: the header
# row, the titles, the date/time column and the float values of the default
# layout. Usage: openpyxl_write.py OUT.xlsx [STEPS] [ITEMS]
import datetime
import struct
import sys

from openpyxl import Workbook
from openpyxl.cell import WriteOnlyCell


def value(step, item):
    number = ((step * 7919 + item * 104729) % 100000) / 100.0 - 250.0
    return struct.unpack("f", struct.pack("f", number))[0]


def main(path, steps=100000, items=10):
    book = Workbook(write_only=True)
    sheet = book.create_sheet()
    sheet.append([None] + ["Water Level[meter]:Instantaneous"] * items)
    sheet.append([None] + [f"item {i + 1}" for i in range(items)])
    start = datetime.datetime(2020, 1, 1)
    for step in range(steps):
        time = WriteOnlyCell(sheet, value=start + datetime.timedelta(minutes=step))
        time.number_format = "yyyy/mm/dd hh:mm:ss"
        sheet.append([time] + [value(step, i) for i in range(items)])
    book.save(path)


if __name__ == "__main__":
    main(sys.argv[1], *(int(a) for a in sys.argv[2:]))
