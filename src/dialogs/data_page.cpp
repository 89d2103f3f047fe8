// SPDX-License-Identifier: MIT
#include "dialogs/data_page.h"

#include <QButtonGroup>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QVBoxLayout>

#include "bridge/value_type_names.h"
#include "dialogs/catalogue_lists.h"
#include "dialogs/dialog_texts.h"
#include "dialogs/field_exchange.h"
#include "dialogs/sorted_entries.h"
#include "module/string_table.h"
#include "shell/shell.h"

using namespace vantrel::dialogs;

namespace {

QRadioButton *Radio(const char *text, const char *name, QWidget *parent)
{
    auto *radio = new QRadioButton(QString::fromUtf8(text), parent);
    radio->setObjectName(name);
    return radio;
}

QComboBox *DropDownList(const char *name, QWidget *parent)
{
    auto *list = new QComboBox(parent);
    list->setObjectName(name);
    list->setEditable(false);
    list->setMinimumContentsLength(18);
    return list;
}

std::vector<std::string> Entries(const QComboBox *list)
{
    std::vector<std::string> entries;
    for (int i = 0; i < list->count(); ++i) entries.push_back(list->itemText(i).toStdString());
    return entries;
}

// Adds an entry at its sorted place, as a sorted list does.
void AddSorted(QComboBox *list, const std::string &entry)
{
    list->insertItem(int(SortedInsertPlace(Entries(list), entry)), QString::fromStdString(entry));
}

// One attribute group: "Use same ...:" with its list, "... in row:" with its row field.
QGroupBox *AttributeGroup(const char *caption, QRadioButton *same, QComboBox *list, QRadioButton *inRow,
                          CNumberField *row, QWidget *parent)
{
    auto *group = new QGroupBox(QString::fromUtf8(caption), parent);
    auto *grid = new QGridLayout(group);
    grid->addWidget(same, 0, 0);
    grid->addWidget(list, 0, 1);
    grid->addWidget(inRow, 1, 0);
    grid->addWidget(row, 1, 1);
    grid->setColumnStretch(2, 1);
    // Each group's two radios exclude each other only.
    auto *buttons = new QButtonGroup(group);
    buttons->addButton(same);
    buttons->addButton(inRow);
    return group;
}

}  // namespace

