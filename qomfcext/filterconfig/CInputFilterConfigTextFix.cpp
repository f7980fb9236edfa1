#include "CInputFilterConfigTextFix.h"

#include <afxcmn.h>

#include <exception>
#include <stdexcept>
#include <vector>

#include "CInputCharSetChoice.h"
#include "CQoFile.h"
#include "CQoInputFilterTextFix.h"
#include "CQoInputFilterTextVF.h"
#include "QoBatchMessageBox.h"
#include "QoLimits.h"
#include "resource.h"

namespace {

const int kMaxSpin = 32767;

const int kAlwaysEnabled[] = {IDC_TEXTFIX_INSTRUCTION, IDC_TEXTFIX_LBL_CHARSET, IDC_TEXTFIX_CHARSET,
                              IDC_TEXTFIX_APPLY, IDC_TEXTFIX_FIRST_NAMES};
const int kRecordControls[] = {IDC_TEXTFIX_LBL_RECORD_LEN, IDC_TEXTFIX_RECORD_LEN, IDC_TEXTFIX_SPIN};

}  // namespace

IMPLEMENT_DYNAMIC(CInputFilterConfigTextFix, CInputFilterConfig)

BEGIN_MESSAGE_MAP(CInputFilterConfigTextFix, CInputFilterConfig)
    ON_BN_CLICKED(IDC_TEXTFIX_APPLY, OnApply)
    ON_BN_CLICKED(IDC_TEXTFIX_FIRST_NAMES, OnApply)
    ON_NOTIFY(UDN_DELTAPOS, IDC_TEXTFIX_SPIN, OnDeltaPosSpin)
END_MESSAGE_MAP()

CInputFilterConfigTextFix::CInputFilterConfigTextFix(CQoInputFilter* pFilter, int nNotifierId, bool bLinesMode)
    : CInputFilterConfig(pFilter, nNotifierId, IDD, NULL),
      m_nRecordLen(0),
      m_nCharSet(-1),
      m_bFirstRecordHasNames(FALSE),
      m_bLinesMode(bLinesMode),
      m_nLongestLine(0)
{
    // The template holds the control: its class must exist before the window.
    CQoTextFormat::RegisterControlClass();
}

CInputFilterConfigTextFix::~CInputFilterConfigTextFix()
{
}

int CInputFilterConfigTextFix::Create(CWnd* pParent)
{
    CQoTextFormat::RegisterControlClass();
    return CDialog::Create(IDD, pParent);
}

bool CInputFilterConfigTextFix::HasFilterForMode() const
{
    if (m_bLinesMode) return dynamic_cast<CQoInputFilterTextVF*>(m_pInputFilter) != NULL;
    return dynamic_cast<CQoInputFilterTextFix*>(m_pInputFilter) != NULL;
}

void CInputFilterConfigTextFix::DoDataExchange(CDataExchange* pDX)
{
    CInputFilterConfig::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_TEXTFIX_RECORD_LEN, m_nRecordLen);
    DDX_Control(pDX, IDC_TEXTFIX_VIEW, m_textView);
    DDX_CBIndex(pDX, IDC_TEXTFIX_CHARSET, m_nCharSet);
    DDX_Check(pDX, IDC_TEXTFIX_FIRST_NAMES, m_bFirstRecordHasNames);
}

BOOL CInputFilterConfigTextFix::OnInitDialog()
{
    CInputFilterConfig::OnInitDialog();
    CInputCharSetChoice::Fill(*static_cast<CComboBox*>(GetDlgItem(IDC_TEXTFIX_CHARSET)));
    static_cast<CSpinButtonCtrl*>(GetDlgItem(IDC_TEXTFIX_SPIN))->SetRange32(0, kMaxSpin);
    if (m_bLinesMode) {
        for (int id : kRecordControls) GetDlgItem(id)->EnableWindow(FALSE);
    }
    m_textView.SetEnabled(TRUE);
    UpdateInputFilter(0);
    FillControl();
    return TRUE;
}

void CInputFilterConfigTextFix::Enable(int bEnable)
{
    if (!::IsWindow(m_hWnd)) return;
    for (int id : kAlwaysEnabled) GetDlgItem(id)->EnableWindow(bEnable);
    for (int id : kRecordControls) GetDlgItem(id)->EnableWindow(m_bLinesMode ? FALSE : bEnable);
    m_textView.SetEnabled(bEnable ? TRUE : FALSE);
}

