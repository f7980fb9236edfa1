// CString: a length-counted char buffer with a header in front of the text.
// An empty string points at one shared, never written header, so default
// construction allocates nothing.
#include "afx.h"

#include <limits.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include <algorithm>

namespace {

struct NilString {
  CStringData data;
  char text[8];
};
NilString g_nil = {{0, 0}, {0}};

inline LPSTR NilText() { return g_nil.data.data(); }

inline int SafeLength(LPCSTR lpsz) { return lpsz == NULL ? 0 : (int)strlen(lpsz); }

// Case mapping of Windows-1252.
struct CaseTables {
  unsigned char lower[256];
  unsigned char upper[256];
  CaseTables() {
    for (int c = 0; c < 256; ++c) lower[c] = upper[c] = (unsigned char)c;
    auto pair = [this](int up, int low) {
      lower[up] = (unsigned char)low;
      upper[low] = (unsigned char)up;
    };
    for (int c = 'A'; c <= 'Z'; ++c) pair(c, c + 32);
    for (int c = 0xC0; c <= 0xDE; ++c)
      if (c != 0xD7) pair(c, c + 32); // 0xD7 is the multiplication sign
    pair(0x8A, 0x9A); // Š š
    pair(0x8C, 0x9C); // Œ œ
    pair(0x8E, 0x9E); // Ž ž
    pair(0x9F, 0xFF); // Ÿ ÿ
  }
};
const CaseTables g_case;

inline bool IsTrimSpace(char ch) {
  return ch == ' ' || ch == '\t' || ch == '\n' || ch == '\v' || ch == '\f' || ch == '\r';
}

inline bool InSet(LPCSTR lpszSet, char ch) { return ch != '\0' && strchr(lpszSet, ch) != NULL; }

} // namespace

// ---------------------------------------------------------------------------
// Buffer management
// ---------------------------------------------------------------------------

void CString::AllocBuffer(int nLen) {
  // Replaces the buffer by a new one of nLen characters (contents undefined).
  ASSERT(nLen >= 0);
  CStringData* pData = static_cast<CStringData*>(malloc(sizeof(CStringData) + (size_t)nLen + 1));
  if (pData == NULL) AfxThrowMemoryException();
  pData->nAllocLength = nLen;
  pData->nDataLength = nLen;
  pData->data()[nLen] = '\0';
  m_pchData = pData->data();
}

void CString::Release() {
  if (m_pchData != NilText()) free(GetData());
  m_pchData = NilText();
}

void CString::EnsureCapacity(int nLen) {
  // Room for nLen characters, keeping the contents; the buffer is then writable.
  ASSERT(nLen >= 0);
  CStringData* pOld = GetData();
  if (m_pchData != NilText() && pOld->nAllocLength >= nLen) return;
  int nNewAlloc = nLen;
  if (m_pchData != NilText()) {
    int nGrown = pOld->nAllocLength + pOld->nAllocLength / 2;
    if (nGrown > nNewAlloc) nNewAlloc = nGrown;
  }
  int nOldLen = pOld->nDataLength;
  LPSTR pOldText = m_pchData;
  AllocBuffer(nNewAlloc);
  memcpy(m_pchData, pOldText, (size_t)nOldLen + 1);
  GetData()->nDataLength = nOldLen;
  if (pOldText != NilText()) free(pOld);
}

void CString::AssignCopy(LPCSTR lpch, int nLen) {
  if (nLen <= 0) {
    if (m_pchData != NilText()) {
      GetData()->nDataLength = 0;
      m_pchData[0] = '\0';
    }
    return;
  }
  if (m_pchData != NilText() && GetData()->nAllocLength >= nLen) {
    memmove(m_pchData, lpch, (size_t)nLen); // the source may lie in this buffer
  } else {
    CStringData* pOld = GetData();
    LPSTR pOldText = m_pchData;
    AllocBuffer(nLen);
    memcpy(m_pchData, lpch, (size_t)nLen);
    if (pOldText != NilText()) free(pOld);
  }
  GetData()->nDataLength = nLen;
  m_pchData[nLen] = '\0';
}

