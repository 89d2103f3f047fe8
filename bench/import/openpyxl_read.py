#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# The comparison: reads every cell of the first sheet with openpyxl in
# read-only mode, as a script would that imports the same workbook.
import sys

import openpyxl

book = openpyxl.load_workbook(sys.argv[1], read_only=True)
cells = 0
for row in book.worksheets[0].iter_rows(values_only=True):
    cells += len(row)
print(cells)
