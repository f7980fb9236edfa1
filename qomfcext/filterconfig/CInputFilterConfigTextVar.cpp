#include "CInputFilterConfigTextVar.h"

#include <cstring>
#include <exception>

#include "CInputCharSetChoice.h"
#include "CQoException.h"
#include "CQoInfoView.h"
#include "CQoInputFilterTextVar.h"
#include "QoBatchMessageBox.h"
#include "resource.h"

namespace {

const char kTabText[] = "[TAB]";
const int kBytesLookedAt = 4096;  // enough to tell text from a binary file

const int kEnabledControls[] = {
    IDC_TEXTVAR_LBL_DELIMITER, IDC_TEXTVAR_LBL_ESCAPE, IDC_TEXTVAR_LBL_CHARSET, IDC_TEXTVAR_LBL_ENCLOSER,
    IDC_TEXTVAR_LBL_SKIP,      IDC_TEXTVAR_DELIMITER,  IDC_TEXTVAR_ESCAPE,      IDC_TEXTVAR_CHARSET,
    IDC_TEXTVAR_ENCLOSER,      IDC_TEXTVAR_SKIP,       IDC_TEXTVAR_INFO,        IDC_TEXTVAR_APPLY,
    IDC_TEXTVAR_PREVIEW,       IDC_TEXTVAR_FIRST_NAMES,
};

// The character a field stands for: 0 for an empty field, else its first character.
char CharOf(const CString& text)
{
    return text.IsEmpty() ? '\0' : text[0];
}

CString TextOf(char c)
{
    return c == '\0' ? CString() : CString(c);
}

// The settings of the filter that an apply may change, to put back when the
// filter cannot read its file with the new ones.
struct Settings {
    int charSet;
    int skip;
    char delimiter, encloser, escape;
    bool firstRowHasNames;

    explicit Settings(const CQoInputFilterTextVar& f)
        : charSet(f.CharSet()),
          skip(f.Skip()),
          delimiter(f.Delimiter()),
          encloser(f.Encloser()),
          escape(f.Escape()),
          firstRowHasNames(f.GetFirstRowHasNames())
    {
    }
    void PutInto(CQoInputFilterTextVar& f) const
    {
        f.CharSet(charSet);
        f.Skip(skip);
        f.Delimiter(delimiter);
        f.Encloser(encloser);
        f.Escape(escape);
        f.SetFirstRowHasNames(firstRowHasNames);
    }
};

}  // namespace

IMPLEMENT_DYNAMIC(CInputFilterConfigTextVar, CInputFilterConfig)

BEGIN_MESSAGE_MAP(CInputFilterConfigTextVar, CInputFilterConfig)
    ON_BN_CLICKED(IDC_TEXTVAR_APPLY, OnApply)
    ON_BN_CLICKED(IDC_TEXTVAR_INFO, OnInfo)
    ON_BN_CLICKED(IDC_TEXTVAR_FIRST_NAMES, OnApply)
END_MESSAGE_MAP()

CInputFilterConfigTextVar::CInputFilterConfigTextVar(CQoInputFilterTextVar* pFilter, int nNotifierId)
    : CInputFilterConfig(pFilter, nNotifierId, IDD, NULL),
      m_preview(true),
      m_nSkip(0),
      m_nCharSet(-1),
      m_bFirstRowHasNames(FALSE)
{
    m_preview.SetInputFilter(pFilter);
}

CInputFilterConfigTextVar::~CInputFilterConfigTextVar()
{
}

CQoInputFilterTextVar* CInputFilterConfigTextVar::TextFilter() const
{
    return static_cast<CQoInputFilterTextVar*>(m_pInputFilter);
}

int CInputFilterConfigTextVar::Create(CWnd* pParent)
{
    return CDialog::Create(IDD, pParent);
}

// The combos are exchanged exactly: an empty encloser must stay empty rather than
// select the first entry that begins with nothing.
void CInputFilterConfigTextVar::DoDataExchange(CDataExchange* pDX)
{
    CInputFilterConfig::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_TEXTVAR_PREVIEW, m_preview);
    DDX_Text(pDX, IDC_TEXTVAR_SKIP, m_nSkip);
    DDX_CBStringExact(pDX, IDC_TEXTVAR_DELIMITER, m_strDelimiter);
    DDX_CBStringExact(pDX, IDC_TEXTVAR_ENCLOSER, m_strEncloser);
    DDX_CBStringExact(pDX, IDC_TEXTVAR_ESCAPE, m_strEscape);
    DDX_CBIndex(pDX, IDC_TEXTVAR_CHARSET, m_nCharSet);
    DDX_Check(pDX, IDC_TEXTVAR_FIRST_NAMES, m_bFirstRowHasNames);
}

