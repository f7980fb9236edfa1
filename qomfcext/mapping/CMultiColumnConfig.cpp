#include "CMultiColumnConfig.h"

#include <CQoInputFilter.h>
#include <CQoOutputSource.h>
#include <CQoOutputSourceInputFilter.h>
#include <CQoString.h>
#include <QoLimits.h>

#include <algorithm>
#include <exception>
#include <utility>

#include "CFuncToNamesDlg.h"
#include "CFunctionManagerConfig.h"
#include "CQoInputDialog.h"
#include "resource.h"

namespace {
// The caption row: dark green, selected or not.
const DWORD kCaptionText = 0x007F00;
const long kDefaultDontShowLimit = 999999;

const UINT kAlwaysEnabled[] = {IDC_MULTI_LBL_NAME,    IDC_MULTI_NAMES,     IDC_MULTI_LBL_FUNCTIONS,
                               IDC_MULTI_EDIT_FUNCTIONS, IDC_MULTI_FUNCTIONS, IDC_MULTI_PREVIEW,
                               IDC_MULTI_SELECT_ALL};
const UINT kWriteModeButtons[] = {IDC_MULTI_NEW, IDC_MULTI_DELETE, IDC_MULTI_FUNC_TO_NAMES};
const UINT kWriteModeOnly[] = {IDC_MULTI_SELECT_ALL, IDC_MULTI_NEW, IDC_MULTI_DELETE};

CString LoadText(UINT nId)
{
    CString text;
    text.LoadString(nId);
    return text;
}

bool SameName(const CString& a, const CString& b)
{
    return a.CollateNoCase(b) == 0;
}
}  // namespace

BEGIN_MESSAGE_MAP(CMultiColumnConfig, CModelessDialog)
    ON_BN_CLICKED(IDC_MULTI_EDIT_NAME, OnChangeName)
    ON_NOTIFY(LVN_COLUMNCLICK, IDC_MULTI_PREVIEW, OnColumnclickList)
    ON_CBN_SELCHANGE(IDC_MULTI_NAMES, OnSelchangeComboNames)
    ON_BN_CLICKED(IDC_MULTI_EDIT_FUNCTIONS, OnChangeFunctions)
    ON_CBN_SELCHANGE(IDC_MULTI_FUNCTIONS, OnSelchangeComboFunctions)
    ON_WM_CONTEXTMENU()
    ON_BN_CLICKED(IDC_MULTI_DELETE, OnDeleteName)
    ON_BN_CLICKED(IDC_MULTI_NEW, OnNewName)
    ON_BN_CLICKED(IDC_MULTI_SELECT_ALL, OnSelectAll)
    ON_BN_CLICKED(IDC_MULTI_FUNC_TO_NAMES, OnFuncToNames)
    ON_COMMAND_RANGE(CMultiColumnConfig::kFirstFunctionCmd, CMultiColumnConfig::kColumnNameCmd, OnPopupCmd)
    ON_COMMAND_RANGE(CMultiColumnConfig::kFirstPrivateCmd, CMultiColumnConfig::kLastPrivateCmd, OnPrivateCmd)
END_MESSAGE_MAP()

CMultiColumnConfig::CMultiColumnConfig(CFunctionManager& manager, CFunctionManager::CSorter& sorter, bool bReadMode,
                                       int nNotifierId, CWnd* pParent)
    : CModelessDialog(IDD_MULTICOLUMN_CONFIG, pParent),
      CModifiedNotifier(nNotifierId),
      m_functionManager(manager),
      m_pInputFilter(NULL),
      m_pInnerInputFilter(NULL),
      m_bFieldNamesEditable(!bReadMode),
      m_bReadMode(bReadMode),
      m_handler(bReadMode ? CMultiColumnHandler::splitInput : CMultiColumnHandler::composeOutput),
      m_bEnabled(true),
      m_pOutputSource(NULL),
      m_pMultiColumnOutputSource(NULL),
      m_lDontShowLimit(kDefaultDontShowLimit),
      m_sorter(sorter)
{
    m_handler.SetAlwaysUseOuterNames(bReadMode);
    m_list.AddListener(this);
    m_list.SetDontShowSelected(true);
    if (!bReadMode) GetInnerColumnsFromManager();
}

