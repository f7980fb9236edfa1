// CFile over Win32 file handles and CStdioFile over a C runtime stream on the
// same handle.
#include "afx.h"

#include <errno.h>
#include <fcntl.h>
#include <io.h>
#include <stdio.h>
#include <string.h>

namespace {

CString FullPath(LPCSTR lpszFileName) {
  CString strPath;
  if (lpszFileName == NULL || *lpszFileName == '\0') return strPath;
  DWORD nNeeded = ::GetFullPathNameA(lpszFileName, 0, NULL, NULL);
  if (nNeeded == 0) return CString(lpszFileName);
  LPSTR pBuf = strPath.GetBuffer((int)nNeeded);
  DWORD nLen = ::GetFullPathNameA(lpszFileName, nNeeded + 1, pBuf, NULL);
  strPath.ReleaseBuffer(nLen > 0 && nLen <= nNeeded ? (int)nLen : 0);
  if (strPath.IsEmpty()) strPath = lpszFileName;
  return strPath;
}

CTime FileTimeOrNull(const FILETIME& ft) { return CTime(ft); }

void FillStatus(CFileStatus& rStatus, DWORD dwAttributes, const FILETIME& ftCreation,
                const FILETIME& ftAccess, const FILETIME& ftWrite, DWORD nSizeHigh, DWORD nSizeLow) {
  rStatus.m_ctime = FileTimeOrNull(ftCreation);
  rStatus.m_atime = FileTimeOrNull(ftAccess);
  rStatus.m_mtime = FileTimeOrNull(ftWrite);
  if (rStatus.m_atime.GetTime() == 0) rStatus.m_atime = rStatus.m_mtime;
  if (rStatus.m_ctime.GetTime() == 0) rStatus.m_ctime = rStatus.m_mtime;
  rStatus.m_size = ((ULONGLONG)nSizeHigh << 32) | nSizeLow;
  rStatus.m_attribute = (BYTE)(dwAttributes & ~(DWORD)FILE_ATTRIBUTE_NORMAL);
  rStatus._m_padding = 0;
}

} // namespace

// ---------------------------------------------------------------------------
// CFile
// ---------------------------------------------------------------------------

IMPLEMENT_DYNAMIC(CFile, CObject)

const HANDLE CFile::hFileNull = INVALID_HANDLE_VALUE;

CFile::CFile() : m_hFile(INVALID_HANDLE_VALUE), m_bCloseOnDelete(FALSE) {}

CFile::CFile(HANDLE hFile) : m_hFile(hFile), m_bCloseOnDelete(FALSE) {}

CFile::CFile(LPCSTR lpszFileName, UINT nOpenFlags) : m_hFile(INVALID_HANDLE_VALUE), m_bCloseOnDelete(FALSE) {
  CFileException e;
  if (!CFile::Open(lpszFileName, nOpenFlags, &e))
    AfxThrowFileException(e.m_cause, e.m_lOsError, e.m_strFileName);
}

CFile::~CFile() {
  if (m_hFile != INVALID_HANDLE_VALUE && m_bCloseOnDelete) ::CloseHandle(m_hFile);
  m_hFile = INVALID_HANDLE_VALUE;
}

