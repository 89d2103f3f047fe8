/* SPDX-License-Identifier: MIT */
/* Checks for the tests written in C: a failed one prints where and why and is
 * counted; main returns CHECK_RESULT(). */
#ifndef VANTREL_TESTS_C_CHECKS_H
#define VANTREL_TESTS_C_CHECKS_H

#include <stdio.h>

static int check_failures = 0;

#define CHECK(condition)                                                                   \
    do {                                                                                   \
        if (!(condition)) {                                                                \
            fprintf(stderr, "%s:%d: check failed: %s\n", __FILE__, __LINE__, #condition); \
            ++check_failures;                                                              \
        }                                                                                  \
    } while (0)

/* The HRESULTs in hex, as the C++ tests print them. */
#define CHECK_HR(expected, actual)                                                        \
    do {                                                                                  \
        HRESULT hr_ = (actual);                                                           \
        if (hr_ != (expected)) {                                                          \
            fprintf(stderr, "%s:%d: %s is 0x%08X, expected 0x%08X\n", __FILE__, __LINE__, \
                    #actual, (unsigned)hr_, (unsigned)(expected));                        \
            ++check_failures;                                                             \
        }                                                                                 \
    } while (0)

#define CHECK_RESULT() (check_failures == 0 ? 0 : 1)

#endif