CDataPageDlg::CDataPageDlg(QWidget *parent)
    : QWidget(parent),
      m_sameItemType(Radio(texts::kSameItemType, "sameItemType", this)),
      m_itemTypeInRow(Radio(texts::kItemTypeInRow, "itemTypeInRow", this)),
      m_sameUnit(Radio(texts::kSameUnit, "sameUnit", this)),
      m_unitInRow(Radio(texts::kUnitInRow, "unitInRow", this)),
      m_sameValueType(Radio(texts::kSameValueType, "sameValueType", this)),
      m_valueTypeInRow(Radio(texts::kValueTypeInRow, "valueTypeInRow", this)),
      m_itemTypeList(DropDownList("itemTypeList", this)),
      m_unitList(DropDownList("unitList", this)),
      m_valueTypeList(DropDownList("valueTypeList", this)),
      m_itemTypeRow(new CNumberField("itemTypeRow", this)),
      m_unitRow(new CNumberField("unitRow", this)),
      m_valueTypeRow(new CNumberField("valueTypeRow", this)),
      m_itemDescriptionRow(new CNumberField("itemDescriptionRow", this)),
      m_startRow(new CNumberField("startRow", this)),
      m_deleteValueRow(new CNumberField("deleteValueRow", this)),
      m_deleteValueBox(new QCheckBox(QString::fromUtf8(texts::kDeleteValueBox), this)),
      m_useDeleteValue(Radio(texts::kUseDeleteValue, "useDeleteValue", this)),
      m_deleteValueInRow(Radio(texts::kDeleteValueInRow, "deleteValueInRow", this)),
      m_deleteValue(new QLineEdit(this))
{
    setObjectName("dataPage");
    m_deleteValueBox->setObjectName("deleteValueBox");
    m_deleteValue->setObjectName("deleteValue");
    m_deleteValue->setMaximumWidth(110);

    auto *outer = new QVBoxLayout(this);
    outer->addWidget(AttributeGroup(texts::kItemTypeGroup, m_sameItemType, m_itemTypeList, m_itemTypeInRow,
                                    m_itemTypeRow, this));
    outer->addWidget(
        AttributeGroup(texts::kUnitGroup, m_sameUnit, m_unitList, m_unitInRow, m_unitRow, this));
    outer->addWidget(AttributeGroup(texts::kValueTypeGroup, m_sameValueType, m_valueTypeList, m_valueTypeInRow,
                                    m_valueTypeRow, this));

    auto *data = new QGroupBox(QString::fromUtf8(texts::kDataGroup), this);
    auto *grid = new QGridLayout(data);
    grid->addWidget(new QLabel(QString::fromUtf8(texts::kItemDescriptionRow), data), 0, 0);
    grid->addWidget(m_itemDescriptionRow, 0, 1);
    grid->addWidget(new QLabel(QString::fromUtf8(texts::kDataStartRow), data), 1, 0);
    grid->addWidget(m_startRow, 1, 1);
    grid->addWidget(m_deleteValueBox, 2, 0, 1, 2);
    grid->addWidget(m_useDeleteValue, 3, 0);
    grid->addWidget(m_deleteValue, 3, 1);
    grid->addWidget(m_deleteValueInRow, 4, 0);
    grid->addWidget(m_deleteValueRow, 4, 1);
    grid->setColumnStretch(2, 1);
    auto *deleteButtons = new QButtonGroup(data);
    deleteButtons->addButton(m_useDeleteValue);
    deleteButtons->addButton(m_deleteValueInRow);
    outer->addWidget(data);
    outer->addStretch(1);

    for (QRadioButton *radio : {m_sameItemType, m_itemTypeInRow, m_sameUnit, m_unitInRow, m_sameValueType,
                                m_valueTypeInRow, m_useDeleteValue, m_deleteValueInRow})
        connect(radio, &QRadioButton::clicked, this, &CDataPageDlg::OnRadioClicked);
    connect(m_deleteValueBox, &QCheckBox::clicked, this, &CDataPageDlg::OnRadioClicked);
    // A user's choice only; a display's selection doesn't count as one.
    connect(m_itemTypeList, &QComboBox::activated, this, &CDataPageDlg::OnItemTypeChosen);
}

std::vector<QWidget *> CDataPageDlg::ReadingOrder() const
{
    return {m_sameItemType,        m_itemTypeList,        m_itemTypeInRow,    m_itemTypeRow->Edit(),
            m_sameUnit,            m_unitList,            m_unitInRow,        m_unitRow->Edit(),
            m_sameValueType,       m_valueTypeList,       m_valueTypeInRow,   m_valueTypeRow->Edit(),
            m_itemDescriptionRow->Edit(), m_startRow->Edit(), m_deleteValueBox, m_useDeleteValue,
            m_deleteValue,         m_deleteValueInRow,    m_deleteValueRow->Edit()};
}

bool CDataPageDlg::OnInitDialog()
{
    m_sameItemType->setChecked(true);
    m_sameUnit->setChecked(true);
    m_sameValueType->setChecked(true);
    m_useDeleteValue->setChecked(true);
    const bool filled = FillLists();
    const std::pair<CNumberField *, int> rows[] = {{m_itemTypeRow, 1}, {m_unitRow, 1}, {m_valueTypeRow, 1},
                                                   {m_itemDescriptionRow, 2}, {m_startRow, 3},
                                                   {m_deleteValueRow, 2}};
    for (const auto &[field, position] : rows) {
        field->Spin()->SetRange(1, 100);
        field->Spin()->SetPosition(position);
    }
    m_fields.m_itemTypeRow = m_fields.m_unitRow = m_fields.m_valueTypeRow = 1;
    m_fields.m_itemDescriptionRow = 2;
    m_fields.m_startRow = 3;
    m_fields.m_deleteValueRow = 2;
    ApplyEnables();
    Display();
    return filled;
}