BOOL CFile::Open(LPCSTR lpszFileName, UINT nOpenFlags, CFileException* pException) {
  // A file still open is closed first rather than leaked.
  if (m_hFile != INVALID_HANDLE_VALUE) Abort();
  if (lpszFileName == NULL) lpszFileName = "";
  nOpenFlags &= ~(UINT)(typeText | typeBinary);

  auto fail = [&](DWORD dwError) {
    if (pException != NULL) {
      pException->m_lOsError = (LONG)dwError;
      pException->m_cause = CFileException::OsErrorToException((LONG)dwError);
      pException->m_strFileName = lpszFileName;
    }
    return FALSE;
  };

  DWORD dwAccess;
  switch (nOpenFlags & 3) {
  case modeRead: dwAccess = GENERIC_READ; break;
  case modeWrite: dwAccess = GENERIC_WRITE; break;
  case modeReadWrite: dwAccess = GENERIC_READ | GENERIC_WRITE; break;
  default: return fail(ERROR_INVALID_PARAMETER);
  }

  DWORD dwShareMode;
  switch (nOpenFlags & 0x70) {
  case shareCompat:
  case shareExclusive: dwShareMode = 0; break;
  case shareDenyWrite: dwShareMode = FILE_SHARE_READ; break;
  case shareDenyRead: dwShareMode = FILE_SHARE_WRITE; break;
  case shareDenyNone: dwShareMode = FILE_SHARE_READ | FILE_SHARE_WRITE; break;
  default: return fail(ERROR_INVALID_PARAMETER);
  }

  SECURITY_ATTRIBUTES sa;
  sa.nLength = sizeof(sa);
  sa.lpSecurityDescriptor = NULL;
  sa.bInheritHandle = (nOpenFlags & modeNoInherit) == 0;

  DWORD dwCreate;
  if (nOpenFlags & modeCreate)
    dwCreate = (nOpenFlags & modeNoTruncate) ? OPEN_ALWAYS : CREATE_ALWAYS;
  else
    dwCreate = OPEN_EXISTING;

  DWORD dwFlags = FILE_ATTRIBUTE_NORMAL;
  if (nOpenFlags & osNoBuffer) dwFlags |= FILE_FLAG_NO_BUFFERING;
  if (nOpenFlags & osWriteThrough) dwFlags |= FILE_FLAG_WRITE_THROUGH;
  if (nOpenFlags & osRandomAccess) dwFlags |= FILE_FLAG_RANDOM_ACCESS;
  if (nOpenFlags & osSequentialScan) dwFlags |= FILE_FLAG_SEQUENTIAL_SCAN;

  HANDLE hFile = ::CreateFileA(lpszFileName, dwAccess, dwShareMode, &sa, dwCreate, dwFlags, NULL);
  if (hFile == INVALID_HANDLE_VALUE) return fail(::GetLastError());

  m_hFile = hFile;
  m_bCloseOnDelete = TRUE;
  m_strFileName = FullPath(lpszFileName);
  return TRUE;
}

UINT CFile::Read(void* lpBuf, UINT nCount) {
  ASSERT(m_hFile != INVALID_HANDLE_VALUE);
  if (nCount == 0) return 0;
  ASSERT(lpBuf != NULL);
  DWORD dwRead = 0;
  if (!::ReadFile(m_hFile, lpBuf, nCount, &dwRead, NULL))
    CFileException::ThrowOsError((LONG)::GetLastError(), m_strFileName);
  return (UINT)dwRead;
}

void CFile::Write(const void* lpBuf, UINT nCount) {
  ASSERT(m_hFile != INVALID_HANDLE_VALUE);
  if (nCount == 0) return;
  ASSERT(lpBuf != NULL);
  DWORD dwWritten = 0;
  if (!::WriteFile(m_hFile, lpBuf, nCount, &dwWritten, NULL))
    CFileException::ThrowOsError((LONG)::GetLastError(), m_strFileName);
  if (dwWritten != nCount) AfxThrowFileException(CFileException::diskFull, -1, m_strFileName);
}

ULONGLONG CFile::Seek(LONGLONG lOff, UINT nFrom) {
  ASSERT(m_hFile != INVALID_HANDLE_VALUE);
  ASSERT(nFrom == begin || nFrom == current || nFrom == end);
  LARGE_INTEGER liOff, liNew;
  liOff.QuadPart = lOff;
  if (!::SetFilePointerEx(m_hFile, liOff, &liNew, nFrom))
    CFileException::ThrowOsError((LONG)::GetLastError(), m_strFileName);
  return (ULONGLONG)liNew.QuadPart;
}

ULONGLONG CFile::SeekToEnd() { return Seek(0, end); }
void CFile::SeekToBegin() { Seek(0, begin); }

ULONGLONG CFile::GetPosition() const {
  ASSERT(m_hFile != INVALID_HANDLE_VALUE);
  LARGE_INTEGER liOff, liNew;
  liOff.QuadPart = 0;
  if (!::SetFilePointerEx(m_hFile, liOff, &liNew, FILE_CURRENT))
    CFileException::ThrowOsError((LONG)::GetLastError(), m_strFileName);
  return (ULONGLONG)liNew.QuadPart;
}

ULONGLONG CFile::GetLength() const {
  ASSERT(m_hFile != INVALID_HANDLE_VALUE);
  LARGE_INTEGER liSize;
  if (!::GetFileSizeEx(m_hFile, &liSize)) CFileException::ThrowOsError((LONG)::GetLastError(), m_strFileName);
  return (ULONGLONG)liSize.QuadPart;
}