// The filter's columns as marks: one at the start of every column and one at the
// end of the last.
void CInputFilterConfigTextFix::MarksFromFilter()
{
    if (!::IsWindow(m_textView.m_hWnd)) return;
    CQoInputFilterTextFix* pFix = dynamic_cast<CQoInputFilterTextFix*>(m_pInputFilter);
    CQoInputFilterTextVF* pVF = dynamic_cast<CQoInputFilterTextVF*>(m_pInputFilter);
    long long pos = 0;
    const int cols = m_pInputFilter->NumCols();
    for (int i = 0; i < cols && pos <= qolimits::maxRecordLength; ++i) {
        m_textView.SetColumnMark(static_cast<long>(pos));
        pos += m_bLinesMode ? pVF->ColLen(i) : pFix->ColLen(i);
    }
    if (pos <= qolimits::maxRecordLength) m_textView.SetColumnMark(static_cast<long>(pos));
}

void CInputFilterConfigTextFix::UpdateInputFilter(int bSave)
{
    if (m_pInputFilter == NULL || !HasFilterForMode()) return;
    if (bSave != 0) {
        SaveSettings();
        return;
    }
    CInputCharSetChoice::Load(m_pInputFilter->CharSet(), m_nCharSet);
    m_nRecordLen = m_bLinesMode ? 0 : static_cast<CQoInputFilterTextFix*>(m_pInputFilter)->RecordLen();
    MarksFromFilter();
    m_bFirstRecordHasNames = m_pInputFilter->GetFirstRowHasNames() ? TRUE : FALSE;
    if (::IsWindow(m_hWnd)) UpdateData(FALSE);
}

bool CInputFilterConfigTextFix::SaveSettings()
{
    // A record length that is no number has been reported by the exchange; half a
    // set of settings is not applied.
    if (::IsWindow(m_hWnd) && !UpdateData(TRUE)) return false;
    if (m_nRecordLen < 0) m_nRecordLen = 1;
    if (!m_bLinesMode && m_nRecordLen > qolimits::maxRecordLength) {
        CString strFormat, strMessage;
        strFormat.LoadString(IDS_TEXTFIX_RECORD_TOO_LONG);
        strMessage.Format(strFormat, qolimits::maxRecordLength);
        ShowError(strMessage);
        return false;
    }
    // A file that went away keeps the filter and the view as they are.
    const CString strFile = m_pInputFilter->FileName();
    if (!strFile.IsEmpty() && !CanOpen(strFile)) return false;

    CQoInputFilterTextFix* pFix = dynamic_cast<CQoInputFilterTextFix*>(m_pInputFilter);
    CQoInputFilterTextVF* pVF = dynamic_cast<CQoInputFilterTextVF*>(m_pInputFilter);
    const int limit = m_bLinesMode ? m_nLongestLine : m_nRecordLen;

    // The boundaries: the start of the record, every mark inside it, its end.
    std::vector<int> bounds(1, 0);
    if (::IsWindow(m_textView.m_hWnd)) {
        for (int p = 1; p < limit; ++p)
            if (m_textView.IsColumnMark(p)) bounds.push_back(p);
    }
    bounds.push_back(limit);
    if (limit == 0) bounds.resize(1);  // nothing to cut: no columns
    const int cols = static_cast<int>(bounds.size()) - 1;
    // Without the view there are no marks to read, and in lines mode without a
    // line shown (an empty file) nothing to cut: the columns stay as they are.
    const bool keepColumns = !::IsWindow(m_textView.m_hWnd) || (m_bLinesMode && limit == 0);

    try {
        CInputCharSetChoice::Save(m_nCharSet, *m_pInputFilter);
        if (!m_bLinesMode) pFix->RecordLen(m_nRecordLen);
        if (!keepColumns) {
            if (cols > qolimits::maxColumns) throw std::length_error("zu viele Spalten");
            if (m_bLinesMode) {
                pVF->SetNumCols(cols);
                for (int i = 0; i < cols; ++i) pVF->ColLen(i, bounds[i + 1] - bounds[i]);
            } else {
                pFix->SetNumCols(cols);
                for (int i = 0; i < cols; ++i) pFix->ColLen(i, bounds[i + 1] - bounds[i]);
            }
        }
        m_pInputFilter->SetFirstRowHasNames(m_bFirstRecordHasNames != FALSE);
    } catch (const std::exception& e) {
        CString strFormat, strMessage;
        strFormat.LoadString(IDS_TEXTFIX_APPLY_FAILED);
        strMessage.Format(strFormat, e.what());
        ShowError(strMessage);
        return false;
    }
    FillControl();
    return true;
}

