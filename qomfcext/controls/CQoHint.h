// CQoHint - a hint box (template 4034 "Hinweis") whose hint the user may
// switch off with "Diesen Hinweis nicht mehr zeigen".
//
// A hint is a string-table text shown by its id. The ids the user switched
// off are kept for the whole process in m_setDontShow; such a hint is not
// shown again, only logged as "nicht angezeigt.". The host stores the set
// between runs through Begin/End/IteratorInc and restores it with Hide:
//
//     CQoHint::ShowHint(IDS_PREVIEW_DOS_HINT, true);
//     for (auto it = CQoHint::Begin(); it != CQoHint::End(); CQoHint::IteratorInc(it))
//         config.Write(*it);
//
// Every hint leaves a log line "CQoHint (<text>), angezeigt." or
// "..., nicht angezeigt."; the line breaks of the text become ";" there.
#pragma once

#include <afxwin.h>

#include <set>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoHint : public CDialog
{
public:
    enum { IDD = 4034 };
    typedef std::set<unsigned int>::const_iterator Iterator;

    // May suppress, no parent.
    CQoHint();
    virtual ~CQoHint();

    // The hint of string `id`, unless the user switched it off; the check box
    // is enabled only when `maySuppress` is set.
    static void ShowHint(unsigned int id, bool maySuppress);
    // A hint with a text of its own; it cannot be switched off.
    static void ShowHint(const char* text);

    void DoShow(unsigned int id);
    void DoShow(const char* text);

    // Switches the hint `id` off; Reset switches every hint on again.
    static void Hide(unsigned int id);
    static void Reset();

    static Iterator Begin();
    static Iterator End();
    static void IteratorInc(Iterator& it);

    BOOL m_bDontShow;      // check box 4114
    CString m_strText;     // edit 4115
    bool m_bMaySuppress;

    static std::set<unsigned int> m_setDontShow;

protected:
    CQoHint(bool maySuppress, CWnd* pParent);

    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();

    DECLARE_MESSAGE_MAP()

private:
    void SetText(const CString& text);
    void Log(UINT resultId) const;
};