void CFile::SetLength(ULONGLONG dwNewLen) {
  ASSERT(m_hFile != INVALID_HANDLE_VALUE);
  Seek((LONGLONG)dwNewLen, begin);
  if (!::SetEndOfFile(m_hFile)) CFileException::ThrowOsError((LONG)::GetLastError(), m_strFileName);
}

void CFile::LockRange(ULONGLONG dwPos, ULONGLONG dwCount) {
  ASSERT(m_hFile != INVALID_HANDLE_VALUE);
  if (!::LockFile(m_hFile, (DWORD)dwPos, (DWORD)(dwPos >> 32), (DWORD)dwCount, (DWORD)(dwCount >> 32)))
    CFileException::ThrowOsError((LONG)::GetLastError(), m_strFileName);
}

void CFile::UnlockRange(ULONGLONG dwPos, ULONGLONG dwCount) {
  ASSERT(m_hFile != INVALID_HANDLE_VALUE);
  if (!::UnlockFile(m_hFile, (DWORD)dwPos, (DWORD)(dwPos >> 32), (DWORD)dwCount, (DWORD)(dwCount >> 32)))
    CFileException::ThrowOsError((LONG)::GetLastError(), m_strFileName);
}

void CFile::Flush() {
  if (m_hFile == INVALID_HANDLE_VALUE) return;
  if (!::FlushFileBuffers(m_hFile)) {
    DWORD dwError = ::GetLastError();
    // A handle opened for reading has nothing to flush.
    if (dwError != ERROR_ACCESS_DENIED && dwError != ERROR_INVALID_HANDLE)
      CFileException::ThrowOsError((LONG)dwError, m_strFileName);
  }
}

void CFile::Close() {
  DWORD dwError = NO_ERROR;
  if (m_hFile != INVALID_HANDLE_VALUE && !::CloseHandle(m_hFile)) dwError = ::GetLastError();
  m_hFile = INVALID_HANDLE_VALUE;
  m_bCloseOnDelete = FALSE;
  CString strName = m_strFileName;
  m_strFileName.Empty();
  if (dwError != NO_ERROR) CFileException::ThrowOsError((LONG)dwError, strName);
}

void CFile::Abort() {
  if (m_hFile != INVALID_HANDLE_VALUE) ::CloseHandle(m_hFile);
  m_hFile = INVALID_HANDLE_VALUE;
  m_bCloseOnDelete = FALSE;
  m_strFileName.Empty();
}

CString CFile::GetFileName() const {
  int nSep = -1;
  for (int i = 0; i < m_strFileName.GetLength(); ++i) {
    char ch = m_strFileName[i];
    if (ch == '\\' || ch == '/' || ch == ':') nSep = i;
  }
  return m_strFileName.Mid(nSep + 1);
}

CString CFile::GetFileTitle() const {
  CString strName = GetFileName();
  int nDot = strName.ReverseFind('.');
  return nDot > 0 ? strName.Left(nDot) : strName;
}

CString CFile::GetFilePath() const { return m_strFileName; }

void CFile::SetFilePath(LPCSTR lpszNewName) { m_strFileName = FullPath(lpszNewName); }

BOOL CFile::GetStatus(CFileStatus& rStatus) const {
  memset(rStatus.m_szFullName, 0, sizeof(rStatus.m_szFullName));
  if (m_hFile == INVALID_HANDLE_VALUE) return FALSE;
  BY_HANDLE_FILE_INFORMATION info;
  if (!::GetFileInformationByHandle(m_hFile, &info)) return FALSE;
  FillStatus(rStatus, info.dwFileAttributes, info.ftCreationTime, info.ftLastAccessTime,
             info.ftLastWriteTime, info.nFileSizeHigh, info.nFileSizeLow);
  lstrcpynA(rStatus.m_szFullName, m_strFileName, MAX_PATH);
  return TRUE;
}

BOOL PASCAL CFile::GetStatus(LPCSTR lpszFileName, CFileStatus& rStatus) {
  memset(rStatus.m_szFullName, 0, sizeof(rStatus.m_szFullName));
  if (lpszFileName == NULL || *lpszFileName == '\0' || strpbrk(lpszFileName, "*?") != NULL) return FALSE;
  CString strFull = FullPath(lpszFileName);
  if (strFull.GetLength() >= MAX_PATH) return FALSE;
  WIN32_FILE_ATTRIBUTE_DATA data;
  if (!::GetFileAttributesExA(lpszFileName, GetFileExInfoStandard, &data)) return FALSE;
  FillStatus(rStatus, data.dwFileAttributes, data.ftCreationTime, data.ftLastAccessTime,
             data.ftLastWriteTime, data.nFileSizeHigh, data.nFileSizeLow);
  lstrcpynA(rStatus.m_szFullName, strFull, MAX_PATH);
  return TRUE;
}

