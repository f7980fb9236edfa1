#include "COutputFilterConfigDao.h"

#include <afxcmn.h>

#include <CQoException.h>
#include <CQoOutputFilterDB.h>
#include <CQoOutputSource.h>
#include <QoLimits.h>

#include <vector>

#include "resource.h"

namespace {

// The page's controls: the list of the columns, and what Enable switches.
const COutputFilterConfigColumns::SLayout layout = {
    IDD_OUTPUT_DAO,
    IDC_OUTDAO_LIST,
    IDC_OUTDAO_FIELDLEN,
    IDC_OUTDAO_TYPE,
    {{"Feld", LVCFMT_LEFT, 45}, {"Typ", LVCFMT_LEFT, 20}, {"L\xE4nge", LVCFMT_RIGHT, 20}, {"indiziert", LVCFMT_LEFT, 15}},
    {IDC_OUTDAO_LBL_TABLE, IDC_OUTDAO_INSTRUCTION, IDC_OUTDAO_INSTRUCTION2, IDC_OUTDAO_LBL_TYPE, IDC_OUTDAO_LBL_FIELDLEN,
     IDC_OUTDAO_TABLE, IDC_OUTDAO_TYPE, IDC_OUTDAO_FIELDLEN, IDC_OUTDAO_INDEXED, IDC_OUTDAO_APPLY, IDC_OUTDAO_LIST}};

}  // namespace

IMPLEMENT_DYNAMIC(COutputFilterConfigDao, COutputFilterConfigColumns)

BEGIN_MESSAGE_MAP(COutputFilterConfigDao, COutputFilterConfigColumns)
    ON_NOTIFY(LVN_ITEMCHANGED, IDC_OUTDAO_LIST, OnItemchangedList)
    ON_CBN_SELCHANGE(IDC_OUTDAO_TYPE, OnSelchangeType)
    ON_BN_CLICKED(IDC_OUTDAO_APPLY, OnApply)
END_MESSAGE_MAP()

COutputFilterConfigDao::COutputFilterConfigDao(int nNotifierId, CWnd* pParent)
    : COutputFilterConfigColumns(nNotifierId, layout, pParent), m_bIndexed(FALSE)
{
}

COutputFilterConfigDao::~COutputFilterConfigDao() {}

void COutputFilterConfigDao::DoDataExchange(CDataExchange* pDX)
{
    COutputFilterConfigColumns::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_OUTDAO_TABLE, m_strTableName);
    DDX_Text(pDX, IDC_OUTDAO_FIELDLEN, m_nFieldLen);
    DDX_CBIndex(pDX, IDC_OUTDAO_TYPE, m_nFieldType);
    DDX_Check(pDX, IDC_OUTDAO_INDEXED, m_bIndexed);
}

BOOL COutputFilterConfigDao::OnInitDialog()
{
    COutputFilterConfigColumns::OnInitDialog();
    InitTypeCombo();
    GetDlgItem(IDC_OUTDAO_INDEXED)->EnableWindow(FALSE);

    // A filter loaded before the window existed keeps its table name.
    if (m_strTableName.IsEmpty())
        m_strTableName = "Tabelle";
    SetDlgItemText(IDC_OUTDAO_TABLE, m_strTableName);
    CWnd* pTable = GetDlgItem(IDC_OUTDAO_TABLE);
    pTable->SetFocus();
    pTable->SendMessage(EM_SETSEL, 0, -1);
    return FALSE;  // the focus is set
}

CQoOutputFilterDB* COutputFilterConfigDao::Filter() const
{
    return dynamic_cast<CQoOutputFilterDB*>(m_pOutputFilter);
}

bool COutputFilterConfigDao::FilterFits() const
{
    return Filter() != NULL;
}

bool COutputFilterConfigDao::CellText(int row, int col, CString& text) const
{
    const SCol& column = m_arrColumns[row];
    if (col == 3)
        text = column.bIndexed ? "ja" : "nein";
    else
        TypedCellText(col, column.strName, column.nType, column.nLength, text);
    return false;
}

