#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Writes hydrometric.csv: what `vantrel import` must print for the sample
# workbook, worked out here from the workbook with openpyxl alone.
#   expected_sample_csv.py SAMPLE.xlsx OUT.csv
import struct
import sys

import openpyxl

VALUE_TYPES = ["Instantaneous", "Accumulated", "Step_Accumulated", "Mean_Step_Accumulated",
               "Reverse_Mean_Step_Accumulated"]


def f32(x):
    return struct.unpack("f", struct.pack("f", x))[0]


def shortest(x):
    # The fewest decimals that give the same 32-bit float back; the sample's
    # values are small enough that plain decimals are the shortest form.
    target = f32(x)
    for decimals in range(0, 12):
        text = "%.*f" % (decimals, target)
        if f32(float(text)) == target:
            return "0" if text in ("-0", "0") else text
    raise ValueError(x)


def main(sample, out):
    book = openpyxl.load_workbook(sample)
    columns = []
    times = None
    for ws in book.worksheets:
        rows = list(ws.iter_rows(values_only=True))
        if times is None:
            times = [r[0] for r in rows[4:]]
        for c in range(1, len(rows[0])):
            columns.append([r[c] for r in rows])
    lines = ["title," + ",".join(c[0] for c in columns),
             "item type," + ",".join(c[1] for c in columns),
             "unit," + ",".join(c[2] for c in columns),
             "value type," + ",".join(c[3] for c in columns),
             "delete value,-9999"]
    for i, t in enumerate(times):
        lines.append(t.strftime("%Y-%m-%d %H:%M:%S") + "," + ",".join(shortest(c[4 + i]) for c in columns))
    assert all(c[3] in VALUE_TYPES for c in columns)
    with open(out, "w", newline="") as f:
        f.write("\n".join(lines) + "\n")


if __name__ == "__main__":
    main(sys.argv[1], sys.argv[2])
