// CRepairRecordDlg - the user repairs a record that a text input filter could
// not read (template 4043, "Daten korrigieren...").
//
// The dialog gets the defective data: the record that did not fit, followed by
// the data after it in the file, and the position where the next correct record
// presumably begins. It shows the data split at that position, the record in
// the correction line above and what follows in the read-only field below; the
// spin control (or the arrow keys on it) moves the split one character at a
// time, each move putting the record back as the split made it. The user then
//   - takes the corrected record over ("Satz übernehmen", 1): refused (message
//     43) while the record, trailing blanks and line breaks aside, is still as
//     the split made it;
//   - skips it ("Satz ignorieren", 2);
//   - or stops reading ("Einlesen abbrechen", Escape or the close box, 0).
// Taking over and skipping both need a split away from 0 (message 42): the next
// record cannot start where the defective one does.
//
// The base library reaches the dialog through CRepairRecordDlgDoIt, which an
// application installs with CQoInterActive::SetRepairRecord:
//
//     CQoInterActive::SetRepairRecord(CRepairRecordDlgDoIt);
//
// The split reaches the whole data however long it is (the spin control runs on
// 32-bit positions).
#pragma once

#include <afxcmn.h>
#include <afxwin.h>

#include "CQoString.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CRepairRecordDlg : public CDialog
{
public:
    enum { IDD = 4043 };

    explicit CRepairRecordDlg(CWnd* pParent = NULL);
    virtual ~CRepairRecordDlg();

    // Shows the dialog for `data` split at `pos`. On 1 (take over) and 2 (skip)
    // `data` holds the correction text and `pos` the chosen split; on 0 (stop)
    // both are unchanged.
    int RepairRecord(CQoString& data, int& pos);

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    virtual void OnOK();
    afx_msg void OnIgnore();
    afx_msg void OnDeltaposSpin(NMHDR* pNMHDR, LRESULT* pResult);

    DECLARE_MESSAGE_MAP()

private:
    // Puts the split at `nPos` (kept within the data) and shows the two parts.
    void Split(int nPos);
    // The checks before the dialog closes; false keeps it open.
    bool MayClose(bool bTakeOver);

    CSpinButtonCtrl m_spin;
    CString m_strData;         // read-only edit 4121: the data after the split
    CString m_strCorrection;   // edit 4120: the record
    bool m_bIgnore;
    CString m_strWhole;        // the whole data handed in
    int m_nPos;                // characters of the whole data that form the record
    int m_nLength;
    CString m_strReference;    // the record as the split last made it
};

// The repair hook for CQoInterActive::SetRepairRecord. The file name is not
// used. Installs the one-line correction (CQoInterActive::SetCorrectRepair)
// for a taken-over record that still does not fit, then shows the dialog
// without a parent; answers 0, 1 or 2 as CRepairRecordDlg::RepairRecord.
QOMFCEXT_API int CRepairRecordDlgDoIt(CQoString const& file, CQoString& data, int& pos);
