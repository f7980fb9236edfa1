#include "COutputFilterConfigTextVar.h"

#include <CQoException.h>
#include <CQoFile.h>
#include <CQoOutputFilterTextVar.h>
#include <CQoOutputSource.h>

#include "resource.h"

namespace {

const char kTab[] = "[TAB]";

int CharSetIndex(int charSet) { return charSet == CQoFile::ascii ? 1 : 0; }

int CharSetOfIndex(int index) { return index == 1 ? CQoFile::ascii : CQoFile::ansi; }

// The text of a setting character; character 0 ("none") is the empty text.
CString TextOf(char ch)
{
    CString text;
    if (ch != 0)
        text = CString(ch, 1);
    return text;
}

char CharOf(const CString& text) { return text.IsEmpty() ? 0 : text[0]; }

// Puts the value into a combo box with an edit field exactly as it is. The
// platform's selection by text matches prefixes, and the empty text is a
// prefix of every entry: an escape character "none" would come back as the
// first entry of the list and be written into the filter at the next apply.
void ShowComboText(CWnd* pDlg, int nIDC, const CString& value)
{
    CComboBox* pCombo = static_cast<CComboBox*>(pDlg->GetDlgItem(nIDC));
    const int index = value.IsEmpty() ? CB_ERR : pCombo->FindStringExact(-1, value);
    pCombo->SetCurSel(index);
    if (index == CB_ERR)
        pCombo->SetWindowText(value);
}

void FillCombo(CWnd* pDlg, int nIDC, int limit, const char* const* items, int count, int select)
{
    CComboBox* pCombo = static_cast<CComboBox*>(pDlg->GetDlgItem(nIDC));
    pCombo->ResetContent();
    if (limit > 0)
        pCombo->LimitText(limit);
    for (int i = 0; i < count; ++i)
        pCombo->AddString(items[i]);
    pCombo->SetCurSel(select);
}

}  // namespace

IMPLEMENT_DYNAMIC(COutputFilterConfigTextVar, COutputFilterConfig)

BEGIN_MESSAGE_MAP(COutputFilterConfigTextVar, COutputFilterConfig)
    ON_BN_CLICKED(IDC_OUTVAR_REFRESH, OnApply)
END_MESSAGE_MAP()

COutputFilterConfigTextVar::COutputFilterConfigTextVar(int nNotifierId, CWnd* pParent)
    : COutputFilterConfig(nNotifierId, IDD_OUTPUT_TEXTVAR, pParent), m_nCharSet(-1), m_bAlwaysEnclose(FALSE),
      m_bNamesFirstLine(FALSE), m_bCharSetHintShown(false)
{
}

COutputFilterConfigTextVar::~COutputFilterConfigTextVar() {}

int COutputFilterConfigTextVar::Create(CWnd* pParent)
{
    return CDialog::Create(IDD_OUTPUT_TEXTVAR, pParent);
}

CQoOutputFilterTextVar* COutputFilterConfigTextVar::Filter() const
{
    return dynamic_cast<CQoOutputFilterTextVar*>(m_pOutputFilter);
}

void COutputFilterConfigTextVar::DoDataExchange(CDataExchange* pDX)
{
    COutputFilterConfig::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_OUTVAR_PREVIEW, m_strPreview);
    DDX_CBIndex(pDX, IDC_OUTVAR_CHARSET, m_nCharSet);
    if (pDX->m_bSaveAndValidate) {
        DDX_CBString(pDX, IDC_OUTVAR_DELIMITER, m_strDelimiter);
        DDX_CBString(pDX, IDC_OUTVAR_ENCLOSER, m_strEncloser);
        DDX_CBString(pDX, IDC_OUTVAR_ESCAPE, m_strEscape);
    } else {
        ShowComboText(this, IDC_OUTVAR_DELIMITER, m_strDelimiter);
        ShowComboText(this, IDC_OUTVAR_ENCLOSER, m_strEncloser);
        ShowComboText(this, IDC_OUTVAR_ESCAPE, m_strEscape);
    }
    DDX_Check(pDX, IDC_OUTVAR_ALWAYS_ENCLOSE, m_bAlwaysEnclose);
    DDX_Check(pDX, IDC_OUTVAR_NAMES_FIRST, m_bNamesFirstLine);
}

BOOL COutputFilterConfigTextVar::OnInitDialog()
{
    CDialog::OnInitDialog();
    static const char* const delimiters[] = {kTab, ";", ",", "~", "|"};
    FillCombo(this, IDC_OUTVAR_DELIMITER, 1, delimiters, 5, 1);
    static const char* const enclosers[] = {"\"", "'"};
    FillCombo(this, IDC_OUTVAR_ENCLOSER, 1, enclosers, 2, 0);
    static const char* const escapes[] = {"\\"};
    FillCombo(this, IDC_OUTVAR_ESCAPE, 1, escapes, 1, 0);
    static const char* const charSets[] = {"Windows Ansi", "DOS Ascii"};
    FillCombo(this, IDC_OUTVAR_CHARSET, 0, charSets, 2, 0);

    UpdateOutputFilter(0);
    OnApply();
    return TRUE;
}

