#include "COutputFilterSourceConfig.h"

#include "resource.h"

BEGIN_MESSAGE_MAP(COutputFilterSourceConfig, CModelessDialog)
    ON_WM_SIZE()
END_MESSAGE_MAP()

COutputFilterSourceConfig::COutputFilterSourceConfig(int nNotifierId, CWnd* pParent)
    : CModelessDialog(IDD, pParent),
      CModifiedNotifier(nNotifierId),
      m_listColumns(0, false),
      m_pSource(nullptr)
{
    m_listColumns.AddModifiedListener(this);
}

COutputFilterSourceConfig::~COutputFilterSourceConfig()
{
    m_listColumns.RemoveModifiedListener(this);
}

int COutputFilterSourceConfig::Create(CWnd* pParent)
{
    if (!CModelessDialog::Create(IDD, pParent))
        return 0;
    InitList();
    return 1;
}

void COutputFilterSourceConfig::SetSource(COutputFilterSource* pSource)
{
    m_pSource = pSource;
    if (::IsWindow(m_hWnd))
        InitList();
}

void COutputFilterSourceConfig::InitList()
{
    if (!::IsWindow(m_listColumns.m_hWnd))
        return;
    m_listColumns.ResetContent();
    if (m_pSource == nullptr)
        return;
    const int nEntries = m_pSource->GetEntryCount();
    for (int i = 0; i < nEntries; ++i) {
        COutputFilterSource::CEntry entry;
        if (m_pSource->GetEntry(i, entry))
            m_listColumns.AddString(entry.GetName(), entry.GetColumn(), entry.GetSelected() ? 1 : 0);
    }
}

void COutputFilterSourceConfig::Enable(bool bEnable)
{
    if (::IsWindow(m_listColumns.m_hWnd))
        m_listColumns.EnableWindow(bEnable ? TRUE : FALSE);
}

int COutputFilterSourceConfig::ModifiedListenerSetModified(int, int)
{
    if (m_pSource == nullptr || !::IsWindow(m_listColumns.m_hWnd))
        return TRUE;
    const int nEntries = m_pSource->GetEntryCount();
    const int nItems = m_listColumns.GetCount();
    if (nEntries > nItems) {
        // The source has columns that the list never showed: show them, change nothing.
        InitList();
        return TRUE;
    }
    // More items than entries: the list is the user's view, the entries follow it.
    const bool bRebuild = nEntries != nItems;
    bool bChanged = bRebuild;
    if (bRebuild)
        m_pSource->RemoveAllEntries();
    // An item may still name a column that the host has since taken away; such
    // an entry would send the output to a column that does not exist.
    const int nColumns = m_pSource->NumSourceColumns();
    for (int i = 0; i < nItems; ++i) {
        const int nColumn = static_cast<int>(m_listColumns.GetItemData(i));
        if (nColumn < 0 || nColumn >= nColumns)
            continue;
        CString name;
        m_listColumns.GetText(i, name);
        const COutputFilterSource::CEntry item(nColumn, name, m_listColumns.GetCheck(i) == 1);
        if (bRebuild) {
            m_pSource->AddEntry(item);
            continue;
        }
        COutputFilterSource::CEntry entry;
        m_pSource->GetEntry(i, entry);
        // A name that reads differently alone is no change of the output.
        if (entry.GetColumn() != item.GetColumn() || entry.GetSelected() != item.GetSelected()) {
            m_pSource->SetEntry(i, item);
            bChanged = true;
        }
    }
    return bChanged ? NotifyListeners() : TRUE;
}

void COutputFilterSourceConfig::DoDataExchange(CDataExchange* pDX)
{
    CModelessDialog::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_OUTSOURCE_COLUMNS, m_listColumns);
}

BOOL COutputFilterSourceConfig::OnInitDialog()
{
    CModelessDialog::OnInitDialog();
    // The list covers the whole page, whatever the template says.
    CRect rc;
    GetWindowRect(&rc);
    ScreenToClient(&rc);
    m_listColumns.MoveWindow(&rc);
    return TRUE;
}

void COutputFilterSourceConfig::OnOK() {}

void COutputFilterSourceConfig::OnCancel() {}

void COutputFilterSourceConfig::OnSize(UINT nType, int cx, int cy)
{
    CModelessDialog::OnSize(nType, cx, cy);
    if (::IsWindow(m_hWnd) && ::IsWindow(m_listColumns.m_hWnd)) {
        m_listColumns.MoveWindow(0, 0, cx, cy);
        m_listColumns.Invalidate();
    }
}
