// SPDX-License-Identifier: MIT
#include "dialogs/time_page.h"

#include <QCalendarWidget>
#include <QEvent>
#include <QGridLayout>
#include <QLabel>
#include <QVBoxLayout>

#include "datetime/format_presets.h"
#include "dialogs/dialog_texts.h"
#include "dialogs/field_exchange.h"

using namespace vantrel::dialogs;

namespace {

QLabel *Label(const char *text, QWidget *parent) { return new QLabel(QString::fromUtf8(text), parent); }

}  // namespace

CTimePageDlg::CTimePageDlg(QWidget *parent)
    : QWidget(parent), m_datePicker(new QDateEdit(this)), m_timePicker(new QTimeEdit(this))
{
    setObjectName("timePage");
    m_datePicker->setObjectName("globalDate");
    m_datePicker->setCalendarPopup(true);
    m_datePicker->setDisplayFormat("yyyy-MM-dd");
    m_timePicker->setObjectName("globalTime");
    m_timePicker->setDisplayFormat("HH:mm:ss");

    struct Spec {
        const char *radio, *columnLabel, *box, *legend, *pickerLabel, *name;
    };
    const Spec specs[3] = {
        {texts::kDateAndTimeRadio, texts::kDateTimeColumn, texts::kDateTimeFormatBox, texts::kDateTimeLegend,
         nullptr, "dateTime"},
        {texts::kSameDateRadio, texts::kTimeColumn, texts::kTimeFormatBox, texts::kTimeLegend, texts::kDateValue,
         "time"},
        {texts::kSameTimeRadio, texts::kDateColumn, texts::kDateFormatBox, texts::kDateLegend, texts::kTimeValue,
         "date"},
    };

    auto *outer = new QVBoxLayout(this);
    outer->addWidget(Label(texts::kTimeHeading, this));
    for (int i = 0; i < 3; ++i) {
        const Spec &spec = specs[i];
        Layout &layout = m_layouts[size_t(i)];
        const QString name = QString::fromUtf8(spec.name);
        layout.radio = new QRadioButton(QString::fromUtf8(spec.radio), this);
        layout.radio->setObjectName(name + "Radio");
        layout.column = new CNumberField(name + "Col", this);
        layout.box = new QCheckBox(QString::fromUtf8(spec.box), this);
        layout.box->setObjectName(name + "FormatBox");
        layout.combo = new CDTFormatCMB(this);
        layout.combo->setObjectName(name + "Format");
        layout.picker = i == 1 ? static_cast<QWidget *>(m_datePicker)
                               : i == 2 ? static_cast<QWidget *>(m_timePicker) : nullptr;

        outer->addSpacing(i == 0 ? 4 : 10);
        outer->addWidget(layout.radio);
        auto *grid = new QGridLayout;
        grid->setContentsMargins(24, 0, 0, 0);
        int row = 0;
        if (layout.picker) {
            grid->addWidget(Label(spec.pickerLabel, this), row, 0);
            grid->addWidget(layout.picker, row++, 1, Qt::AlignLeft);
        }
        grid->addWidget(Label(spec.columnLabel, this), row, 0);
        grid->addWidget(layout.column, row++, 1);
        grid->addWidget(layout.box, row, 0);
        grid->addWidget(layout.combo, row++, 1);
        grid->addWidget(Label(spec.legend, this), row, 1);
        grid->setColumnStretch(2, 1);
        outer->addLayout(grid);

        connect(layout.radio, &QRadioButton::clicked, this, [this, i] { EnableLayouts(i); });
        connect(layout.box, &QCheckBox::clicked, this, [this, i] { OnBoxClicked(i); });
        connect(layout.combo, &CDTFormatCMB::focusLeft, this, [this, i] { OnComboLeft(i); });
    }
    outer->addStretch(1);
    m_timePicker->installEventFilter(this);
    m_datePicker->calendarWidget()->window()->installEventFilter(this);
}

std::vector<QWidget *> CTimePageDlg::ReadingOrder() const
{
    std::vector<QWidget *> order;
    for (const Layout &layout : m_layouts) {
        order.push_back(layout.radio);
        if (layout.picker) order.push_back(layout.picker);
        order.insert(order.end(), {layout.column->Edit(), layout.box, layout.combo});
    }
    return order;
}

void CTimePageDlg::OnInitDialog()
{
    m_fields.m_globalTime = LocalNow();
    m_fields.m_globalDate = LocalNow();
    m_layouts[0].radio->setChecked(true);
    for (Layout &layout : m_layouts) {
        layout.column->Spin()->SetRange(1, 100);
        layout.column->Spin()->SetPosition(1);
    }
    m_fields.m_dateTimeCol = m_fields.m_timeCol = m_fields.m_dateCol = 1;
    EnableLayouts(0);
    Display();
    m_layouts[0].combo->FillPresets(vantrel::datetime::FormatPresetDateTime);
    m_layouts[2].combo->FillPresets(vantrel::datetime::FormatPresetDate);
    m_layouts[1].combo->FillPresets(vantrel::datetime::FormatPresetTime);
}

