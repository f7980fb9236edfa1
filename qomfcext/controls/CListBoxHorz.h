// CListBoxHorz - a list box whose horizontal scroll range grows with the
// widest text ever added, so that long entries can be scrolled into view.
// Removing entries never narrows it.
#pragma once

#include <afxwin.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CListBoxHorz : public CListBox
{
    DECLARE_DYNAMIC(CListBoxHorz)

public:
    CListBoxHorz();
    virtual ~CListBoxHorz();

    virtual int AddString(const char* lpszItem);
    virtual int InsertString(int nIndex, const char* lpszItem);

protected:
    DECLARE_MESSAGE_MAP()

private:
    int m_nWidest;
};
