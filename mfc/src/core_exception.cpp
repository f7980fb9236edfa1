// The exception classes. An exception knows whether it was made with new
// (CException::operator new marks the block it hands out), so Delete() frees
// heap exceptions and leaves stack and static ones alone.
#include "afx.h"

#include <string.h>

namespace {

// The block most recently handed out by CException::operator new on this thread.
thread_local void* t_pLastNew = NULL;

BOOL CopyMessage(LPCSTR lpszText, LPSTR lpszError, UINT nMaxError) {
  if (lpszError != NULL && nMaxError > 0) {
    lpszError[0] = '\0';
    if (lpszText != NULL) lstrcpynA(lpszError, lpszText, (int)nMaxError);
  }
  return lpszText != NULL;
}

} // namespace

// ---------------------------------------------------------------------------
// CException
// ---------------------------------------------------------------------------

IMPLEMENT_DYNAMIC(CException, CObject)

void* CException::operator new(size_t nSize) {
  void* p = ::operator new(nSize);
  t_pLastNew = p;
  return p;
}

void CException::operator delete(void* p) { ::operator delete(p); }

CException::CException() : CException(TRUE) {}

CException::CException(BOOL bAutoDelete) : m_bAutoDelete(bAutoDelete), m_bHeapObject(FALSE) {
  if (t_pLastNew == this) {
    m_bHeapObject = TRUE;
    t_pLastNew = NULL;
  }
}

CException::~CException() {}

void CException::Delete() {
  if (m_bAutoDelete && m_bHeapObject) delete this;
}

BOOL CException::GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext) const {
  if (pnHelpContext != NULL) *pnHelpContext = 0;
  return CopyMessage(NULL, lpszError, nMaxError);
}

AFX_EXCEPTION_LINK::~AFX_EXCEPTION_LINK() {
  if (m_pException != NULL) m_pException->Delete();
}

// ---------------------------------------------------------------------------
// The exceptions with a fixed message
// ---------------------------------------------------------------------------

IMPLEMENT_DYNAMIC(CSimpleException, CException)

CSimpleException::CSimpleException() {}
CSimpleException::CSimpleException(BOOL bAutoDelete) : CException(bAutoDelete) {}

BOOL CSimpleException::GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext) const {
  if (pnHelpContext != NULL) *pnHelpContext = 0;
  return CopyMessage(GetMessageText(), lpszError, nMaxError);
}

LPCSTR CSimpleException::GetMessageText() const { return NULL; }

#define QO_SIMPLE_EXCEPTION(class_name, text)                                \
  IMPLEMENT_DYNAMIC(class_name, CSimpleException)                            \
  class_name::class_name() {}                                                \
  class_name::class_name(BOOL bAutoDelete) : CSimpleException(bAutoDelete) {} \
  LPCSTR class_name::GetMessageText() const { return text; }

QO_SIMPLE_EXCEPTION(CMemoryException, "Nicht genügend Arbeitsspeicher.")
QO_SIMPLE_EXCEPTION(CNotSupportedException, "Dieser Vorgang wird nicht unterstützt.")
QO_SIMPLE_EXCEPTION(CInvalidArgException, "Ungültiges Argument.")
QO_SIMPLE_EXCEPTION(CResourceException, "Eine benötigte Ressource ist nicht verfügbar.")
// The user has already been told why the operation stopped.
QO_SIMPLE_EXCEPTION(CUserException, NULL)

void AFXAPI AfxThrowMemoryException() {
  // Not allocated: there may be no memory left to make one.
  static CMemoryException s_memoryException(FALSE);
  throw &s_memoryException;
}

void AFXAPI AfxThrowNotSupportedException() { throw new CNotSupportedException; }
void AFXAPI AfxThrowInvalidArgException() { throw new CInvalidArgException; }
void AFXAPI AfxThrowResourceException() { throw new CResourceException; }
void AFXAPI AfxThrowUserException() { throw new CUserException; }