void CTimePageDlg::Exchange(bool commit)
{
    CFieldExchange exchange(commit ? vantrel::dialogs::Exchange::Commit : vantrel::dialogs::Exchange::Display);
    std::vector<QAbstractButton *> radios{m_layouts[0].radio, m_layouts[1].radio, m_layouts[2].radio};
    exchange.Radio(radios, m_fields.m_timeMode);
    exchange.WholeNumber(m_layouts[0].column->Edit(), m_fields.m_dateTimeCol, texts::kDateTimeColumn);
    exchange.Check(m_layouts[0].box, m_fields.m_useDTFormat);
    exchange.EditText(m_layouts[0].combo, m_fields.m_dateTimeFormat);
    exchange.DatePart(m_datePicker, m_fields.m_globalDate);
    exchange.WholeNumber(m_layouts[1].column->Edit(), m_fields.m_timeCol, texts::kTimeColumn);
    exchange.Check(m_layouts[1].box, m_fields.m_useTFormat);
    exchange.EditText(m_layouts[1].combo, m_fields.m_timeFormat);
    exchange.TimePart(m_timePicker, m_fields.m_globalTime);
    exchange.WholeNumber(m_layouts[2].column->Edit(), m_fields.m_dateCol, texts::kDateColumn);
    exchange.Check(m_layouts[2].box, m_fields.m_useDFormat);
    exchange.EditText(m_layouts[2].combo, m_fields.m_dateFormat);
    m_lastExchangeOk = exchange.Succeeded();
}

bool CTimePageDlg::Commit()
{
    Exchange(true);
    return m_lastExchangeOk;
}

void CTimePageDlg::Display() { Exchange(false); }

void CTimePageDlg::EnableLayouts(int mode)
{
    for (int i = 0; i < 3; ++i) {
        Layout &layout = m_layouts[size_t(i)];
        const bool on = TimeLayoutEnabled(mode, i);
        layout.column->SetAllEnabled(on);
        layout.box->setEnabled(on);
        layout.combo->setEnabled(TimeComboEnabled(mode, i, layout.box->isChecked()));
        if (layout.picker) layout.picker->setEnabled(on);
    }
}

void CTimePageDlg::OnBoxClicked(int layout)
{
    Layout &controls = m_layouts[size_t(layout)];
    controls.combo->setEnabled(controls.box->isChecked());
    Commit();
}

void CTimePageDlg::OnComboLeft(int layout)
{
    Commit();
    const std::string &field = layout == 0 ? m_fields.m_dateTimeFormat
                               : layout == 1 ? m_fields.m_timeFormat
                                             : m_fields.m_dateFormat;
    m_layouts[size_t(layout)].combo->AddIfMissing(field);
}

void CTimePageDlg::SetDateCol(int column)
{
    m_fields.m_dateCol = column;
    Display();
}

void CTimePageDlg::SetDateFormat(const std::string &format)
{
    m_fields.m_dateFormat = format;
    Display();
}

void CTimePageDlg::SetDateTimeCol(int column)
{
    m_fields.m_dateTimeCol = column;
    Display();
}

void CTimePageDlg::SetDateTimeFormat(const std::string &format)
{
    m_fields.m_dateTimeFormat = format;
    Display();
}

void CTimePageDlg::SetGlobalDate(const DateValue &date)
{
    m_fields.m_globalDate = date;
    Display();
}

void CTimePageDlg::SetGlobalTime(const DateValue &time)
{
    m_fields.m_globalTime = time;
    Display();
}

void CTimePageDlg::SetTimeCol(int column)
{
    m_fields.m_timeCol = column;
    Display();
}

void CTimePageDlg::SetTimeFormat(const std::string &format)
{
    m_fields.m_timeFormat = format;
    Display();
}

void CTimePageDlg::SetTimeMode(int mode)
{
    m_fields.m_timeMode = mode;
    Display();
    EnableLayouts(mode);
}

void CTimePageDlg::SetUseDTFormat(int use)
{
    m_fields.m_useDTFormat = use;
    Display();
    m_layouts[0].combo->setEnabled(TimeComboEnabled(m_fields.m_timeMode, 0, use == 1));
}

void CTimePageDlg::SetUseDFormat(int use)
{
    m_fields.m_useDFormat = use;
    Display();
    m_layouts[2].combo->setEnabled(TimeComboEnabled(m_fields.m_timeMode, 2, use == 1));
}

void CTimePageDlg::SetUseTFormat(int use)
{
    m_fields.m_useTFormat = use;
    Display();
    m_layouts[1].combo->setEnabled(TimeComboEnabled(m_fields.m_timeMode, 1, use == 1));
}

void CTimePageDlg::hideEvent(QHideEvent *event)
{
    QWidget::hideEvent(event);
    if (!m_parentClosing) Commit();
}

void CTimePageDlg::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    if (!m_parentClosing) Display();
}

bool CTimePageDlg::eventFilter(QObject *watched, QEvent *event)
{
    const bool timeLeft = watched == m_timePicker && event->type() == QEvent::FocusOut;
    const bool calendarClosed = watched != m_timePicker && event->type() == QEvent::Hide;
    if (timeLeft || calendarClosed) Commit();
    return QWidget::eventFilter(watched, event);
}
