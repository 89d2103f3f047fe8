#!/usr/bin/python3
# SPDX-License-Identifier: MIT
# Writes a one-sheet workbook for the import benchmark straight as XML (an
# xlsx is a zip of XML parts), which is much faster than a spreadsheet
# library at a million rows:
#   make_workbook.py FILE ROWS ITEMS
# Row 1 holds the titles, row 2 the item types, row 3 the units; the data
# start in row 4, the date/time in column A as true dates, one item a column.
import math
import sys
import zipfile

CONTENT_TYPES = """<?xml version="1.0" encoding="UTF-8" standalone="yes"?>
<Types xmlns="http://schemas.openxmlformats.org/package/2006/content-types">
<Default Extension="rels" ContentType="application/vnd.openxmlformats-package.relationships+xml"/>
<Default Extension="xml" ContentType="application/xml"/>
<Override PartName="/xl/workbook.xml" ContentType="application/vnd.openxmlformats-officedocument.spreadsheetml.sheet.main+xml"/>
<Override PartName="/xl/worksheets/sheet1.xml" ContentType="application/vnd.openxmlformats-officedocument.spreadsheetml.worksheet+xml"/>
<Override PartName="/xl/styles.xml" ContentType="application/vnd.openxmlformats-officedocument.spreadsheetml.styles+xml"/>
<Override PartName="/xl/sharedStrings.xml" ContentType="application/vnd.openxmlformats-officedocument.spreadsheetml.sharedStrings+xml"/>
</Types>"""
ROOT_RELS = """<?xml version="1.0" encoding="UTF-8" standalone="yes"?>
<Relationships xmlns="http://schemas.openxmlformats.org/package/2006/relationships">
<Relationship Id="rId1" Type="http://schemas.openxmlformats.org/officeDocument/2006/relationships/officeDocument" Target="xl/workbook.xml"/>
</Relationships>"""
WORKBOOK = """<?xml version="1.0" encoding="UTF-8" standalone="yes"?>
<workbook xmlns="http://schemas.openxmlformats.org/spreadsheetml/2006/main" xmlns:r="http://schemas.openxmlformats.org/officeDocument/2006/relationships">
<sheets><sheet name="Data" sheetId="1" r:id="rId1"/></sheets>
</workbook>"""
WORKBOOK_RELS = """<?xml version="1.0" encoding="UTF-8" standalone="yes"?>
<Relationships xmlns="http://schemas.openxmlformats.org/package/2006/relationships">
<Relationship Id="rId1" Type="http://schemas.openxmlformats.org/officeDocument/2006/relationships/worksheet" Target="worksheets/sheet1.xml"/>
<Relationship Id="rId2" Type="http://schemas.openxmlformats.org/officeDocument/2006/relationships/styles" Target="styles.xml"/>
<Relationship Id="rId3" Type="http://schemas.openxmlformats.org/officeDocument/2006/relationships/sharedStrings" Target="sharedStrings.xml"/>
</Relationships>"""
# Style 1: the built-in date and time format 22.
STYLES = """<?xml version="1.0" encoding="UTF-8" standalone="yes"?>
<styleSheet xmlns="http://schemas.openxmlformats.org/spreadsheetml/2006/main">
<fonts count="1"><font><sz val="11"/><name val="Calibri"/></font></fonts>
<fills count="2"><fill><patternFill patternType="none"/></fill><fill><patternFill patternType="gray125"/></fill></fills>
<borders count="1"><border><left/><right/><top/><bottom/><diagonal/></border></borders>
<cellStyleXfs count="1"><xf numFmtId="0" fontId="0" fillId="0" borderId="0"/></cellStyleXfs>
<cellXfs count="2"><xf numFmtId="0" fontId="0" fillId="0" borderId="0" xfId="0"/><xf numFmtId="22" fontId="0" fillId="0" borderId="0" xfId="0" applyNumberFormat="1"/></cellXfs>
<cellStyles count="1"><cellStyle name="Normal" xfId="0" builtinId="0"/></cellStyles>
</styleSheet>"""
SHEET_HEAD = ('<?xml version="1.0" encoding="UTF-8" standalone="yes"?>\n'
              '<worksheet xmlns="http://schemas.openxmlformats.org/spreadsheetml/2006/main"><sheetData>')
START_SERIAL = 45352.0  # 2024-03-01
TYPES = [("Water Level", "meter"), ("Discharge", "meter^3/sec"), ("Rainfall", "millimeter"),
         ("Temperature", "degree Celsius"), ("Wind Speed", "meter/sec")]


def column_name(index):
    name = ""
    index += 1
    while index:
        index, rest = divmod(index - 1, 26)
        name = chr(65 + rest) + name
    return name


def main(path, rows, items):
    strings = ["Date/Time"]
    header = [["Date/Time"], [], []]
    for i in range(items):
        kind, unit = TYPES[i % len(TYPES)]
        header[0].append("Item %d" % (i + 1))
        header[1].append(kind)
        header[2].append(unit)
    index = {}
    for line in header:
        for text in line:
            if text not in index:
                index[text] = len(index)
    cols = [column_name(c) for c in range(items + 1)]
    with zipfile.ZipFile(path, "w", zipfile.ZIP_DEFLATED, compresslevel=1) as book:
        book.writestr("[Content_Types].xml", CONTENT_TYPES)
        book.writestr("_rels/.rels", ROOT_RELS)
        book.writestr("xl/workbook.xml", WORKBOOK)
        book.writestr("xl/_rels/workbook.xml.rels", WORKBOOK_RELS)
        book.writestr("xl/styles.xml", STYLES)
        shared = "".join("<si><t>%s</t></si>" % t for t in index)
        book.writestr("xl/sharedStrings.xml",
                      '<?xml version="1.0" encoding="UTF-8" standalone="yes"?>\n'
                      '<sst xmlns="http://schemas.openxmlformats.org/spreadsheetml/2006/main" count="%d" uniqueCount="%d">%s</sst>'
                      % (len(index), len(index), shared))
        with book.open("xl/worksheets/sheet1.xml", "w", force_zip64=True) as sheet:
            sheet.write(SHEET_HEAD.encode())
            for r, line in enumerate(header, start=1):
                first = 0 if r == 1 else 1
                cells = "".join('<c r="%s%d" t="s"><v>%d</v></c>' % (cols[c + first], r, index[t])
                                for c, t in enumerate(line))
                sheet.write(('<row r="%d">%s</row>' % (r, cells)).encode())
            chunk = []
            for step in range(rows):
                r = step + 4
                parts = ['<row r="%d"><c r="A%d" s="1"><v>%r</v></c>' % (r, r, START_SERIAL + step / 1440.0)]
                for c in range(items):
                    value = round(10.0 * math.sin(step / 50.0 + c) + c, 3)
                    parts.append('<c r="%s%d"><v>%r</v></c>' % (cols[c + 1], r, value))
                parts.append("</row>")
                chunk.append("".join(parts))
                if len(chunk) == 10000:
                    sheet.write("".join(chunk).encode())
                    chunk = []
            sheet.write(("".join(chunk) + "</sheetData></worksheet>").encode())


if __name__ == "__main__":
    main(sys.argv[1], int(sys.argv[2]), int(sys.argv[3]))