// ---------------------------------------------------------------------------
// CFileException
// ---------------------------------------------------------------------------

IMPLEMENT_DYNAMIC(CFileException, CException)

CFileException::CFileException(int cause, LONG lOsError, LPCSTR lpszArchiveName)
    : m_cause(cause), m_lOsError(lOsError), m_strFileName(lpszArchiveName) {}

CFileException::~CFileException() {}

BOOL CFileException::GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext) const {
  if (pnHelpContext != NULL) *pnHelpContext = 0;
  LPCSTR lpszFormat;
  switch (m_cause) {
  case none: lpszFormat = "Beim Zugriff auf die Datei %1 ist kein Fehler aufgetreten."; break;
  case fileNotFound: lpszFormat = "Die Datei %1 wurde nicht gefunden."; break;
  case badPath: lpszFormat = "Der Pfad der Datei %1 ist ungültig."; break;
  case tooManyOpenFiles:
    lpszFormat = "Die Datei %1 konnte nicht geöffnet werden, weil zu viele Dateien geöffnet sind.";
    break;
  case accessDenied: lpszFormat = "Der Zugriff auf die Datei %1 wurde verweigert."; break;
  case invalidFile: lpszFormat = "Für die Datei %1 wurde ein ungültiges Dateihandle verwendet."; break;
  case removeCurrentDir:
    lpszFormat = "Das Verzeichnis %1 kann nicht entfernt werden, weil es das aktuelle Verzeichnis ist.";
    break;
  case directoryFull:
    lpszFormat = "Die Datei %1 konnte nicht angelegt werden, weil das Verzeichnis voll ist.";
    break;
  case badSeek: lpszFormat = "Das Positionieren in der Datei %1 ist fehlgeschlagen."; break;
  case hardIO: lpszFormat = "Beim Zugriff auf die Datei %1 ist ein Hardwarefehler aufgetreten."; break;
  case sharingViolation:
    lpszFormat = "Die Datei %1 wird von einem anderen Programm verwendet (Freigabeverletzung).";
    break;
  case lockViolation: lpszFormat = "Ein Bereich der Datei %1 ist gesperrt (Sperrverletzung)."; break;
  case diskFull: lpszFormat = "Der Datenträger ist voll; die Datei %1 konnte nicht geschrieben werden."; break;
  case endOfFile: lpszFormat = "Beim Lesen der Datei %1 wurde das Dateiende überschritten."; break;
  default: lpszFormat = "Beim Zugriff auf die Datei %1 ist ein unbekannter Fehler aufgetreten."; break;
  }
  LPCSTR lpszName = m_strFileName.IsEmpty() ? "(ohne Namen)" : (LPCSTR)m_strFileName;
  CString strMessage;
  AfxFormatStrings(strMessage, lpszFormat, &lpszName, 1);
  return CopyMessage(strMessage, lpszError, nMaxError);
}

