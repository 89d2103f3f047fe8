// SPDX-License-Identifier: MIT
// PathFileExistsA and PathAddExtensionA on real files and on 260-char buffers.
#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>
#include <fstream>
#include <string>

#include "shell/shell.h"
#include "support/temp_dir.h"

namespace {

namespace fs = std::filesystem;

// Runs PathAddExtensionA on a MAX_PATH buffer holding path.
struct Added {
    BOOL result;
    std::string path;
};
Added AddExtension(const std::string &path, const char *ext)
{
    char buffer[MAX_PATH];
    std::memset(buffer, 'X', sizeof buffer);
    std::memcpy(buffer, path.c_str(), path.size() + 1);
    const BOOL result = PathAddExtensionA(buffer, ext);
    return {result, buffer};
}

TEST(PathFileExists, FileFolderMissingAndEmpty)
{
    testing_host::TempDir folder;
    const fs::path file = folder.Path() / "data sheet.xlsx";
    std::ofstream(file) << "x";

    EXPECT_EQ(PathFileExistsA(file.c_str()), 1);
    EXPECT_EQ(PathFileExistsA(folder.Path().c_str()), 1);
    EXPECT_EQ(PathFileExistsA((folder.Path() / "missing.xlsx").c_str()), 0);
    EXPECT_EQ(PathFileExistsA((folder.Path() / "missing" / "deeper.xlsx").c_str()), 0);
    EXPECT_EQ(PathFileExistsA(""), 0);
    EXPECT_EQ(PathFileExistsA(nullptr), 0);

    fs::remove(file);
    EXPECT_EQ(PathFileExistsA(file.c_str()), 0);
}

TEST(PathAddExtension, AddsOnlyWhereTheLastComponentHasNone)
{
    // No extension: the default is ".xml", or the one given.
    EXPECT_EQ(AddExtension("/data/template", nullptr).result, 1);
    EXPECT_EQ(AddExtension("/data/template", nullptr).path, "/data/template.xml");
    EXPECT_EQ(AddExtension("template", ".txt").path, "template.txt");

    // An existing extension stays as it is.
    const Added existing = AddExtension("/data/template.tpl", nullptr);
    EXPECT_EQ(existing.result, 0);
    EXPECT_EQ(existing.path, "/data/template.tpl");
    EXPECT_EQ(AddExtension("archive.tar.gz", nullptr).path, "archive.tar.gz");
    EXPECT_EQ(AddExtension("trailing.", nullptr).path, "trailing.");

    // A dot in a folder name is no extension of the file.
    EXPECT_EQ(AddExtension("/data/v1.2/template", nullptr).path, "/data/v1.2/template.xml");
    EXPECT_EQ(AddExtension("./template", nullptr).path, "./template.xml");
    // A blank after the dot: the dot is part of the name.
    EXPECT_EQ(AddExtension("/data/run no. 2", nullptr).path, "/data/run no. 2.xml");
    EXPECT_EQ(AddExtension("/data/run no.2", nullptr).path, "/data/run no.2");

    EXPECT_EQ(PathAddExtensionA(nullptr, ".xml"), 0);
}

TEST(PathAddExtension, RefusesWhatWouldNotFitAndLeavesThePath)
{
    // 255 chars + ".xml" = 259 chars and the zero: fits exactly.
    const std::string fits(255, 'a');
    const Added exact = AddExtension(fits, nullptr);
    EXPECT_EQ(exact.result, 1);
    EXPECT_EQ(exact.path, fits + ".xml");

    // One char more would need 261.
    const std::string tooLong(256, 'a');
    const Added refused = AddExtension(tooLong, nullptr);
    EXPECT_EQ(refused.result, 0);
    EXPECT_EQ(refused.path, tooLong);

    // A buffer with no zero within MAX_PATH is never read past its end.
    char unterminated[MAX_PATH];
    std::memset(unterminated, 'a', sizeof unterminated);
    EXPECT_EQ(PathAddExtensionA(unterminated, nullptr), 0);
    EXPECT_EQ(unterminated[MAX_PATH - 1], 'a');
}

}  // namespace