CMultiColumnConfig::~CMultiColumnConfig()
{
    m_list.RemoveListener(this);
    m_list.SetInputFilter(NULL);
    if (m_pInnerInputFilter != NULL) m_pInnerInputFilter->Delete();
    if (m_pMultiColumnOutputSource != NULL) m_pMultiColumnOutputSource->Delete();
    for (CQoOutputSource* pSource : m_replacedSources) pSource->Delete();
}

BOOL CMultiColumnConfig::Create(CWnd* pParent)
{
    return CDialog::Create(IDD_MULTICOLUMN_CONFIG, pParent);
}

void CMultiColumnConfig::DoDataExchange(CDataExchange* pDX)
{
    CModelessDialog::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_MULTI_FUNCTIONS, m_cbFunctions);
    DDX_Control(pDX, IDC_MULTI_NAMES, m_cbNames);
    DDX_Control(pDX, IDC_MULTI_PREVIEW, m_list);
}

BOOL CMultiColumnConfig::OnInitDialog()
{
    CModelessDialog::OnInitDialog();
    m_list.Init();
    InitFunctionList();
    for (UINT nId : kWriteModeOnly) {
        CWnd* pButton = GetDlgItem(nId);
        if (pButton != NULL) pButton->ShowWindow(m_bReadMode ? SW_HIDE : SW_SHOW);
    }
    if (m_bReadMode) {
        // A file given before the window existed: its names are shown now.
        if (m_pInputFilter != NULL) {
            m_cbNames.ResetContent();
            for (int i = 0; i < GetNumOuterColumns(); ++i) {
                CQoString name;
                m_pInputFilter->ColName(i, name);
                m_cbNames.AddString(name.GetString());
            }
            m_cbNames.SetCurSel(0);
            OnSelchangeComboNames();
        }
    } else {
        if (m_pOutputSource != NULL) SetOutputSource(m_pOutputSource);
        m_list.SetExtendedStyle(m_list.GetExtendedStyle() | LVS_EX_HEADERDRAGDROP);
    }
    RefreshList();
    Enable(m_bEnabled);
    return TRUE;
}

void CMultiColumnConfig::Enable(bool bEnable)
{
    m_bEnabled = bEnable;
    if (!::IsWindow(m_hWnd)) return;
    for (UINT nId : kAlwaysEnabled) {
        CWnd* pControl = GetDlgItem(nId);
        if (pControl != NULL) pControl->EnableWindow(bEnable);
    }
    CWnd* pRename = GetDlgItem(IDC_MULTI_EDIT_NAME);
    if (pRename != NULL) pRename->EnableWindow(bEnable && m_bFieldNamesEditable);
    for (UINT nId : kWriteModeButtons) {
        CWnd* pControl = GetDlgItem(nId);
        if (pControl != NULL) pControl->EnableWindow(bEnable && !m_bReadMode);
    }
}

// --- the sources ----------------------------------------------------------------

void CMultiColumnConfig::SetInputFilter(CQoInputFilter* pFilter)
{
    m_pInputFilter = pFilter;
    if (!m_bReadMode) return;  // an output's columns are the user's, not a file's

    // The column count comes from the file.
    int nColumns = pFilter != NULL ? pFilter->NumCols() : 0;
    nColumns = std::max(0, std::min(nColumns, qolimits::maxColumns));
    m_outerColumns.clear();
    for (int i = 0; i < nColumns; ++i) {
        const long lFunction = static_cast<size_t>(i) < m_outerColumnFunctions.size()
                                   ? m_outerColumnFunctions[static_cast<size_t>(i)]
                                   : CFunctionManager::unusedFunction;
        m_outerColumns.push_back(COuterColumn(i, CString(), lFunction));
    }
    // Without a filter the handler lets go of the old one too, so that nothing
    // reads a file the application may have closed.
    m_handler.SetReadFilter(pFilter);
    m_bFieldNamesEditable = pFilter != NULL && !pFilter->GetFirstRowHasNames();
    DisplayReadList();

    if (!::IsWindow(m_hWnd)) return;
    m_cbNames.ResetContent();
    for (int i = 0; i < nColumns; ++i) {
        CQoString name;
        pFilter->ColName(i, name);
        m_cbNames.AddString(name.GetString());
    }
    CWnd* pRename = GetDlgItem(IDC_MULTI_EDIT_NAME);
    if (pRename != NULL) pRename->EnableWindow(m_bEnabled && m_bFieldNamesEditable);
    m_cbNames.SetCurSel(0);
    OnSelchangeComboNames();
}

