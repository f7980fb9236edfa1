// CColumnsDlg - "Ausgabespalten": the user composes the output columns of
// the input's columns on the combination field page (one output column per
// input column to start with; combinations such as street and town in one
// column are defined through the page's function dialogs) and chooses and
// orders the columns written on the output source page beside it.
//
// The dialog works on a copy of the program's columns; OK takes the copy
// over, Abbrechen drops it.
//
//     CColumnsDlg dlg(job.Columns(), records, this);
//     if (dlg.DoModal() == IDOK) ... the output page shows the new columns ...
#pragma once

#include <afxwin.h>

#include <CFunctionManager.h>
#include <CModifiedListener.h>

#include <memory>

#include "../columns/CColumnMapping.h"
#include "resource.h"

class CMultiColumnConfig;
class COutputFilterSource;
class COutputFilterSourceConfig;

class CColumnsDlg : public CDialog, public CModifiedListener
{
public:
    enum { IDD = IDD_COLUMNS };
    // The notifier ids of the two pages.
    enum { idCompose = 3, idSelection = 4 };

    // `records`: the input's rows, over which the columns are built (not owned).
    CColumnsDlg(CColumnMapping& columns, COutputFilterSource& records, CWnd* pParent = NULL);
    ~CColumnsDlg() override;

    // The combination page changed the composition: the selection follows.
    int ModifiedListenerSetModified(int bModified, int nNotifierId) override;

protected:
    virtual BOOL OnInitDialog();
    virtual void OnOK();
    afx_msg void OnDestroy();
    DECLARE_MESSAGE_MAP()

private:
    // Functions in the manager's order: the input's columns, then the combinations.
    class CInOrder : public CFunctionManager::CSorter
    {
    public:
        void Sort(std::vector<CFunctionManager::CFunction>&) override {}
    };

    void Place(CWnd* page, UINT marker, bool fitHeight);

    CColumnMapping& m_columns;
    COutputFilterSource& m_records;
    CColumnMapping m_work;
    CInOrder m_order;
    std::unique_ptr<CMultiColumnConfig> m_compose;
    std::unique_ptr<COutputFilterSourceConfig> m_select;
};
