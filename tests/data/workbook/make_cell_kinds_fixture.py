#!/usr/bin/python3
# SPDX-License-Identifier: MIT
"""Writes cell_kinds.xlsx, the workbook of the cell access tests that holds
what a write through the engine can't make: texts that read as numbers
(a put text is taken as typed), error cells and booleans beside numbers.
Run with Debian's /usr/bin/python3; the .xlsx is committed beside it.

    /usr/bin/python3 tests/data/workbook/make_cell_kinds_fixture.py"""

import os

from openpyxl import Workbook

HERE = os.path.dirname(os.path.abspath(__file__))


def cell_kinds():
    wb = Workbook()
    ws = wb.active
    ws.title = "Kinds"
    # Row 1: a number, a word, a number as text, a boolean, an error, a word.
    ws.append([1.5, "abc", "12.5", True, "#N/A", "xyz"])
    # Row 2: an empty cell between a boolean and a division error.
    ws["A2"] = False
    ws["C2"] = "#DIV/0!"
    wb.save(os.path.join(HERE, "cell_kinds.xlsx"))


if __name__ == "__main__":
    cell_kinds()
