// SPDX-License-Identifier: MIT
#include "dialogs/message_presenter.h"

#include <QApplication>
#include <QMessageBox>
#include <QString>

namespace vantrel::dialogs {
namespace {

// One box with one OK button over the window that is up.
void Present(std::string_view text, std::string_view caption)
{
    QMessageBox box(QMessageBox::NoIcon, QString::fromUtf8(caption.data(), qsizetype(caption.size())),
                    QString::fromUtf8(text.data(), qsizetype(text.size())), QMessageBox::Ok,
                    QApplication::activeModalWidget());
    box.setObjectName("vantrelMessage");
    box.exec();
}

}  // namespace

CGuiMessagePresenter::CGuiMessagePresenter() : m_sink(Present) {}

}  // namespace vantrel::dialogs
