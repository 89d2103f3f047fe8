// SPDX-License-Identifier: MIT
// MessageBoxA: the default stderr output, capture by a sink, and restore.
#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "shell/message_box.h"
#include "shell/shell.h"

namespace {

using Message = std::pair<std::string, std::string>;  // text, caption

shell::MessageSink CaptureInto(std::vector<Message> &messages)
{
    return [&messages](std::string_view text, std::string_view caption) {
        messages.emplace_back(std::string(text), std::string(caption));
    };
}

TEST(MessageBox, DefaultWritesCaptionAndTextToStderr)
{
    testing::internal::CaptureStderr();
    EXPECT_EQ(MessageBoxA(nullptr, "Please enter the correct file.", "Warning!", MB_OK), IDOK);
    EXPECT_EQ(MessageBoxA(nullptr, nullptr, nullptr, MB_OK), IDOK);
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "Warning!: Please enter the correct file.\nError: \n");
}

TEST(MessageBox, ScopedSinksCaptureAndRestoreInOrder)
{
    std::vector<Message> outer;
    std::vector<Message> inner;
    {
        shell::ScopedMessageSink outerGuard(CaptureInto(outer));
        EXPECT_EQ(MessageBoxA(nullptr, "first", "Vantrel", MB_OK), IDOK);
        {
            shell::ScopedMessageSink innerGuard(CaptureInto(inner));
            MessageBoxA(nullptr, "second", "Warning!", MB_OK);
        }
        MessageBoxA(nullptr, "third", "Vantrel", MB_OK);
    }
    EXPECT_EQ(outer, (std::vector<Message>{{"first", "Vantrel"}, {"third", "Vantrel"}}));
    EXPECT_EQ(inner, (std::vector<Message>{{"second", "Warning!"}}));

    // After the last guard the default is back.
    testing::internal::CaptureStderr();
    MessageBoxA(nullptr, "fourth", "Vantrel", MB_OK);
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "Vantrel: fourth\n");
    EXPECT_EQ(outer.size(), 2u);
}

TEST(MessageBox, ASinkMayRaiseAnotherMessageAndAThrowingSinkFallsBack)
{
    std::vector<Message> seen;
    {
        // A presenter that shows a second box from within the first.
        shell::ScopedMessageSink guard([&seen](std::string_view text, std::string_view caption) {
            seen.emplace_back(std::string(text), std::string(caption));
            if (text == "outer") MessageBoxA(nullptr, "nested", "Vantrel", MB_OK);
        });
        MessageBoxA(nullptr, "outer", "Vantrel", MB_OK);
    }
    EXPECT_EQ(seen, (std::vector<Message>{{"outer", "Vantrel"}, {"nested", "Vantrel"}}));

    shell::ScopedMessageSink failing([](std::string_view, std::string_view) {
        throw std::runtime_error("presenter gone");
    });
    testing::internal::CaptureStderr();
    EXPECT_EQ(MessageBoxA(nullptr, "still shown", "Vantrel", MB_OK), IDOK);
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "Vantrel: still shown\n");
}

}  // namespace
