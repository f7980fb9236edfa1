// Dialog data exchange: members <-> controls, with the German prompts of
// qomfc.dll when the user's input cannot be taken.
#include <limits>
#include <type_traits>
#include "afxpriv.h"

#include <errno.h>
#include <float.h>
#include <limits.h>
#include <stdlib.h>

CDataExchange::CDataExchange(CWnd* pDlgWnd, BOOL bSaveAndValidate)
    : m_bSaveAndValidate(bSaveAndValidate), m_pDlgWnd(pDlgWnd), m_idLastControl(0), m_bEditLastControl(FALSE) {
  ASSERT(pDlgWnd != NULL && ::IsWindow(pDlgWnd->m_hWnd));
}

HWND CDataExchange::PrepareCtrl(int nIDC) {
  ASSERT(nIDC != 0 && nIDC != -1); // IDC_STATIC cannot be exchanged
  HWND hWndCtrl = ::GetDlgItem(m_pDlgWnd->m_hWnd, nIDC);
  if (hWndCtrl == NULL) {
    ASSERT(FALSE); // no such control in the template
    AfxThrowNotSupportedException();
  }
  m_idLastControl = nIDC;
  m_bEditLastControl = FALSE;
  return hWndCtrl;
}

HWND CDataExchange::PrepareEditCtrl(int nIDC) {
  HWND hWndCtrl = PrepareCtrl(nIDC);
  m_bEditLastControl = TRUE;
  return hWndCtrl;
}

void CDataExchange::Fail() {
  if (m_bSaveAndValidate && m_idLastControl != 0) {
    HWND hWndLast = ::GetDlgItem(m_pDlgWnd->m_hWnd, m_idLastControl);
    if (hWndLast != NULL) {
      // Through the dialog so that the default button follows the focus.
      if (m_pDlgWnd->IsKindOf(RUNTIME_CLASS(CDialog)))
        ::SendMessageA(m_pDlgWnd->m_hWnd, WM_NEXTDLGCTL, (WPARAM)hWndLast, 1L);
      else
        ::SetFocus(hWndLast);
      if (m_bEditLastControl) ::SendMessageA(hWndLast, EM_SETSEL, 0, -1);
    }
  }
  AfxThrowUserException();
  __builtin_unreachable();
}

namespace {

CString GetText(HWND hWnd) {
  CString str;
  int nLen = ::GetWindowTextLengthA(hWnd);
  int nGot = ::GetWindowTextA(hWnd, str.GetBufferSetLength(nLen), nLen + 1);
  str.ReleaseBuffer(nGot < nLen ? nGot : -1);
  return str;
}

// The text without surrounding blanks; FALSE for an empty text.
BOOL Trimmed(HWND hWnd, CString& str) {
  str = GetText(hWnd);
  str.Trim();
  return !str.IsEmpty();
}

BOOL ParseSigned(HWND hWnd, long long llMin, long long llMax, long long& value) {
  CString str;
  if (!Trimmed(hWnd, str)) return FALSE;
  char* pEnd = NULL;
  errno = 0;
  long long v = strtoll(str, &pEnd, 10);
  if (errno != 0 || pEnd == (LPCSTR)str || *pEnd != '\0' || v < llMin || v > llMax) return FALSE;
  value = v;
  return TRUE;
}

BOOL ParseUnsigned(HWND hWnd, unsigned long long ullMax, unsigned long long& value) {
  CString str;
  if (!Trimmed(hWnd, str)) return FALSE;
  if (str[0] == '-') return FALSE; // no silent wrap-around of negative numbers
  char* pEnd = NULL;
  errno = 0;
  unsigned long long v = strtoull(str, &pEnd, 10);
  if (errno != 0 || pEnd == (LPCSTR)str || *pEnd != '\0' || v > ullMax) return FALSE;
  value = v;
  return TRUE;
}

[[noreturn]] void FailWith(CDataExchange* pDX, UINT nIDPrompt) {
  AfxMessageBox(nIDPrompt, MB_OK | MB_ICONEXCLAMATION);
  pDX->Fail();
}

// An integer field: parsed within the type's range (unsigned types refuse a
// minus sign), shown in decimal.
template <class T>
void ExchangeInteger(CDataExchange* pDX, int nIDC, T& value) {
  HWND hWndCtrl = pDX->PrepareEditCtrl(nIDC);
  if (pDX->m_bSaveAndValidate) {
    if (std::is_signed<T>::value) {
      long long v;
      if (!ParseSigned(hWndCtrl, std::numeric_limits<T>::min(), std::numeric_limits<T>::max(), v))
        FailWith(pDX, AFX_IDP_PARSE_INT);
      value = (T)v;
    } else {
      unsigned long long v;
      if (!ParseUnsigned(hWndCtrl, std::numeric_limits<T>::max(), v)) FailWith(pDX, AFX_IDP_PARSE_UINT);
      value = (T)v;
    }
  } else {
    char sz[32];
    if (std::is_signed<T>::value)
      snprintf(sz, sizeof(sz), "%lld", (long long)value);
    else
      snprintf(sz, sizeof(sz), "%llu", (unsigned long long)value);
    AfxSetWindowText(hWndCtrl, sz);
  }
}

} // namespace

