// CInputFilterConfigDao - the page of the file-database filter (CQoInputFilterDao:
// an Access-type database, an .mdb file or an Excel workbook), template 4012.
//
// The list above names the tables and select queries of the filter's open
// database (a workbook's sheets and ranges with the workbook icon). A pick goes
// to the filter at once (InitTable, rows counted), the preview below shows the
// first 1000 rows of it, and the listeners are told.
//
// Every change of the list's selection asks the listeners first: a listener that
// answers 0 keeps the current table, the list showing it still. A table that the
// filter cannot open is reported and the filter goes back to the table it read
// before, the list with it. UpdateInputFilter(0) lists the tables anew when the
// filter opened another database and selects the filter's current table; a
// database that is not open is reported once and the list keeps what it showed.
//
//     CInputFilterConfigDao page(&dao, ID_INPUT);
//     page.AddModifiedListener(&doc);  // may refuse a change of table
//     page.Create(pHostWnd);
//     page.UpdateInputFilter(0);       // selects the filter's table
#pragma once

#include "CInputFilterConfig.h"
#include "CInputFilterListCtrl.h"
#include "QoMfcExtApi.h"

class CImageList;
class CQoInputFilterDao;

class QOMFCEXT_API CInputFilterConfigDao : public CInputFilterConfig
{
    DECLARE_DYNAMIC(CInputFilterConfigDao)

public:
    enum { IDD = 4012 };
    // Images of the table list
    enum { imageTable = 0, imageQuery = 1, imageWorkbook = 2 };

    CInputFilterConfigDao(CQoInputFilterDao* pFilter, int nNotifierId);
    ~CInputFilterConfigDao() override;

    void Enable(int bEnable) override;
    int Create(CWnd* pParent) override;
    // 0: the list in line with the filter's database and table; nonzero: nothing
    // (every pick is applied at once).
    void UpdateInputFilter(int bSave) override;

    CListCtrl m_tables;              // 4030, item data 0 for a table, 1 for a query
    CInputFilterListCtrl m_preview;  // 4022
    int m_nSelected;                 // item last handed to the filter, -1: none since the last refill

protected:
    CImageList* m_pImageList;        // owned

    void DoDataExchange(CDataExchange* pDX) override;
    BOOL OnInitDialog() override;
    void OnOK() override;
    void OnCancel() override;

    // Lists the tables and select queries of the filter's database anew.
    void FillTableList();

    afx_msg void OnItemchangedTables(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnItemchangingTables(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg LRESULT OnShowPickError(WPARAM wParam, LPARAM lParam);
    DECLARE_MESSAGE_MAP()

private:
    CQoInputFilterDao* DaoFilter() const;
    // Selects the item (-1: none) without asking the listeners and without
    // handing it to the filter; it becomes the selected index.
    void ShowSelected(int nItem);
    void RefreshPreview();
    // A pick that could not be taken: the list shows the filter's table again
    // at once, the message follows once the list has finished with the click.
    void RefusePick(const CString& strMessage);

    bool m_bFilling;          // the list is being refilled: its notifications mean nothing
    bool m_bShowing;          // the page moves the selection itself: nobody is asked
    CString m_strListed;      // the database whose tables the list shows
    CString m_strReported;    // the closed database last reported, reported once
    CString m_strPickError;   // shown by OnShowPickError
};
