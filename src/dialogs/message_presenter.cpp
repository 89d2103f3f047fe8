// SPDX-License-Identifier: MIT
#include "dialogs/message_presenter.h"

#include <QApplication>
#include <QMessageBox>
#include <QString>

#include "shell/shell.h"

namespace vantrel::dialogs {
namespace {

// One box with one OK button over the window that is up.
void Present(std::string_view text, std::string_view caption)
{
    const unsigned icon = shell::ShownMessageType() & MB_ICONMASK;
    const QMessageBox::Icon shown = icon == MB_ICONEXCLAMATION   ? QMessageBox::Warning
                                    : icon == MB_ICONERROR       ? QMessageBox::Critical
                                    : icon == MB_ICONINFORMATION ? QMessageBox::Information
                                                                 : QMessageBox::NoIcon;
    QMessageBox box(shown, QString::fromUtf8(caption.data(), qsizetype(caption.size())),
                    QString::fromUtf8(text.data(), qsizetype(text.size())), QMessageBox::Ok,
                    QApplication::activeModalWidget());
    box.setObjectName("vantrelMessage");
    box.exec();
}

}  // namespace

CGuiMessagePresenter::CGuiMessagePresenter() : m_sink(Present) {}

}  // namespace vantrel::dialogs
