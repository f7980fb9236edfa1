#include "COutputFilterConfigDbase.h"

#include <afxcmn.h>

#include <CDbaseField.h>
#include <CQoArray.h>
#include <CQoException.h>
#include <CQoOutputFilterDbase.h>
#include <CQoOutputSource.h>
#include <QoLimits.h>

#include <vector>

#include "resource.h"

namespace {

// The page's controls: the list of the columns, and what Enable switches.
const COutputFilterConfigColumns::SLayout layout = {
    IDD_OUTPUT_DBASE,
    IDC_OUTDBF_LIST,
    IDC_OUTDBF_FIELDLEN,
    IDC_OUTDBF_TYPE,
    {{MAKEINTRESOURCE(IDS_COL_FIELD), LVCFMT_LEFT, 60},
     {MAKEINTRESOURCE(IDS_COL_TYPE), LVCFMT_LEFT, 20},
     {MAKEINTRESOURCE(IDS_COL_LENGTH), LVCFMT_RIGHT, 20}},
    {IDC_OUTDBF_INSTRUCTION, IDC_OUTDBF_INSTRUCTION2, IDC_OUTDBF_LBL_TYPE, IDC_OUTDBF_LBL_FIELDLEN, IDC_OUTDBF_TYPE,
     IDC_OUTDBF_FIELDLEN, IDC_OUTDBF_APPLY, IDC_OUTDBF_LIST}};

}  // namespace

IMPLEMENT_DYNAMIC(COutputFilterConfigDbase, COutputFilterConfigColumns)

BEGIN_MESSAGE_MAP(COutputFilterConfigDbase, COutputFilterConfigColumns)
    ON_BN_CLICKED(IDC_OUTDBF_APPLY, OnApply)
    ON_NOTIFY(LVN_ITEMCHANGED, IDC_OUTDBF_LIST, OnItemchangedList)
    ON_CBN_SELCHANGE(IDC_OUTDBF_TYPE, OnSelchangeType)
END_MESSAGE_MAP()

COutputFilterConfigDbase::COutputFilterConfigDbase(int nNotifierId, CWnd* pParent)
    : COutputFilterConfigColumns(nNotifierId, layout, pParent)
{
}

COutputFilterConfigDbase::~COutputFilterConfigDbase() {}

void COutputFilterConfigDbase::DoDataExchange(CDataExchange* pDX)
{
    COutputFilterConfigColumns::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_OUTDBF_FIELDLEN, m_nFieldLen);
    DDX_CBIndex(pDX, IDC_OUTDBF_TYPE, m_nFieldType);
}

BOOL COutputFilterConfigDbase::OnInitDialog()
{
    COutputFilterConfigColumns::OnInitDialog();
    InitTypeCombo();
    return TRUE;
}

CQoOutputFilterDbase* COutputFilterConfigDbase::Filter() const
{
    return dynamic_cast<CQoOutputFilterDbase*>(m_pOutputFilter);
}

bool COutputFilterConfigDbase::FilterFits() const
{
    return Filter() != NULL;
}

bool COutputFilterConfigDbase::CellText(int row, int col, CString& text) const
{
    const SCol& column = m_arrColumns[row];
    TypedCellText(col, column.strName, column.nType, column.nLength, text);
    return false;
}

void COutputFilterConfigDbase::ShowColumn(int row)
{
    ShowTypedColumn(row, m_arrColumns);
}

// A numeric field is always numericLen wide.
bool COutputFilterConfigDbase::TakeSelectedColumn()
{
    return TakeTypeAndLength(m_arrColumns[m_nSelIndex], maxTextLen);
}

bool COutputFilterConfigDbase::LoadColumnsFromSource()
{
    return LoadColumns(m_arrColumns, TypedColumn<SCol>(defaultType, defaultLen), false);
}

void COutputFilterConfigDbase::UpdateOutputFilter(int nSave)
{
    CQoOutputFilterDbase* pFilter = Filter();
    if (pFilter == NULL || m_pOutputSource == NULL)
        return;
    if (nSave == 0) {
        const int n = pFilter->NumCols();
        m_arrColumns.SetSize(n);
        for (int i = 0; i < n; ++i) {
            SCol& col = m_arrColumns[i];
            CDbaseField field;
            if (pFilter->GetFieldDesc(i, field)) {
                col.strName = field.Name().GetString();
                col.nLength = field.Length();
                col.nType = field.Type() == 'N' ? 1 : 2;
            } else {
                // A column the filter has no description for is written as
                // text of the full length.
                CQoString name;
                pFilter->GetColumnName(i, name);
                col.strName = name.GetString();
                col.nLength = defaultLen;
                col.nType = defaultType;
            }
            col.nDataLength = -1;
        }
        if (::IsWindow(m_hWnd)) {
            ListItemChanged();
            m_list.Invalidate();
        }
        return;
    }
    if (::IsWindow(m_hWnd) && !UpdateData(TRUE))
        return;
    WriteToFilter();
}

bool COutputFilterConfigDbase::WriteToFilter()
{
    CQoOutputFilterDbase* pFilter = Filter();
    try {
        const int n =
            qolimits::Checked("Spalten", m_pOutputSource->GetNumColumns(), 0, qolimits::maxColumns);
        // Every description is made and checked first: a refusal leaves the
        // filter as it was.
        CQoArray<CDbaseField> fields;
        std::vector<CQoString> names(static_cast<size_t>(n));
        for (int i = 0; i < n; ++i) {
            CQoString& name = names[static_cast<size_t>(i)];
            m_pOutputSource->GetColumnName(i, name);
            const bool numeric = i < GetColumnCount() && m_arrColumns[i].nType == 1;
            const int length = numeric ? numericLen : i < GetColumnCount() ? m_arrColumns[i].nLength : defaultLen;
            const CString problem = numeric ? CString() : TextLengthProblem(name.GetString(), length, maxTextLen);
            if (!problem.IsEmpty()) {
                AfxMessageBox(problem, MB_ICONEXCLAMATION);
                return false;
            }
            fields.Add(CDbaseField(name.GetString(), numeric ? 'N' : 'C', length));
        }
        pFilter->NumCols(n);
        for (int i = 0; i < n; ++i)
            pFilter->ColumnName(i, names[static_cast<size_t>(i)]);
        // The filter keeps a copy; the page keeps its own settings.
        pFilter->SetFieldDescs(&fields);
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
        return false;
    }
    return true;
}