void PASCAL CFile::Rename(LPCSTR lpszOldName, LPCSTR lpszNewName) {
  if (!::MoveFileA(lpszOldName, lpszNewName)) CFileException::ThrowOsError((LONG)::GetLastError(), lpszOldName);
}

void PASCAL CFile::Remove(LPCSTR lpszFileName) {
  if (!::DeleteFileA(lpszFileName)) CFileException::ThrowOsError((LONG)::GetLastError(), lpszFileName);
}

// ---------------------------------------------------------------------------
// CStdioFile
// ---------------------------------------------------------------------------

IMPLEMENT_DYNAMIC(CStdioFile, CFile)

namespace {

// The C runtime's error of the last stream call as a Win32 error code.
LONG StreamError() {
  unsigned long nDos = _doserrno;
  return nDos != 0 ? (LONG)nDos : (LONG)ERROR_GEN_FAILURE;
}

} // namespace

CStdioFile::CStdioFile() : m_pStream(NULL) {}

CStdioFile::CStdioFile(LPCSTR lpszFileName, UINT nOpenFlags) : m_pStream(NULL) {
  CFileException e;
  if (!CStdioFile::Open(lpszFileName, nOpenFlags, &e))
    AfxThrowFileException(e.m_cause, e.m_lOsError, e.m_strFileName);
}

CStdioFile::~CStdioFile() {
  if (m_pStream != NULL && m_bCloseOnDelete) fclose(m_pStream); // also closes m_hFile
  if (m_pStream != NULL) m_hFile = INVALID_HANDLE_VALUE;
  m_pStream = NULL;
}

BOOL CStdioFile::Open(LPCSTR lpszFileName, UINT nOpenFlags, CFileException* pException) {
  if (m_pStream != NULL) Abort();
  if (!CFile::Open(lpszFileName, nOpenFlags & ~(UINT)(typeText | typeBinary), pException)) return FALSE;

  // The stream mode as MFC builds it: "w" creates, "a" writes at the end of an
  // existing file, "r" reads; "+" adds the other direction.
  char szMode[4];
  int nMode = 0;
  int nFlags = 0;
  if (nOpenFlags & modeCreate) {
    szMode[nMode++] = (nOpenFlags & modeNoTruncate) ? 'a' : 'w';
  } else if (nOpenFlags & modeWrite) {
    szMode[nMode++] = 'a';
  } else {
    szMode[nMode++] = 'r';
  }
  if (szMode[0] == 'a') nFlags |= _O_APPEND;
  if ((szMode[0] == 'r' && (nOpenFlags & modeReadWrite)) || (szMode[0] != 'r' && !(nOpenFlags & modeWrite))) {
    szMode[nMode++] = '+';
    nFlags |= _O_RDWR;
  } else if (szMode[0] == 'r') {
    nFlags |= _O_RDONLY;
  } else {
    nFlags |= _O_WRONLY;
  }
  if (nOpenFlags & typeBinary) {
    szMode[nMode++] = 'b';
    nFlags |= _O_BINARY;
  } else {
    szMode[nMode++] = 't';
    nFlags |= _O_TEXT;
  }
  szMode[nMode] = '\0';

  int nHandle = _open_osfhandle((intptr_t)m_hFile, nFlags);
  if (nHandle != -1) m_pStream = _fdopen(nHandle, szMode);
  if (m_pStream == NULL) {
    if (pException != NULL) {
      pException->m_cause = CFileException::genericException;
      pException->m_lOsError = (LONG)ERROR_GEN_FAILURE;
      pException->m_strFileName = lpszFileName;
    }
    if (nHandle != -1)
      _close(nHandle); // closes m_hFile too
    else
      ::CloseHandle(m_hFile);
    m_hFile = INVALID_HANDLE_VALUE;
    m_bCloseOnDelete = FALSE;
    m_strFileName.Empty();
    return FALSE;
  }
  return TRUE;
}

