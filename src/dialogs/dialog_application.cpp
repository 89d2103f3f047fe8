// SPDX-License-Identifier: MIT
#include "dialogs/dialog_application.h"

#include <clocale>
#include <cstdlib>
#include <string_view>

#include <QApplication>

#ifdef VANTREL_HAVE_XCB
#include <xcb/xcb.h>
#endif

#include "module/string_table.h"

namespace vantrel::dialogs {
namespace {

constexpr int kMessageOpenNoDisplay = 148;
constexpr int kMessageOpenNoWidgets = 149;
constexpr int kMessageSaveNoDisplay = 152;
constexpr int kMessageSaveNoWidgets = 153;
constexpr int kMessageDisplayDoesNotAnswer = 154;

std::string Variable(const char *name)
{
    const char *value = std::getenv(name);
    return value ? value : "";
}

// The arguments of an application made for a host; Qt keeps referring to them.
int g_argc = 1;
char g_name[] = "vantrel";
char *g_argv[] = {g_name, nullptr};

}  // namespace

CDialogApplication::CDialogApplication() = default;
CDialogApplication::~CDialogApplication() = default;

bool DisplayAvailable()
{
    return !Variable("QT_QPA_PLATFORM").empty() || !Variable("DISPLAY").empty() ||
           !Variable("WAYLAND_DISPLAY").empty();
}

bool XDisplayAnswers(std::string &display)
{
    display = Variable("DISPLAY");
    const std::string platform = Variable("QT_QPA_PLATFORM");
    const bool xcbPlatform = std::string_view(platform).substr(0, 3) == "xcb";
    const bool xcbByDefault = platform.empty() && Variable("WAYLAND_DISPLAY").empty();
    if (display.empty() || !(xcbPlatform || xcbByDefault)) return true;
#ifdef VANTREL_HAVE_XCB
    // The connection Qt's X platform would make first, authentication included.
    xcb_connection_t *connection = xcb_connect(display.c_str(), nullptr);
    const bool answers = connection && xcb_connection_has_error(connection) == 0;
    if (connection) xcb_disconnect(connection);
    return answers;
#else
    return true;
#endif
}

bool CDialogApplication::Start(DialogKind kind, std::string &error)
{
    const bool open = kind == DialogKind::Open;
    if (QCoreApplication::instance()) {
        if (qobject_cast<QApplication *>(QCoreApplication::instance())) return true;
        error = LoadMessage(open ? kMessageOpenNoWidgets : kMessageSaveNoWidgets);
        return false;
    }
    if (!DisplayAvailable()) {
        error = LoadMessage(open ? kMessageOpenNoDisplay : kMessageSaveNoDisplay);
        return false;
    }
    std::string display;
    if (!XDisplayAnswers(display)) {
        error = FormatMessage(kMessageDisplayDoesNotAnswer, open ? "open" : "save", display.c_str());
        return false;
    }
    // Qt switches every category of the C library's locale to the user's;
    // the host's number notation (a decimal point, unless the host chose
    // otherwise) comes back at once, as printf and strtod in the host and its
    // other libraries rely on it.
    const char *numeric = std::setlocale(LC_NUMERIC, nullptr);
    const std::string hostNumeric = numeric ? numeric : "C";
    m_made = std::make_unique<QApplication>(g_argc, g_argv);
    std::setlocale(LC_NUMERIC, hostNumeric.c_str());
    return true;
}

}  // namespace vantrel::dialogs
