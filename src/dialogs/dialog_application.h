// SPDX-License-Identifier: MIT
// What a dialog needs before it can come up in a host: a Qt widget
// application (made for the dialog when the host runs none) and a display
// that answers. Without them Qt would end the process; the host gets a
// reason instead.
#pragma once

#include <memory>
#include <string>

class QApplication;

namespace vantrel::dialogs {

enum class DialogOutcome { Confirmed, Cancelled, Failed };
enum class DialogKind { Open, Save };

class CDialogApplication {
public:
    CDialogApplication();
    ~CDialogApplication();
    CDialogApplication(const CDialogApplication &) = delete;
    CDialogApplication &operator=(const CDialogApplication &) = delete;

    // True when a widget application runs now, the host's or one made here;
    // false with the reason in error.
    bool Start(DialogKind kind, std::string &error);

private:
    std::unique_ptr<QApplication> m_made;
};

// Whether a Qt application could show windows here: some platform is named,
// or an X or Wayland display is given.
bool DisplayAvailable();

// When Qt would use the X display of DISPLAY (no other platform named, no
// Wayland display given): whether a connection to it can be made. display
// gets its name. True whenever X isn't the way.
bool XDisplayAnswers(std::string &display);

}  // namespace vantrel::dialogs
