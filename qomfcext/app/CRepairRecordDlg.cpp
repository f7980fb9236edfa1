#include "CRepairRecordDlg.h"

#include "CCorrectRepairDlg.h"
#include "CQoInterActive.h"
#include "resource.h"

BEGIN_MESSAGE_MAP(CRepairRecordDlg, CDialog)
    ON_BN_CLICKED(IDC_REPAIR_IGNORE, OnIgnore)
    ON_NOTIFY(UDN_DELTAPOS, IDC_REPAIR_SPIN, OnDeltaposSpin)
END_MESSAGE_MAP()

namespace {

// Trailing blanks and line breaks do not count as a change of the record.
CString WithoutTrailingBreaks(const CString& str)
{
    CString copy = str;
    copy.TrimRight(" \r\n");
    return copy;
}

}  // namespace

CRepairRecordDlg::CRepairRecordDlg(CWnd* pParent)
    : CDialog(IDD, pParent), m_bIgnore(false), m_nPos(0), m_nLength(0)
{
}

CRepairRecordDlg::~CRepairRecordDlg() {}

void CRepairRecordDlg::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_REPAIR_SPIN, m_spin);
    DDX_Text(pDX, IDC_REPAIR_DATA, m_strData);
    DDX_Text(pDX, IDC_REPAIR_CORRECTION, m_strCorrection);
}

int CRepairRecordDlg::RepairRecord(CQoString& data, int& pos)
{
    // The edit controls end a text at a NUL byte; a blank in its place keeps
    // every later character where the file has it.
    m_strWhole = CString(data.GetString(), data.GetLength());
    m_strWhole.Replace('\0', ' ');
    m_nPos = pos < 0 ? 0 : (pos > m_strWhole.GetLength() ? m_strWhole.GetLength() : pos);
    m_bIgnore = false;

    // -1 (the dialog could not be shown) stops reading too: nothing was repaired.
    INT_PTR nResult = DoModal();
    if (nResult == IDCANCEL || nResult == -1)
        return 0;
    data = CQoString(m_strCorrection, m_strCorrection.GetLength());
    pos = m_nPos;
    return m_bIgnore ? 2 : 1;
}

BOOL CRepairRecordDlg::OnInitDialog()
{
    CDialog::OnInitDialog();
    // Records and the data after them may be longer than an edit takes by
    // typing.
    SendDlgItemMessage(IDC_REPAIR_CORRECTION, EM_LIMITTEXT, 0, 0);
    SendDlgItemMessage(IDC_REPAIR_DATA, EM_LIMITTEXT, 0, 0);
    m_nLength = m_strWhole.GetLength();
    m_spin.SetRange32(0, m_nLength);
    Split(m_nPos);
    m_spin.SetPos32(m_nPos);
    return TRUE;
}

void CRepairRecordDlg::Split(int nPos)
{
    m_nPos = nPos < 0 ? 0 : (nPos > m_nLength ? m_nLength : nPos);
    m_strCorrection = m_strWhole.Left(m_nPos);
    m_strReference = m_strCorrection;
    m_strData = m_strWhole.Mid(m_nPos);
    UpdateData(FALSE);
}

void CRepairRecordDlg::OnDeltaposSpin(NMHDR* pNMHDR, LRESULT* pResult)
{
    NMUPDOWN* pNMUpDown = reinterpret_cast<NMUPDOWN*>(pNMHDR);
    long long llPos = static_cast<long long>(pNMUpDown->iPos) + pNMUpDown->iDelta;
    if (llPos < 0)
        llPos = 0;
    if (llPos > m_nLength)
        llPos = m_nLength;
    // The control moves itself (limited to the same range) once it is answered.
    Split(static_cast<int>(llPos));
    *pResult = 0;
}

bool CRepairRecordDlg::MayClose(bool bTakeOver)
{
    if (!UpdateData(TRUE))
        return false;
    UINT nRefusal = 0;
    if (m_nPos == 0)
        nRefusal = IDS_REPAIR_SET_SPLIT;
    else if (bTakeOver && WithoutTrailingBreaks(m_strCorrection) == WithoutTrailingBreaks(m_strReference))
        nRefusal = IDS_REPAIR_UNCHANGED;
    if (nRefusal == 0)
        return true;
    // Owned by the dialog, so that it stays in front of it until answered.
    CString strText;
    strText.LoadString(nRefusal);
    MessageBox(strText, AfxGetAppName(), MB_OK | MB_ICONEXCLAMATION);
    return false;
}

void CRepairRecordDlg::OnOK()
{
    if (MayClose(true))
        EndDialog(IDOK);
}

void CRepairRecordDlg::OnIgnore()
{
    if (!MayClose(false))
        return;
    m_bIgnore = true;
    EndDialog(IDOK);
}

int CRepairRecordDlgDoIt(CQoString const& file, CQoString& data, int& pos)
{
    (void)file;
    CQoInterActive::SetCorrectRepair(CCorrectRepairDlgDoIt);
    CRepairRecordDlg dlg(NULL);
    return dlg.RepairRecord(data, pos);
}
