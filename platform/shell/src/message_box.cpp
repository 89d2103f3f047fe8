// SPDX-License-Identifier: MIT
// MessageBoxA and the slot of its sink.
#include "shell/message_box.h"

#include <cstdio>
#include <mutex>
#include <utility>

#include "shell/shell.h"

namespace shell {
namespace {

std::mutex g_sinkLock;
MessageSink g_sink;  // empty: the default, stderr
thread_local unsigned t_shownType = MB_OK;

// Allocates nothing, so that it can also serve when a sink failed for lack of memory.
void WriteToStderr(std::string_view text, std::string_view caption) noexcept
{
    std::fprintf(stderr, "%.*s: %.*s\n", static_cast<int>(caption.size()), caption.data(),
                 static_cast<int>(text.size()), text.data());
    std::fflush(stderr);
}

}  // namespace

MessageSink ExchangeMessageSink(MessageSink sink)
{
    std::lock_guard lock(g_sinkLock);
    std::swap(g_sink, sink);
    return sink;
}

unsigned ShownMessageType() { return t_shownType; }

}  // namespace shell

int MessageBoxA(void * /*owner*/, const char *text, const char *caption, unsigned type)
{
    // Known to the sink for the time of this call; a nested box has its own.
    const unsigned outerType = std::exchange(shell::t_shownType, type);
    const std::string_view body = text ? text : "";
    const std::string_view title = caption ? caption : "Error";
    try {
        shell::MessageSink sink;
        {
            // Copy under the lock and call outside it: a sink may itself show a box.
            std::lock_guard lock(shell::g_sinkLock);
            sink = shell::g_sink;
        }
        if (sink)
            sink(body, title);
        else
            shell::WriteToStderr(body, title);
    } catch (...) {
        // A failing sink must not take the caller down; the message still shows.
        shell::WriteToStderr(body, title);
    }
    shell::t_shownType = outerType;
    return IDOK;
}
