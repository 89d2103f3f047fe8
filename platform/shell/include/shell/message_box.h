// SPDX-License-Identifier: MIT
// Where MessageBoxA sends its text. By default a message goes to stderr as
// "caption: text" and a line end. A test installs a capturing sink; a dialog
// installs a presenter that shows a real box while its window is up.
//
// Threads: the slot is guarded by a lock, so installing and showing may
// happen on different threads, but the sink runs on the thread that called
// MessageBoxA, outside the lock (it may show a modal box or even raise another
// message). Guards restore in the reverse order of their making; they are
// meant for one caller thread, the one that shows the messages.
#pragma once

#include <functional>
#include <string_view>

namespace shell {

// Receives one message: its text and its caption.
using MessageSink = std::function<void(std::string_view text, std::string_view caption)>;

// Installs sink and returns the one it replaces. An empty sink restores the
// default, which writes to stderr. Exported for the dialogs and tests.
__attribute__((visibility("default"))) MessageSink ExchangeMessageSink(MessageSink sink);

// The type (MB_OK with an MB_ICON... flag) of the message that the sink is
// being called for on this thread: a sink that shows a box picks its icon by it.
__attribute__((visibility("default"))) unsigned ShownMessageType();

// Installs a sink for its lifetime, then puts the previous one back.
class ScopedMessageSink {
public:
    explicit ScopedMessageSink(MessageSink sink) : previous_(ExchangeMessageSink(std::move(sink))) {}
    ~ScopedMessageSink() { ExchangeMessageSink(std::move(previous_)); }
    ScopedMessageSink(const ScopedMessageSink &) = delete;
    ScopedMessageSink &operator=(const ScopedMessageSink &) = delete;

private:
    MessageSink previous_;
};

}  // namespace shell
