#include "CCombiColumnConfig.h"

#include "CPrefixDialog.h"
#include "FreeFunctionId.h"
#include "resource.h"

namespace {

// Item data of the lists carries a function id, negative ones included.
long IdOfData(DWORD_PTR data)
{
    return static_cast<long>(static_cast<LONG_PTR>(data));
}

DWORD_PTR DataOfId(long id)
{
    return static_cast<DWORD_PTR>(static_cast<LONG_PTR>(id));
}

bool SameFunctionsAndSeparators(const std::vector<CFunctionManager::CCombiPart>& a,
                                const std::vector<CFunctionManager::CCombiPart>& b)
{
    if (a.size() != b.size())
        return false;
    for (size_t i = 0; i < a.size(); ++i) {
        if (a[i].GetFunctionId() != b[i].GetFunctionId() || a[i].GetSeparator() != b[i].GetSeparator())
            return false;
    }
    return true;
}

} // namespace

BEGIN_MESSAGE_MAP(CCombiColumnConfig, CDialog)
    ON_LBN_SELCHANGE(IDC_COMBI_FUNCTIONS, OnFunctionSelChange)
    ON_LBN_DBLCLK(IDC_COMBI_FUNCTIONS, OnAdd)
    ON_BN_CLICKED(IDC_COMBI_ADD, OnAdd)
    ON_BN_CLICKED(IDC_COMBI_DELETE, OnDelete)
    ON_NOTIFY(LVN_ITEMCHANGED, IDC_COMBI_PARTS, OnPartChanged)
END_MESSAGE_MAP()

CCombiColumnConfig::CCombiColumnConfig(const CFunctionManager& manager, bool editMode, CWnd* pParent)
    : CDialog(IDD, pParent),
      m_functionManager(manager),
      m_bEditMode(editMode),
      m_bHasEditedId(false),
      m_lEditedId(0)
{
}

CCombiColumnConfig::~CCombiColumnConfig() {}

void CCombiColumnConfig::SetCombination(const std::vector<CFunctionManager::CCombiPart>& parts)
{
    m_parts = parts;
    m_bHasEditedId = false;
}

void CCombiColumnConfig::SetCombination(const std::vector<CFunctionManager::CCombiPart>& parts, long editedId)
{
    m_parts = parts;
    m_bHasEditedId = true;
    m_lEditedId = editedId;
}

void CCombiColumnConfig::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_COMBI_PARTS, m_listParts);
    DDX_Control(pDX, IDC_COMBI_FUNCTIONS, m_listFunctions);
    DDX_Text(pDX, IDC_COMBI_NAME, m_strCombinationName);
}

BOOL CCombiColumnConfig::OnInitDialog()
{
    CDialog::OnInitDialog();

    // Combinations are not parts of combinations, and no column is "no function".
    const int count = m_functionManager.GetNumFunctions();
    for (int i = 0; i < count; ++i) {
        CFunctionManager::CFunction function(0, CString());
        if (!m_functionManager.GetFunctionAt(i, function))
            continue;
        const CFunctionManager::type kind = m_functionManager.Id2Type(function.GetId());
        if (kind == CFunctionManager::noType || kind == CFunctionManager::combiType)
            continue;
        if (function.GetId() == CFunctionManager::unusedFunction)
            continue;
        const int index = m_listFunctions.AddString(function.GetName());
        if (index >= 0)
            m_listFunctions.SetItemData(index, DataOfId(function.GetId()));
    }

    m_listParts.SetExtendedStyle(m_listParts.GetExtendedStyle() | LVS_EX_FULLROWSELECT);
    m_listParts.DeleteAllItems();
    while (m_listParts.DeleteColumn(0)) {
    }
    CString title;
    title.LoadString(IDS_COL_SEPARATOR);
    m_listParts.InsertColumn(0, title, LVCFMT_LEFT, 50);
    title.LoadString(IDS_COL_FUNCTION);
    m_listParts.InsertColumn(1, title, LVCFMT_LEFT, 150);
    title.LoadString(IDS_COL_ALWAYS_SEPARATE);
    m_listParts.InsertColumn(2, title, LVCFMT_LEFT, 100);

    // A separator such as "&" is shown as it is, not as a mnemonic.
    CWnd* pName = GetDlgItem(IDC_COMBI_NAME);
    if (pName != NULL)
        pName->ModifyStyle(0, SS_NOPREFIX);

    Refresh();
    return TRUE;
}

void CCombiColumnConfig::OnFunctionSelChange()
{
    UpdateButtons();
}

void CCombiColumnConfig::OnPartChanged(NMHDR*, LRESULT* pResult)
{
    UpdateButtons();
    if (pResult != NULL)
        *pResult = 0;
}

