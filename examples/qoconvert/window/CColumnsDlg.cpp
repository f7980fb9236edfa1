#include "CColumnsDlg.h"

#include <CMultiColumnConfig.h>
#include <COutputFilterSource.h>
#include <COutputFilterSourceConfig.h>
#include <CQoConfigFile.h>
#include <CQoString.h>

BEGIN_MESSAGE_MAP(CColumnsDlg, CDialog)
    ON_WM_DESTROY()
END_MESSAGE_MAP()

CColumnsDlg::CColumnsDlg(CColumnMapping& columns, COutputFilterSource& records, CWnd* pParent)
    : CDialog(IDD, pParent), m_columns(columns), m_records(records)
{
}

CColumnsDlg::~CColumnsDlg() = default;

BOOL CColumnsDlg::OnInitDialog()
{
    CDialog::OnInitDialog();

    // The copy goes the way of the project file, so that it holds exactly
    // what a run would convert with.
    CQoConfigFile state;
    m_columns.WriteConfig(state);
    m_work.ReadConfig(state);
    m_work.Build(m_records);

    // The page composes over the input's columns: function i + 1 reads
    // input column i, whatever functions the user defines besides.
    m_compose.reset(new CMultiColumnConfig(m_work.Functions(), m_order, false, idCompose, this));
    m_compose->ClearInnerFunctions();
    for (int i = 0; i < m_work.NumInputColumns(); ++i) {
        CFunctionManager::CFunction function(i + 1, CString());
        m_work.Functions().GetFunction(i + 1, function);
        m_compose->AddInnerColumn(i + 1, function.GetName(), i);
    }
    const std::vector<long> functions = m_work.OuterFunctions();
    for (size_t i = 0; i < functions.size(); ++i) {
        CQoString name;
        m_work.Handler().GetOuterColName(static_cast<int>(i), name);
        m_compose->AddOuterColumn(name.GetString());
        m_compose->SetOuterColumnFunction(static_cast<int>(i), functions[i]);
    }
    m_compose->SetOutputSource(&m_records);
    m_compose->Create(this);
    // The page fills its function list after choosing the first column:
    // show that column's function.
    m_compose->UpdateListSelections();
    Place(m_compose.get(), IDC_COMPOSE_PAGE, false);
    m_compose->AddModifiedListener(this);
    // From here on the columns are known by the page's ids.
    m_work.TakeComposition(m_compose->GetHandler(), false);

    m_select.reset(new COutputFilterSourceConfig(idSelection, this));
    m_select->SetSource(&m_work.View());
    m_select->Create(this);
    Place(m_select.get(), IDC_SELECT_PAGE, true);
    return TRUE;
}

void CColumnsDlg::Place(CWnd* page, UINT marker, bool fitHeight)
{
    CRect rect;
    GetDlgItem(marker)->GetWindowRect(&rect);
    ScreenToClient(&rect);
    CRect size;
    page->GetWindowRect(&size);
    int height = size.Height();
    if (fitHeight && m_compose && ::IsWindow(m_compose->m_hWnd)) {
        CRect compose;
        m_compose->GetWindowRect(&compose);
        height = compose.Height();
    }
    page->SetWindowPos(NULL, rect.left, rect.top, size.Width(), height, SWP_NOZORDER | SWP_NOACTIVATE);
    page->ShowWindow(SW_SHOW);
}

int CColumnsDlg::ModifiedListenerSetModified(int /*bModified*/, int nNotifierId)
{
    if (nNotifierId == idCompose && m_compose) {
        m_work.TakeComposition(m_compose->GetHandler(), true);
        if (m_select && ::IsWindow(m_select->m_hWnd))
            m_select->InitList();
    }
    return 1;
}

void CColumnsDlg::OnOK()
{
    // The page tells not every last step of its changes: take it as it is.
    if (m_compose)
        m_work.TakeComposition(m_compose->GetHandler(), true);
    if (m_work.View().GetNumColumns() == 0) {
        AfxMessageBox("W\xE4hlen Sie mindestens eine Spalte f\xFCr die Ausgabe aus.", MB_OK | MB_ICONEXCLAMATION);
        return;
    }
    CQoConfigFile state;
    m_work.WriteConfig(state);
    m_columns.ReadConfig(state);
    m_columns.Build(m_records);
    CDialog::OnOK();
}

void CColumnsDlg::OnDestroy()
{
    // The pages are children of this window: they go before it does.
    if (m_select && ::IsWindow(m_select->m_hWnd))
        m_select->DestroyWindow();
    if (m_compose && ::IsWindow(m_compose->m_hWnd))
        m_compose->DestroyWindow();
    CDialog::OnDestroy();
}
