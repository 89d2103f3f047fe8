// SPDX-License-Identifier: MIT
// The trees' files: plain text a person can read and edit, written whole or
// not at all, and reported, never replaced, when they can't be read.
#include <gtest/gtest.h>

#include "platform/registry/registry_fixture.h"

namespace {

using namespace testing_registry;
using testing_host::ReadFile;
using testing_host::WriteFile;

TEST(RegistryFile, IsPlainTextWrittenInItsOwnFormAndReadAsEditedByHand)
{
    ScopedRegistryRoot root;
    WriteFile(root.ClassesFile(),
              "; vantrel registry, version 1\r\n"
              "; by hand, with comments, blank lines and CRLF\r\n"
              "[CLSID\\{1}]\r\n"
              "   \r\n"
              "@=\"A \\x41\\t\"   \r\n"
              "; a comment between values\r\n"
              "\"AppID\"=\"{2}\"\r\n"
              "[clsid\\{1}]\r\n"
              "\"appid\"=\"{3}\"\r\n");
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "CLSID\\{1}"), "A A\t");
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "CLSID\\{1}", "AppID"), "{3}");
    RegistryCreateKey(REGISTRY_CLASSES_ROOT, "CLSID\\{1}\\Programmable");
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "CLSID\\{1}\\InprocServer32", nullptr, "/opt/a \"b\"\\c.so");
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "Text", "Lines", "one\ntwo\r\x7f");
    EXPECT_EQ(ReadFile(root.ClassesFile()),
              "; vantrel registry, version 1\n"
              "; classes root\n"
              "\n[CLSID]\n"
              "\n[CLSID\\{1}]\n"
              "@=\"A A\\t\"\n"
              "\"AppID\"=\"{3}\"\n"
              "\n[CLSID\\{1}\\InprocServer32]\n"
              "@=\"/opt/a \\\"b\\\"\\\\c.so\"\n"
              "\n[CLSID\\{1}\\Programmable]\n"
              "\n[Text]\n"
              "\"Lines\"=\"one\\ntwo\\r\\x7F\"\n");
    EXPECT_FALSE(std::filesystem::exists(root.HostFile()));
}

TEST(RegistryFile, ADamagedFileIsReportedAndLeftAsItIs)
{
    const std::pair<const char *, const char *> cases[] = {
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
        {"; vantrel registry, version 1\n[A]\ngarbage\n", "line 3: a quoted text was expected"},
    };
    for (const auto &[text, reason] : cases) {
        SCOPED_TRACE(text);
        ScopedRegistryRoot root;
        WriteFile(root.ClassesFile(), text);
        const std::string expected =
            "the registry file " + root.ClassesFile() + " is damaged and was left as it is: " + reason;
        char buffer[64];
        DWORD size = sizeof buffer;
        EXPECT_EQ(RegistryGetValue(REGISTRY_CLASSES_ROOT, "A", nullptr, buffer, &size), REGISTRY_CORRUPT);
        EXPECT_EQ(RegistryLastFailure(), expected);
        EXPECT_EQ(RegistryKeyExists(REGISTRY_CLASSES_ROOT, "A"), REGISTRY_CORRUPT);
        EXPECT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "A", nullptr, "new"), REGISTRY_CORRUPT);
        EXPECT_EQ(RegistryDeleteTree(REGISTRY_CLASSES_ROOT, "A"), REGISTRY_CORRUPT);
        EXPECT_EQ(ReadFile(root.ClassesFile()), text);
        EXPECT_EQ(RegistrySetValue(REGISTRY_HOST_TREE, "A", nullptr, "fine"), REGISTRY_OK) << "the other tree works on";
    }
}

}  // namespace