void CCombiColumnConfig::UpdateButtons()
{
    CWnd* pAdd = GetDlgItem(IDC_COMBI_ADD);
    if (pAdd != NULL)
        pAdd->EnableWindow(m_listFunctions.GetCurSel() >= 0);
    CWnd* pDelete = GetDlgItem(IDC_COMBI_DELETE);
    if (pDelete != NULL)
        pDelete->EnableWindow(m_listParts.GetNextItem(-1, LVNI_SELECTED) >= 0);
}

void CCombiColumnConfig::OnAdd()
{
    const int selected = m_listFunctions.GetCurSel();
    if (selected < 0)
        return;
    const long id = IdOfData(m_listFunctions.GetItemData(selected));

    // The first part needs no separator; every further one asks for it.
    CString separator;
    bool alwaysSeparate = false;
    if (m_listParts.GetItemCount() > 0) {
        CPrefixDialog prefix(this);
        if (prefix.DoModal() != IDOK)
            return;
        separator = prefix.m_strSeparator;
        alwaysSeparate = prefix.m_bAlwaysSeparate != FALSE;
    }
    m_parts.push_back(CFunctionManager::CCombiPart(id, separator, alwaysSeparate));
    Refresh();
}

void CCombiColumnConfig::OnDelete()
{
    const int row = m_listParts.GetNextItem(-1, LVNI_SELECTED);
    if (row < 0 || static_cast<size_t>(row) >= m_rowParts.size())
        return;
    // The row's own part: parts without a row do not shift the places.
    m_parts.erase(m_parts.begin() + static_cast<std::ptrdiff_t>(m_rowParts[static_cast<size_t>(row)]));
    Refresh();
}

void CCombiColumnConfig::Refresh()
{
    m_strCombinationName.Empty();
    m_rowParts.clear();
    if (m_listParts.m_hWnd != NULL)
        m_listParts.DeleteAllItems();

    for (size_t i = 0; i < m_parts.size(); ++i) {
        const CFunctionManager::CCombiPart& part = m_parts[i];
        CFunctionManager::CFunction function(0, CString());
        if (!m_functionManager.GetFunction(part.GetFunctionId(), function))
            continue;   // kept in the parts, but neither listed nor named
        m_strCombinationName += part.GetSeparator() + function.GetName();
        if (m_listParts.m_hWnd == NULL)
            continue;
        const int row = m_listParts.InsertItem(m_listParts.GetItemCount(), part.GetSeparator());
        if (row < 0)
            continue;
        m_listParts.SetItemText(row, 1, function.GetName());
        m_listParts.SetItemText(row, 2, part.GetAlwaysSeparate() ? "true" : "false");
        m_listParts.SetItemData(row, DataOfId(part.GetFunctionId()));
        m_rowParts.push_back(i);
    }

    if (m_hWnd != NULL) {
        UpdateData(FALSE);
        UpdateButtons();
    }
}

bool CCombiColumnConfig::IsDefinedElsewhere() const
{
    const int count = m_functionManager.GetNumFunctions();
    for (int i = 0; i < count; ++i) {
        CFunctionManager::CFunction function(0, CString());
        if (!m_functionManager.GetFunctionAt(i, function))
            continue;
        if (m_functionManager.Id2Type(function.GetId()) != CFunctionManager::combiType)
            continue;
        // The combination being edited is not a second one of its kind.
        if (m_bEditMode && m_bHasEditedId && function.GetId() == m_lEditedId)
            continue;
        if (SameFunctionsAndSeparators(function.GetCombination(), m_parts))
            return true;
    }
    return false;
}

bool CCombiColumnConfig::TakeFreeCombiId(long& id)
{
    if (!FindFreeFunctionId(m_functionManager, m_functionManager.GetNextCombiId(false),
                            m_functionManager.GetMinCombiId(), m_functionManager.GetMaxCombiId(), id))
        return false;
    m_functionManager.SetNextCombiId(id);
    id = m_functionManager.GetNextCombiId(true);
    return true;
}

void CCombiColumnConfig::OnOK()
{
    // Read the controls first: a refusal below must leave the dialog as it was.
    if (!UpdateData(TRUE))
        return;
    if (m_parts.size() < 2) {
        AfxMessageBox(IDS_COMBINATION_TOO_SHORT, MB_OK | MB_ICONEXCLAMATION);
        return;
    }
    if (IsDefinedElsewhere()) {
        AfxMessageBox(IDS_COMBINATION_EXISTS, MB_OK | MB_ICONEXCLAMATION);
        return;
    }
    if (!m_bEditMode) {
        long id = 0;
        if (!TakeFreeCombiId(id)) {
            AfxMessageBox(IDS_NO_FREE_COMBINATION_ID, MB_OK | MB_ICONEXCLAMATION);
            return;
        }
        CFunctionManager::CFunction combination(id, m_strCombinationName);
        combination.SetCombination(m_parts);
        m_functionManager.AddFunction(combination);
    }
    EndDialog(IDOK);
}
