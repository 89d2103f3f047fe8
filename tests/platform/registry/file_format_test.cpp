// SPDX-License-Identifier: MIT
// The trees' files: plain text a person can read and edit, written whole or
// not at all, and reported, never replaced, when they can't be read.
#include <gtest/gtest.h>

#include <sys/stat.h>

#include "platform/registry/registry_fixture.h"

namespace {

using namespace testing_registry;

TEST(RegistryFile, IsPlainReadableText)
{
    ScopedRegistryRoot root;
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "CLSID\\{1}", nullptr, "A class");
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "CLSID\\{1}", "AppID", "{2}");
    RegistryCreateKey(REGISTRY_CLASSES_ROOT, "CLSID\\{1}\\Programmable");
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "CLSID\\{1}\\InprocServer32", nullptr, "/opt/a \"b\"\\c.so");
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "Text", "Lines", "one\ntwo\r\x7f");

    EXPECT_EQ(FileText(root.ClassesFile()),
              "; vantrel registry, version 1\n"
              "; classes root\n"
              "\n[CLSID]\n"
              "\n[CLSID\\{1}]\n"
              "@=\"A class\"\n"
              "\"AppID\"=\"{2}\"\n"
              "\n[CLSID\\{1}\\InprocServer32]\n"
              "@=\"/opt/a \\\"b\\\"\\\\c.so\"\n"
              "\n[CLSID\\{1}\\Programmable]\n"
              "\n[Text]\n"
              "\"Lines\"=\"one\\ntwo\\r\\x7F\"\n");
    EXPECT_EQ(FileText(root.HostFile()), "<missing>");

    struct stat info {};
    ASSERT_EQ(stat(root.ClassesFile().c_str(), &info), 0);
    EXPECT_EQ(info.st_mode & 0777, 0644u);
}

TEST(RegistryFile, HandWrittenFilesAreRead)
{
    ScopedRegistryRoot root;
    WriteFile(root.HostFile(),
              "; vantrel registry, version 1\r\n"
              "; written by hand, with comments, blank lines and CRLF\r\n"
              "\r\n"
              "[ProductAreas\\4\\Bridges\\Other]\r\n"
              "   \r\n"
              "@=\"other \\x41\\t\"   \r\n"
              "; a comment between values\r\n"
              "\"Name\"=\"Other bridge\"\r\n"
              "[productareas\\4\\bridges\\OTHER]\r\n"
              "\"name\"=\"Renamed\"\r\n");
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Other"), "other A\t");
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Other", "Name"), "Renamed");

    // A change rewrites the file in the store's own form.
    RegistrySetValue(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Other", "Name", "Again");
    EXPECT_EQ(FileText(root.HostFile()),
              "; vantrel registry, version 1\n"
              "; host tree\n"
              "\n[ProductAreas]\n"
              "\n[ProductAreas\\4]\n"
              "\n[ProductAreas\\4\\Bridges]\n"
              "\n[ProductAreas\\4\\Bridges\\Other]\n"
              "@=\"other A\\t\"\n"
              "\"Name\"=\"Again\"\n");
}

struct CorruptCase {
    const char *text;
    const char *reason;
};

TEST(RegistryFile, ADamagedFileIsReportedAndLeftAsItIs)
{
    const CorruptCase cases[] = {
        {"", "the file is empty: it has no header line"},
        {"[CLSID]\n", "line 1: this is not a registry file: the first line must be \"; vantrel registry, version 1\""},
        {"; vantrel registry, version 1\n@=\"x\"\n", "line 2: a value stands before any key"},
        {"; vantrel registry, version 1\n[A]\n@=\"open\n", "line 3: a quoted text has no closing quote"},
        {"; vantrel registry, version 1\n[A]\n\"n\"=\"\\q\"\n", "line 3: unknown escape \\q"},
        {"; vantrel registry, version 1\n[A]\n\"n\"=\"\\x00\"\n", "line 3: \\x must be followed by two hex digits, not 00"},
        {"; vantrel registry, version 1\n[A]\n\"n\" \"v\"\n", "line 3: '=' was expected after the value name"},
        {"; vantrel registry, version 1\n[A]\n\"n\"=\"v\" x\n", "line 3: text follows the value"},
        {"; vantrel registry, version 1\n[A]\n\"\"=\"v\"\n", "line 3: the default value is written @, not \"\""},
        {"; vantrel registry, version 1\n\n[A\\\\B]\n", "line 3: the key path \"A\\\\B\" has an empty key name"},
        {"; vantrel registry, version 1\n[A\n", "line 2: a key line must be [path]"},
        {"; vantrel registry, version 1\ngarbage\n", "line 2: a value stands before any key"},
        {"; vantrel registry, version 1\n[A]\ngarbage\n", "line 3: a quoted text was expected"},
    };
    for (const auto &bad : cases) {
        SCOPED_TRACE(bad.text);
        ScopedRegistryRoot root;
        WriteFile(root.ClassesFile(), bad.text);
        const std::string expected = "the registry file " + root.ClassesFile().string() +
                                     " is damaged and was left as it is: " + bad.reason;

        char buffer[64];
        DWORD size = sizeof buffer;
        EXPECT_EQ(RegistryGetValue(REGISTRY_CLASSES_ROOT, "A", nullptr, buffer, &size), REGISTRY_CORRUPT);
        EXPECT_EQ(RegistryLastFailure(), expected);
        EXPECT_EQ(RegistryKeyExists(REGISTRY_CLASSES_ROOT, "A"), REGISTRY_CORRUPT);
        EXPECT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "A", nullptr, "new"), REGISTRY_CORRUPT);
        EXPECT_EQ(RegistryLastFailure(), expected);
        EXPECT_EQ(RegistryDeleteTree(REGISTRY_CLASSES_ROOT, "A"), REGISTRY_CORRUPT);
        EXPECT_EQ(FileText(root.ClassesFile()), bad.text);

        // The other tree goes on working.
        EXPECT_EQ(RegistrySetValue(REGISTRY_HOST_TREE, "A", nullptr, "fine"), REGISTRY_OK);
        EXPECT_EQ(Value(REGISTRY_HOST_TREE, "A"), "fine");
    }
}

TEST(RegistryFile, AFolderThatCannotBeWrittenIsReported)
{
    testing_host::TempDir dir;
    const auto blocker = dir.Path() / "not-a-folder";
    WriteFile(blocker, "a file where the root folder should be");
    ASSERT_EQ(RegistrySetRootFolder(blocker.c_str()), REGISTRY_OK);
    EXPECT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "A", nullptr, "x"), REGISTRY_IO_FAILED);
    EXPECT_NE(std::string(RegistryLastFailure()).find(blocker.string()), std::string::npos) << RegistryLastFailure();
    EXPECT_EQ(FileText(blocker), "a file where the root folder should be");
    RegistrySetRootFolder(nullptr);
}

}  // namespace