void CMultiColumnConfig::SetOutputSource(CQoOutputSource* pSource)
{
    if (m_bReadMode) return;  // the preview shows the split file
    m_pOutputSource = pSource;
    m_handler.SetWriteOutputSource(pSource);
    if (m_pMultiColumnOutputSource != NULL) m_replacedSources.push_back(m_pMultiColumnOutputSource);
    m_pMultiColumnOutputSource = m_handler.CreateMultiColumnOutputSource();

    m_list.SetInputFilter(NULL);
    if (m_pInnerInputFilter != NULL) m_pInnerInputFilter->Delete();
    m_pInnerInputFilter = new CQoOutputSourceInputFilter(m_pMultiColumnOutputSource);
    RebuildNameList();
    InitFunctionList();
    DisplayWriteList();
}

// --- outer columns ------------------------------------------------------------------

void CMultiColumnConfig::GetOuterColumnName(int nIndex, CQoString& name) const
{
    m_handler.GetOuterColName(nIndex, name);
}

long CMultiColumnConfig::GetOuterFunction(int nIndex) const
{
    return IsOuter(nIndex) ? m_outerColumns[static_cast<size_t>(nIndex)].m_lFunction : -1;
}

long CMultiColumnConfig::GetInnerFunction(int nIndex) const
{
    return m_handler.GetInnerFunction(nIndex);
}

void CMultiColumnConfig::SetOuterColumnFunction(int nIndex, long lFunction)
{
    if (!IsOuter(nIndex)) return;
    m_outerColumns[static_cast<size_t>(nIndex)].m_lFunction = lFunction;
    if (static_cast<size_t>(nIndex) < m_outerColumnFunctions.size())
        m_outerColumnFunctions[static_cast<size_t>(nIndex)] = lFunction;
}

void CMultiColumnConfig::SetOuterColumnFunctions(const std::vector<long>& functions)
{
    m_outerColumnFunctions = functions;
}

void CMultiColumnConfig::SetOuterColumnName(int nIndex, const CQoString& name)
{
    if (IsOuter(nIndex) && m_pInputFilter != NULL) m_pInputFilter->SetColName(nIndex, name);
}

void CMultiColumnConfig::SetDontShowLimit(long lLimit)
{
    m_lDontShowLimit = lLimit;
}

void CMultiColumnConfig::AddOuterColumn(const CString& strName)
{
    if (m_bReadMode) return;
    const int nId = m_handler.GetNextFreeOuterColumnId();
    m_handler.AddOuterColumn(nId, strName);
    m_outerColumns.push_back(COuterColumn(nId, strName, CFunctionManager::unusedFunction));
    NotifyListeners();
}

void CMultiColumnConfig::RemoveOuterColumn(int nIndex)
{
    // The columns of a file cannot be removed: the functions would slide onto
    // the wrong columns.
    if (m_bReadMode) return;
    m_handler.DeleteColumn(false, nIndex);
    if (IsOuter(nIndex)) m_outerColumns.erase(m_outerColumns.begin() + nIndex);
    NotifyListeners();
}

void CMultiColumnConfig::AddInnerColumn(long lFunction, const CString& strName, int nSourceColumn)
{
    m_handler.AddInnerColumn(static_cast<int>(lFunction), lFunction, strName, nSourceColumn);
}

