#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Writes the benchmark's series in the CSV form that "vantrel import" prints:
# STEPS time steps a minute apart from 2020-01-01, ITEMS float items.
# Usage: make_series.py OUT.csv [STEPS] [ITEMS]
import datetime
import struct
import sys


def same_single(text, single):
    return struct.unpack("f", struct.pack("f", float(text)))[0] == single


def float_text(value):
    # The shortest text that gives back the same 32-bit float, as import prints it.
    single = struct.unpack("f", struct.pack("f", value))[0]
    for decimals in range(0, 8):
        text = f"{single:.{decimals}f}"
        if same_single(text, single):
            return text
    return repr(single)


def value(step, item):
    return ((step * 7919 + item * 104729) % 100000) / 100.0 - 250.0


def main(path, steps=100000, items=10):
    start = datetime.datetime(2020, 1, 1)
    with open(path, "w") as out:
        out.write("title," + ",".join(f"item {i + 1}" for i in range(items)) + "\n")
        out.write("item type," + ",".join(["Water Level"] * items) + "\n")
        out.write("unit," + ",".join(["meter"] * items) + "\n")
        out.write("value type," + ",".join(["Instantaneous"] * items) + "\n")
        out.write("delete value,-9999\n")
        for step in range(steps):
            time = (start + datetime.timedelta(minutes=step)).strftime("%Y-%m-%d %H:%M:%S")
            out.write(time + "," + ",".join(float_text(value(step, i)) for i in range(items)) + "\n")


if __name__ == "__main__":
    main(sys.argv[1], *(int(a) for a in sys.argv[2:]))
