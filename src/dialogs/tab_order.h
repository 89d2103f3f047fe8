// SPDX-License-Identifier: MIT
// The Tab key follows a dialog from top to bottom, not the order in which its
// widgets happened to be made: the dialogs name their controls in reading order.
#pragma once

#include <vector>

#include <QWidget>

namespace vantrel::dialogs {

inline void ChainTabOrder(const std::vector<QWidget *> &readingOrder)
{
    for (size_t i = 1; i < readingOrder.size(); ++i) QWidget::setTabOrder(readingOrder[i - 1], readingOrder[i]);
}

}  // namespace vantrel::dialogs