void CMultiColumnConfig::ClearInnerFunctions()
{
    if (m_bReadMode) return;
    m_handler.DeleteColumns(true);
    NotifyListeners();
}

void CMultiColumnConfig::DoSelectAll(bool bQuiet)
{
    if (m_bReadMode) return;
    if (!bQuiet && AfxMessageBox(IDS_SELECT_ALL_WARNING, MB_YESNO | MB_ICONQUESTION) != IDYES) return;
    while (!m_outerColumns.empty()) RemoveOuterColumn(0);
    const CString strFormat = LoadText(IDS_FIELD_N);
    const int nFunctions = std::min(m_functionManager.GetNumFunctions(), qolimits::maxColumns);
    for (int i = 0; i < nFunctions; ++i) {
        CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
        if (!m_functionManager.GetFunctionAt(i, function)) continue;
        CString strName;
        strName.Format(strFormat, i + 1);
        AddOuterColumn(strName);
        SetOuterColumnFunction(GetNumOuterColumns() - 1, function.GetId());
    }
    RebuildNameList();
    DisplayWriteList();
}

// --- filling and showing ----------------------------------------------------------------

long CMultiColumnConfig::ShownFunction(long lFunction) const
{
    return lFunction >= m_lDontShowLimit ? CFunctionManager::unusedFunction : lFunction;
}

std::vector<CFunctionManager::CFunction> CMultiColumnConfig::SortedFunctions()
{
    std::vector<CFunctionManager::CFunction> functions;
    for (int i = 0; i < m_functionManager.GetNumFunctions(); ++i) {
        CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
        if (m_functionManager.GetFunctionAt(i, function) && function.GetId() < m_lDontShowLimit)
            functions.push_back(function);
    }
    m_sorter.Sort(functions);
    return functions;
}

void CMultiColumnConfig::InitFunctionList()
{
    if (!::IsWindow(m_cbFunctions.m_hWnd)) return;
    m_cbFunctions.ResetContent();
    for (const CFunctionManager::CFunction& function : SortedFunctions()) {
        const int nItem = m_cbFunctions.AddString(function.GetName());
        if (nItem >= 0) m_cbFunctions.SetItemData(nItem, static_cast<DWORD_PTR>(function.GetId()));
    }
}

void CMultiColumnConfig::DisplayReadList()
{
    // An output's mapping is built by DisplayWriteList; clearing it here would lose it.
    if (!m_bReadMode) return;
    m_handler.ClearAssignments();
    m_handler.DeleteColumns(true);
    int nInner = -1;
    for (size_t i = 0; i < m_outerColumns.size(); ++i) {
        const int nOuter = m_outerColumns[i].m_nId;
        CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
        if (!m_functionManager.GetFunction(m_outerColumns[i].m_lFunction, function)) continue;
        const std::vector<CFunctionManager::CCombiPart> parts = function.GetCombination();
        if (parts.empty()) {
            ++nInner;
            m_handler.AddInnerColumn(nInner, function.GetId(), function.GetName(), -1);
            m_handler.AddAssignment(nOuter, nInner, "", false);
            continue;
        }
        for (const CFunctionManager::CCombiPart& part : parts) {
            CFunctionManager::CFunction partFunction(CFunctionManager::unusedFunction, CString());
            if (!m_functionManager.GetFunction(part.GetFunctionId(), partFunction)) continue;
            ++nInner;
            m_handler.AddInnerColumn(nInner, partFunction.GetId(), partFunction.GetName(), -1);
            m_handler.AddAssignment(nOuter, nInner, part.GetSeparator(), part.GetAlwaysSeparate());
        }
    }
    m_list.SetInputFilter(NULL);
    if (m_pInnerInputFilter != NULL) m_pInnerInputFilter->Delete();
    m_pInnerInputFilter = m_handler.CreateMultiColumnInputFilter();
    RefreshList();
}

