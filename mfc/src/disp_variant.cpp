// COleVariant, COleDateTime and COleCurrency over oleaut32. Text variants hold
// single-byte Windows-1252 text in a BSTR (see afxdisp.h), so conversions that
// oleaut32 would do on wide text go through a wide copy here.
#include "afxdisp.h"

#include <math.h>
#include <stdio.h>
#include <string.h>
#include <time.h>

#include <string>

namespace {

std::wstring Wide1252(LPCSTR lpsz) {
  int nLength = lstrlenA(lpsz);
  if (nLength == 0) return std::wstring();
  int nWide = MultiByteToWideChar(1252, 0, lpsz, nLength, NULL, 0);
  std::wstring wide((size_t)nWide, L'\0');
  MultiByteToWideChar(1252, 0, lpsz, nLength, &wide[0], nWide);
  return wide;
}

CString Narrow1252(const WCHAR* pwch, UINT nLength) {
  if (nLength == 0) return CString();
  int nBytes = WideCharToMultiByte(1252, 0, pwch, (int)nLength, NULL, 0, NULL, NULL);
  CString str;
  LPSTR p = str.GetBuffer(nBytes);
  WideCharToMultiByte(1252, 0, pwch, (int)nLength, p, nBytes, NULL, NULL);
  str.ReleaseBuffer(nBytes);
  return str;
}

// A DATE's calendar fields; FALSE outside the range OLE dates cover.
BOOL SplitDate(DATE dt, SYSTEMTIME& st) {
  if (!(dt > -657435.0 && dt < 2958466.0)) return FALSE;
  // VariantTimeToSystemTime rounds to whole seconds as MFC's date does.
  return VariantTimeToSystemTime(dt, &st);
}

} // namespace

// ---------------------------------------------------------------------------
// COleCurrency
// ---------------------------------------------------------------------------

COleCurrency::COleCurrency() : m_status(valid) { m_cur.int64 = 0; }

COleCurrency::COleCurrency(CURRENCY cySrc) : m_cur(cySrc), m_status(valid) {}

COleCurrency::COleCurrency(long nUnits, long nFractionalUnits) : m_status(valid) {
  m_cur.int64 = (LONGLONG)nUnits * 10000 + nFractionalUnits;
}

COleCurrency::COleCurrency(const VARIANT& varSrc) : m_status(valid) {
  m_cur.int64 = 0;
  VARIANT v;
  VariantInit(&v);
  if (FAILED(VariantChangeType(&v, const_cast<VARIANT*>(&varSrc), 0, VT_CY)))
    m_status = invalid;
  else
    m_cur = V_CY(&v);
  VariantClear(&v);
}

CString COleCurrency::Format(DWORD dwFlags, LCID lcid) const {
  if (m_status == null) return CString();
  if (m_status == invalid) return CString("Invalid currency");
  BSTR bstr = NULL;
  if (FAILED(VarBstrFromCy(m_cur, lcid, dwFlags, &bstr))) return CString();
  CString str = Narrow1252(bstr, SysStringLen(bstr));
  SysFreeString(bstr);
  return str;
}

BOOL COleCurrency::ParseCurrency(LPCTSTR lpszCurrency, DWORD dwFlags, LCID lcid) {
  std::wstring wide = Wide1252(lpszCurrency != NULL ? lpszCurrency : "");
  CY cy;
  if (FAILED(VarCyFromStr(const_cast<OLECHAR*>(wide.c_str()), lcid, dwFlags, &cy))) {
    m_status = invalid;
    return FALSE;
  }
  m_cur = cy;
  m_status = valid;
  return TRUE;
}

// ---------------------------------------------------------------------------
// COleDateTime
// ---------------------------------------------------------------------------

COleDateTime::COleDateTime() : m_dt(0), m_status(valid) {}

COleDateTime::COleDateTime(DATE dtSrc) : m_dt(dtSrc), m_status(valid) {}

COleDateTime::COleDateTime(int nYear, int nMonth, int nDay, int nHour, int nMin, int nSec) : m_dt(0), m_status(valid) {
  SetDateTime(nYear, nMonth, nDay, nHour, nMin, nSec);
}

COleDateTime::COleDateTime(const VARIANT& varSrc) : m_dt(0), m_status(valid) {
  VARIANT v;
  VariantInit(&v);
  if (FAILED(VariantChangeType(&v, const_cast<VARIANT*>(&varSrc), 0, VT_DATE)))
    m_status = invalid;
  else
    m_dt = V_DATE(&v);
  VariantClear(&v);
}

COleDateTime COleDateTime::GetCurrentTime() {
  SYSTEMTIME st;
  GetLocalTime(&st);
  return COleDateTime(st.wYear, st.wMonth, st.wDay, st.wHour, st.wMinute, st.wSecond);
}

