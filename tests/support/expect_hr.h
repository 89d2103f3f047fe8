// SPDX-License-Identifier: MIT
// EXPECT_HR / ASSERT_HR: compare HRESULTs and print both in hex on failure.
#pragma once

#include <cstdint>
#include <cstdio>
#include <string>

#include <gtest/gtest.h>

namespace vantrel::testing {

inline std::string HrText(int32_t hr)
{
    char buffer[16];
    std::snprintf(buffer, sizeof buffer, "0x%08X", static_cast<unsigned>(hr));
    return buffer;
}

inline ::testing::AssertionResult HrEqual(const char *expectedText, const char *actualText,
                                          int32_t expected, int32_t actual)
{
    if (expected == actual) return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure()
           << actualText << " is " << HrText(actual) << ", expected " << expectedText << " "
           << HrText(expected);
}

}  // namespace vantrel::testing

#define EXPECT_HR(expected, actual) \
    EXPECT_PRED_FORMAT2(::vantrel::testing::HrEqual, expected, actual)
#define ASSERT_HR(expected, actual) \
    ASSERT_PRED_FORMAT2(::vantrel::testing::HrEqual, expected, actual)