void COutputFilterConfigTextVar::Enable(bool bOn)
{
    if (!::IsWindow(m_hWnd))
        return;
    static const int ids[] = {IDC_OUTVAR_LBL_DELIMITER, IDC_OUTVAR_LBL_ENCLOSER, IDC_OUTVAR_LBL_ESCAPE,
                              IDC_OUTVAR_LBL_CHARSET,   IDC_OUTVAR_DELIMITER,    IDC_OUTVAR_ENCLOSER,
                              IDC_OUTVAR_ESCAPE,        IDC_OUTVAR_CHARSET,      IDC_OUTVAR_ALWAYS_ENCLOSE,
                              IDC_OUTVAR_NAMES_FIRST,   IDC_OUTVAR_REFRESH,      IDC_OUTVAR_PREVIEW};
    for (int id : ids)
        if (CWnd* pCtrl = GetDlgItem(id))
            pCtrl->EnableWindow(bOn);
}

void COutputFilterConfigTextVar::DefaultAction()
{
    OnApply();
}

void COutputFilterConfigTextVar::RefreshDisplay()
{
    OnApply();
}

void COutputFilterConfigTextVar::OnOK()
{
    DefaultAction();
}

void COutputFilterConfigTextVar::UpdateOutputFilter(int nSave)
{
    CQoOutputFilterTextVar* pFilter = Filter();
    if (pFilter == NULL)
        return;
    if (nSave == 0) {
        m_strDelimiter = pFilter->Delimiter() == '\t' ? CString(kTab) : TextOf(pFilter->Delimiter());
        m_strEncloser = TextOf(pFilter->Encloser());
        m_strEscape = TextOf(pFilter->Escape());
        m_nCharSet = CharSetIndex(pFilter->FileCharSet());
        m_bAlwaysEnclose = pFilter->ForceEncloser() ? TRUE : FALSE;
        m_bNamesFirstLine = pFilter->WriteHeaderFlag() ? TRUE : FALSE;
        if (::IsWindow(m_hWnd))
            UpdateData(FALSE);
        return;
    }
    if (m_pOutputSource == NULL)
        return;
    if (::IsWindow(m_hWnd))
        UpdateData(TRUE);
    try {
        const int n = m_pOutputSource->GetNumColumns();
        pFilter->NumCols(n);
        for (int i = 0; i < pFilter->NumCols(); ++i) {
            CQoString name;
            m_pOutputSource->GetColumnName(i, name);
            pFilter->ColumnName(i, name);
        }
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
    }
    pFilter->Delimiter(m_strDelimiter == kTab ? '\t' : CharOf(m_strDelimiter));
    pFilter->Encloser(CharOf(m_strEncloser));
    pFilter->Escape(CharOf(m_strEscape));
    pFilter->FileCharSet(CharSetOfIndex(m_nCharSet));
    pFilter->ForceEncloser(m_bAlwaysEnclose == 1);
    pFilter->WriteHeaderFlag(m_bNamesFirstLine == 1);
}

void COutputFilterConfigTextVar::OnApply()
{
    CQoOutputFilterTextVar* pFilter = Filter();
    if (pFilter == NULL || m_pOutputSource == NULL)
        return;
    UpdateOutputFilter(1);
    if (m_nCharSet == 1 && !m_bCharSetHintShown) {
        // Marked first: a preview asked for while the box is open does not show it again.
        m_bCharSetHintShown = true;
        AfxMessageBox(IDS_PREVIEW_DOS_HINT, MB_OK);
    }
    BuildPreview(pFilter);
    if (::IsWindow(m_hWnd))
        UpdateData(FALSE);
}

void COutputFilterConfigTextVar::BuildPreview(CQoOutputFilterTextVar* pFilter)
{
    m_strPreview.Empty();
    // The filter refuses to write such a file; a preview of it would deceive.
    if (const char* problem = pFilter->SettingsProblem()) {
        m_strPreview = problem;
        return;
    }
    try {
        CQoString line;
        pFilter->WriteHeader(&line);
        m_strPreview += line.GetString();
        const int columns = pFilter->NumCols();
        for (long r = 0; r < m_pOutputSource->GetNumRows() && r < previewRows; ++r) {
            pFilter->InitRow();
            for (int c = 0; c < columns; ++c) {
                CQoString value;
                m_pOutputSource->GetValue(r, c, value);
                pFilter->Value(c, value);
            }
            pFilter->WriteRow(&line);
            m_strPreview += line.GetString();
        }
    } catch (CQoException const& e) {
        // The rows so far, then why the next one cannot be written.
        m_strPreview += e.Message();
    }
}