void CString::ConcatInPlace(LPCSTR lpch, int nLen) {
  if (nLen <= 0) return;
  int nOldLen = GetLength();
  if (nLen > INT_MAX - nOldLen - 1) AfxThrowMemoryException();
  int nNewLen = nOldLen + nLen;
  if (m_pchData != NilText() && GetData()->nAllocLength >= nNewLen) {
    memmove(m_pchData + nOldLen, lpch, (size_t)nLen);
  } else {
    // Grow into a new block first: lpch may point into the old one.
    CStringData* pOld = GetData();
    LPSTR pOldText = m_pchData;
    int nNewAlloc = std::max(nNewLen, nOldLen + nOldLen / 2);
    AllocBuffer(nNewAlloc);
    memcpy(m_pchData, pOldText, (size_t)nOldLen);
    memcpy(m_pchData + nOldLen, lpch, (size_t)nLen);
    if (pOldText != NilText()) free(pOld);
  }
  GetData()->nDataLength = nNewLen;
  m_pchData[nNewLen] = '\0';
}

// ---------------------------------------------------------------------------
// Construction and assignment
// ---------------------------------------------------------------------------

CString::CString() : m_pchData(NilText()) {}

CString::CString(const CString& stringSrc) : m_pchData(NilText()) {
  AssignCopy(stringSrc.m_pchData, stringSrc.GetLength());
}

CString::CString(CString&& stringSrc) noexcept : m_pchData(stringSrc.m_pchData) {
  stringSrc.m_pchData = NilText();
}

CString::CString(char ch, int nRepeat) : m_pchData(NilText()) {
  if (nRepeat > 0) {
    AllocBuffer(nRepeat);
    memset(m_pchData, ch, (size_t)nRepeat);
  }
}

CString::CString(LPCSTR lpsz) : m_pchData(NilText()) {
  if (lpsz != NULL && IS_INTRESOURCE(lpsz))
    LoadString(LOWORD((UINT_PTR)lpsz));
  else
    AssignCopy(lpsz, SafeLength(lpsz));
}

CString::CString(LPCSTR lpch, int nLength) : m_pchData(NilText()) {
  ASSERT(nLength >= 0 && (lpch != NULL || nLength == 0));
  if (lpch != NULL && nLength > 0) AssignCopy(lpch, nLength);
}

CString::CString(const unsigned char* psz) : CString(reinterpret_cast<LPCSTR>(psz)) {}

CString::CString(LPCWSTR lpsz) : CString(lpsz, lpsz == NULL ? 0 : (int)wcslen(lpsz)) {}

CString::CString(LPCWSTR lpch, int nLength) : m_pchData(NilText()) {
  if (lpch == NULL || nLength <= 0) return;
  int nLen = WideCharToMultiByte(CP_ACP, 0, lpch, nLength, NULL, 0, NULL, NULL);
  if (nLen <= 0) return;
  AllocBuffer(nLen);
  WideCharToMultiByte(CP_ACP, 0, lpch, nLength, m_pchData, nLen, NULL, NULL);
}

CString::~CString() { Release(); }

void CString::Empty() { Release(); }

CString& CString::operator=(const CString& stringSrc) {
  if (this != &stringSrc) AssignCopy(stringSrc.m_pchData, stringSrc.GetLength());
  return *this;
}

CString& CString::operator=(CString&& stringSrc) noexcept {
  if (this != &stringSrc) {
    Release();
    m_pchData = stringSrc.m_pchData;
    stringSrc.m_pchData = NilText();
  }
  return *this;
}

CString& CString::operator=(char ch) {
  AssignCopy(&ch, 1);
  return *this;
}

CString& CString::operator=(LPCSTR lpsz) {
  AssignCopy(lpsz, SafeLength(lpsz));
  return *this;
}

CString& CString::operator=(const unsigned char* psz) { return *this = reinterpret_cast<LPCSTR>(psz); }

CString& CString::operator=(LPCWSTR lpsz) {
  CString converted(lpsz);
  return *this = std::move(converted);
}

void CString::SetString(LPCSTR lpch, int nLength) {
  ASSERT(nLength >= 0);
  AssignCopy(lpch, lpch == NULL ? 0 : nLength);
}

