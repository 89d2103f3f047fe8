// SPDX-License-Identifier: MIT
// The preset formats of the format combo boxes.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "datetime/date_time_util.h"
#include "datetime/format_presets.h"

namespace {

using namespace vantrel::datetime;

TEST(FormatPresets, ListsInTheOrderOfAdding)
{
    EXPECT_EQ(FormatPresets(FormatPresetDateTime),
              (std::vector<std::string>{
                  "YYYY-MM-DD HH:mm:ss", "YYYY-MM-DD HH-mm-ss", "DD-MM-YYYY HH:mm:ss",
                  "DD-MM-YYYY HH-mm-ss", "YYYY/MM/DD HH:mm:ss", "YYYY/MM/DD HH/mm/ss",
                  "DD/MM/YYYY HH:mm:ss", "DD/MM/YYYY HH/mm/ss", "YYYY-MM-DDTHH:mm:ss",
                  "YYYY|MM|DD|HH|mm|ss"}));
    EXPECT_EQ(FormatPresets(FormatPresetDate),
              (std::vector<std::string>{"YYYY-MM-DD", "DD-MM-YYYY", "YYYY/MM/DD", "DD/MM/YYYY",
                                        "YYYY|MM|DD"}));
    EXPECT_EQ(FormatPresets(FormatPresetTime),
              (std::vector<std::string>{"HH:mm:ss", "HH-mm-ss", "HH/mm/ss", "HH|mm|ss"}));
    EXPECT_EQ(FormatPresets(FormatPresetDate), DatePresetList());
    EXPECT_EQ(FormatPresets(FormatPresetTime), TimePresetList());
    EXPECT_TRUE(FormatPresets(3).empty());
    EXPECT_TRUE(FormatPresets(-1).empty());
    EXPECT_TRUE(kFormatComboListSorted);
}

TEST(FormatPresets, EveryPresetIsAUsableFormatOfItsKind)
{
    const int expectedClass[] = {kFormatDateAndTime, kFormatDateOnly, kFormatTimeOnly};
    for (int kind = FormatPresetDateTime; kind <= FormatPresetTime; ++kind) {
        const auto &presets = FormatPresets(kind);
        for (size_t i = 0; i < presets.size(); ++i) {
            const std::string &preset = presets[i];
            std::string error;
            EXPECT_TRUE(CDateTimeUtil::CheckFormatLetters(preset, error)) << preset;
            EXPECT_EQ(CDateTimeUtil::ClassifyFormat(preset), expectedClass[kind]) << preset;
            // Only the last preset of each list spreads over columns.
            const int columns = i + 1 < presets.size() ? 1 : (kind == FormatPresetDateTime ? 6 : 3);
            EXPECT_EQ(CDateTimeUtil::GetFormatColumnCount(preset), columns) << preset;
        }
    }
}

TEST(FormatPresets, DateTimePresetsJoinADateAndATime)
{
    for (const std::string &preset : FormatPresets(FormatPresetDateTime)) {
        bool joined = false;
        for (const std::string &date : DatePresetList())
            for (const std::string &time : TimePresetList())
                for (const char joint : {' ', 'T', '|'})
                    joined = joined || preset == date + joint + time;
        EXPECT_TRUE(joined) << preset;
    }
}

}  // namespace
