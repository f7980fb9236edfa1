// CQoComboBox - a drop-down list whose items can be shown greyed out.
//
// Each item carries its enabled flag as item data (1 enabled, 0 greyed); a
// greyed item is drawn in the grey text colour but can still be selected, so
// whoever fills the list checks IsEnabled before acting on a selection. The
// control must be owner-drawn (fixed) with strings:
//
//     // template: COMBOBOX ..., CBS_DROPDOWNLIST | CBS_OWNERDRAWFIXED | CBS_HASSTRINGS
//     DDX_Control(pDX, IDC_VALUES, m_values);   // then, once the window exists:
//     m_values.Init();                          // item height from the control's font
//     m_values.AddString("Name", TRUE);
//     m_values.AddString("Vorname", FALSE);     // shown grey
//     if (m_values.IsEnabled(m_values.GetCurSel())) ...
#pragma once

#include <afxwin.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoComboBox : public CComboBox
{
public:
    CQoComboBox();
    ~CQoComboBox() override;
    CQoComboBox(const CQoComboBox&) = delete;
    CQoComboBox& operator=(const CQoComboBox&) = delete;

    // Adds the text with its flag; the index, or the combo box's error value
    // (negative) when the text could not be added.
    int AddString(const char* lpszText, int bEnabled);
    // Whether item nIndex is enabled (its item data is 1); FALSE for a bad index.
    int IsEnabled(int nIndex) const;
    // Sets the flag of item nIndex; nothing is repainted.
    void Enable(int nIndex, int bEnabled);
    // Makes the items and the selection field as high as the font needs.
    void Init();

    void DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct) override;
    // The height is set by Init; the system's first guess is kept until then.
    void MeasureItem(LPMEASUREITEMSTRUCT lpMeasureItemStruct) override;

private:
    using CComboBox::AddString;  // every item must get its flag
};
