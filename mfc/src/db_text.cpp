// Text between the program (Windows-1252) and the drivers: a UTF-8 store gets
// and gives UTF-8, every other driver the bytes as they are.
#include "db_private.h"

namespace qodb {

namespace {
const UINT kCodePage = 1252;
}

std::wstring Widen(LPCSTR lpsz, int nLength) {
  if (lpsz == NULL) return std::wstring();
  if (nLength < 0) nLength = lstrlenA(lpsz);
  if (nLength == 0) return std::wstring();
  int nWide = MultiByteToWideChar(kCodePage, 0, lpsz, nLength, NULL, 0);
  std::wstring wide((size_t)(nWide > 0 ? nWide : 0), L'\0');
  if (nWide > 0) MultiByteToWideChar(kCodePage, 0, lpsz, nLength, &wide[0], nWide);
  return wide;
}

CString Narrow(const WCHAR* pwch, int nLength) {
  CString str;
  if (pwch == NULL || nLength <= 0) return str;
  // Characters that Windows-1252 lacks become '?': the program cannot hold them.
  int nBytes = WideCharToMultiByte(kCodePage, 0, pwch, nLength, NULL, 0, NULL, NULL);
  if (nBytes <= 0) return str;
  LPSTR p = str.GetBufferSetLength(nBytes);
  WideCharToMultiByte(kCodePage, 0, pwch, nLength, p, nBytes, NULL, NULL);
  str.ReleaseBuffer(nBytes);
  return str;
}

std::string Utf8FromWide(const WCHAR* pwch, int nLength) {
  if (pwch == NULL || nLength <= 0) return std::string();
  int nBytes = WideCharToMultiByte(CP_UTF8, 0, pwch, nLength, NULL, 0, NULL, NULL);
  std::string utf8((size_t)(nBytes > 0 ? nBytes : 0), '\0');
  if (nBytes > 0) WideCharToMultiByte(CP_UTF8, 0, pwch, nLength, &utf8[0], nBytes, NULL, NULL);
  return utf8;
}

std::wstring WideFromUtf8(const char* p, int nLength) {
  if (p == NULL || nLength <= 0) return std::wstring();
  int nWide = MultiByteToWideChar(CP_UTF8, 0, p, nLength, NULL, 0);
  std::wstring wide((size_t)(nWide > 0 ? nWide : 0), L'\0');
  if (nWide > 0) MultiByteToWideChar(CP_UTF8, 0, p, nLength, &wide[0], nWide);
  return wide;
}

namespace {
// The UTF-8 bytes of each Windows-1252 byte (bytes 0..127 are their own).
struct Utf8Table {
  char bytes[256][4];
  unsigned char lengths[256];
  Utf8Table() {
    for (int c = 0; c < 256; ++c) {
      char in = (char)c;
      WCHAR wide = 0;
      if (MultiByteToWideChar(kCodePage, 0, &in, 1, &wide, 1) != 1) wide = (WCHAR)c;
      lengths[c] = (unsigned char)WideCharToMultiByte(CP_UTF8, 0, &wide, 1, bytes[c], 4, NULL, NULL);
    }
  }
};
const Utf8Table& Table() {
  static const Utf8Table table;
  return table;
}
}  // namespace

void AppendUtf8(std::string& out, const char* p, size_t nLength) {
  const Utf8Table& table = Table();
  const size_t nStart = out.size();
  out.resize(nStart + nLength * 3);
  char* q = &out[nStart];
  for (size_t i = 0; i < nLength; ++i) {
    unsigned char c = (unsigned char)p[i];
    if (c < 0x80) {
      *q++ = (char)c;
    } else {
      for (unsigned char k = 0; k < table.lengths[c]; ++k) *q++ = table.bytes[c][k];
    }
  }
  out.resize((size_t)(q - &out[nStart]) + nStart);
}

std::string ToDriver(int nTextForm, LPCSTR lpsz, int nLength) {
  if (lpsz == NULL) return std::string();
  if (nLength < 0) nLength = lstrlenA(lpsz);
  if (nTextForm != CDatabase::textUtf8) return std::string(lpsz, (size_t)nLength);
  std::wstring wide = Widen(lpsz, nLength);
  return Utf8FromWide(wide.data(), (int)wide.size());
}

CString FromDriver(int nTextForm, const char* p, int nLength) {
  if (p == NULL) return CString();
  if (nLength < 0) nLength = lstrlenA(p);
  if (nTextForm != CDatabase::textUtf8) return CString(p, nLength);
  std::wstring wide = WideFromUtf8(p, nLength);
  return Narrow(wide.data(), (int)wide.size());
}

} // namespace qodb
