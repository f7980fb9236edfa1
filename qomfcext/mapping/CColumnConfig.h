// CColumnConfig - the page on which the user says what each field of the input
// file means, by giving every field one value (a "functionality") from a list
// that the application supplies.
//
// The page shows the input data in a preview whose first row names, above
// every column, the value given to that field. A value other than the default
// belongs to one field at most: while a field is being chosen for, the values
// held by other fields are shown greyed and cannot be picked. The default value
// may be given to any number of fields and is where a field falls back to.
// Every accepted change is told to the listeners (CModifiedNotifier); a
// listener that refuses undoes it. The page reads and writes no file.
//
//     class CMyColumns : public CColumnConfig {
//         void AdjustValueFlags() override {}        // may grey out more values
//     };
//     CMyColumns page(ID_COLUMNS, NULL);
//     page.AddValue(0, "(nicht verwenden)", TRUE, TRUE);  // the default
//     page.AddValue(1, "Name", TRUE, FALSE);
//     page.Create(pHostWnd);
//     page.Init(&inputFilter);                        // once the window exists
//     ...
//     int field = page.GetFilterIndex(1);             // the field holding "Name", or -1
//
// Value indexes (places in the value array: Enabled) and value ids (the
// application's numbers: Value, RemoveValue, GetFilterIndex) are different
// things.
#pragma once

#include <afxtempl.h>

#include "CColoredInputFilterListCtrl.h"
#include "CModelessDialog.h"
#include "CModifiedNotifier.h"
#include "CQoComboBox.h"
#include "QoMfcExtApi.h"

class CQoInputFilter;

class QOMFCEXT_API CColumnConfig : public CModelessDialog, public CModifiedNotifier
{
public:
    // One value that a field can be given.
    class QOMFCEXT_API CEntry
    {
    public:
        CEntry();
        CEntry(const char* lpszName, int nId, int bEnabled);
        virtual ~CEntry();

        CString m_strName;       // shown in the lists, the caption row and the menu
        int m_nId;               // the application's number for the value
        int m_bEnabled;          // whether it may be chosen for the current field now
        int m_bInitiallyEnabled; // the flag given when it was added; Init restores it
    };

    // Command ids of the popup menu: the values from kFirstValueCmd on, the
    // field name last. Only this many values can be chosen from the menu.
    enum { kFirstValueCmd = 1025, kFieldNameCmd = 1125, kMenuValues = kFieldNameCmd - kFirstValueCmd };

    CColumnConfig(int nNotifierId, CWnd* pParent);
    ~CColumnConfig() override;

    // Virtual functions you might override
    // Enables or disables the page's controls; a disabled page opens no menu.
    virtual void Enable(BOOL bEnable);
    // Removes every value with this id except the default value; fields that
    // held a removed value fall back to the default value.
    virtual void RemoveValue(int nId);
    // Called after the page has decided which values the current field may
    // take and before the value list is filled: change flags with Enabled(i, f).
    virtual void AdjustValueFlags() = 0;
    virtual void AddValue(int nId, const char* lpszName, int bEnabled, int bMakeDefault);
    // The same, with the new value's index as its id.
    virtual void AddValue(const char* lpszName, int bEnabled, int bMakeDefault);
    // The field-name item of the popup menu was chosen for this field.
    virtual void PopupNameClicked(int nField);

    // Not intended to be overridden
    BOOL Create(CWnd* pParent);
    // Takes the fields of the filter (not owned; null for none). Call after
    // Create so that the lists are filled; may be called again.
    void Init(CQoInputFilter* pFilter);
    CQoInputFilter* InputFilter() const { return m_pInputFilter; }
    int NumFields() const { return m_nNumFields; }
    int NumValues() const { return static_cast<int>(m_arrValues.GetSize()); }
    // The id of the field's value; a bad field index answers for the default value.
    int Value(int nField) const;
    // Gives the field the (last) value with this id, or the default value if
    // none has it. Nothing is redrawn and no listener is told.
    void Value(int nField, int nId);
    // The name of the field's value; the string is left alone if there is none.
    void GetName(int nField, CString& strName) const;
    CString GetFieldName(int nField) const;
    // The enabled flag of the value at this index (FALSE outside the array).
    int Enabled(int nIndex) const;
    void Enabled(int nIndex, int bEnabled);
    // The lowest field holding the value with this id, or -1.
    int GetFilterIndex(int nId) const;
    // Shows the names of the fields' values in the caption row; with
    // bSelectFirst the first field is selected as well.
    void SetupHeaders(int bSelectFirst);

protected:
    void DoDataExchange(CDataExchange* pDX) override;
    BOOL OnInitDialog() override;
    void OnOK() override;
    void OnCancel() override;

    afx_msg void OnSelchangeFieldList();
    afx_msg void OnColumnclickList(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnSelchangeValueList();
    afx_msg void OnContextMenu(CWnd* pWnd, CPoint point);
    afx_msg void OnPopupCmd(UINT nID);
    DECLARE_MESSAGE_MAP()

    CQoComboBox m_cbValues;
    CComboBox m_cbFields;
    CColoredInputFilterListCtrl m_list;
    int m_nCurrentField;
    int m_nNumFields;
    CQoInputFilter* m_pInputFilter;
    BOOL m_bEnabled;
    CArray<CEntry, CEntry&> m_arrValues;
    CArray<int, int> m_arrFieldValues;
    int m_nDefaultValue;
    // Whether the first item of the popup menu (the field's name) can be
    // chosen; the page never sets it, a subclass may.
    bool m_bFieldNameEnabled;

private:
    bool IsValueIndex(int nIndex) const { return nIndex >= 0 && nIndex < NumValues(); }
    bool IsField(int nField) const { return nField >= 0 && nField < m_arrFieldValues.GetSize(); }
    // The value index of the field, or the default index for a bad field.
    int ValueIndexOf(int nField) const;
    void ComputeValueFlags();
    // Shows the field's stored value in the value list.
    void ShowValueOf(int nField);
};