BOOL CInputFilterConfigTextVar::OnInitDialog()
{
    CInputFilterConfig::OnInitDialog();
    m_preview.Init();

    CComboBox* pDelimiter = static_cast<CComboBox*>(GetDlgItem(IDC_TEXTVAR_DELIMITER));
    pDelimiter->ResetContent();
    pDelimiter->LimitText(1);  // "[TAB]" can only be picked from the list
    for (const char* item : {kTabText, ";", ",", "~", "|"}) pDelimiter->AddString(item);

    CComboBox* pEncloser = static_cast<CComboBox*>(GetDlgItem(IDC_TEXTVAR_ENCLOSER));
    pEncloser->ResetContent();
    pEncloser->LimitText(1);
    pEncloser->AddString("\"");
    pEncloser->AddString("'");

    CComboBox* pEscape = static_cast<CComboBox*>(GetDlgItem(IDC_TEXTVAR_ESCAPE));
    pEscape->ResetContent();
    pEscape->LimitText(1);
    pEscape->AddString("\\");

    CInputCharSetChoice::Fill(*static_cast<CComboBox*>(GetDlgItem(IDC_TEXTVAR_CHARSET)));

    UpdateInputFilter(0);
    return TRUE;
}

void CInputFilterConfigTextVar::Enable(int bEnable)
{
    if (!::IsWindow(m_hWnd)) return;
    for (int id : kEnabledControls) {
        if (CWnd* pCtrl = GetDlgItem(id)) pCtrl->EnableWindow(bEnable);
    }
}

void CInputFilterConfigTextVar::UpdateInputFilter(int bSave)
{
    if (m_pInputFilter == NULL) return;
    if (bSave != 0) {
        SaveSettings();
        return;
    }
    CQoInputFilterTextVar* pFilter = TextFilter();
    CInputCharSetChoice::Load(pFilter->CharSet(), m_nCharSet);
    m_nSkip = pFilter->Skip();
    m_strDelimiter = pFilter->Delimiter() == '\t' ? CString(kTabText) : TextOf(pFilter->Delimiter());
    m_strEncloser = TextOf(pFilter->Encloser());
    m_strEscape = TextOf(pFilter->Escape());
    m_bFirstRowHasNames = pFilter->GetFirstRowHasNames() ? TRUE : FALSE;
    if (::IsWindow(m_hWnd)) {
        UpdateData(FALSE);
        RefreshPreview();
    }
}

bool CInputFilterConfigTextVar::SaveSettings()
{
    CQoInputFilterTextVar* pFilter = TextFilter();
    // A skip that is no whole number is reported by the exchange, which stops
    // there: the skip and the fields exchanged after it (delimiter, encloser,
    // escape, character set, first line) keep the values they had, and the
    // save goes on with them, so the filter is re-opened and the listeners
    // hear of it as after any apply.
    if (::IsWindow(m_hWnd)) UpdateData(TRUE);

    if (m_nSkip < 0) {
        m_nSkip = 0;
        if (::IsWindow(m_hWnd)) UpdateData(FALSE);
    }
    const char cDelimiter = m_strDelimiter == kTabText ? '\t' : CharOf(m_strDelimiter);
    const char cEncloser = CharOf(m_strEncloser);
    const char cEscape = CharOf(m_strEscape);
    if (!CheckSettings(cDelimiter)) return false;

    const CString strFile = pFilter->FileName();
    if (!strFile.IsEmpty() && !CheckFile(strFile)) return false;

    const Settings before(*pFilter);
    const bool boundariesMoved =
        cDelimiter != pFilter->Delimiter() || cEncloser != pFilter->Encloser() || cEscape != pFilter->Escape();
    CInputCharSetChoice::Save(m_nCharSet, *pFilter);
    pFilter->Skip(m_nSkip);
    pFilter->Delimiter(cDelimiter);
    pFilter->Encloser(cEncloser);
    pFilter->Escape(cEscape);
    // The record boundaries may have moved: the known number of rows is void.
    if (boundariesMoved) pFilter->SetNumRows(0);
    // Before the re-open, so that the names and the first row are read as set.
    pFilter->SetFirstRowHasNames(m_bFirstRowHasNames != FALSE);
    if (strFile.IsEmpty()) return true;  // nothing to read yet

    try {
        pFilter->Init(CQoString(strFile));
        return true;
    } catch (const std::exception& e) {
        // The filter goes back to what it read before; the page keeps the user's
        // values so that they can be corrected.
        const CString strMessage = e.what();
        try {
            before.PutInto(*pFilter);
            pFilter->Init(CQoString(strFile));
        } catch (const std::exception&) {
        }
        ShowError(strMessage);
        RefreshPreview();
        return false;
    }
}