void CMultiColumnConfig::GetInnerColumnsFromManager()
{
    if (m_bReadMode) return;
    m_handler.DeleteColumns(true);
    for (int i = 0; i < m_functionManager.GetNumFunctions(); ++i) {
        CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
        if (!m_functionManager.GetFunctionAt(i, function)) continue;
        const CFunctionManager::type kind = m_functionManager.Id2Type(function.GetId());
        if (kind == CFunctionManager::combiType || kind == CFunctionManager::noType) continue;
        AddInnerColumn(function.GetId(), function.GetName(), -1);
    }
}

void CMultiColumnConfig::DisplayWriteList()
{
    // In read mode the outer columns are the file's and their parts come from DisplayReadList.
    if (m_bReadMode) return;
    m_handler.ClearAssignments();
    m_handler.DeleteColumns(false);
    for (const COuterColumn& column : m_outerColumns) {
        m_handler.AddOuterColumn(column.m_nId, column.m_strName);
        CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
        if (!m_functionManager.GetFunction(column.m_lFunction, function)) continue;
        const std::vector<CFunctionManager::CCombiPart> parts = function.GetCombination();
        if (parts.empty()) {
            m_handler.AddAssignment(column.m_nId, static_cast<int>(function.GetId()), "", false);
            continue;
        }
        for (const CFunctionManager::CCombiPart& part : parts) {
            CFunctionManager::CFunction partFunction(CFunctionManager::unusedFunction, CString());
            if (!m_functionManager.GetFunction(part.GetFunctionId(), partFunction)) continue;
            m_handler.AddAssignment(column.m_nId, static_cast<int>(part.GetFunctionId()), part.GetSeparator(),
                                    part.GetAlwaysSeparate());
        }
    }
    RefreshList();
}

void CMultiColumnConfig::RefreshList()
{
    m_list.SetInputFilter(m_pInnerInputFilter);
    m_list.SetSpecialFirstRow(true, kCaptionText, kCaptionText);
    if (!::IsWindow(m_list.m_hWnd) || m_pInnerInputFilter == NULL) return;
    try {
        m_list.Update();
    } catch (const std::exception&) {
        // A file that cannot be read any more shows what could be read of it.
    }
    const int nColumns = std::max(0, std::min(m_pInnerInputFilter->NumCols(), qolimits::maxColumns));
    for (int i = 0; i < nColumns; ++i) {
        CQoString text;
        if (!m_bReadMode) {
            m_handler.GetInnerNamesOfOuterColumn(i, text);
        } else if (m_handler.GetInnerFunction(i) < m_lDontShowLimit) {
            m_handler.GetInnerColName(i, text, true);
        } else {
            CFunctionManager::CFunction none(CFunctionManager::unusedFunction, CString());
            if (m_functionManager.GetFunction(CFunctionManager::unusedFunction, none)) text = none.GetName().GetString();
        }
        m_list.SetSpecialText(i, text.GetString());
    }
    m_list.Update(0);
}

void CMultiColumnConfig::RebuildNameList()
{
    if (!::IsWindow(m_cbNames.m_hWnd)) return;
    m_cbNames.ResetContent();
    for (int i = 0; i < m_handler.NumOuterColumns(); ++i) {
        CQoString name;
        m_handler.GetOuterColName(i, name);
        m_cbNames.AddString(name.GetString());
    }
    m_cbNames.SetCurSel(0);
    OnSelchangeComboNames();
}

bool CMultiColumnConfig::SelectFunctionItem(long lFunction)
{
    for (int i = 0; i < m_cbFunctions.GetCount(); ++i) {
        if (static_cast<long>(m_cbFunctions.GetItemData(i)) == lFunction) {
            m_cbFunctions.SetCurSel(i);
            return true;
        }
    }
    return false;
}

// --- the user's choices ---------------------------------------------------------------------

void CMultiColumnConfig::OnSelchangeComboNames()
{
    if (!::IsWindow(m_cbFunctions.m_hWnd)) return;
    const int nName = m_cbNames.GetCurSel();
    if (!IsOuter(nName)) return;
    // A column whose function the list does not offer shows none, not the
    // function of the column chosen before.
    if (!SelectFunctionItem(ShownFunction(m_outerColumns[static_cast<size_t>(nName)].m_lFunction)))
        m_cbFunctions.SetCurSel(-1);
}