// ---------------------------------------------------------------------------
// Elements and concatenation
// ---------------------------------------------------------------------------

char CString::GetAt(int nIndex) const {
  ASSERT(nIndex >= 0 && nIndex < GetLength());
  return m_pchData[nIndex];
}

void CString::SetAt(int nIndex, char ch) {
  ASSERT(nIndex >= 0 && nIndex < GetLength());
  m_pchData[nIndex] = ch;
}

CString& CString::operator+=(const CString& string) {
  ConcatInPlace(string.m_pchData, string.GetLength());
  return *this;
}

CString& CString::operator+=(char ch) {
  ConcatInPlace(&ch, 1);
  return *this;
}

CString& CString::operator+=(LPCSTR lpsz) {
  ConcatInPlace(lpsz, SafeLength(lpsz));
  return *this;
}

void CString::Append(LPCSTR lpsz) { ConcatInPlace(lpsz, SafeLength(lpsz)); }
void CString::Append(LPCSTR lpch, int nLength) {
  ASSERT(nLength >= 0);
  if (lpch != NULL) ConcatInPlace(lpch, nLength);
}
void CString::Append(const CString& string) { ConcatInPlace(string.m_pchData, string.GetLength()); }
void CString::AppendChar(char ch) { ConcatInPlace(&ch, 1); }

CString AFXAPI operator+(const CString& string1, const CString& string2) {
  CString s;
  s.Preallocate(string1.GetLength() + string2.GetLength());
  s += string1;
  s += string2;
  return s;
}
CString AFXAPI operator+(const CString& string, char ch) {
  CString s(string);
  s += ch;
  return s;
}
CString AFXAPI operator+(char ch, const CString& string) {
  CString s(ch, 1);
  s += string;
  return s;
}
CString AFXAPI operator+(const CString& string, LPCSTR lpsz) {
  CString s(string);
  s += lpsz;
  return s;
}
CString AFXAPI operator+(LPCSTR lpsz, const CString& string) {
  CString s(lpsz);
  s += string;
  return s;
}

// ---------------------------------------------------------------------------
// Comparison
// ---------------------------------------------------------------------------

int CString::Compare(LPCSTR lpsz) const {
  if (lpsz == NULL) lpsz = "";
  return strcmp(m_pchData, lpsz);
}

int CString::CompareNoCase(LPCSTR lpsz) const {
  if (lpsz == NULL) lpsz = "";
  const unsigned char* p1 = reinterpret_cast<const unsigned char*>(m_pchData);
  const unsigned char* p2 = reinterpret_cast<const unsigned char*>(lpsz);
  for (;; ++p1, ++p2) {
    int c1 = g_case.lower[*p1];
    int c2 = g_case.lower[*p2];
    if (c1 != c2) return c1 - c2;
    if (c1 == 0) return 0;
  }
}

static int CollateImpl(LPCSTR lpsz1, LPCSTR lpsz2, DWORD dwFlags) {
  if (lpsz2 == NULL) lpsz2 = "";
  int nResult = CompareStringA(LOCALE_USER_DEFAULT, dwFlags, lpsz1, -1, lpsz2, -1);
  if (nResult == 0) return strcmp(lpsz1, lpsz2); // no collation available: byte order
  return nResult - CSTR_EQUAL;
}

int CString::Collate(LPCSTR lpsz) const { return CollateImpl(m_pchData, lpsz, 0); }
int CString::CollateNoCase(LPCSTR lpsz) const { return CollateImpl(m_pchData, lpsz, NORM_IGNORECASE); }

// ---------------------------------------------------------------------------
// Extraction
// ---------------------------------------------------------------------------

CString CString::Mid(int nFirst) const { return Mid(nFirst, GetLength() - nFirst); }

CString CString::Mid(int nFirst, int nCount) const {
  int nLen = GetLength();
  if (nFirst < 0) nFirst = 0;
  if (nCount < 0) nCount = 0;
  if (nFirst > nLen) nFirst = nLen;
  if (nCount > nLen - nFirst) nCount = nLen - nFirst;
  if (nFirst == 0 && nCount == nLen) return *this;
  return CString(m_pchData + nFirst, nCount);
}