bool CInputFilterConfigTextFix::CanOpen(const CString& strFile)
{
    CQoFile file(8);
    if (file.Open(strFile, CQoFile::read | CQoFile::binary)) return true;
    CString strFormat, strMessage;
    strFormat.LoadString(IDS_FILE_OPEN_FAILED);
    strMessage.Format(strFormat, (LPCSTR)strFile);
    ShowError(strMessage);
    return false;
}

bool CInputFilterConfigTextFix::FillControl()
{
    if (m_pInputFilter == NULL || !HasFilterForMode() || !::IsWindow(m_textView.m_hWnd)) return false;
    const CString strFile = m_pInputFilter->FileName();
    CQoFile file(8);
    if (!strFile.IsEmpty() && !file.Open(strFile, CQoFile::read | CQoFile::binary)) {
        CString strFormat, strMessage;
        strFormat.LoadString(IDS_FILE_OPEN_FAILED);
        strMessage.Format(strFormat, (LPCSTR)strFile);
        ShowError(strMessage);
        return false;
    }
    m_textView.ClearLines();
    if (file.IsOpen()) {
        file.FileCharSet(m_pInputFilter->CharSet());
        const long maxLines = m_lMaxPreviewRows;
        if (!m_bLinesMode) {
            const int len = m_nRecordLen;
            if (len > 0 && len <= qolimits::maxRecordLength) {
                std::vector<char> buffer(static_cast<size_t>(len) + 10);
                try {
                    if (m_bFirstRecordHasNames) file.Seek(len, CQoFile::begin);
                    for (long n = 0; n < maxLines; ++n) {
                        const size_t got = file.Read(buffer.data(), static_cast<size_t>(len), false);
                        if (got == 0) break;
                        // A NUL inside a record would cut the line short.
                        for (size_t i = 0; i < got; ++i)
                            if (buffer[i] == '\0') buffer[i] = ' ';
                        buffer[got] = '\0';
                        m_textView.AddLine(buffer.data());
                    }
                } catch (const std::exception&) {
                    // what could be read is shown
                }
            }
        } else {
            m_nLongestLine = 0;
            CQoString line;
            if (m_bFirstRecordHasNames) file.ReadString(line, false);
            for (long n = 0; n < maxLines && file.ReadString(line, false); ++n) {
                line.TrimNewline();
                if (line.GetLength() > m_nLongestLine) m_nLongestLine = line.GetLength();
                m_textView.AddLine(line);
            }
        }
    } else if (m_bLinesMode) {
        m_nLongestLine = 0;
    }
    MarksFromFilter();
    return true;
}

void CInputFilterConfigTextFix::OnDeltaPosSpin(NMHDR* pNMHDR, LRESULT* pResult)
{
    NMUPDOWN* pUpDown = reinterpret_cast<NMUPDOWN*>(pNMHDR);
    *pResult = 0;
    long long next = static_cast<long long>(pUpDown->iPos) + pUpDown->iDelta;
    if (next < 0) next = 0;
    if (next > kMaxSpin) next = kMaxSpin;
    if (next == pUpDown->iPos) return;
    // The old end of the record goes, so that the last column grows or shrinks
    // with it instead of leaving a column between the old and the new end.
    m_textView.RemoveColumnMark(pUpDown->iPos);
    m_nRecordLen = static_cast<int>(next);
    UpdateData(FALSE);
    // The filter gets the new length and the marks inside it; a change of the
    // filter is told as every other one is.
    if (m_pInputFilter != NULL && HasFilterForMode() && SaveSettings()) NotifyListeners();
}

void CInputFilterConfigTextFix::ShowError(const char* text)
{
    QoBatchMessageBox(0, IDOK, text, MB_OK | MB_ICONEXCLAMATION);
}

void CInputFilterConfigTextFix::OnApply()
{
    if (m_pInputFilter == NULL || !HasFilterForMode()) return;
    if (!SaveSettings()) return;
    NotifyListeners();
}

void CInputFilterConfigTextFix::DefaultAction()
{
    OnApply();
}

void CInputFilterConfigTextFix::OnOK()
{
}

void CInputFilterConfigTextFix::OnCancel()
{
}
