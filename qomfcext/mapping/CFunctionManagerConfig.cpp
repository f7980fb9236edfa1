#include "CFunctionManagerConfig.h"

#include "CCombiColumnConfig.h"
#include "CQoInputDialog.h"
#include "FreeFunctionId.h"
#include "resource.h"

BEGIN_MESSAGE_MAP(CFunctionManagerConfig, CDialog)
    ON_LBN_SELCHANGE(IDC_FUNC_USERDEFINED, OnUserSelChange)
    ON_LBN_SELCHANGE(IDC_FUNC_COMBINATIONS, OnCombiSelChange)
    ON_BN_CLICKED(IDC_FUNC_USER_NEW, OnUserNew)
    ON_BN_CLICKED(IDC_FUNC_USER_EDIT, OnUserEdit)
    ON_BN_CLICKED(IDC_FUNC_USER_DELETE, OnUserDelete)
    ON_BN_CLICKED(IDC_FUNC_COMBI_NEW, OnCombiNew)
    ON_BN_CLICKED(IDC_FUNC_COMBI_EDIT, OnCombiEdit)
    ON_BN_CLICKED(IDC_FUNC_COMBI_DELETE, OnCombiDelete)
END_MESSAGE_MAP()

CFunctionManagerConfig::CFunctionManagerConfig(const CFunctionManager& manager, bool userdefinedEditing,
                                               CWnd* pParent)
    : CDialog(IDD, pParent), m_functionManager(manager), m_bUserdefinedEditing(userdefinedEditing)
{
}

CFunctionManagerConfig::~CFunctionManagerConfig() {}

void CFunctionManagerConfig::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_FUNC_USERDEFINED, m_listUserdefined);
    DDX_Control(pDX, IDC_FUNC_PREDEFINED, m_listPredefined);
    DDX_Control(pDX, IDC_FUNC_COMBINATIONS, m_listCombinations);
}

BOOL CFunctionManagerConfig::OnInitDialog()
{
    CDialog::OnInitDialog();
    FillLists();
    EnableControl(IDC_FUNC_USER_DELETE, m_bUserdefinedEditing);
    EnableControl(IDC_FUNC_USER_NEW, m_bUserdefinedEditing);
    return TRUE;
}

void CFunctionManagerConfig::EnableControl(int nID, bool enable)
{
    CWnd* pControl = GetDlgItem(nID);
    if (pControl != NULL)
        pControl->EnableWindow(enable ? TRUE : FALSE);
}

void CFunctionManagerConfig::FillLists()
{
    m_listUserdefined.ResetContent();
    m_listPredefined.ResetContent();
    m_listCombinations.ResetContent();

    const int count = m_functionManager.GetNumFunctions();
    for (int i = 0; i < count; ++i) {
        CFunctionManager::CFunction function(0, CString());
        if (!m_functionManager.GetFunctionAt(i, function))
            continue;
        CListBox* pList = NULL;
        switch (m_functionManager.Id2Type(function.GetId())) {
        case CFunctionManager::predefinedType:
        case CFunctionManager::fileType:
            pList = &m_listPredefined;
            break;
        case CFunctionManager::userdefinedType:
            pList = &m_listUserdefined;
            break;
        case CFunctionManager::combiType:
            pList = &m_listCombinations;
            break;
        default:
            break;   // in no range: not shown
        }
        if (pList == NULL)
            continue;
        const int index = pList->AddString(function.GetName());
        if (index >= 0)
            pList->SetItemData(index, static_cast<DWORD_PTR>(static_cast<LONG_PTR>(function.GetId())));
    }

    // No list has a selection after a refill.
    EnableControl(IDC_FUNC_USER_EDIT, false);
    EnableControl(IDC_FUNC_USER_DELETE, false);
    EnableControl(IDC_FUNC_COMBI_DELETE, false);
    EnableControl(IDC_FUNC_COMBI_EDIT, false);
}

bool CFunctionManagerConfig::SelectedId(const CListBox& list, long& id, int& index)
{
    index = list.GetCurSel();
    if (index < 0)
        return false;
    id = static_cast<long>(static_cast<LONG_PTR>(list.GetItemData(index)));
    return true;
}