bool CInputFilterConfigTextVar::CheckSettings(char cDelimiter)
{
    if (cDelimiter != '\0' && cDelimiter != '\r' && cDelimiter != '\n') return true;
    CString strMessage;
    strMessage.LoadString(IDS_TEXTVAR_NO_DELIMITER);
    ShowError(strMessage);
    if (::IsWindow(m_hWnd)) GotoDlgCtrl(GetDlgItem(IDC_TEXTVAR_DELIMITER));
    return false;
}

// The filter would read any file, a picture as well, as records of garbage: a
// file that holds a NUL byte near its start is not text in any of our character
// sets, and is refused before the filter sees it.
bool CInputFilterConfigTextVar::CheckFile(const CString& strFile)
{
    HANDLE hFile = ::CreateFileA(strFile, GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                                 NULL, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, NULL);
    char buffer[kBytesLookedAt];
    DWORD dwRead = 0;
    const bool bRead = hFile != INVALID_HANDLE_VALUE && ::ReadFile(hFile, buffer, sizeof(buffer), &dwRead, NULL);
    if (hFile != INVALID_HANDLE_VALUE) ::CloseHandle(hFile);
    CString strFormat, strMessage;
    if (!bRead) {
        strFormat.LoadString(IDS_FILE_OPEN_FAILED);
    } else if (memchr(buffer, '\0', dwRead) != NULL) {
        strFormat.LoadString(IDS_INPUT_NOT_TEXT);
    } else {
        return true;
    }
    strMessage.Format(strFormat, (LPCSTR)strFile);
    ShowError(strMessage);
    return false;
}

void CInputFilterConfigTextVar::RefreshPreview()
{
    if (!::IsWindow(m_preview.m_hWnd)) return;
    try {
        m_preview.Update();
    } catch (const std::exception& e) {
        ShowError(e.what());
    }
}

void CInputFilterConfigTextVar::ShowError(const char* text)
{
    QoBatchMessageBox(0, IDOK, text, MB_OK | MB_ICONEXCLAMATION);
}

void CInputFilterConfigTextVar::OnApply()
{
    if (m_pInputFilter == NULL) return;
    if (!SaveSettings()) return;
    RefreshPreview();
    m_preview.RedrawWindow(NULL, NULL, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW);
    NotifyListeners();  // a refusal changes nothing here: the settings are applied
}

void CInputFilterConfigTextVar::DefaultAction()
{
    OnApply();
}

void CInputFilterConfigTextVar::OnOK()
{
    OnApply();
}

void CInputFilterConfigTextVar::OnCancel()
{
}

void CInputFilterConfigTextVar::OnInfo()
{
    CQoInfoView view;
    view.Append("Das Trennzeichen ist das Zeichen, mit dem die einzelnen Felder voneinander getrennt werden. "
                "In den meisten Fällen ist dies das Semikolon oder das Komma.\r\n\r\n");
    view.Append("Der Begrenzer kann die einzelnen Felder einschließen, oft werden hierfür die doppelten "
                "Anführungszeichen verwendet.\r\n\r\n");
    view.Append("Das Escapezeichen wird verwendet, wenn das als Trenn- oder Begrenzungszeichen verwendete "
                "Zeichen in den Daten selber vorkommt. Es wird dann dem entsprechenden Zeichen vorangestellt. "
                "Hier wird oft der backslash \\ verwendet.\r\n\r\n");
    view.Append("Im Feld überlesen kann angegeben werden, wieviele Sätze am Dateianfang überlesen werden "
                "sollen.\r\n\r\n");
    view.Append("Mit Hilfe des Buttons Übernehmen werden die Einstellungen in die untere Liste übertragen "
                "(dort werden maximal 50 Sätze angezeigt).");
    view.DoModal();
}
