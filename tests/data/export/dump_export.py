#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Tells what an export did to a workbook, as plain lines for a test to compare:
#   changed NAME      a zip entry of BEFORE whose bytes differ in AFTER
#   missing NAME      a zip entry of BEFORE that AFTER lacks
#   added NAME        a zip entry that only AFTER has
#   cell S!A1 VALUE | FORMAT   every cell of AFTER that openpyxl reads, by sheet
# Usage: /usr/bin/python3 dump_export.py BEFORE AFTER   (BEFORE may be "-")
import sys
import zipfile

from openpyxl import load_workbook


def entries(path):
    with zipfile.ZipFile(path) as archive:
        return {info.filename: archive.read(info.filename) for info in archive.infolist()}


def main(before, after):
    if before != "-":
        old, new = entries(before), entries(after)
        for name in sorted(old):
            if name not in new:
                print("missing", name)
            elif old[name] != new[name]:
                print("changed", name)
        for name in sorted(set(new) - set(old)):
            print("added", name)
    book = load_workbook(after)
    for sheet in book.worksheets:
        for row in sheet.iter_rows():
            for cell in row:
                if cell.value is not None:
                    print(f"cell {sheet.title}!{cell.coordinate} {cell.value!r} | {cell.number_format}")


if __name__ == "__main__":
    main(sys.argv[1], sys.argv[2])
