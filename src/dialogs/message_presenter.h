// SPDX-License-Identifier: MIT
// While a dialog is up, the platform's message box shows a real window:
// this puts a presenter in place for its lifetime and restores the sink
// that was there before.
#pragma once

#include "shell/message_box.h"

namespace vantrel::dialogs {

class CGuiMessagePresenter {
public:
    CGuiMessagePresenter();

private:
    shell::ScopedMessageSink m_sink;
};

}  // namespace vantrel::dialogs
