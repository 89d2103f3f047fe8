// SPDX-License-Identifier: MIT
#include "dialogs/number_field.h"

#include <QHBoxLayout>
#include <QVBoxLayout>

#include "dialogs/field_parsing.h"

CSpinArrows::CSpinArrows(QLineEdit *buddy, QWidget *parent)
    : QWidget(parent), m_buddy(buddy), m_up(new QToolButton(this)), m_down(new QToolButton(this))
{
    auto *layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    for (QToolButton *button : {m_up, m_down}) {
        button->setAutoRepeat(true);
        button->setFocusPolicy(Qt::NoFocus);
        button->setFixedSize(16, 11);
        layout->addWidget(button);
    }
    m_up->setArrowType(Qt::UpArrow);
    m_down->setArrowType(Qt::DownArrow);
    m_up->setObjectName("up");
    m_down->setObjectName("down");
    connect(m_up, &QToolButton::clicked, this, [this] { Step(1); });
    connect(m_down, &QToolButton::clicked, this, [this] { Step(-1); });
}

void CSpinArrows::SetRange(int low, int high)
{
    m_low = low;
    m_high = high;
}

void CSpinArrows::SetPosition(int position) { m_position = position; }

void CSpinArrows::Step(int step)
{
    m_position = vantrel::dialogs::SpinStep(m_buddy->text().toStdString(), m_position, step, m_low, m_high);
    m_buddy->setText(QString::number(m_position));
}

CNumberField::CNumberField(const QString &objectName, QWidget *parent)
    : QWidget(parent), m_edit(new QLineEdit(this)), m_spin(new CSpinArrows(m_edit, this))
{
    setObjectName(objectName);
    m_edit->setObjectName(objectName + "Edit");
    m_spin->setObjectName(objectName + "Spin");
    m_edit->setMaximumWidth(70);
    auto *layout = new QHBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(1);
    layout->addWidget(m_edit);
    layout->addWidget(m_spin);
    layout->addStretch(1);
}

void CNumberField::SetAllEnabled(bool enabled)
{
    m_edit->setEnabled(enabled);
    m_spin->setEnabled(enabled);
}
