#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Tells what an export did to a workbook, as plain lines for a test to compare:
#   changed NAME / missing NAME / added NAME   zip entries of AFTER against BEFORE
#   cell S!A1 VALUE | FORMAT                   every cell of AFTER that openpyxl reads
#   before S!A1 VALUE | FORMAT                 the same of BEFORE
# Usage: /usr/bin/python3 dump_export.py BEFORE AFTER   (BEFORE may be "-")
import sys
import zipfile

from openpyxl import load_workbook


def entries(path):
    with zipfile.ZipFile(path) as archive:
        return {info.filename: archive.read(info.filename) for info in archive.infolist()}


def cells(path, tag):
    for sheet in load_workbook(path).worksheets:
        for row in sheet.iter_rows():
            for cell in row:
                if cell.value is not None:
                    print(f"{tag} {sheet.title}!{cell.coordinate} {cell.value!r} | {cell.number_format}")


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
    cells(after, "cell")
    if before != "-":
        cells(before, "before")


if __name__ == "__main__":
    main(sys.argv[1], sys.argv[2])
