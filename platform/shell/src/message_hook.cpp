// SPDX-License-Identifier: MIT
// The message-box sink for hosts written in C: a function and its context.
#include <string>

#include "shell/message_box.h"
#include "shell/shell.h"

void SetMessageBoxHook(MessageBoxHook hook, void *context)
{
    if (!hook) {
        shell::ExchangeMessageSink({});
        return;
    }
    shell::ExchangeMessageSink([hook, context](std::string_view text, std::string_view caption) {
        // A C function wants its texts ended by a zero.
        const std::string body(text), title(caption);
        hook(body.c_str(), title.c_str(), shell::ShownMessageType(), context);
    });
}