void CMultiColumnConfig::OnSelchangeComboFunctions()
{
    const int nFunction = m_cbFunctions.GetCurSel();
    const int nName = m_cbNames.GetCurSel();
    if (nFunction < 0 || !IsOuter(nName)) return;
    m_outerColumnFunctions.clear();
    m_outerColumns[static_cast<size_t>(nName)].m_lFunction = static_cast<long>(m_cbFunctions.GetItemData(nFunction));
    if (m_bReadMode)
        DisplayReadList();
    else
        DisplayWriteList();
    NotifyListeners();
}

void CMultiColumnConfig::OnColumnclickList(NMHDR* pNMHDR, LRESULT* pResult)
{
    const NMLISTVIEW* pNMLV = reinterpret_cast<const NMLISTVIEW*>(pNMHDR);
    *pResult = 0;
    int nColumn = pNMLV->iSubItem;
    if (nColumn == -1) return;
    if (m_bReadMode) {
        CQoString name;
        nColumn = m_handler.GetOuterNameOfInnerColumn(nColumn, name);
        if (nColumn == -1) return;
    }
    m_cbNames.SetCurSel(nColumn);
    OnSelchangeComboNames();
}

bool CMultiColumnConfig::OuterNameTaken(int nIndex, const CString& strName) const
{
    for (int i = 0; i < m_handler.NumOuterColumns(); ++i) {
        if (i == nIndex) continue;
        CQoString name;
        m_handler.GetOuterColName(i, name);
        if (SameName(name.GetString(), strName)) return true;
    }
    return false;
}

void CMultiColumnConfig::ChangeNameTo(int nIndex, const CString& strName)
{
    m_handler.ChangeColumnName(true, nIndex, CQoString(strName));
    if (IsOuter(nIndex)) m_outerColumns[static_cast<size_t>(nIndex)].m_strName = strName;
    NotifyListeners();
}

void CMultiColumnConfig::OnChangeName()
{
    RenameSelected();
}

void CMultiColumnConfig::RenameSelected()
{
    UpdateData(TRUE);
    const int nName = m_cbNames.GetCurSel();
    if (!IsOuter(nName)) return;
    // The column's own function: the function list may show none for it.
    const long lFunction = ShownFunction(m_outerColumns[static_cast<size_t>(nName)].m_lFunction);

    CQoString current;
    m_handler.GetOuterColName(nName, current);
    CQoInputDialog dlg(this);
    dlg.m_strTitle = LoadText(IDS_EDIT_FIELD_NAME);
    dlg.m_strPrompt = LoadText(IDS_FIELD_NAME);
    dlg.m_strValue = current.GetString();
    if (dlg.DoModal() != IDOK) return;
    const CString strName = dlg.m_strValue;
    if (strName.IsEmpty()) {
        AfxMessageBox(IDS_NAME_EMPTY, MB_OK | MB_ICONEXCLAMATION);
        return;
    }

    // The function takes the column's name too, except the "no function" entry,
    // which many columns share.
    CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
    const bool bRenameFunction =
        lFunction != CFunctionManager::unusedFunction && m_functionManager.GetFunction(lFunction, function);
    // Names are unique without regard to case, among the columns and among the
    // functions: a clash changes nothing at all.
    bool bTaken = OuterNameTaken(nName, strName);
    for (int i = 0; bRenameFunction && !bTaken && i < m_functionManager.GetNumFunctions(); ++i) {
        CFunctionManager::CFunction other(CFunctionManager::unusedFunction, CString());
        if (m_functionManager.GetFunctionAt(i, other) && other.GetId() != lFunction &&
            SameName(other.GetName(), strName))
            bTaken = true;
    }
    if (bTaken) {
        AfxMessageBox(IDS_NAME_IN_USE, MB_OK | MB_ICONEXCLAMATION);
        return;
    }

    if (bRenameFunction) {
        function.SetName(strName);
        m_functionManager.AddFunction(function);
        // The caption row names the inner columns after their functions.
        for (int i = 0; i < m_handler.NumInnerColumns(); ++i)
            if (m_handler.GetInnerFunction(i) == lFunction) m_handler.ChangeColumnName(false, i, CQoString(strName));
    }
    ChangeNameTo(nName, strName);
    RebuildNameList();
    m_cbNames.SetCurSel(nName);
    OnSelchangeComboNames();
    RefreshList();
}

