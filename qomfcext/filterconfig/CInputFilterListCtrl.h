// CInputFilterListCtrl - a plain report list that copies an input filter's rows
// into itself: for the pages whose filters are small or read at once (dBase,
// database tables), where a copy of the first rows is the simplest preview.
//
// Update() empties the list and reads from the first row on, at most the number
// of rows set with SetMaxRows (0: all of them - the pages always set a limit,
// since every row read stays in the list's memory).
//
//     m_list.SetInputFilter(&filter);   // not owned
//     m_list.SetMaxRows(1000);
//     m_list.Update();
//
// The filter's CQoException travels to the caller of Update().
#pragma once

#include <afxcmn.h>

#include "QoMfcExtApi.h"

class CQoInputFilter;

class QOMFCEXT_API CInputFilterListCtrl : public CListCtrl
{
public:
    explicit CInputFilterListCtrl(int useHeader = 1);
    ~CInputFilterListCtrl() override;
    CInputFilterListCtrl(const CInputFilterListCtrl&) = delete;
    CInputFilterListCtrl& operator=(const CInputFilterListCtrl&) = delete;

    void SetInputFilter(CQoInputFilter* pFilter);
    // Rows copied at most; 0: no limit.
    void SetMaxRows(long maxRows);
    // Nonzero: the columns are titled with the filter's names; 0: untitled.
    void UseHeader(int useHeader);

    // Refills columns, rows and column widths from the filter.
    void Update();

protected:
    DECLARE_MESSAGE_MAP()

private:
    int m_nUseHeader;
    long m_lMaxRows;
    CQoInputFilter* m_pFilter;
};