bool CDataPageDlg::FillLists()
{
    const std::vector<std::string> itemTypes = CatalogueItemTypes();
    if (itemTypes.empty()) {
        MessageBoxA(nullptr, vantrel::LoadMessage(150).c_str(),
                    vantrel::LoadMessage(vantrel::kStringApplicationTitle).c_str(), MB_OK);
        return false;
    }
    for (const std::string &name : itemTypes) AddSorted(m_itemTypeList, name);
    std::string current = itemTypes.front();
    const int undefinedType = FindPrefixEntry(Entries(m_itemTypeList), "Undefined");
    if (undefinedType >= 0) {
        m_itemTypeList->setCurrentIndex(undefinedType);
        current = "Undefined";
    } else {
        m_itemTypeList->setCurrentIndex(FindExactEntry(Entries(m_itemTypeList), current));
    }
    for (const std::string &unit : GetUnitsOfItemType(current)) AddSorted(m_unitList, unit);
    const int undefinedUnit = FindPrefixEntry(Entries(m_unitList), "undefined");
    m_unitList->setCurrentIndex(undefinedUnit >= 0 ? undefinedUnit : (m_unitList->count() > 0 ? 0 : -1));
    for (const char *name : vantrel::ValueTypeNames) m_valueTypeList->addItem(QString::fromUtf8(name));
    m_valueTypeList->setCurrentIndex(0);
    return true;
}

void CDataPageDlg::FillUnits(const std::string &itemType)
{
    m_unitList->clear();
    for (const std::string &unit : GetUnitsOfItemType(itemType)) AddSorted(m_unitList, unit);
    m_unitList->setCurrentIndex(m_unitList->count() > 0 ? 0 : -1);
}

void CDataPageDlg::OnItemTypeChosen()
{
    Commit();
    FillUnits(m_itemTypeList->currentText().toStdString());
}

bool CDataPageDlg::SelectItemType(const std::string &name)
{
    const int found = FindExactEntry(Entries(m_itemTypeList), name);
    if (found < 0) return false;
    m_fields.m_itemType = m_itemTypeList->itemText(found).toStdString();
    // The units on offer always belong to the item type shown.
    FillUnits(m_fields.m_itemType);
    m_fields.m_unit = m_unitList->currentText().toStdString();
    Display();
    return true;
}

bool CDataPageDlg::SelectUnit(const std::string &name)
{
    const int found = FindExactEntry(Entries(m_unitList), name);
    if (found < 0) return false;
    m_fields.m_unit = m_unitList->itemText(found).toStdString();
    Display();
    return true;
}

bool CDataPageDlg::SelectValueType(const std::string &name)
{
    for (const char *valueType : vantrel::ValueTypeNames) {
        if (!EqualIgnoringCase(valueType, name)) continue;
        m_fields.m_valueType = name;
        Display();
        return true;
    }
    return false;
}

void CDataPageDlg::Exchange(bool commit)
{
    CFieldExchange exchange(commit ? vantrel::dialogs::Exchange::Commit : vantrel::dialogs::Exchange::Display);
    exchange.Check(m_deleteValueBox, m_fields.m_useDelValNotEmpty);
    exchange.ListChoice(m_unitList, m_fields.m_unit);
    exchange.ListChoice(m_itemTypeList, m_fields.m_itemType);
    exchange.ListChoice(m_valueTypeList, m_fields.m_valueType);
    exchange.Number(m_deleteValue, m_fields.m_deleteValue, texts::kUseDeleteValue);
    exchange.WholeNumber(m_deleteValueRow->Edit(), m_fields.m_deleteValueRow, texts::kDeleteValueInRow);
    exchange.WholeNumber(m_itemDescriptionRow->Edit(), m_fields.m_itemDescriptionRow, texts::kItemDescriptionRow);
    exchange.WholeNumber(m_unitRow->Edit(), m_fields.m_unitRow, texts::kUnitInRow);
    exchange.WholeNumber(m_itemTypeRow->Edit(), m_fields.m_itemTypeRow, texts::kItemTypeInRow);
    exchange.WholeNumber(m_valueTypeRow->Edit(), m_fields.m_valueTypeRow, texts::kValueTypeInRow);
    exchange.WholeNumber(m_startRow->Edit(), m_fields.m_startRow, texts::kDataStartRow);
    exchange.Radio({m_sameItemType, m_itemTypeInRow}, m_fields.m_itemTypeInRow);
    exchange.Radio({m_sameUnit, m_unitInRow}, m_fields.m_unitInRow);
    exchange.Radio({m_sameValueType, m_valueTypeInRow}, m_fields.m_valueTypeInRow);
    exchange.Radio({m_useDeleteValue, m_deleteValueInRow}, m_fields.m_deleteValueInRow);
    m_lastExchangeOk = exchange.Succeeded();
}

