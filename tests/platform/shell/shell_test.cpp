// SPDX-License-Identifier: MIT
// The shell functions: message boxes on stderr unless a sink takes them, and
// paths on real files and in 260-char buffers.
#include <gtest/gtest.h>

#include <cstring>
#include <stdexcept>
#include <string>

#include "shell/shell.h"
#include "support/files.h"
#include "support/message_boxes.h"
#include "support/temp_dir.h"

namespace {

TEST(MessageBox, SinksNestAndTheDefaultWritesToStderr)
{
    testing::internal::CaptureStderr();
    MessageBoxA(nullptr, "Please enter the correct file.", "Warning!", MB_OK);
    MessageBoxA(nullptr, nullptr, nullptr, MB_OK);
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "Warning!: Please enter the correct file.\nError: \n");
    testing_host::MessageBoxes outer;
    {
        testing_host::MessageBoxes inner;
        EXPECT_EQ(MessageBoxA(nullptr, "first", "Warning!", MB_OK), IDOK);
        EXPECT_EQ(inner.texts.size() == 1 ? inner.texts[0] + " / " + inner.captions[0] : "", "first / Warning!");
    }
    {
        shell::ScopedMessageSink failing([](std::string_view, std::string_view) { throw std::runtime_error("gone"); });
        testing::internal::CaptureStderr();
        EXPECT_EQ(MessageBoxA(nullptr, "still shown", "Vantrel", MB_OK), IDOK);
        EXPECT_EQ(testing::internal::GetCapturedStderr(), "Vantrel: still shown\n") << "a failing sink falls back";
    }
    MessageBoxA(nullptr, "second", "Vantrel", MB_OK);
    EXPECT_EQ(outer.texts, std::vector<std::string>{"second"});
}

TEST(PathFileExists, FilesAndFoldersExistMissingAndEmptyPathsDont)
{
    testing_host::TempDir folder;
    testing_host::WriteFile(folder.File("data sheet.xlsx"), "x");
    for (auto [path, exists] : {std::pair<std::string, BOOL>{folder.File("data sheet.xlsx"), 1}, {folder.File(""), 1},
                                {folder.File("missing.xlsx"), 0}, {folder.File("missing/deeper.xlsx"), 0}, {"", 0}})
        EXPECT_EQ(PathFileExistsA(path.c_str()), exists) << path;
    EXPECT_EQ(PathFileExistsA(nullptr), 0);
}

TEST(PathAddExtension, AddsOnlyWhereTheLastComponentHasNoneAndItFits)
{
    const std::pair<std::string, std::string> cases[] = {
        {"/data/template", "/data/template.xml"}, {"/data/template.tpl", "/data/template.tpl"},
        {"trailing.", "trailing."},                {"/data/v1.2/template", "/data/v1.2/template.xml"},
        {"./template", "./template.xml"},          {"/data/run no. 2", "/data/run no. 2.xml"},  // a blank after the dot
        {"/data/run no.2", "/data/run no.2"},      {std::string(255, 'a'), std::string(255, 'a') + ".xml"},
        {std::string(256, 'a'), std::string(256, 'a')}};  // 261 with the zero: too long
    for (const auto &[path, expected] : cases) {
        char buffer[MAX_PATH];
        std::memset(buffer, 'X', sizeof buffer);
        std::memcpy(buffer, path.c_str(), path.size() + 1);
        EXPECT_EQ(PathAddExtensionA(buffer, nullptr), path != expected) << path;
        EXPECT_EQ(buffer, expected);
    }
    char buffer[MAX_PATH] = "template";
    EXPECT_EQ(PathAddExtensionA(buffer, ".txt"), 1);
    EXPECT_STREQ(buffer, "template.txt");
    std::memset(buffer, 'a', sizeof buffer);  // no zero within MAX_PATH: never read past the end
    EXPECT_EQ(PathAddExtensionA(buffer, nullptr), 0);
    EXPECT_EQ(buffer[MAX_PATH - 1], 'a');
}

}  // namespace