int PASCAL CFileException::OsErrorToException(LONG lOsError) {
  switch ((DWORD)lOsError) {
  case NO_ERROR: return none;
  case ERROR_FILE_NOT_FOUND:
  case ERROR_NO_MORE_FILES:
  case ERROR_DISK_CHANGE:
  case ERROR_MOD_NOT_FOUND:
    return fileNotFound;
  case ERROR_PATH_NOT_FOUND:
  case ERROR_INVALID_DRIVE:
  case ERROR_NOT_SAME_DEVICE:
  case ERROR_WRONG_DISK:
  case ERROR_DUP_NAME:
  case ERROR_BAD_NETPATH:
  case ERROR_DEV_NOT_EXIST:
  case ERROR_BAD_NET_NAME:
  case ERROR_SHARING_PAUSED:
  case ERROR_ALREADY_ASSIGNED:
  case ERROR_BUFFER_OVERFLOW:
  case ERROR_INVALID_NAME:
  case ERROR_INVALID_LEVEL:
  case ERROR_NO_VOLUME_LABEL:
  case ERROR_DIR_NOT_ROOT:
  case ERROR_LABEL_TOO_LONG:
  case ERROR_BAD_PATHNAME:
  case ERROR_FILENAME_EXCED_RANGE:
  case ERROR_META_EXPANSION_TOO_LONG:
  case ERROR_DIRECTORY:
    return badPath;
  case ERROR_TOO_MANY_OPEN_FILES:
  case ERROR_SHARING_BUFFER_EXCEEDED:
  case ERROR_TOO_MANY_NAMES:
  case ERROR_NO_MORE_SEARCH_HANDLES:
    return tooManyOpenFiles;
  case ERROR_ACCESS_DENIED:
  case ERROR_INVALID_ACCESS:
  case ERROR_WRITE_PROTECT:
  case ERROR_WRITE_FAULT:
  case ERROR_NETWORK_BUSY:
  case ERROR_BAD_NET_RESP:
  case ERROR_NETNAME_DELETED:
  case ERROR_NETWORK_ACCESS_DENIED:
  case ERROR_REQ_NOT_ACCEP:
  case ERROR_FILE_EXISTS:
  case ERROR_CANNOT_MAKE:
  case ERROR_INVALID_PASSWORD:
  case ERROR_BUSY:
  case ERROR_ALREADY_EXISTS:
  case ERROR_SWAPERROR:
    return accessDenied;
  case ERROR_INVALID_HANDLE:
  case ERROR_BAD_FORMAT:
  case ERROR_NOT_DOS_DISK:
  case ERROR_BAD_REM_ADAP:
  case ERROR_BAD_DEV_TYPE:
  case ERROR_INVALID_TARGET_HANDLE:
  case ERROR_INVALID_ORDINAL:
  case ERROR_INVALID_EXE_SIGNATURE:
  case ERROR_BAD_EXE_FORMAT:
    return invalidFile;
  case ERROR_CURRENT_DIRECTORY:
  case ERROR_DIR_NOT_EMPTY:
    return removeCurrentDir;
  case ERROR_NO_SPOOL_SPACE:
    return directoryFull;
  case ERROR_BAD_LENGTH:
  case ERROR_SEEK:
  case ERROR_SECTOR_NOT_FOUND:
  case ERROR_READ_FAULT:
  case ERROR_NEGATIVE_SEEK:
  case ERROR_SEEK_ON_DEVICE:
    return badSeek;
  case ERROR_BAD_UNIT:
  case ERROR_NOT_READY:
  case ERROR_BAD_COMMAND:
  case ERROR_CRC:
  case ERROR_ADAP_HDW_ERR:
  case ERROR_UNEXP_NET_ERR:
  case ERROR_NET_WRITE_FAULT:
  case ERROR_INVALID_CATEGORY:
  case ERROR_OPERATION_ABORTED:
  case ERROR_IO_INCOMPLETE:
  case ERROR_IO_PENDING:
    return hardIO;
  case ERROR_SHARING_VIOLATION:
    return sharingViolation;
  case ERROR_LOCK_VIOLATION:
  case ERROR_DRIVE_LOCKED:
  case ERROR_LOCK_FAILED:
    return lockViolation;
  case ERROR_HANDLE_DISK_FULL:
  case ERROR_DISK_FULL:
    return diskFull;
  case ERROR_HANDLE_EOF:
    return endOfFile;
  default:
    return genericException;
  }
}

void PASCAL CFileException::ThrowOsError(LONG lOsError, LPCSTR lpszFileName) {
  if (lOsError != 0) AfxThrowFileException(OsErrorToException(lOsError), lOsError, lpszFileName);
}

void AFXAPI AfxThrowFileException(int cause, LONG lOsError, LPCSTR lpszFileName) {
  throw new CFileException(cause, lOsError, lpszFileName);
}