void CFunctionManagerConfig::OnUserSelChange()
{
    long id = 0;
    int index = -1;
    // A function that a combination uses keeps its name and stays.
    const bool editable = SelectedId(m_listUserdefined, id, index) && !m_functionManager.ExistsCombiWithId(id);
    EnableControl(IDC_FUNC_USER_DELETE, editable);
    EnableControl(IDC_FUNC_USER_EDIT, editable);
}

void CFunctionManagerConfig::OnCombiSelChange()
{
    const bool selected = m_listCombinations.GetCurSel() >= 0;
    EnableControl(IDC_FUNC_COMBI_DELETE, selected);
    EnableControl(IDC_FUNC_COMBI_EDIT, selected);
}

bool CFunctionManagerConfig::AskForNewName(CString& name)
{
    CQoInputDialog input(this);
    input.m_strTitle.LoadString(IDS_INPUT_TITLE);
    input.m_strPrompt.LoadString(IDS_ENTER_NAME);
    input.m_strValue = name;
    if (input.DoModal() != IDOK)
        return false;

    // " Kunde" and "Kunde" would look like one name in every list.
    CString entered = input.m_strValue;
    entered.Trim(" \t");
    if (entered.IsEmpty()) {
        AfxMessageBox(IDS_NAME_EMPTY, MB_OK | MB_ICONEXCLAMATION);
        return false;
    }
    if (m_functionManager.ExistsFunction(entered)) {
        AfxMessageBox(IDS_NAME_IN_USE, MB_OK | MB_ICONEXCLAMATION);
        return false;
    }
    name = entered;
    return true;
}

void CFunctionManagerConfig::OnUserNew()
{
    CString name;
    if (!AskForNewName(name))
        return;
    long id = 0;
    if (!FindFreeFunctionId(m_functionManager, m_functionManager.GetNextUserdefinedId(false),
                            m_functionManager.GetMinUserdefinedId(), m_functionManager.GetMaxUserdefinedId(), id)) {
        AfxMessageBox(IDS_NO_FREE_USERDEFINED_ID, MB_OK | MB_ICONEXCLAMATION);
        return;
    }
    m_functionManager.SetNextUserdefinedId(id);
    // A function deleted earlier under this name gets its old id back.
    CFunctionManager::CFunction function(m_functionManager.GetNextUserdefinedId(true), name);
    m_functionManager.AddFunction(function);
    FillLists();
}

void CFunctionManagerConfig::OnUserEdit()
{
    long id = 0;
    int index = -1;
    if (!SelectedId(m_listUserdefined, id, index) || m_functionManager.ExistsCombiWithId(id))
        return;
    CFunctionManager::CFunction function(id, CString());
    if (!m_functionManager.GetFunction(id, function))
        return;
    CString name = function.GetName();
    if (!AskForNewName(name))
        return;
    function.SetName(name);
    m_functionManager.AddFunction(function);
    FillLists();
}

void CFunctionManagerConfig::OnUserDelete()
{
    long id = 0;
    int index = -1;
    if (!SelectedId(m_listUserdefined, id, index) || m_functionManager.ExistsCombiWithId(id))
        return;
    m_functionManager.DeleteFunction(id);
    m_listUserdefined.DeleteString(static_cast<UINT>(index));
}

void CFunctionManagerConfig::OnCombiNew()
{
    CCombiColumnConfig combi(m_functionManager, false, this);
    if (combi.DoModal() != IDOK)
        return;
    m_functionManager = combi.GetFunctionManager();
    FillLists();
}

void CFunctionManagerConfig::OnCombiEdit()
{
    long id = 0;
    int index = -1;
    if (!SelectedId(m_listCombinations, id, index))
        return;
    CFunctionManager::CFunction function(id, CString());
    if (!m_functionManager.GetFunction(id, function))
        return;
    CCombiColumnConfig combi(m_functionManager, true, this);
    combi.SetCombination(function.GetCombination(), id);
    if (combi.DoModal() != IDOK)
        return;
    m_functionManager = combi.GetFunctionManager();
    function.SetCombination(combi.GetCombination());
    function.SetName(combi.GetCombinationName());
    m_functionManager.AddFunction(function);
    FillLists();
}

void CFunctionManagerConfig::OnCombiDelete()
{
    long id = 0;
    int index = -1;
    if (!SelectedId(m_listCombinations, id, index))
        return;
    m_functionManager.DeleteFunction(id);
    m_listCombinations.DeleteString(static_cast<UINT>(index));
}
