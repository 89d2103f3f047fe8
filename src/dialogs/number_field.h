// SPDX-License-Identifier: MIT
// A number field with spin arrows beside it. The arrows run from 1 to 100;
// typing is free, and what the field holds is judged when it is committed.
// Field and arrows are enabled apart, since some pages leave the arrows
// enabled while the field is not.
#pragma once

#include <QLineEdit>
#include <QToolButton>
#include <QWidget>

class CSpinArrows : public QWidget {
    Q_OBJECT
public:
    explicit CSpinArrows(QLineEdit *buddy, QWidget *parent = nullptr);
    void SetRange(int low, int high);
    void SetPosition(int position);
    int Position() const { return m_position; }
    // One arrow press: +1 up, -1 down.
    void Step(int step);

private:
    QLineEdit *m_buddy;
    QToolButton *m_up;
    QToolButton *m_down;
    int m_low = 1;
    int m_high = 100;
    int m_position = 1;
};

class CNumberField : public QWidget {
    Q_OBJECT
public:
    explicit CNumberField(const QString &objectName, QWidget *parent = nullptr);
    QLineEdit *Edit() const { return m_edit; }
    CSpinArrows *Spin() const { return m_spin; }
    // Enables the field and the arrows alike.
    void SetAllEnabled(bool enabled);

private:
    QLineEdit *m_edit;
    CSpinArrows *m_spin;
};
