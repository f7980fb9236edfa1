// Automation value types of the MFC subset: COleVariant (a VARIANT that owns
// its contents), COleDateTime (an OLE date: days since 30 Dec 1899 as a
// double) and COleCurrency (a CY: a 64-bit integer of 1/10000 units).
//
// Text in a COleVariant is kept as MFC's ANSI build keeps it when asked for
// VT_BSTRT: a BSTR holding single-byte Windows-1252 characters (SysAllocStringByteLen),
// so `V_BSTR(&v)` reads as `const char*`. The file-database engine hands out
// its text fields so, and `(LPCSTR)v.bstrVal` gives the text back.
#pragma once

#include "afx.h"

#include <oleauto.h>

class COleCurrency;
class COleDateTime;

// ---------------------------------------------------------------------------
// COleCurrency
// ---------------------------------------------------------------------------

class AFX_API COleCurrency {
public:
  enum CurrencyStatus { valid = 0, invalid = 1, null = 2 };

  COleCurrency();
  COleCurrency(CURRENCY cySrc);
  COleCurrency(long nUnits, long nFractionalUnits);
  explicit COleCurrency(const VARIANT& varSrc);

  // The value in the user's locale (VarFormatCurrency-like: digits with the
  // locale's separators), as VarBstrFromCy does for dwFlags and lcid.
  CString Format(DWORD dwFlags = 0, LCID lcid = LANG_USER_DEFAULT) const;
  BOOL ParseCurrency(LPCTSTR lpszCurrency, DWORD dwFlags = 0, LCID lcid = LANG_USER_DEFAULT);

  CURRENCY m_cur;
  CurrencyStatus m_status;
};

// ---------------------------------------------------------------------------
// COleDateTime
// ---------------------------------------------------------------------------

class AFX_API COleDateTime {
public:
  enum DateTimeStatus { valid = 0, invalid = 1, null = 2 };

  COleDateTime();
  COleDateTime(DATE dtSrc);
  COleDateTime(int nYear, int nMonth, int nDay, int nHour, int nMin, int nSec);
  explicit COleDateTime(const VARIANT& varSrc);

  static COleDateTime GetCurrentTime();

  int SetDateTime(int nYear, int nMonth, int nDay, int nHour, int nMin, int nSec);
  int GetYear() const;
  int GetMonth() const;
  int GetDay() const;
  int GetHour() const;
  int GetMinute() const;
  int GetSecond() const;
  DateTimeStatus GetStatus() const { return m_status; }

  // strftime-style formatting of the date and time ("%m %d %y", "%d.%m.%Y").
  CString Format(LPCTSTR lpszFormat) const;
  // Parses a date and/or time in the user's locale (VarDateFromStr); FALSE when it is none.
  BOOL ParseDateTime(LPCTSTR lpszDate, DWORD dwFlags = 0, LCID lcid = LANG_USER_DEFAULT);

  DATE m_dt;
  DateTimeStatus m_status;
};

// ---------------------------------------------------------------------------
// COleVariant
// ---------------------------------------------------------------------------

class AFX_API COleVariant : public tagVARIANT {
public:
  COleVariant();                                   // VT_EMPTY
  COleVariant(const VARIANT& varSrc);
  COleVariant(const COleVariant& varSrc);
  // Text: VT_BSTRT keeps the single-byte text (what the engine uses),
  // VT_BSTR makes a wide BSTR of it.
  COleVariant(LPCTSTR lpszSrc, VARTYPE vtSrc = VT_BSTR);
  COleVariant(const CString& strSrc);
  COleVariant(BYTE nSrc);
  COleVariant(short nSrc, VARTYPE vtSrc = VT_I2);  // VT_I2 or VT_BOOL
  COleVariant(long lSrc, VARTYPE vtSrc = VT_I4);   // VT_I4, VT_ERROR or VT_BOOL
  COleVariant(float fltSrc);
  COleVariant(double dblSrc);
  COleVariant(const COleCurrency& curSrc);
  COleVariant(const COleDateTime& timeSrc);
  ~COleVariant();

  COleVariant& operator=(const VARIANT& varSrc);
  COleVariant& operator=(const COleVariant& varSrc);

  void Clear();
  void ChangeType(VARTYPE vartype, LPVARIANT pSrc = NULL);
  // Raw bytes as VT_ARRAY|VT_UI1.
  void SetBytes(const void* pData, UINT nBytes);

  operator LPVARIANT() { return this; }
  operator const VARIANT*() const { return this; }
};

// Asks COleVariant's text constructor for a VT_BSTR that holds the
// single-byte text as it is (the variant's type is VT_BSTR).
#ifndef VT_BSTRT
#define VT_BSTRT ((VARTYPE)0x0FFF)
#endif

// Parameter descriptions of CWnd::InvokeHelper, one byte (the VARTYPE) per argument:
//     static BYTE parms[] = VTS_I4 VTS_BSTR;
//     InvokeHelper(5, DISPATCH_METHOD, VT_BOOL, &bResult, parms, 12L, "Text");
#define VTS_NONE ""
#define VTS_I2 "\x02"
#define VTS_I4 "\x03"
#define VTS_R8 "\x05"
#define VTS_BSTR "\x08"
#define VTS_DISPATCH "\x09"
#define VTS_BOOL "\x0B"
#define VTS_VARIANT "\x0C"
