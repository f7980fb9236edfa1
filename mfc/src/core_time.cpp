// CTime over the C runtime's 64-bit time functions.
#include "afx.h"

#include <string.h>

CTime PASCAL CTime::GetCurrentTime() { return CTime(_time64(NULL)); }

CTime::CTime(int nYear, int nMonth, int nDay, int nHour, int nMin, int nSec, int nDST) {
  struct tm t;
  memset(&t, 0, sizeof(t));
  t.tm_year = nYear - 1900;
  t.tm_mon = nMonth - 1;
  t.tm_mday = nDay;
  t.tm_hour = nHour;
  t.tm_min = nMin;
  t.tm_sec = nSec;
  t.tm_isdst = nDST;
  m_time = _mktime64(&t);
  if (m_time == -1) AfxThrowInvalidArgException(); // outside what the runtime can represent
}

CTime::CTime(const SYSTEMTIME& st, int nDST) : m_time(0) {
  if (st.wYear < 1900) return; // a null time, as MFC makes it
  *this = CTime(st.wYear, st.wMonth, st.wDay, st.wHour, st.wMinute, st.wSecond, nDST);
}

CTime::CTime(const FILETIME& ft, int nDST) : m_time(0) {
  (void)nDST;
  ULARGE_INTEGER u;
  u.LowPart = ft.dwLowDateTime;
  u.HighPart = ft.dwHighDateTime;
  if (u.QuadPart == 0) return;
  // 100-ns intervals since 1601 -> seconds since 1970, both UTC.
  m_time = (__time64_t)((LONGLONG)(u.QuadPart / 10000000ULL) - 11644473600LL);
}

struct tm* CTime::GetLocalTm(struct tm* ptm) const {
  ASSERT(ptm != NULL);
  struct tm* p = _localtime64(&m_time);
  if (p == NULL) return NULL;
  *ptm = *p;
  return ptm;
}

struct tm* CTime::GetGmtTm(struct tm* ptm) const {
  ASSERT(ptm != NULL);
  struct tm* p = _gmtime64(&m_time);
  if (p == NULL) return NULL;
  *ptm = *p;
  return ptm;
}

BOOL CTime::GetAsSystemTime(SYSTEMTIME& st) const {
  struct tm t;
  if (GetLocalTm(&t) == NULL) return FALSE;
  st.wYear = (WORD)(t.tm_year + 1900);
  st.wMonth = (WORD)(t.tm_mon + 1);
  st.wDayOfWeek = (WORD)t.tm_wday;
  st.wDay = (WORD)t.tm_mday;
  st.wHour = (WORD)t.tm_hour;
  st.wMinute = (WORD)t.tm_min;
  st.wSecond = (WORD)t.tm_sec;
  st.wMilliseconds = 0;
  return TRUE;
}

static int LocalPart(__time64_t t, int tm::*part) {
  struct tm* p = _localtime64(&t);
  return p == NULL ? 0 : p->*part;
}

int CTime::GetYear() const { return LocalPart(m_time, &tm::tm_year) + 1900; }
int CTime::GetMonth() const { return LocalPart(m_time, &tm::tm_mon) + 1; }
int CTime::GetDay() const { return LocalPart(m_time, &tm::tm_mday); }
int CTime::GetHour() const { return LocalPart(m_time, &tm::tm_hour); }
int CTime::GetMinute() const { return LocalPart(m_time, &tm::tm_min); }
int CTime::GetSecond() const { return LocalPart(m_time, &tm::tm_sec); }
int CTime::GetDayOfWeek() const { return LocalPart(m_time, &tm::tm_wday) + 1; }

static CString FormatTm(const struct tm* ptm, LPCSTR pszFormat) {
  CString str;
  if (ptm == NULL || pszFormat == NULL || *pszFormat == '\0') return str;
  for (size_t nSize = 128; nSize <= 65536; nSize *= 4) {
    LPSTR pBuf = str.GetBuffer((int)nSize);
    size_t n = strftime(pBuf, nSize, pszFormat, ptm);
    if (n > 0 || nSize >= 65536) {
      str.ReleaseBuffer((int)n);
      return str;
    }
  }
  str.ReleaseBuffer(0);
  return str;
}

CString CTime::Format(LPCSTR pszFormat) const {
  struct tm t;
  return FormatTm(GetLocalTm(&t), pszFormat);
}

CString CTime::FormatGmt(LPCSTR pszFormat) const {
  struct tm t;
  return FormatTm(GetGmtTm(&t), pszFormat);
}