CString CString::Left(int nCount) const {
  int nLen = GetLength();
  if (nCount < 0) nCount = 0;
  if (nCount >= nLen) return *this;
  return CString(m_pchData, nCount);
}

CString CString::Right(int nCount) const {
  int nLen = GetLength();
  if (nCount < 0) nCount = 0;
  if (nCount >= nLen) return *this;
  return CString(m_pchData + nLen - nCount, nCount);
}

CString CString::SpanIncluding(LPCSTR lpszCharSet) const {
  if (lpszCharSet == NULL) lpszCharSet = "";
  return Left((int)strspn(m_pchData, lpszCharSet));
}

CString CString::SpanExcluding(LPCSTR lpszCharSet) const {
  if (lpszCharSet == NULL) lpszCharSet = "";
  return Left((int)strcspn(m_pchData, lpszCharSet));
}

CString CString::Tokenize(LPCSTR pszTokens, int& iStart) const {
  int nLen = GetLength();
  if (iStart >= 0 && iStart < nLen) {
    if (pszTokens == NULL || *pszTokens == '\0') return CString(m_pchData + iStart, nLen - iStart);
    LPCSTR pszPlace = m_pchData + iStart;
    int nIncluding = (int)strspn(pszPlace, pszTokens);
    if (iStart + nIncluding < nLen) {
      int iFrom = iStart + nIncluding;
      int nUntil = (int)strcspn(m_pchData + iFrom, pszTokens);
      iStart = iFrom + nUntil + 1;
      return Mid(iFrom, nUntil);
    }
  }
  iStart = -1;
  return CString();
}

// ---------------------------------------------------------------------------
// Case and order
// ---------------------------------------------------------------------------

CString& CString::MakeUpper() {
  int nLen = GetLength();
  for (int i = 0; i < nLen; ++i) m_pchData[i] = (char)g_case.upper[(unsigned char)m_pchData[i]];
  return *this;
}

CString& CString::MakeLower() {
  int nLen = GetLength();
  for (int i = 0; i < nLen; ++i) m_pchData[i] = (char)g_case.lower[(unsigned char)m_pchData[i]];
  return *this;
}

CString& CString::MakeReverse() {
  std::reverse(m_pchData, m_pchData + GetLength());
  return *this;
}

// ---------------------------------------------------------------------------
// Editing
// ---------------------------------------------------------------------------

int CString::Replace(char chOld, char chNew) {
  if (chOld == chNew) return 0;
  int nCount = 0;
  int nLen = GetLength();
  for (int i = 0; i < nLen; ++i) {
    if (m_pchData[i] == chOld) {
      m_pchData[i] = chNew;
      ++nCount;
    }
  }
  return nCount;
}

int CString::Replace(LPCSTR lpszOld, LPCSTR lpszNew) {
  int nOldLen = SafeLength(lpszOld);
  if (nOldLen == 0) return 0;
  int nNewLen = SafeLength(lpszNew);
  int nLen = GetLength();

  int nCount = 0;
  for (int i = Find(lpszOld); i >= 0; i = Find(lpszOld, i + nOldLen)) ++nCount;
  if (nCount == 0) return 0;

  CString result;
  result.Preallocate(nLen + nCount * (nNewLen - nOldLen));
  int nFrom = 0;
  for (int i = Find(lpszOld); i >= 0; i = Find(lpszOld, i + nOldLen)) {
    result.Append(m_pchData + nFrom, i - nFrom);
    result.Append(lpszNew == NULL ? "" : lpszNew, nNewLen);
    nFrom = i + nOldLen;
  }
  result.Append(m_pchData + nFrom, nLen - nFrom);
  *this = std::move(result);
  return nCount;
}

int CString::Remove(char chRemove) {
  int nLen = GetLength();
  int nKept = 0;
  for (int i = 0; i < nLen; ++i)
    if (m_pchData[i] != chRemove) m_pchData[nKept++] = m_pchData[i];
  int nCount = nLen - nKept;
  if (nCount > 0) {
    GetData()->nDataLength = nKept;
    m_pchData[nKept] = '\0';
  }
  return nCount;
}