void CMultiColumnConfig::OnChangeFunctions()
{
    CFunctionManagerConfig dlg(m_functionManager, m_bReadMode, this);
    if (dlg.DoModal() != IDOK) return;
    m_functionManager = dlg.GetFunctionManager();
    InitFunctionList();
    OnSelchangeComboNames();
    // The mapping follows the functions as they are now: a deleted one is no
    // longer split or composed, a changed combination takes its new parts.
    if (m_bReadMode)
        DisplayReadList();
    else
        DisplayWriteList();
    NotifyListeners();
}

void CMultiColumnConfig::OnNewName()
{
    if (m_bReadMode) return;
    AddOuterColumn(LoadText(IDS_NEW_COLUMN));
    RebuildNameList();
    DisplayWriteList();
    m_cbNames.SetCurSel(m_cbNames.GetCount() - 1);
    OnSelchangeComboNames();
    RenameSelected();
}

void CMultiColumnConfig::OnDeleteName()
{
    const int nName = m_cbNames.GetCurSel();
    if (nName < 0) return;
    RemoveOuterColumn(nName);
    RebuildNameList();
    DisplayWriteList();
    m_cbNames.SetCurSel(0);
    OnSelchangeComboNames();
    NotifyListeners();
}

void CMultiColumnConfig::OnSelectAll()
{
    DoSelectAll(false);
}

void CMultiColumnConfig::OnFuncToNames()
{
    CFuncToNamesDlg dlg(this);
    if (dlg.DoModal() != IDOK) return;
    const int nSelected = m_cbNames.GetCurSel();
    const bool bAll = dlg.GetChoice() == CFuncToNamesDlg::allFields;
    if (!bAll && !IsOuter(nSelected)) return;

    // The new names, all checked before the first is given.
    std::vector<std::pair<int, CString>> changes;
    const int nFirst = bAll ? 0 : nSelected;
    const int nEnd = bAll ? std::min(m_cbNames.GetCount(), GetNumOuterColumns()) : nSelected + 1;
    for (int i = nFirst; i < nEnd; ++i) {
        CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
        if (m_functionManager.GetFunction(ShownFunction(m_outerColumns[static_cast<size_t>(i)].m_lFunction), function))
            changes.push_back(std::make_pair(i, function.GetName()));
    }
    std::vector<CString> names;
    for (int i = 0; i < m_handler.NumOuterColumns(); ++i) {
        CQoString name;
        m_handler.GetOuterColName(i, name);
        names.push_back(name.GetString());
    }
    for (const std::pair<int, CString>& change : changes)
        if (static_cast<size_t>(change.first) < names.size()) names[static_cast<size_t>(change.first)] = change.second;
    for (const std::pair<int, CString>& change : changes) {
        for (size_t j = 0; j < names.size(); ++j) {
            if (static_cast<int>(j) != change.first && SameName(names[j], change.second)) {
                AfxMessageBox(IDS_NAME_IN_USE, MB_OK | MB_ICONEXCLAMATION);
                return;
            }
        }
    }

    for (const std::pair<int, CString>& change : changes) ChangeNameTo(change.first, change.second);
    RebuildNameList();
    m_cbNames.SetCurSel(nSelected);
    OnSelchangeComboNames();
    RefreshList();
}