void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, CString& value) {
  HWND hWndCtrl = pDX->PrepareEditCtrl(nIDC);
  if (pDX->m_bSaveAndValidate)
    value = GetText(hWndCtrl);
  else
    AfxSetWindowText(hWndCtrl, value);
}

void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, int& value) { ExchangeInteger(pDX, nIDC, value); }
void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, long& value) { ExchangeInteger(pDX, nIDC, value); }
void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, UINT& value) { ExchangeInteger(pDX, nIDC, value); }
void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, DWORD& value) { ExchangeInteger(pDX, nIDC, value); }

void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, double& value) {
  HWND hWndCtrl = pDX->PrepareEditCtrl(nIDC);
  if (pDX->m_bSaveAndValidate) {
    CString str;
    if (!Trimmed(hWndCtrl, str)) FailWith(pDX, AFX_IDP_PARSE_REAL);
    char* pEnd = NULL;
    errno = 0;
    double d = strtod(str, &pEnd);
    if (errno == ERANGE || pEnd == (LPCSTR)str || *pEnd != '\0' || d != d) FailWith(pDX, AFX_IDP_PARSE_REAL);
    value = d;
  } else {
    char sz[64];
    snprintf(sz, sizeof(sz), "%.*g", DBL_DIG, value);
    AfxSetWindowText(hWndCtrl, sz);
  }
}

void AFXAPI DDX_Check(CDataExchange* pDX, int nIDC, int& value) {
  HWND hWndCtrl = pDX->PrepareCtrl(nIDC);
  if (pDX->m_bSaveAndValidate) {
    value = (int)::SendMessageA(hWndCtrl, BM_GETCHECK, 0, 0);
  } else {
    ASSERT(value >= 0 && value <= 2);
    ::SendMessageA(hWndCtrl, BM_SETCHECK, (WPARAM)value, 0);
  }
}

void AFXAPI DDX_Radio(CDataExchange* pDX, int nIDC, int& value) {
  HWND hWndCtrl = pDX->PrepareCtrl(nIDC);
  // nIDC is the first radio button of its group (WS_GROUP); the group ends at
  // the next control with WS_GROUP.
  ASSERT(::GetWindowLongA(hWndCtrl, GWL_STYLE) & WS_GROUP);
  if (pDX->m_bSaveAndValidate) value = -1;
  int iButton = 0;
  do {
    if (::SendMessageA(hWndCtrl, WM_GETDLGCODE, 0, 0) & DLGC_RADIOBUTTON) {
      if (pDX->m_bSaveAndValidate) {
        if (::SendMessageA(hWndCtrl, BM_GETCHECK, 0, 0) != 0) value = iButton;
      } else {
        ::SendMessageA(hWndCtrl, BM_SETCHECK, iButton == value, 0);
      }
      iButton++;
    }
    hWndCtrl = ::GetWindow(hWndCtrl, GW_HWNDNEXT);
  } while (hWndCtrl != NULL && !(::GetWindowLongA(hWndCtrl, GWL_STYLE) & WS_GROUP));
}

void AFXAPI DDX_Control(CDataExchange* pDX, int nIDC, CWnd& rControl) {
  if (rControl.m_hWnd != NULL) return; // exchanged once, when the dialog starts
  HWND hWndCtrl = pDX->PrepareCtrl(nIDC);
  if (!rControl.SubclassWindow(hWndCtrl)) {
    ASSERT(FALSE); // the control belongs to another CWnd already
    AfxThrowNotSupportedException();
  }
}

void AFXAPI DDX_CBIndex(CDataExchange* pDX, int nIDC, int& index) {
  HWND hWndCtrl = pDX->PrepareCtrl(nIDC);
  if (pDX->m_bSaveAndValidate)
    index = (int)::SendMessageA(hWndCtrl, CB_GETCURSEL, 0, 0);
  else
    ::SendMessageA(hWndCtrl, CB_SETCURSEL, (WPARAM)index, 0);
}

void AFXAPI DDX_CBString(CDataExchange* pDX, int nIDC, CString& value) {
  HWND hWndCtrl = pDX->PrepareCtrl(nIDC);
  DWORD dwStyle = (DWORD)::GetWindowLongA(hWndCtrl, GWL_STYLE);
  if (pDX->m_bSaveAndValidate) {
    if ((dwStyle & 0x3) == CBS_DROPDOWNLIST) {
      int nIndex = (int)::SendMessageA(hWndCtrl, CB_GETCURSEL, 0, 0);
      value.Empty();
      if (nIndex != CB_ERR) {
        int nLen = (int)::SendMessageA(hWndCtrl, CB_GETLBTEXTLEN, nIndex, 0);
        if (nLen > 0) {
          ::SendMessageA(hWndCtrl, CB_GETLBTEXT, nIndex, (LPARAM)value.GetBufferSetLength(nLen));
          value.ReleaseBuffer();
        }
      }
    } else {
      value = GetText(hWndCtrl);
    }
  } else {
    // The matching item if there is one; else the text (combo boxes with an edit field).
    if (::SendMessageA(hWndCtrl, CB_SELECTSTRING, (WPARAM)-1, (LPARAM)(LPCSTR)value) == CB_ERR) {
      if ((dwStyle & 0x3) != CBS_DROPDOWNLIST)
        AfxSetWindowText(hWndCtrl, value);
      else
        ::SendMessageA(hWndCtrl, CB_SETCURSEL, (WPARAM)-1, 0);
    }
  }
}