int CString::Insert(int nIndex, char ch) {
  char sz[2] = {ch, '\0'};
  CString s(sz, 1);
  int nLen = GetLength();
  if (nIndex < 0) nIndex = 0;
  if (nIndex > nLen) nIndex = nLen;
  *this = Left(nIndex) + s + Mid(nIndex);
  return GetLength();
}

int CString::Insert(int nIndex, LPCSTR pstr) {
  int nInsert = SafeLength(pstr);
  if (nInsert == 0) return GetLength();
  int nLen = GetLength();
  if (nIndex < 0) nIndex = 0;
  if (nIndex > nLen) nIndex = nLen;
  CString result;
  result.Preallocate(nLen + nInsert);
  result.Append(m_pchData, nIndex);
  result.Append(pstr, nInsert);
  result.Append(m_pchData + nIndex, nLen - nIndex);
  *this = std::move(result);
  return GetLength();
}

int CString::Delete(int nIndex, int nCount) {
  int nLen = GetLength();
  if (nIndex < 0) nIndex = 0;
  if (nCount <= 0 || nIndex >= nLen) return nLen;
  if (nCount > nLen - nIndex) nCount = nLen - nIndex;
  memmove(m_pchData + nIndex, m_pchData + nIndex + nCount, (size_t)(nLen - nIndex - nCount) + 1);
  GetData()->nDataLength = nLen - nCount;
  return nLen - nCount;
}

// ---------------------------------------------------------------------------
// Trimming
// ---------------------------------------------------------------------------

template <class Pred>
static void TrimLeftIf(CString& s, Pred pred) {
  int nLen = s.GetLength();
  LPCSTR p = s;
  int n = 0;
  while (n < nLen && pred(p[n])) ++n;
  if (n > 0) s.Delete(0, n);
}

template <class Pred>
static void TrimRightIf(CString& s, Pred pred) {
  int nLen = s.GetLength();
  LPCSTR p = s;
  int n = nLen;
  while (n > 0 && pred(p[n - 1])) --n;
  if (n < nLen) s.Delete(n, nLen - n);
}

CString& CString::TrimLeft() { TrimLeftIf(*this, IsTrimSpace); return *this; }
CString& CString::TrimRight() { TrimRightIf(*this, IsTrimSpace); return *this; }
CString& CString::Trim() { return TrimRight().TrimLeft(); }

CString& CString::TrimLeft(char chTarget) {
  TrimLeftIf(*this, [chTarget](char ch) { return ch == chTarget; });
  return *this;
}
CString& CString::TrimRight(char chTarget) {
  TrimRightIf(*this, [chTarget](char ch) { return ch == chTarget; });
  return *this;
}
CString& CString::Trim(char chTarget) { return TrimRight(chTarget).TrimLeft(chTarget); }

CString& CString::TrimLeft(LPCSTR lpszTargets) {
  if (lpszTargets != NULL && *lpszTargets) TrimLeftIf(*this, [lpszTargets](char ch) { return InSet(lpszTargets, ch); });
  return *this;
}
CString& CString::TrimRight(LPCSTR lpszTargets) {
  if (lpszTargets != NULL && *lpszTargets) TrimRightIf(*this, [lpszTargets](char ch) { return InSet(lpszTargets, ch); });
  return *this;
}
CString& CString::Trim(LPCSTR lpszTargets) { return TrimRight(lpszTargets).TrimLeft(lpszTargets); }

// ---------------------------------------------------------------------------
// Searching (within the whole length, embedded NULs included)
// ---------------------------------------------------------------------------

int CString::Find(char ch, int nStart) const {
  int nLen = GetLength();
  if (nStart < 0) nStart = 0;
  if (nStart >= nLen) return -1;
  const void* p = memchr(m_pchData + nStart, ch, (size_t)(nLen - nStart));
  return p == NULL ? -1 : (int)(static_cast<LPCSTR>(p) - m_pchData);
}