UINT CStdioFile::Read(void* lpBuf, UINT nCount) {
  ASSERT(m_pStream != NULL);
  if (nCount == 0) return 0;
  size_t nRead = fread(lpBuf, 1, nCount, m_pStream);
  if (nRead < nCount && ferror(m_pStream)) {
    clearerr(m_pStream);
    CFileException::ThrowOsError(StreamError(), m_strFileName);
  }
  return (UINT)nRead;
}

void CStdioFile::Write(const void* lpBuf, UINT nCount) {
  ASSERT(m_pStream != NULL);
  if (nCount == 0) return;
  if (fwrite(lpBuf, 1, nCount, m_pStream) != nCount) {
    clearerr(m_pStream);
    CFileException::ThrowOsError(StreamError(), m_strFileName);
  }
}

void CStdioFile::WriteString(LPCSTR lpsz) {
  ASSERT(m_pStream != NULL && lpsz != NULL);
  if (lpsz == NULL) return;
  if (fputs(lpsz, m_pStream) == EOF) {
    clearerr(m_pStream);
    CFileException::ThrowOsError(StreamError(), m_strFileName);
  }
}

LPSTR CStdioFile::ReadString(LPSTR lpsz, UINT nMax) {
  ASSERT(m_pStream != NULL && lpsz != NULL && nMax > 0);
  LPSTR lpszResult = fgets(lpsz, (int)nMax, m_pStream);
  if (lpszResult == NULL && ferror(m_pStream)) {
    clearerr(m_pStream);
    CFileException::ThrowOsError(StreamError(), m_strFileName);
  }
  return lpszResult;
}

BOOL CStdioFile::ReadString(CString& rString) {
  ASSERT(m_pStream != NULL);
  rString.Empty();
  char szBuf[512];
  BOOL bReadAny = FALSE;
  for (;;) {
    LPSTR lpszResult = fgets(szBuf, (int)sizeof(szBuf), m_pStream);
    if (lpszResult == NULL) {
      if (ferror(m_pStream)) {
        clearerr(m_pStream);
        CFileException::ThrowOsError(StreamError(), m_strFileName);
      }
      break;
    }
    bReadAny = TRUE;
    size_t nLen = strlen(szBuf);
    if (nLen > 0 && szBuf[nLen - 1] == '\n') {
      rString.Append(szBuf, (int)nLen - 1);
      return TRUE;
    }
    rString.Append(szBuf, (int)nLen);
  }
  return bReadAny; // a last line without line end counts
}

ULONGLONG CStdioFile::Seek(LONGLONG lOff, UINT nFrom) {
  ASSERT(m_pStream != NULL);
  ASSERT(nFrom == begin || nFrom == current || nFrom == end);
  int nOrigin = nFrom == begin ? SEEK_SET : (nFrom == end ? SEEK_END : SEEK_CUR);
  if (_fseeki64(m_pStream, lOff, nOrigin) != 0)
    AfxThrowFileException(CFileException::badSeek, StreamError(), m_strFileName);
  return GetPosition();
}

ULONGLONG CStdioFile::GetPosition() const {
  ASSERT(m_pStream != NULL);
  __int64 nPos = _ftelli64(m_pStream);
  if (nPos < 0) AfxThrowFileException(CFileException::invalidFile, StreamError(), m_strFileName);
  return (ULONGLONG)nPos;
}

ULONGLONG CStdioFile::GetLength() const {
  ASSERT(m_pStream != NULL);
  fflush(m_pStream);
  return CFile::GetLength();
}

void CStdioFile::Flush() {
  if (m_pStream != NULL && fflush(m_pStream) != 0)
    AfxThrowFileException(CFileException::diskFull, StreamError(), m_strFileName);
}

void CStdioFile::Close() {
  int nErr = 0;
  if (m_pStream != NULL) nErr = fclose(m_pStream); // closes m_hFile as well
  LONG lOsError = nErr != 0 ? StreamError() : 0;
  m_pStream = NULL;
  m_hFile = INVALID_HANDLE_VALUE;
  m_bCloseOnDelete = FALSE;
  CString strName = m_strFileName;
  m_strFileName.Empty();
  if (nErr != 0) AfxThrowFileException(CFileException::OsErrorToException(lOsError) == CFileException::none
                                           ? CFileException::genericException
                                           : CFileException::OsErrorToException(lOsError),
                                       lOsError, strName);
}

void CStdioFile::Abort() {
  if (m_pStream != NULL) {
    fclose(m_pStream);
    m_pStream = NULL;
    m_hFile = INVALID_HANDLE_VALUE;
  }
  CFile::Abort();
}
