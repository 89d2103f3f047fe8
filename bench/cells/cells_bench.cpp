// SPDX-License-Identifier: MIT
// The cell benchmark: opens a workbook through CExcelObj and times the reads
// an import makes, each on the first sheet's whole used range and on a small
// part of it, so that a cost that grows with the used range instead of the
// cells returned shows. Prints one line of "name seconds" pairs and the peak
// resident memory:
//   cells_bench BOOK
#include <sys/resource.h>

#include <chrono>
#include <cstdio>
#include <string>

#include "workbook/excel_obj.h"

namespace {

using Clock = std::chrono::steady_clock;

double Since(Clock::time_point start) { return std::chrono::duration<double>(Clock::now() - start).count(); }

double PeakMegabytes()
{
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return double(usage.ru_maxrss) / 1024.0;  // kilobytes on Linux
}

template <typename F>
double Time(F &&f)
{
    const auto start = Clock::now();
    f();
    return Since(start);
}

}  // namespace

int main(int argc, char **argv)
{
    if (argc != 2) {
        std::fprintf(stderr, "usage: cells_bench BOOK\n");
        return 2;
    }
    CExcelObj excel;
    std::string error;
    const double open = Time([&] {
        if (!excel.StartExcel(error) || !excel.OpenWorkbook(argv[1], error) || !excel.SelectSheet(1, error)) {
            std::fprintf(stderr, "%s\n", error.c_str());
            std::exit(1);
        }
    });
    const double openPeak = PeakMegabytes();

    UsedColumns used;
    int rows = 0, counted = 0, rowCells = 0;
    const double usedColumns = Time([&] { used = excel.GetUsedColumns(); });
    const double usedRows = Time([&] { rows = excel.GetUsedRowCount(); });
    const double countColumn = Time([&] { excel.CountColumnCells(1, counted, used.firstColumn); });
    const double countRow = Time([&] { rowCells = excel.CountRowCells(1, used.firstColumn, used.columnCount); });

    automation::SafeArray block;
    std::string errors;
    // The date/time column as an import reads it, then every value at once.
    const double dateColumn = Time([&] { excel.ReadCellBlock(1, rows, used.firstColumn, 1, block, false); });
    block = automation::SafeArray();
    const double valueBlock =
        Time([&] { excel.ReadValueBlock(1, rows, used.firstColumn, used.columnCount, block, -999.0, errors); });
    double sum = 0.0;
    {
        double *values = nullptr;
        SafeArrayAccessData(block.Get(), reinterpret_cast<void **>(&values));
        for (size_t i = 0; i < size_t(rows) * size_t(used.columnCount); ++i) sum += values[i];
        SafeArrayUnaccessData(block.Get());
    }
    block = automation::SafeArray();
    // The same reads on 1,000 rows from the middle of the sheet.
    const int middle = rows / 2;
    const double smallValueBlock =
        Time([&] { excel.ReadValueBlock(middle, 1000, used.firstColumn, used.columnCount, block, -999.0, errors); });
    const double smallCellBlock =
        Time([&] { excel.ReadCellBlock(middle, 1000, used.firstColumn, used.columnCount, block, true); });
    block = automation::SafeArray();
    int tailCount = 0;
    const double countColumnTail = Time([&] { excel.CountColumnCells(rows - 999, tailCount, used.firstColumn); });

    excel.CloseWorkbook(0);
    excel.QuitExcel();
    std::printf("rows %d columns %d first_column %d counted %d row_cells %d tail_count %d errors %zu checksum %.6g\n",
                rows, used.columnCount, used.firstColumn, counted, rowCells, tailCount, errors.size(), sum);
    std::printf("open %.3f GetUsedColumns %.6f GetUsedRowCount %.6f CountColumnCells %.6f CountRowCells %.6f "
                "ReadCellBlock_date_column %.3f ReadValueBlock_all %.3f ReadValueBlock_1000_rows %.6f "
                "ReadCellBlock_1000_rows_as_text %.6f CountColumnCells_last_1000 %.6f open_peak_mb %.1f peak_mb %.1f\n",
                open, usedColumns, usedRows, countColumn, countRow, dateColumn, valueBlock, smallValueBlock,
                smallCellBlock, countColumnTail, openPeak, PeakMegabytes());
    return 0;
}