int CString::Find(LPCSTR lpszSub, int nStart) const {
  int nLen = GetLength();
  int nSubLen = SafeLength(lpszSub);
  if (nStart < 0) nStart = 0;
  if (nStart > nLen) return -1;
  if (nSubLen == 0) return nStart;
  for (int i = nStart; i + nSubLen <= nLen; ++i) {
    const void* p = memchr(m_pchData + i, lpszSub[0], (size_t)(nLen - nSubLen + 1 - i));
    if (p == NULL) return -1;
    i = (int)(static_cast<LPCSTR>(p) - m_pchData);
    if (memcmp(m_pchData + i, lpszSub, (size_t)nSubLen) == 0) return i;
  }
  return -1;
}

int CString::ReverseFind(char ch) const {
  for (int i = GetLength() - 1; i >= 0; --i)
    if (m_pchData[i] == ch) return i;
  return -1;
}

int CString::FindOneOf(LPCSTR lpszCharSet) const {
  if (lpszCharSet == NULL) return -1;
  int nLen = GetLength();
  for (int i = 0; i < nLen; ++i)
    if (InSet(lpszCharSet, m_pchData[i])) return i;
  return -1;
}

// ---------------------------------------------------------------------------
// Formatting
// ---------------------------------------------------------------------------

// printf into a fresh string: the arguments may point into the target.
static CString FormatToNew(LPCSTR lpszFormat, va_list argList) {
  ASSERT(lpszFormat != NULL);
  CString result;
  if (lpszFormat == NULL) return result;
  char szSmall[512];
  va_list args;
  va_copy(args, argList);
  int n = vsnprintf(szSmall, sizeof(szSmall), lpszFormat, args);
  va_end(args);
  if (n < 0) AfxThrowInvalidArgException(); // a format the runtime refuses
  if (n < (int)sizeof(szSmall)) {
    result.SetString(szSmall, n);
    return result;
  }
  LPSTR pBuf = result.GetBuffer(n);
  va_copy(args, argList);
  vsnprintf(pBuf, (size_t)n + 1, lpszFormat, args);
  va_end(args);
  result.ReleaseBuffer(n);
  return result;
}

void CString::FormatV(LPCSTR lpszFormat, va_list argList) { *this = FormatToNew(lpszFormat, argList); }

void AFX_CDECL CString::Format(LPCSTR lpszFormat, ...) {
  va_list args;
  va_start(args, lpszFormat);
  FormatV(lpszFormat, args);
  va_end(args);
}

void AFX_CDECL CString::Format(UINT nFormatID, ...) {
  CString strFormat;
  strFormat.LoadString(nFormatID);
  va_list args;
  va_start(args, nFormatID);
  FormatV(strFormat, args);
  va_end(args);
}

void CString::AppendFormatV(LPCSTR lpszFormat, va_list argList) { *this += FormatToNew(lpszFormat, argList); }

void AFX_CDECL CString::AppendFormat(LPCSTR lpszFormat, ...) {
  va_list args;
  va_start(args, lpszFormat);
  AppendFormatV(lpszFormat, args);
  va_end(args);
}

// ---------------------------------------------------------------------------
// Resources and code pages
// ---------------------------------------------------------------------------

BOOL CString::LoadString(UINT nID) {
  Empty();
  HINSTANCE hInst = AfxFindStringResourceHandle(nID);
  if (hInst == NULL) return FALSE;
  // A string table entry holds at most 65535 characters.
  for (int nSize = 256; nSize <= 65536; nSize *= 4) {
    LPSTR pBuf = GetBuffer(nSize);
    int nLen = ::LoadStringA(hInst, nID, pBuf, nSize + 1);
    if (nLen < nSize || nSize == 65536) {
      ReleaseBuffer(nLen < 0 ? 0 : nLen);
      FreeExtra();
      return nLen > 0;
    }
  }
  return FALSE;
}

void CString::AnsiToOem() {
  if (IsEmpty()) return;
  ::CharToOemBuffA(m_pchData, m_pchData, (DWORD)GetLength());
}

void CString::OemToAnsi() {
  if (IsEmpty()) return;
  ::OemToCharBuffA(m_pchData, m_pchData, (DWORD)GetLength());
}