bool CDataPageDlg::Commit()
{
    Exchange(true);
    return m_lastExchangeOk;
}

void CDataPageDlg::Display() { Exchange(false); }

bool CDataPageDlg::CheckDataRows() const
{
    const int message = m_fields.CheckDataRows();
    if (message == 0) return true;
    MessageBoxA(nullptr, vantrel::LoadMessage(message).c_str(),
                vantrel::LoadMessage(vantrel::kStringApplicationTitle).c_str(), MB_OK | MB_ICONEXCLAMATION);
    return false;
}

void CDataPageDlg::ApplyEnables()
{
    const DataPageEnables on =
        DataEnables(m_itemTypeInRow->isChecked() ? 1 : 0, m_unitInRow->isChecked() ? 1 : 0,
                    m_valueTypeInRow->isChecked() ? 1 : 0, m_deleteValueBox->isChecked(),
                    m_deleteValueInRow->isChecked() ? 1 : 0);
    // The spins stay enabled; only the fields follow the radios.
    m_itemTypeList->setEnabled(on.itemTypeList);
    m_itemTypeRow->Edit()->setEnabled(on.itemTypeRow);
    m_unitList->setEnabled(on.unitList);
    m_unitRow->Edit()->setEnabled(on.unitRow);
    m_valueTypeList->setEnabled(on.valueTypeList);
    m_valueTypeRow->Edit()->setEnabled(on.valueTypeRow);
    m_useDeleteValue->setEnabled(on.deleteRadios);
    m_deleteValueInRow->setEnabled(on.deleteRadios);
    m_deleteValue->setEnabled(on.deleteValue);
    m_deleteValueRow->Edit()->setEnabled(on.deleteValueRow);
}

void CDataPageDlg::OnRadioClicked()
{
    Commit();
    ApplyEnables();
}

void CDataPageDlg::SetDeleteValue(double value)
{
    m_fields.m_deleteValue = value;
    Display();
}

void CDataPageDlg::SetDeleteValueRow(int row)
{
    m_fields.m_deleteValueRow = row;
    Display();
}

void CDataPageDlg::SetItemDescriptionRow(int row)
{
    m_fields.m_itemDescriptionRow = row;
    Display();
}

void CDataPageDlg::SetStartRow(int row)
{
    m_fields.m_startRow = row;
    Display();
}

void CDataPageDlg::SetUnitRow(int row)
{
    m_fields.m_unitRow = row;
    Display();
}

void CDataPageDlg::SetItemTypeRow(int row)
{
    m_fields.m_itemTypeRow = row;
    Display();
}

void CDataPageDlg::SetValueTypeRow(int row)
{
    m_fields.m_valueTypeRow = row;
    Display();
}

void CDataPageDlg::SetItemTypeInRow(int inRow)
{
    m_fields.m_itemTypeInRow = inRow;
    Display();
    ApplyEnables();
}

void CDataPageDlg::SetUnitInRow(int inRow)
{
    m_fields.m_unitInRow = inRow;
    Display();
    ApplyEnables();
}

void CDataPageDlg::SetValueTypeInRow(int inRow)
{
    m_fields.m_valueTypeInRow = inRow;
    Display();
    ApplyEnables();
}

void CDataPageDlg::SetUseDelValNotEmpty(int use)
{
    m_fields.m_useDelValNotEmpty = use;
    Display();
    ApplyEnables();
}

void CDataPageDlg::SetDeleteValueInRow(int inRow)
{
    m_fields.m_deleteValueInRow = inRow;
    Display();
    ApplyEnables();
}

void CDataPageDlg::hideEvent(QHideEvent *event)
{
    QWidget::hideEvent(event);
    if (!m_parentClosing) Commit();
}

void CDataPageDlg::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    if (!m_parentClosing) Display();
}