void COutputFilterConfigDao::ShowColumn(int row)
{
    ShowTypedColumn(row, m_arrColumns);
    if (row >= 0) {
        m_bIndexed = m_arrColumns[row].bIndexed ? TRUE : FALSE;
        CheckDlgButton(IDC_OUTDAO_INDEXED, m_bIndexed);
    }
    GetDlgItem(IDC_OUTDAO_INDEXED)->EnableWindow(row >= 0);
}

bool COutputFilterConfigDao::TakeSelectedColumn()
{
    SCol& col = m_arrColumns[m_nSelIndex];
    if (!TakeTypeAndLength(col, maxTextLen))
        return false;
    col.bIndexed = m_bIndexed != 0;
    return true;
}

bool COutputFilterConfigDao::LoadColumnsFromSource()
{
    return LoadColumns(m_arrColumns, TypedColumn<SCol>(defaultType, defaultLen), false);
}

void COutputFilterConfigDao::UpdateOutputFilter(int nSave)
{
    CQoOutputFilterDB* pFilter = Filter();
    if (pFilter == NULL || m_pOutputSource == NULL)
        return;
    if (nSave == 0) {
        m_strTableName = pFilter->GetTableName().GetString();
        if (m_strTableName.IsEmpty())
            m_strTableName = "Tabelle";
        const int n = pFilter->NumCols();
        m_arrColumns.SetSize(n);
        for (int i = 0; i < n; ++i) {
            CQoString name;
            pFilter->GetColumnName(i, name);
            SCol& col = m_arrColumns[i];
            col.strName = name.GetString();
            col.bIndexed = pFilter->GetIndexed(i);
            col.nLength = pFilter->GetLength(i);
            col.nType = pFilter->GetType(i);
            col.nDataLength = -1;
        }
        if (::IsWindow(m_hWnd)) {
            SetDlgItemText(IDC_OUTDAO_TABLE, m_strTableName);
            ListItemChanged();
            m_list.Invalidate();
        }
        return;
    }
    if (::IsWindow(m_hWnd) && !UpdateData(TRUE))
        return;
    if (GetColumnCount() < pFilter->NumCols() && !LoadColumnsFromSource())
        return;
    WriteToFilter();
}

bool COutputFilterConfigDao::WriteToFilter()
{
    CQoOutputFilterDB* pFilter = Filter();
    CString problem;
    CString table = m_strTableName;
    table.TrimLeft();
    table.TrimRight();
    if (table.IsEmpty())
        problem = "Bitte geben Sie den Namen der Tabelle an, in die geschrieben wird.";
    try {
        const int n =
            qolimits::Checked("Spalten", m_pOutputSource->GetNumColumns(), 0, qolimits::maxColumns);
        // The source and every column are checked first: a refusal leaves the
        // filter as it was.
        std::vector<CQoString> names(static_cast<size_t>(n));
        for (int i = 0; i < n; ++i)
            m_pOutputSource->GetColumnName(i, names[static_cast<size_t>(i)]);
        for (int i = 0; i < n && i < GetColumnCount() && problem.IsEmpty(); ++i) {
            const SCol& col = m_arrColumns[i];
            const char* name = names[static_cast<size_t>(i)].GetString();
            if (col.nType != 1 && col.nType != 2)
                problem.Format("Das Feld '%s' hat einen unbekannten Feldtyp (%d). Bitte w\xE4hlen Sie "
                               "'Text' oder 'numerisch'.",
                               name, col.nType);
            else if (col.nType == 2)
                problem = TextLengthProblem(name, col.nLength, maxTextLen);
        }
        if (!problem.IsEmpty()) {
            AfxMessageBox(problem, MB_ICONEXCLAMATION);
            return false;
        }
        pFilter->NumCols(n);
        for (int i = 0; i < n; ++i) {
            pFilter->ColumnName(i, names[static_cast<size_t>(i)]);
            if (i < GetColumnCount()) {
                const SCol& col = m_arrColumns[i];
                pFilter->SetLength(i, col.nLength);
                pFilter->SetType(i, col.nType);
                pFilter->SetIndexed(i, col.bIndexed);
            } else {
                pFilter->SetLength(i, defaultLen);
                pFilter->SetType(i, defaultType);
                pFilter->SetIndexed(i, false);
            }
        }
        pFilter->SetTableName(static_cast<const char*>(m_strTableName));
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
        return false;
    }
    return true;
}