void CMultiColumnConfig::OnContextMenu(CWnd*, CPoint point)
{
    if (!m_bEnabled || !::IsWindow(m_list.m_hWnd)) return;
    const int nColumn = m_list.ColumnAtScreenPoint(point);
    if (nColumn < 0) return;

    CQoString name;
    int nOuter = nColumn;
    if (m_bReadMode)
        nOuter = m_handler.GetOuterNameOfInnerColumn(nColumn, name);
    else if (!m_handler.GetOuterColName(nColumn, name))
        nOuter = -1;
    if (nOuter < 0) return;
    m_cbNames.SetCurSel(nOuter);
    OnSelchangeComboNames();

    CMenu menu;
    if (!menu.CreatePopupMenu()) return;
    menu.AppendMenu(MF_STRING | MF_DISABLED, kColumnNameCmd, name.GetString());
    menu.SetDefaultItem(kColumnNameCmd);
    menu.AppendMenu(MF_SEPARATOR);
    menu.AppendMenu(MF_STRING | (m_bFieldNamesEditable ? 0 : MF_GRAYED | MF_DISABLED), kRenameCmd,
                    LoadText(IDS_EDIT_FIELD_NAME));
    menu.AppendMenu(MF_STRING, kEditFunctionsCmd, LoadText(IDS_EDIT_FUNCTIONS));
    menu.AppendMenu(MF_SEPARATOR);
    // Past these the command ids belong to the items above.
    m_menuFunctions.clear();
    for (const CFunctionManager::CFunction& function : SortedFunctions()) {
        if (m_menuFunctions.size() >= static_cast<size_t>(kMenuFunctions)) break;
        menu.AppendMenu(MF_STRING, kFirstFunctionCmd + static_cast<UINT>(m_menuFunctions.size()), function.GetName());
        m_menuFunctions.push_back(function.GetId());
    }
    menu.TrackPopupMenu(TPM_RIGHTBUTTON, point.x, point.y, this);
}

void CMultiColumnConfig::OnPopupCmd(UINT nID)
{
    if (nID == kRenameCmd) {
        RenameSelected();
        return;
    }
    if (nID == kEditFunctionsCmd) {
        OnChangeFunctions();
        return;
    }
    const size_t nPos = nID - kFirstFunctionCmd;
    if (nID < kFirstFunctionCmd || nPos >= m_menuFunctions.size()) return;
    // The menu's function, looked up by its id in the function list.
    if (SelectFunctionItem(m_menuFunctions[nPos])) OnSelchangeComboFunctions();
}

void CMultiColumnConfig::ColoredListCtrlOrderChanged()
{
    if (::IsWindow(m_hWnd)) PostMessage(WM_COMMAND, kOrderChangedCmd, 0);
}

void CMultiColumnConfig::OnPrivateCmd(UINT nID)
{
    if (nID != kOrderChangedCmd || m_bReadMode || !::IsWindow(m_list.m_hWnd)) return;
    CHeaderCtrl* pHeader = m_list.GetHeaderCtrl();
    const int nColumns = pHeader != NULL ? pHeader->GetItemCount() : 0;
    if (nColumns <= 0) return;
    std::vector<int> order(static_cast<size_t>(nColumns));
    if (!m_list.GetColumnOrderArray(order.data(), nColumns)) return;
    std::vector<int> natural(static_cast<size_t>(nColumns));
    for (int i = 0; i < nColumns; ++i) natural[static_cast<size_t>(i)] = i;
    // Putting the order back is itself a change of the order: it arrives here
    // again in natural order and changes nothing.
    if (order == natural) return;

    // The order must be one of exactly the page's columns; anything else is put
    // back without moving data.
    std::vector<int> sorted(order);
    std::sort(sorted.begin(), sorted.end());
    m_list.SetColumnOrderArray(nColumns, natural.data());
    if (nColumns != GetNumOuterColumns() || sorted != natural) {
        RefreshList();
        return;
    }
    const std::vector<COuterColumn> columns(m_outerColumns);
    const std::vector<long> functions(m_outerColumnFunctions);
    for (size_t i = 0; i < order.size(); ++i) {
        const size_t from = static_cast<size_t>(order[i]);
        m_outerColumns[i] = columns[from];
        if (i < functions.size() && from < functions.size()) m_outerColumnFunctions[i] = functions[from];
    }
    DisplayWriteList();
    RebuildNameList();
    NotifyListeners();
}