// As DDX_CBString, but loading does not take an item that merely begins with the
// value: an empty value or "[" leaves the edit text as it is given.
void AFXAPI DDX_CBStringExact(CDataExchange* pDX, int nIDC, CString& value) {
  if (pDX->m_bSaveAndValidate) {
    DDX_CBString(pDX, nIDC, value);
    return;
  }
  HWND hWndCtrl = pDX->PrepareCtrl(nIDC);
  DWORD dwStyle = (DWORD)::GetWindowLongA(hWndCtrl, GWL_STYLE);
  int nIndex = (int)::SendMessageA(hWndCtrl, CB_FINDSTRINGEXACT, (WPARAM)-1, (LPARAM)(LPCSTR)value);
  if (nIndex != CB_ERR) {
    ::SendMessageA(hWndCtrl, CB_SETCURSEL, (WPARAM)nIndex, 0);
  } else if ((dwStyle & 0x3) != CBS_DROPDOWNLIST) {
    ::SendMessageA(hWndCtrl, CB_SETCURSEL, (WPARAM)-1, 0);
    AfxSetWindowText(hWndCtrl, value);
  } else {
    ::SendMessageA(hWndCtrl, CB_SETCURSEL, (WPARAM)-1, 0);
  }
}

void AFXAPI DDX_LBIndex(CDataExchange* pDX, int nIDC, int& index) {
  HWND hWndCtrl = pDX->PrepareCtrl(nIDC);
  if (pDX->m_bSaveAndValidate)
    index = (int)::SendMessageA(hWndCtrl, LB_GETCURSEL, 0, 0);
  else
    ::SendMessageA(hWndCtrl, LB_SETCURSEL, (WPARAM)index, 0);
}

void AFXAPI DDX_LBString(CDataExchange* pDX, int nIDC, CString& value) {
  HWND hWndCtrl = pDX->PrepareCtrl(nIDC);
  if (pDX->m_bSaveAndValidate) {
    int nIndex = (int)::SendMessageA(hWndCtrl, LB_GETCURSEL, 0, 0);
    value.Empty();
    if (nIndex != LB_ERR) {
      int nLen = (int)::SendMessageA(hWndCtrl, LB_GETTEXTLEN, nIndex, 0);
      if (nLen > 0) {
        ::SendMessageA(hWndCtrl, LB_GETTEXT, nIndex, (LPARAM)value.GetBufferSetLength(nLen));
        value.ReleaseBuffer();
      }
    }
  } else {
    if (::SendMessageA(hWndCtrl, LB_SELECTSTRING, (WPARAM)-1, (LPARAM)(LPCSTR)value) == LB_ERR)
      ::SendMessageA(hWndCtrl, LB_SETCURSEL, (WPARAM)-1, 0);
  }
}

void AFXAPI DDV_MaxChars(CDataExchange* pDX, CString const& value, int nChars) {
  ASSERT(nChars >= 1);
  if (pDX->m_bSaveAndValidate) {
    if (value.GetLength() > nChars) {
      char szT[32];
      snprintf(szT, sizeof(szT), "%d", nChars);
      CString prompt;
      AfxFormatString1(prompt, AFX_IDP_PARSE_STRING_SIZE, szT);
      AfxMessageBox(prompt, MB_ICONEXCLAMATION, AFX_IDP_PARSE_STRING_SIZE);
      pDX->Fail();
    }
  } else if (pDX->m_idLastControl != 0 && pDX->m_bEditLastControl) {
    // The edit control refuses longer input from the start.
    HWND hWndLast = ::GetDlgItem(pDX->m_pDlgWnd->m_hWnd, pDX->m_idLastControl);
    if (hWndLast != NULL) ::SendMessageA(hWndLast, EM_LIMITTEXT, nChars, 0);
  }
}

void AFXAPI DDV_MinMaxInt(CDataExchange* pDX, int value, int minVal, int maxVal) {
  ASSERT(minVal <= maxVal);
  if (!pDX->m_bSaveAndValidate || (value >= minVal && value <= maxVal)) return;
  char szMin[32], szMax[32];
  snprintf(szMin, sizeof(szMin), "%d", minVal);
  snprintf(szMax, sizeof(szMax), "%d", maxVal);
  CString prompt;
  AfxFormatString2(prompt, AFX_IDP_PARSE_INT_RANGE, szMin, szMax);
  AfxMessageBox(prompt, MB_ICONEXCLAMATION, AFX_IDP_PARSE_INT_RANGE);
  pDX->Fail();
}
