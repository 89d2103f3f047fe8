// SPDX-License-Identifier: MIT
// CDataPageDlg: the page "Data description" of the open dialog. Item type,
// unit and value type are one choice for all items or come from a row; the
// page also holds the title row, the first data row and how a missing value
// is marked. The fields live in DataPageFields.
#pragma once

#include <string>
#include <vector>

#include <QCheckBox>
#include <QComboBox>
#include <QLineEdit>
#include <QRadioButton>
#include <QWidget>

#include "dialogs/data_page_fields.h"
#include "dialogs/number_field.h"

class CDataPageDlg : public QWidget {
    Q_OBJECT
public:
    explicit CDataPageDlg(QWidget *parent = nullptr);

    // The lists, the rows, the enabled states, then a display. False when
    // the catalogue offers no item type (the user has been told).
    bool OnInitDialog();
    bool Commit();
    // The page's controls from top to bottom, for the Tab key.
    std::vector<QWidget *> ReadingOrder() const;
    void Display();

    const vantrel::dialogs::DataPageFields &Fields() const { return m_fields; }
    bool GetKeyValue(int key, std::string &value) const { return m_fields.GetKeyValue(key, value); }

    // The row check of OK, on the committed fields; shows its message.
    bool CheckDataRows() const;

    // Fills the three lists; false when the catalogue has no item type.
    bool FillLists();
    bool SelectItemType(const std::string &name);
    bool SelectUnit(const std::string &name);
    bool SelectValueType(const std::string &name);

    // Setters for a loaded template: each stores and displays; those of the
    // radios and the box also bring the enabled states into line.
    void SetDeleteValue(double value);
    void SetDeleteValueRow(int row);
    void SetItemDescriptionRow(int row);
    void SetStartRow(int row);
    void SetUnitRow(int row);
    void SetItemTypeRow(int row);
    void SetValueTypeRow(int row);
    void SetItemTypeInRow(int inRow);
    void SetUnitInRow(int inRow);
    void SetValueTypeInRow(int inRow);
    void SetUseDelValNotEmpty(int use);
    void SetDeleteValueInRow(int inRow);

    void SetParentClosing(bool closing) { m_parentClosing = closing; }

protected:
    void hideEvent(QHideEvent *event) override;
    void showEvent(QShowEvent *event) override;

private:
    void Exchange(bool commit);
    // The enabled states as the radios and the box stand now.
    void ApplyEnables();
    void OnRadioClicked();
    void OnItemTypeChosen();
    void FillUnits(const std::string &itemType);

    vantrel::dialogs::DataPageFields m_fields;
    QRadioButton *m_sameItemType, *m_itemTypeInRow;
    QRadioButton *m_sameUnit, *m_unitInRow;
    QRadioButton *m_sameValueType, *m_valueTypeInRow;
    QComboBox *m_itemTypeList, *m_unitList, *m_valueTypeList;
    CNumberField *m_itemTypeRow, *m_unitRow, *m_valueTypeRow;
    CNumberField *m_itemDescriptionRow, *m_startRow, *m_deleteValueRow;
    QCheckBox *m_deleteValueBox;
    QRadioButton *m_useDeleteValue, *m_deleteValueInRow;
    QLineEdit *m_deleteValue;
    bool m_parentClosing = false;
    bool m_lastExchangeOk = true;
};
