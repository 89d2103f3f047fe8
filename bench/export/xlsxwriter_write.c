/* SPDX-License-Identifier: MIT
 *
 * The benchmark's cells written by libxlsxwriter: the same header rows, titles,
 * date/time column and float values that "vantrel export" writes with the
 * default layout. Usage: xlsxwriter_write OUT.xlsx [STEPS] [ITEMS] [constant]
 * ("constant" turns on the library's row-streaming mode).
 */
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include <xlsxwriter.h>

static double Value(long step, int item)
{
    return (double)(float)((double)((step * 7919 + item * 104729) % 100000) / 100.0 - 250.0);
}

int main(int argc, char **argv)
{
    if (argc < 2) {
        fprintf(stderr, "usage: %s OUT.xlsx [STEPS] [ITEMS] [constant]\n", argv[0]);
        return 2;
    }
    const long steps = argc > 2 ? atol(argv[2]) : 100000;
    const int items = argc > 3 ? atoi(argv[3]) : 10;
    lxw_workbook_options options = {.constant_memory = argc > 4 && strcmp(argv[4], "constant") == 0,
                                    .tmpdir = NULL};
    lxw_workbook *book = workbook_new_opt(argv[1], &options);
    lxw_worksheet *sheet = workbook_add_worksheet(book, NULL);
    lxw_format *dateFormat = workbook_add_format(book);
    format_set_num_format(dateFormat, "yyyy/mm/dd hh:mm:ss");

    char text[64];
    for (int i = 0; i < items; ++i) {
        worksheet_write_string(sheet, 0, (lxw_col_t)(i + 1), "Water Level[meter]:Instantaneous", NULL);
    }
    for (int i = 0; i < items; ++i) {
        snprintf(text, sizeof text, "item %d", i + 1);
        worksheet_write_string(sheet, 1, (lxw_col_t)(i + 1), text, NULL);
    }
    /* One minute a step from 2020-01-01: serial 43831. */
    for (long step = 0; step < steps; ++step) {
        const lxw_row_t row = (lxw_row_t)(step + 2);
        worksheet_write_number(sheet, row, 0, 43831.0 + (double)step / 1440.0, dateFormat);
        for (int i = 0; i < items; ++i) worksheet_write_number(sheet, row, (lxw_col_t)(i + 1), Value(step, i), NULL);
    }
    return workbook_close(book) == LXW_NO_ERROR ? 0 : 1;
}