int COleDateTime::SetDateTime(int nYear, int nMonth, int nDay, int nHour, int nMin, int nSec) {
  SYSTEMTIME st = {};
  st.wYear = (WORD)nYear;
  st.wMonth = (WORD)nMonth;
  st.wDay = (WORD)nDay;
  st.wHour = (WORD)nHour;
  st.wMinute = (WORD)nMin;
  st.wSecond = (WORD)nSec;
  // SystemTimeToVariantTime carries over days past the month's end: MFC
  // calls such a date invalid, and so do we.
  static const int kDays[] = {31, 29, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  BOOL bOk = nYear >= 100 && nYear <= 9999 && nMonth >= 1 && nMonth <= 12 && nDay >= 1 && nDay <= kDays[nMonth - 1] &&
             nHour >= 0 && nHour <= 23 && nMin >= 0 && nMin <= 59 && nSec >= 0 && nSec <= 59;
  if (bOk && nMonth == 2 && nDay == 29) bOk = (nYear % 4 == 0 && nYear % 100 != 0) || nYear % 400 == 0;
  DATE dt = 0;
  if (bOk && SystemTimeToVariantTime(&st, &dt)) {
    m_dt = dt;
    m_status = valid;
    return 0;
  }
  m_dt = 0;
  m_status = invalid;
  return 1;
}

#define QO_DATE_PART(name, field)                                                                                     \
  int COleDateTime::name() const {                                                                                     \
    SYSTEMTIME st;                                                                                                     \
    return m_status == valid && SplitDate(m_dt, st) ? (int)st.field : -1;                                              \
  }
QO_DATE_PART(GetYear, wYear)
QO_DATE_PART(GetMonth, wMonth)
QO_DATE_PART(GetDay, wDay)
QO_DATE_PART(GetHour, wHour)
QO_DATE_PART(GetMinute, wMinute)
QO_DATE_PART(GetSecond, wSecond)
#undef QO_DATE_PART

CString COleDateTime::Format(LPCTSTR lpszFormat) const {
  if (m_status == null) return CString();
  SYSTEMTIME st;
  if (m_status != valid || !SplitDate(m_dt, st)) return CString("Invalid DateTime");
  struct tm t = {};
  t.tm_year = st.wYear - 1900;
  t.tm_mon = st.wMonth - 1;
  t.tm_mday = st.wDay;
  t.tm_hour = st.wHour;
  t.tm_min = st.wMinute;
  t.tm_sec = st.wSecond;
  t.tm_wday = st.wDayOfWeek;
  char szOut[512];
  size_t n = strftime(szOut, sizeof(szOut), lpszFormat != NULL ? lpszFormat : "", &t);
  return CString(szOut, (int)n);
}

BOOL COleDateTime::ParseDateTime(LPCTSTR lpszDate, DWORD dwFlags, LCID lcid) {
  std::wstring wide = Wide1252(lpszDate != NULL ? lpszDate : "");
  DATE dt = 0;
  if (wide.empty() || FAILED(VarDateFromStr(const_cast<OLECHAR*>(wide.c_str()), lcid, dwFlags, &dt))) {
    m_status = invalid;
    return FALSE;
  }
  m_dt = dt;
  m_status = valid;
  return TRUE;
}

// ---------------------------------------------------------------------------
// COleVariant
// ---------------------------------------------------------------------------

COleVariant::COleVariant() { VariantInit(this); }

COleVariant::COleVariant(const VARIANT& varSrc) {
  VariantInit(this);
  VariantCopy(this, const_cast<VARIANT*>(&varSrc));
}

COleVariant::COleVariant(const COleVariant& varSrc) : tagVARIANT() {
  VariantInit(this);
  VariantCopy(this, const_cast<COleVariant*>(&varSrc));
}

COleVariant::COleVariant(LPCTSTR lpszSrc, VARTYPE vtSrc) {
  VariantInit(this);
  ASSERT(vtSrc == VT_BSTR || vtSrc == VT_BSTRT);
  LPCSTR p = lpszSrc != NULL ? lpszSrc : "";
  vt = VT_BSTR;
  if (vtSrc == VT_BSTRT) {
    bstrVal = SysAllocStringByteLen(p, (UINT)lstrlenA(p));
  } else {
    std::wstring wide = Wide1252(p);
    bstrVal = SysAllocStringLen(wide.data(), (UINT)wide.size());
  }
  if (bstrVal == NULL) AfxThrowMemoryException();
}

COleVariant::COleVariant(const CString& strSrc) {
  VariantInit(this);
  vt = VT_BSTR;
  std::wstring wide = Wide1252(strSrc);
  bstrVal = SysAllocStringLen(wide.data(), (UINT)wide.size());
  if (bstrVal == NULL) AfxThrowMemoryException();
}

COleVariant::COleVariant(BYTE nSrc) {
  VariantInit(this);
  vt = VT_UI1;
  bVal = nSrc;
}

COleVariant::COleVariant(short nSrc, VARTYPE vtSrc) {
  VariantInit(this);
  ASSERT(vtSrc == VT_I2 || vtSrc == VT_BOOL);
  if (vtSrc == VT_BOOL) {
    vt = VT_BOOL;
    boolVal = nSrc ? VARIANT_TRUE : VARIANT_FALSE;
  } else {
    vt = VT_I2;
    iVal = nSrc;
  }
}

COleVariant::COleVariant(long lSrc, VARTYPE vtSrc) {
  VariantInit(this);
  ASSERT(vtSrc == VT_I4 || vtSrc == VT_ERROR || vtSrc == VT_BOOL);
  if (vtSrc == VT_BOOL) {
    vt = VT_BOOL;
    boolVal = lSrc ? VARIANT_TRUE : VARIANT_FALSE;
  } else if (vtSrc == VT_ERROR) {
    vt = VT_ERROR;
    scode = lSrc;
  } else {
    vt = VT_I4;
    lVal = lSrc;
  }
}

COleVariant::COleVariant(float fltSrc) {
  VariantInit(this);
  vt = VT_R4;
  fltVal = fltSrc;
}

COleVariant::COleVariant(double dblSrc) {
  VariantInit(this);
  vt = VT_R8;
  dblVal = dblSrc;
}

COleVariant::COleVariant(const COleCurrency& curSrc) {
  VariantInit(this);
  vt = VT_CY;
  cyVal = curSrc.m_cur;
}

COleVariant::COleVariant(const COleDateTime& timeSrc) {
  VariantInit(this);
  vt = VT_DATE;
  date = timeSrc.m_dt;
}

COleVariant::~COleVariant() { VariantClear(this); }

COleVariant& COleVariant::operator=(const VARIANT& varSrc) {
  if (static_cast<const VARIANT*>(this) != &varSrc) {
    VariantClear(this);
    if (FAILED(VariantCopy(this, const_cast<VARIANT*>(&varSrc)))) AfxThrowMemoryException();
  }
  return *this;
}

COleVariant& COleVariant::operator=(const COleVariant& varSrc) { return operator=(static_cast<const VARIANT&>(varSrc)); }

void COleVariant::Clear() { VariantClear(this); }

void COleVariant::ChangeType(VARTYPE vartype, LPVARIANT pSrc) {
  if (pSrc == NULL) pSrc = this;
  if (pSrc == this && vartype == vt) return;
  VARIANT result;
  VariantInit(&result);
  HRESULT hr;
  if (V_VT(pSrc) == VT_BSTR && vartype != VT_BSTR) {
    // The text is single-byte here: oleaut32 reads BSTRs as wide text.
    UINT nBytes = SysStringByteLen(V_BSTR(pSrc));
    std::string bytes((const char*)V_BSTR(pSrc), nBytes);
    std::wstring wide = Wide1252(bytes.c_str());
    VARIANT wideSrc;
    VariantInit(&wideSrc);
    V_VT(&wideSrc) = VT_BSTR;
    V_BSTR(&wideSrc) = SysAllocStringLen(wide.data(), (UINT)wide.size());
    hr = VariantChangeType(&result, &wideSrc, 0, vartype);
    VariantClear(&wideSrc);
  } else if (V_VT(pSrc) != VT_BSTR && vartype == VT_BSTR) {
    hr = VariantChangeType(&result, pSrc, 0, VT_BSTR);
    if (SUCCEEDED(hr)) {
      CString str = Narrow1252(V_BSTR(&result), SysStringLen(V_BSTR(&result)));
      VariantClear(&result);
      V_VT(&result) = VT_BSTR;
      V_BSTR(&result) = SysAllocStringByteLen(str, (UINT)str.GetLength());
    }
  } else {
    hr = VariantChangeType(&result, pSrc, 0, vartype);
  }
  if (FAILED(hr)) {
    VariantClear(&result);
    AfxThrowInvalidArgException();   // the subset has no COleException
  }
  VariantClear(this);
  *static_cast<VARIANT*>(this) = result;
}

void COleVariant::SetBytes(const void* pData, UINT nBytes) {
  VariantClear(this);
  SAFEARRAY* psa = SafeArrayCreateVector(VT_UI1, 0, nBytes);
  if (psa == NULL) AfxThrowMemoryException();
  if (nBytes > 0) {
    void* pDest = NULL;
    SafeArrayAccessData(psa, &pDest);
    memcpy(pDest, pData, nBytes);
    SafeArrayUnaccessData(psa);
  }
  vt = VT_ARRAY | VT_UI1;
  parray = psa;
}
