// COutputFilterSourceConfig - the page on which the user chooses and orders the
// columns of an output source (template 4030).
//
// The page is one check list over its whole area: an item per entry of the
// source's entry list, ticked when the column is written; dragging an item
// changes the output order. Each change goes straight into the source (the
// page keeps no copy) and is then announced to the page's own listeners; a
// click or key that changed nothing is not announced.
//
//     COutputFilterSourceConfig page(ID_COLUMNS_PAGE, pHost);
//     page.SetSource(&mySource);                     // not owned
//     page.Create(pHost);                            // fills the list
//     page.AddModifiedListener(&myDocument);         // told of every change
//     ... the user ticks and drags; mySource.NumColumns() follows at once ...
//     page.DestroyWindow();
//
// When the source's inner columns change, the host calls InitArray() on the
// source and InitList() here.
#pragma once

#include <afxwin.h>

#include "CDragCheckListBox.h"
#include "CModelessDialog.h"
#include "CModifiedListener.h"
#include "CModifiedNotifier.h"
#include "COutputFilterSource.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API COutputFilterSourceConfig : public CModelessDialog,
                                               public CModifiedNotifier,
                                               public CModifiedListener
{
public:
    enum { IDD = 4030 };

    COutputFilterSourceConfig(int nNotifierId, CWnd* pParent);
    virtual ~COutputFilterSourceConfig();

    // Makes the page as a child of pParent and fills the list; 0 on failure.
    int Create(CWnd* pParent);

    // Refills the list when the page exists.
    void SetSource(COutputFilterSource* pSource);
    COutputFilterSource* GetSource() const { return m_pSource; }
    // The list anew from the source's entries: name, inner column, ticked.
    void InitList();
    void Enable(bool bEnable);

    // Called by the column list after each click or key: takes the list's
    // order and ticks into the source and tells the page's listeners if that
    // changed anything; their verdict is the answer.
    virtual int ModifiedListenerSetModified(int bModified, int nNotifierId);

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    // Enter and Escape leave the page as it is.
    virtual void OnOK();
    virtual void OnCancel();

    afx_msg void OnSize(UINT nType, int cx, int cy);
    DECLARE_MESSAGE_MAP()

private:
    using CModelessDialog::Create;

    CDragCheckListBox m_listColumns;
    COutputFilterSource* m_pSource;
};