BSTR CString::AllocSysString() const {
  int nLen = GetLength();
  int nWide = nLen == 0 ? 0 : MultiByteToWideChar(CP_ACP, 0, m_pchData, nLen, NULL, 0);
  BSTR bstr = ::SysAllocStringLen(NULL, (UINT)nWide);
  if (bstr == NULL) AfxThrowMemoryException();
  if (nWide > 0) MultiByteToWideChar(CP_ACP, 0, m_pchData, nLen, bstr, nWide);
  bstr[nWide] = L'\0';
  return bstr;
}

BSTR CString::SetSysString(BSTR* pbstr) const {
  ASSERT(pbstr != NULL);
  BSTR bstrNew = AllocSysString();
  ::SysFreeString(*pbstr);
  *pbstr = bstrNew;
  return bstrNew;
}

// ---------------------------------------------------------------------------
// Direct buffer access
// ---------------------------------------------------------------------------

LPSTR CString::GetBuffer(int nMinBufLength) {
  ASSERT(nMinBufLength >= 0);
  if (nMinBufLength < 0) nMinBufLength = 0;
  int nLen = GetLength();
  EnsureCapacity(std::max(nMinBufLength, nLen));
  return m_pchData;
}

void CString::ReleaseBuffer(int nNewLength) {
  if (m_pchData == NilText()) return; // GetBuffer was not called: nothing to take over
  int nAlloc = GetData()->nAllocLength;
  if (nNewLength < 0) nNewLength = (int)strnlen(m_pchData, (size_t)nAlloc);
  ASSERT(nNewLength <= nAlloc);
  if (nNewLength > nAlloc) nNewLength = nAlloc;
  GetData()->nDataLength = nNewLength;
  m_pchData[nNewLength] = '\0';
}

LPSTR CString::GetBufferSetLength(int nNewLength) {
  ASSERT(nNewLength >= 0);
  if (nNewLength < 0) nNewLength = 0;
  int nOldLen = GetLength();
  GetBuffer(nNewLength);
  if (nNewLength > nOldLen) memset(m_pchData + nOldLen, 0, (size_t)(nNewLength - nOldLen));
  GetData()->nDataLength = nNewLength;
  m_pchData[nNewLength] = '\0';
  return m_pchData;
}

void CString::Preallocate(int nLength) {
  if (nLength > 0) EnsureCapacity(nLength);
}

void CString::FreeExtra() {
  if (m_pchData == NilText()) return;
  int nLen = GetLength();
  if (nLen == 0) {
    Release();
    return;
  }
  if (GetData()->nAllocLength == nLen) return;
  CStringData* pOld = GetData();
  LPSTR pOldText = m_pchData;
  AllocBuffer(nLen);
  memcpy(m_pchData, pOldText, (size_t)nLen);
  free(pOld);
}

LPSTR CString::LockBuffer() { return GetBuffer(0); }
void CString::UnlockBuffer() {}

// ---------------------------------------------------------------------------
// Message strings with %1..%9
// ---------------------------------------------------------------------------

void AFXAPI AfxFormatStrings(CString& rString, LPCSTR lpszFormat, LPCSTR const* rglpsz, int nString) {
  CString result;
  if (lpszFormat != NULL) {
    for (LPCSTR p = lpszFormat; *p; ++p) {
      if (p[0] == '%' && p[1] >= '1' && p[1] <= '9' && p[1] - '1' < nString) {
        LPCSTR lpszArg = rglpsz[p[1] - '1'];
        if (lpszArg != NULL) result += lpszArg;
        ++p;
      } else {
        result += *p;
      }
    }
  }
  rString = std::move(result);
}

void AFXAPI AfxFormatString1(CString& rString, UINT nIDS, LPCSTR lpsz1) {
  CString strFormat;
  strFormat.LoadString(nIDS);
  AfxFormatStrings(rString, strFormat, &lpsz1, 1);
}

void AFXAPI AfxFormatString2(CString& rString, UINT nIDS, LPCSTR lpsz1, LPCSTR lpsz2) {
  CString strFormat;
  strFormat.LoadString(nIDS);
  LPCSTR rglpsz[2] = {lpsz1, lpsz2};
  AfxFormatStrings(rString, strFormat, rglpsz, 2);
}
