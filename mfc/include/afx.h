// The core of the MFC subset: diagnostics macros, CObject with run-time class
// information, CString, the exception classes, CFile/CStdioFile and CTime.
//
// Text is char in Windows-1252 (the ANSI Win32 entry points); UNICODE is never
// defined. Everything here lives in the one MFC DLL (qomfc.dll) so that the
// application and every extension DLL share it.
//
// Use:
//   - derive from CObject and put DECLARE_DYNAMIC/DECLARE_DYNCREATE in the class,
//     IMPLEMENT_DYNAMIC/IMPLEMENT_DYNCREATE in one source file; RUNTIME_CLASS,
//     IsKindOf and CreateObject then work across DLLs;
//   - throw exceptions as pointers (AfxThrowFileException, ...) and catch them as
//     `catch (CException* e) { ...; e->Delete(); }`, or use TRY/CATCH/END_CATCH,
//     which delete the exception by themselves unless it is re-thrown.
#pragma once

#ifdef UNICODE
#error "The MFC subset is ANSI only: do not define UNICODE"
#endif

#include <windows.h>
#include <oleauto.h>
#include <stdarg.h>
#include <stddef.h>
#include <stdio.h>
#include <string.h>
#include <time.h>

#include "afxv_dll.h"

#ifndef _T
#define _T(x) x
#endif
#ifndef _TEXT
#define _TEXT(x) x
#endif
#ifndef _TCHAR_DEFINED
typedef char _TCHAR;
#endif

#ifndef PASCAL
#define PASCAL __stdcall
#endif

// An iteration position in a list or map; NULL ends the iteration.
struct __POSITION {};
typedef __POSITION* POSITION;
#define BEFORE_START_POSITION ((POSITION)-1L)

class CObject;
class CString;
class CException;
class CFileException;
class CDumpContext;
struct CRuntimeClass;

// ---------------------------------------------------------------------------
// Diagnostics
//
// ASSERT checks a caller's promise in _DEBUG builds, as MFC's does; a release
// build compiles it away, so a condition that input (a file, a project, a
// user) can reach is never left to an assertion: it is a checked error with
// a message. A failed assertion is reported on stderr and through
// OutputDebugString (never a dialog, so batch runs do not block), then the
// process stops through AfxDebugBreak with the breakpoint status, a code no
// caller mistakes for a result of its own. VERIFY evaluates its expression in
// every build. TRACE writes to the debugger only in _DEBUG builds.
// ---------------------------------------------------------------------------

AFX_API BOOL AFXAPI AfxAssertFailedLine(LPCSTR lpszFileName, int nLine);
AFX_API void AFXAPI AfxDebugBreak();
AFX_API void AFX_CDECL AfxTrace(LPCSTR lpszFormat, ...);
AFX_API void AFXAPI AfxAssertValidObject(const CObject* pOb, LPCSTR lpszFileName, int nLine);
AFX_API BOOL AFXAPI AfxIsValidAddress(const void* lp, UINT_PTR nBytes, BOOL bReadWrite = TRUE);
AFX_API BOOL AFXAPI AfxIsValidString(LPCSTR lpsz, int nLength = -1);

#ifdef _DEBUG
#define ASSERT(f) \
  do { if (!(f) && AfxAssertFailedLine(__FILE__, __LINE__)) AfxDebugBreak(); } while (0)
#define VERIFY(f) ASSERT(f)
#define ASSERT_VALID(pOb) (AfxAssertValidObject((pOb), __FILE__, __LINE__))
#define DEBUG_ONLY(f) (f)
#else
#define ASSERT(f) ((void)0)
#define VERIFY(f) ((void)(f))
#define ASSERT_VALID(pOb) ((void)0)
#define DEBUG_ONLY(f) ((void)0)
#endif
#define ASSERT_KINDOF(class_name, object) ASSERT((object)->IsKindOf(RUNTIME_CLASS(class_name)))
#define ASSERT_POINTER(p, type) ASSERT(((p) != NULL) && AfxIsValidAddress((p), sizeof(type), FALSE))
#define ASSERT_NULL_OR_POINTER(p, type) ASSERT(((p) == NULL) || AfxIsValidAddress((p), sizeof(type), FALSE))

#ifdef _DEBUG
#define TRACE AfxTrace
#else
#define TRACE(...) ((void)0)
#endif
#define TRACE0(sz) TRACE("%s", sz)
#define TRACE1(sz, p1) TRACE(sz, p1)
#define TRACE2(sz, p1, p2) TRACE(sz, p1, p2)
#define TRACE3(sz, p1, p2, p3) TRACE(sz, p1, p2, p3)

#ifndef DEBUG_NEW
#define DEBUG_NEW new
#endif

#ifndef UNUSED
#define UNUSED(x) ((void)(x))
#endif
#ifndef UNUSED_ALWAYS
#define UNUSED_ALWAYS(x) ((void)(x))
#endif

// A minimal dump context: CObject::Dump writes through it to the debugger.
class AFX_API CDumpContext {
public:
  CDumpContext();
  CDumpContext& operator<<(LPCSTR lpsz);
  CDumpContext& operator<<(const CString& str);
  CDumpContext& operator<<(const void* lp);
  CDumpContext& operator<<(int n);
  CDumpContext& operator<<(UINT n);
  CDumpContext& operator<<(LONG n);
  CDumpContext& operator<<(DWORD n);
  CDumpContext& operator<<(LONGLONG n);
  CDumpContext& operator<<(ULONGLONG n);
  CDumpContext& operator<<(double d);
  void Flush();
  int GetDepth() const { return m_nDepth; }
  void SetDepth(int nNewDepth) { m_nDepth = nNewDepth; }

private:
  int m_nDepth;
};

extern AFX_API CDumpContext afxDump;

// ---------------------------------------------------------------------------
// Run-time class information
//
// As in MFC's DLL build, the base class is reached through a function
// (m_pfnGetBaseClass) and RUNTIME_CLASS(X) calls X::GetThisClass(): the
// run-time class records of other DLLs are never imported as data.
// ---------------------------------------------------------------------------

struct AFX_API CRuntimeClass {
  LPCSTR m_lpszClassName;
  int m_nObjectSize;
  UINT m_wSchema;                               // 0xFFFF for classes that are not serializable
  CObject* (PASCAL* m_pfnCreateObject)();       // NULL for classes without DYNCREATE
  CRuntimeClass* (PASCAL* m_pfnGetBaseClass)(); // NULL for CObject
  CRuntimeClass* m_pNextClass;                  // unused; kept for the MFC layout

  // New object of this class, or NULL if the class cannot be created dynamically
  // (or creation failed).
  CObject* CreateObject();
  // TRUE if this class is pBaseClass or derives from it.
  BOOL IsDerivedFrom(const CRuntimeClass* pBaseClass) const;

  // Looks a class up by name among every class of every loaded module that uses
  // IMPLEMENT_DYNAMIC/DYNCREATE/SERIAL; NULL if there is none.
  static CRuntimeClass* PASCAL FromName(LPCSTR lpszClassName);
  static CObject* PASCAL CreateObject(LPCSTR lpszClassName);
};

// Registers a run-time class for FromName while its module is loaded.
struct AFX_API AFX_CLASSINIT {
  explicit AFX_CLASSINIT(CRuntimeClass* pNewClass);
  ~AFX_CLASSINIT();
  CRuntimeClass* m_pClass;
};

#define _RUNTIME_CLASS(class_name) ((CRuntimeClass*)(&class_name::class##class_name))
#define RUNTIME_CLASS(class_name) (class_name::GetThisClass())

#define DECLARE_DYNAMIC(class_name)                  \
protected:                                           \
  static CRuntimeClass* PASCAL _GetBaseClass();      \
public:                                              \
  static const CRuntimeClass class##class_name;      \
  static CRuntimeClass* PASCAL GetThisClass();       \
  virtual CRuntimeClass* GetRuntimeClass() const;

#define DECLARE_DYNCREATE(class_name) \
  DECLARE_DYNAMIC(class_name)         \
  static CObject* PASCAL CreateObject();

#define DECLARE_SERIAL(class_name) DECLARE_DYNCREATE(class_name)

#define IMPLEMENT_RUNTIMECLASS(class_name, base_class_name, wSchema, pfnNew)                      \
  CRuntimeClass* PASCAL class_name::_GetBaseClass() { return RUNTIME_CLASS(base_class_name); }  \
  const CRuntimeClass class_name::class##class_name = {#class_name, (int)sizeof(class class_name), \
                                                       wSchema, pfnNew, &class_name::_GetBaseClass, \
                                                       NULL};                                      \
  CRuntimeClass* PASCAL class_name::GetThisClass() { return _RUNTIME_CLASS(class_name); }         \
  CRuntimeClass* class_name::GetRuntimeClass() const { return _RUNTIME_CLASS(class_name); }       \
  static AFX_CLASSINIT _init_##class_name(_RUNTIME_CLASS(class_name));

#define IMPLEMENT_DYNAMIC(class_name, base_class_name) \
  IMPLEMENT_RUNTIMECLASS(class_name, base_class_name, 0xFFFF, NULL)

#define IMPLEMENT_DYNCREATE(class_name, base_class_name)                   \
  CObject* PASCAL class_name::CreateObject() { return new class_name; } \
  IMPLEMENT_RUNTIMECLASS(class_name, base_class_name, 0xFFFF, &class_name::CreateObject)

#define IMPLEMENT_SERIAL(class_name, base_class_name, wSchema)             \
  CObject* PASCAL class_name::CreateObject() { return new class_name; } \
  IMPLEMENT_RUNTIMECLASS(class_name, base_class_name, wSchema, &class_name::CreateObject)

// The root of the MFC class tree. Objects are not copyable through CObject.
class AFX_API CObject {
public:
  virtual CRuntimeClass* GetRuntimeClass() const;
  virtual ~CObject() = 0;

  BOOL IsSerializable() const;
  BOOL IsKindOf(const CRuntimeClass* pClass) const;

  virtual void AssertValid() const;
  virtual void Dump(CDumpContext& dc) const;

  static const CRuntimeClass classCObject;
  static CRuntimeClass* PASCAL GetThisClass();
  static CRuntimeClass* PASCAL _GetBaseClass();

protected:
  CObject();

private:
  CObject(const CObject&) = delete;
  void operator=(const CObject&) = delete;
};

// Checked downcasts: NULL when the object is not of the class (DYNAMIC_DOWNCAST);
// an assertion (STATIC_DOWNCAST).
AFX_API CObject* AFXAPI AfxDynamicDownCast(CRuntimeClass* pClass, CObject* pObject);
AFX_API CObject* AFXAPI AfxStaticDownCast(CRuntimeClass* pClass, CObject* pObject);
#define DYNAMIC_DOWNCAST(class_name, object) \
  ((class_name*)AfxDynamicDownCast(RUNTIME_CLASS(class_name), (CObject*)(object)))
#define STATIC_DOWNCAST(class_name, object) \
  ((class_name*)AfxStaticDownCast(RUNTIME_CLASS(class_name), (CObject*)(object)))

// ---------------------------------------------------------------------------
// CString: a string of char (Windows-1252) with value semantics.
//
// The length is kept explicitly, so a string may hold NUL characters (put there
// through GetBufferSetLength); operations that take C strings stop at the first
// NUL of their argument. Positions are zero-based; out-of-range positions and
// counts are clamped as in MFC, never an error.
//
// Comparisons: Compare and the operators compare bytes (unsigned, like strcmp).
// CompareNoCase compares bytes after folding case with MakeLower's mapping.
// Collate/CollateNoCase compare by the user locale's collation through
// CompareStringA (so "Ä" sorts next to "A", not after "Z").
// MakeUpper/MakeLower fold ASCII letters and the letters of Windows-1252
// (ä/Ä, ö/Ö, ü/Ü, é/É, ...); "ß" and "µ" have no upper-case form in that
// code page and stay unchanged under MakeUpper.
// ---------------------------------------------------------------------------

struct CStringData {
  int nDataLength;  // characters, without the terminating NUL
  int nAllocLength; // characters that fit, without the terminating NUL
  char* data() { return reinterpret_cast<char*>(this + 1); }
};

class AFX_API CString {
public:
  // Construction
  CString();
  CString(const CString& stringSrc);
  CString(CString&& stringSrc) noexcept;
  CString(char ch, int nRepeat = 1);
  // A NULL pointer makes an empty string; a MAKEINTRESOURCE value loads that
  // string from the resources (LoadString).
  CString(LPCSTR lpsz);
  CString(LPCSTR lpch, int nLength);
  CString(const unsigned char* psz);
  CString(LPCWSTR lpsz); // converted from UTF-16 to the ANSI code page
  CString(LPCWSTR lpch, int nLength);
  ~CString();

  // Attributes
  int GetLength() const { return GetData()->nDataLength; }
  BOOL IsEmpty() const { return GetData()->nDataLength == 0; }
  void Empty();
  int GetAllocLength() const { return GetData()->nAllocLength; }

  char GetAt(int nIndex) const;
  char operator[](int nIndex) const { return GetAt(nIndex); }
  void SetAt(int nIndex, char ch);
  operator LPCSTR() const { return m_pchData; }
  LPCSTR GetString() const { return m_pchData; }

  // Assignment
  CString& operator=(const CString& stringSrc);
  CString& operator=(CString&& stringSrc) noexcept;
  CString& operator=(char ch);
  CString& operator=(LPCSTR lpsz);
  CString& operator=(const unsigned char* psz);
  CString& operator=(LPCWSTR lpsz);
  void SetString(LPCSTR lpch, int nLength);

  // Concatenation
  CString& operator+=(const CString& string);
  CString& operator+=(char ch);
  CString& operator+=(LPCSTR lpsz);
  void Append(LPCSTR lpsz);
  void Append(LPCSTR lpch, int nLength);
  void Append(const CString& string);
  void AppendChar(char ch);

  // Comparison: < 0, 0 or > 0
  int Compare(LPCSTR lpsz) const;
  int CompareNoCase(LPCSTR lpsz) const;
  int Collate(LPCSTR lpsz) const;
  int CollateNoCase(LPCSTR lpsz) const;

  // Extraction (clamped to the string)
  CString Mid(int nFirst, int nCount) const;
  CString Mid(int nFirst) const;
  CString Left(int nCount) const;
  CString Right(int nCount) const;
  CString SpanIncluding(LPCSTR lpszCharSet) const;
  CString SpanExcluding(LPCSTR lpszCharSet) const;
  // Next token after iStart, skipping leading delimiters; iStart becomes -1 and
  // the result empty when no token is left.
  CString Tokenize(LPCSTR pszTokens, int& iStart) const;

  // Changing case and order
  CString& MakeUpper();
  CString& MakeLower();
  CString& MakeReverse();

  // Editing; the counts and lengths returned are those of MFC
  int Replace(char chOld, char chNew);          // number of characters replaced
  int Replace(LPCSTR lpszOld, LPCSTR lpszNew);  // number of occurrences replaced
  int Remove(char chRemove);                    // number of characters removed
  int Insert(int nIndex, char ch);              // new length
  int Insert(int nIndex, LPCSTR pstr);          // new length
  int Delete(int nIndex, int nCount = 1);       // new length

  // Trimming: white space (space, \t, \n, \v, \f, \r), one character, or a set
  CString& Trim();
  CString& Trim(char chTarget);
  CString& Trim(LPCSTR lpszTargets);
  CString& TrimLeft();
  CString& TrimLeft(char chTarget);
  CString& TrimLeft(LPCSTR lpszTargets);
  CString& TrimRight();
  CString& TrimRight(char chTarget);
  CString& TrimRight(LPCSTR lpszTargets);

  // Searching: zero-based index or -1
  int Find(char ch, int nStart = 0) const;
  int Find(LPCSTR lpszSub, int nStart = 0) const;
  int ReverseFind(char ch) const;
  int FindOneOf(LPCSTR lpszCharSet) const;

  // Formatting with printf rules; any length
  void AFX_CDECL Format(LPCSTR lpszFormat, ...);
  void AFX_CDECL Format(UINT nFormatID, ...);
  void FormatV(LPCSTR lpszFormat, va_list argList);
  void AFX_CDECL AppendFormat(LPCSTR lpszFormat, ...);
  void AppendFormatV(LPCSTR lpszFormat, va_list argList);

  // Resources: the string with the id from the resource chain (the application,
  // then every extension DLL). FALSE and an empty string when there is none.
  BOOL LoadString(UINT nID);

  // Windows-1252 <-> OEM code page in place
  void AnsiToOem();
  void OemToAnsi();

  // A BSTR (UTF-16) copy for OLE automation; the caller frees it with SysFreeString.
  BSTR AllocSysString() const;
  BSTR SetSysString(BSTR* pbstr) const;

  // Direct access to the buffer: GetBuffer gives at least nMinBufLength
  // characters (plus the NUL) with the current contents; ReleaseBuffer takes the
  // new length (-1: up to the first NUL). GetBufferSetLength sets the length at
  // once (the characters beyond the old contents are NUL).
  LPSTR GetBuffer(int nMinBufLength = 0);
  void ReleaseBuffer(int nNewLength = -1);
  LPSTR GetBufferSetLength(int nNewLength);
  void Preallocate(int nLength);
  void FreeExtra();
  LPSTR LockBuffer();
  void UnlockBuffer();

private:
  CStringData* GetData() const { return reinterpret_cast<CStringData*>(m_pchData) - 1; }
  void AllocBuffer(int nLen);
  void EnsureCapacity(int nLen);
  void AssignCopy(LPCSTR lpch, int nLen);
  void ConcatInPlace(LPCSTR lpch, int nLen);
  void Release();

  LPSTR m_pchData; // points after the CStringData header; never NULL
};

AFX_API CString AFXAPI operator+(const CString& string1, const CString& string2);
AFX_API CString AFXAPI operator+(const CString& string, char ch);
AFX_API CString AFXAPI operator+(char ch, const CString& string);
AFX_API CString AFXAPI operator+(const CString& string, LPCSTR lpsz);
AFX_API CString AFXAPI operator+(LPCSTR lpsz, const CString& string);

inline bool operator==(const CString& s1, const CString& s2) { return s1.Compare(s2) == 0; }
inline bool operator==(const CString& s1, LPCSTR s2) { return s1.Compare(s2) == 0; }
inline bool operator==(LPCSTR s1, const CString& s2) { return s2.Compare(s1) == 0; }
inline bool operator!=(const CString& s1, const CString& s2) { return s1.Compare(s2) != 0; }
inline bool operator!=(const CString& s1, LPCSTR s2) { return s1.Compare(s2) != 0; }
inline bool operator!=(LPCSTR s1, const CString& s2) { return s2.Compare(s1) != 0; }
inline bool operator<(const CString& s1, const CString& s2) { return s1.Compare(s2) < 0; }
inline bool operator<(const CString& s1, LPCSTR s2) { return s1.Compare(s2) < 0; }
inline bool operator<(LPCSTR s1, const CString& s2) { return s2.Compare(s1) > 0; }
inline bool operator>(const CString& s1, const CString& s2) { return s1.Compare(s2) > 0; }
inline bool operator>(const CString& s1, LPCSTR s2) { return s1.Compare(s2) > 0; }
inline bool operator>(LPCSTR s1, const CString& s2) { return s2.Compare(s1) < 0; }
inline bool operator<=(const CString& s1, const CString& s2) { return s1.Compare(s2) <= 0; }
inline bool operator<=(const CString& s1, LPCSTR s2) { return s1.Compare(s2) <= 0; }
inline bool operator<=(LPCSTR s1, const CString& s2) { return s2.Compare(s1) >= 0; }
inline bool operator>=(const CString& s1, const CString& s2) { return s1.Compare(s2) >= 0; }
inline bool operator>=(const CString& s1, LPCSTR s2) { return s1.Compare(s2) >= 0; }
inline bool operator>=(LPCSTR s1, const CString& s2) { return s2.Compare(s1) <= 0; }

// The module whose string table holds nID: the application first, then every
// extension DLL of the resource chain; NULL if none has it. Defined with the
// window classes.
AFX_API HINSTANCE AFXAPI AfxFindStringResourceHandle(UINT nID);

// Loads string nIDS and replaces %1 (and %2) with the texts given.
AFX_API void AFXAPI AfxFormatString1(CString& rString, UINT nIDS, LPCSTR lpsz1);
AFX_API void AFXAPI AfxFormatString2(CString& rString, UINT nIDS, LPCSTR lpsz1, LPCSTR lpsz2);
// Replaces %1..%9 in lpszFormat with rglpsz[0..nString-1].
AFX_API void AFXAPI AfxFormatStrings(CString& rString, LPCSTR lpszFormat, LPCSTR const* rglpsz,
                                     int nString);

// ---------------------------------------------------------------------------
// Exceptions
//
// Exceptions are thrown as pointers and ended with Delete(), which frees an
// exception made with new and leaves one on the stack or in static storage alone.
// ---------------------------------------------------------------------------

class AFX_API CException : public CObject {
  DECLARE_DYNAMIC(CException)
public:
  CException();
  explicit CException(BOOL bAutoDelete);
  virtual ~CException();

  // Frees the exception if it was made with new (and auto-deletion is on).
  void Delete();

  // The message for the user in lpszError (at most nMaxError characters with the
  // NUL); FALSE when there is no message.
  virtual BOOL GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext = NULL) const;
  // Shows the message in a message box; nMessageID is used when there is no
  // message of its own. Defined with the window classes.
  virtual int ReportError(UINT nType = MB_OK, UINT nMessageID = 0);

  static void* operator new(size_t nSize);
  static void operator delete(void* p);

  BOOL m_bAutoDelete;

protected:
  BOOL m_bHeapObject; // made with new
};

// An exception whose message is a fixed text.
class AFX_API CSimpleException : public CException {
  DECLARE_DYNAMIC(CSimpleException)
public:
  CSimpleException();
  explicit CSimpleException(BOOL bAutoDelete);
  virtual BOOL GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext = NULL) const;

protected:
  virtual LPCSTR GetMessageText() const;
};

class AFX_API CMemoryException : public CSimpleException {
  DECLARE_DYNAMIC(CMemoryException)
public:
  CMemoryException();
  explicit CMemoryException(BOOL bAutoDelete);
protected:
  virtual LPCSTR GetMessageText() const;
};

class AFX_API CNotSupportedException : public CSimpleException {
  DECLARE_DYNAMIC(CNotSupportedException)
public:
  CNotSupportedException();
  explicit CNotSupportedException(BOOL bAutoDelete);
protected:
  virtual LPCSTR GetMessageText() const;
};

class AFX_API CInvalidArgException : public CSimpleException {
  DECLARE_DYNAMIC(CInvalidArgException)
public:
  CInvalidArgException();
  explicit CInvalidArgException(BOOL bAutoDelete);
protected:
  virtual LPCSTR GetMessageText() const;
};

class AFX_API CResourceException : public CSimpleException {
  DECLARE_DYNAMIC(CResourceException)
public:
  CResourceException();
  explicit CResourceException(BOOL bAutoDelete);
protected:
  virtual LPCSTR GetMessageText() const;
};

// Stops a user operation after the user has been told why; it has no message.
class AFX_API CUserException : public CSimpleException {
  DECLARE_DYNAMIC(CUserException)
public:
  CUserException();
  explicit CUserException(BOOL bAutoDelete);
protected:
  virtual LPCSTR GetMessageText() const;
};

class AFX_API CFileException : public CException {
  DECLARE_DYNAMIC(CFileException)
public:
  enum {
    none,
    genericException,
    fileNotFound,
    badPath,
    tooManyOpenFiles,
    accessDenied,
    invalidFile,
    removeCurrentDir,
    directoryFull,
    badSeek,
    hardIO,
    sharingViolation,
    lockViolation,
    diskFull,
    endOfFile,
    generic = genericException // the older name
  };

  CFileException(int cause = CFileException::none, LONG lOsError = -1, LPCSTR lpszArchiveName = NULL);
  virtual ~CFileException();

  // German message naming the file, e.g. "Die Datei C:\x.txt wurde nicht gefunden."
  virtual BOOL GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext = NULL) const;

  // The cause code for a Win32 error code (GetLastError).
  static int PASCAL OsErrorToException(LONG lOsError);
  // Throws a CFileException for a Win32 error code; nothing for NO_ERROR.
  static void PASCAL ThrowOsError(LONG lOsError, LPCSTR lpszFileName = NULL);

  int m_cause;
  LONG m_lOsError;
  CString m_strFileName;
};

AFX_API void AFXAPI AfxThrowMemoryException();
AFX_API void AFXAPI AfxThrowNotSupportedException();
AFX_API void AFXAPI AfxThrowInvalidArgException();
AFX_API void AFXAPI AfxThrowResourceException();
AFX_API void AFXAPI AfxThrowUserException();
AFX_API void AFXAPI AfxThrowFileException(int cause, LONG lOsError = -1, LPCSTR lpszFileName = NULL);

// Ends an exception caught by TRY/CATCH unless THROW_LAST passed it on.
struct AFX_API AFX_EXCEPTION_LINK {
  explicit AFX_EXCEPTION_LINK(CException* pException) : m_pException(pException) {}
  ~AFX_EXCEPTION_LINK();
  CException* m_pException;
};

// The MFC exception macros over C++ exceptions. An exception caught by CATCH or
// CATCH_ALL is deleted at the end of its block unless THROW_LAST() re-throws it;
// do not call Delete() on it inside the block.
#define TRY try {
#define CATCH(class_name, e)                                       \
  }                                                                \
  catch (class_name * e) {                                         \
    ASSERT(e->IsKindOf(RUNTIME_CLASS(class_name)));                \
    AFX_EXCEPTION_LINK _afxExceptionLink(e);
#define AND_CATCH(class_name, e) CATCH(class_name, e)
#define END_CATCH }
#define CATCH_ALL(e) CATCH(CException, e)
#define AND_CATCH_ALL(e) CATCH(CException, e)
#define END_CATCH_ALL }
#define END_TRY }
#define THROW(e) throw e
#define THROW_LAST()                            \
  do {                                          \
    _afxExceptionLink.m_pException = NULL;      \
    throw;                                      \
  } while (0)

#include "atltypes.h"

// ---------------------------------------------------------------------------
// CTimeSpan and CTime: seconds, and a point in time as seconds since 1970 (UTC).
// The calendar parts (GetYear, ..., Format) are those of local time.
// ---------------------------------------------------------------------------

class CTimeSpan {
public:
  CTimeSpan() : m_timeSpan(0) {}
  CTimeSpan(__time64_t time) : m_timeSpan(time) {}
  CTimeSpan(LONG lDays, int nHours, int nMins, int nSecs)
      : m_timeSpan(nSecs + 60 * (nMins + 60 * (nHours + (__time64_t)24 * lDays))) {}

  LONGLONG GetDays() const { return m_timeSpan / (24 * 3600); }
  LONGLONG GetTotalHours() const { return m_timeSpan / 3600; }
  LONG GetHours() const { return (LONG)(GetTotalHours() - GetDays() * 24); }
  LONGLONG GetTotalMinutes() const { return m_timeSpan / 60; }
  LONG GetMinutes() const { return (LONG)(GetTotalMinutes() - GetTotalHours() * 60); }
  LONGLONG GetTotalSeconds() const { return m_timeSpan; }
  LONG GetSeconds() const { return (LONG)(GetTotalSeconds() - GetTotalMinutes() * 60); }
  __time64_t GetTimeSpan() const { return m_timeSpan; }

  CTimeSpan operator+(CTimeSpan span) const { return CTimeSpan(m_timeSpan + span.m_timeSpan); }
  CTimeSpan operator-(CTimeSpan span) const { return CTimeSpan(m_timeSpan - span.m_timeSpan); }
  CTimeSpan& operator+=(CTimeSpan span) { m_timeSpan += span.m_timeSpan; return *this; }
  CTimeSpan& operator-=(CTimeSpan span) { m_timeSpan -= span.m_timeSpan; return *this; }
  bool operator==(CTimeSpan span) const { return m_timeSpan == span.m_timeSpan; }
  bool operator!=(CTimeSpan span) const { return m_timeSpan != span.m_timeSpan; }
  bool operator<(CTimeSpan span) const { return m_timeSpan < span.m_timeSpan; }
  bool operator>(CTimeSpan span) const { return m_timeSpan > span.m_timeSpan; }
  bool operator<=(CTimeSpan span) const { return m_timeSpan <= span.m_timeSpan; }
  bool operator>=(CTimeSpan span) const { return m_timeSpan >= span.m_timeSpan; }

private:
  __time64_t m_timeSpan;
};

// windows.h maps GetCurrentTime to GetTickCount; here it is CTime's member.
#ifdef GetCurrentTime
#undef GetCurrentTime
#endif

class AFX_API CTime {
public:
  static CTime PASCAL GetCurrentTime();

  CTime() : m_time(0) {}
  CTime(__time64_t time) : m_time(time) {}
  // Local date and time; nDST < 0 lets the C runtime decide about daylight saving.
  CTime(int nYear, int nMonth, int nDay, int nHour, int nMin, int nSec, int nDST = -1);
  CTime(const SYSTEMTIME& st, int nDST = -1); // local time
  CTime(const FILETIME& ft, int nDST = -1);   // UTC, as file times are

  __time64_t GetTime() const { return m_time; }
  struct tm* GetLocalTm(struct tm* ptm) const;
  struct tm* GetGmtTm(struct tm* ptm) const;
  BOOL GetAsSystemTime(SYSTEMTIME& st) const; // local time

  int GetYear() const;
  int GetMonth() const;
  int GetDay() const;
  int GetHour() const;
  int GetMinute() const;
  int GetSecond() const;
  int GetDayOfWeek() const; // 1 = Sunday

  // strftime formats of the local (Format) or UTC (FormatGmt) time.
  CString Format(LPCSTR pszFormat) const;
  CString FormatGmt(LPCSTR pszFormat) const;

  CTimeSpan operator-(CTime time) const { return CTimeSpan(m_time - time.m_time); }
  CTime operator-(CTimeSpan span) const { return CTime(m_time - span.GetTimeSpan()); }
  CTime operator+(CTimeSpan span) const { return CTime(m_time + span.GetTimeSpan()); }
  CTime& operator+=(CTimeSpan span) { m_time += span.GetTimeSpan(); return *this; }
  CTime& operator-=(CTimeSpan span) { m_time -= span.GetTimeSpan(); return *this; }
  bool operator==(CTime time) const { return m_time == time.m_time; }
  bool operator!=(CTime time) const { return m_time != time.m_time; }
  bool operator<(CTime time) const { return m_time < time.m_time; }
  bool operator>(CTime time) const { return m_time > time.m_time; }
  bool operator<=(CTime time) const { return m_time <= time.m_time; }
  bool operator>=(CTime time) const { return m_time >= time.m_time; }

private:
  __time64_t m_time;
};

// ---------------------------------------------------------------------------
// CFile: unbuffered binary file over a Win32 file handle. Failures of the
// world (missing file, full disk, ...) are thrown as CFileException*; Open
// reports them through its out-parameter instead.
// ---------------------------------------------------------------------------

struct CFileStatus {
  CTime m_ctime;          // creation time
  CTime m_mtime;          // last write time
  CTime m_atime;          // last access time
  ULONGLONG m_size;       // bytes
  BYTE m_attribute;       // CFile::Attribute bits
  BYTE _m_padding;
  char m_szFullName[MAX_PATH]; // absolute path
};

class AFX_API CFile : public CObject {
  DECLARE_DYNAMIC(CFile)
public:
  enum OpenFlags {
    modeRead = 0x00000,
    modeWrite = 0x00001,
    modeReadWrite = 0x00002,
    shareCompat = 0x00000,
    shareExclusive = 0x00010,
    shareDenyWrite = 0x00020,
    shareDenyRead = 0x00030,
    shareDenyNone = 0x00040,
    modeNoInherit = 0x00080,
    modeCreate = 0x01000,
    modeNoTruncate = 0x02000,
    typeText = 0x04000,   // CStdioFile only
    typeBinary = 0x08000, // CStdioFile only
    osNoBuffer = 0x10000,
    osWriteThrough = 0x20000,
    osRandomAccess = 0x40000,
    osSequentialScan = 0x80000
  };
  enum Attribute { normal = 0x00, readOnly = 0x01, hidden = 0x02, system = 0x04, volume = 0x08,
                   directory = 0x10, archive = 0x20 };
  enum SeekPosition { begin = 0x0, current = 0x1, end = 0x2 };

  static const HANDLE hFileNull;

  CFile();
  explicit CFile(HANDLE hFile); // attaches; the handle is not closed by the destructor
  CFile(LPCSTR lpszFileName, UINT nOpenFlags); // throws CFileException* on failure
  virtual ~CFile();                            // closes an open file, ignoring errors

  operator HANDLE() const { return m_hFile; }

  virtual BOOL Open(LPCSTR lpszFileName, UINT nOpenFlags, CFileException* pError = NULL);
  virtual UINT Read(void* lpBuf, UINT nCount);         // bytes read; 0 at the end
  virtual void Write(const void* lpBuf, UINT nCount);
  virtual ULONGLONG Seek(LONGLONG lOff, UINT nFrom);  // new position
  ULONGLONG SeekToEnd();
  void SeekToBegin();
  virtual ULONGLONG GetPosition() const;
  virtual ULONGLONG GetLength() const;
  virtual void SetLength(ULONGLONG dwNewLen);
  virtual void LockRange(ULONGLONG dwPos, ULONGLONG dwCount);
  virtual void UnlockRange(ULONGLONG dwPos, ULONGLONG dwCount);
  virtual void Flush();
  virtual void Close();
  virtual void Abort(); // closes, ignoring every error

  virtual CString GetFileName() const;  // "x.txt"
  virtual CString GetFileTitle() const; // "x"
  virtual CString GetFilePath() const;  // absolute path
  virtual void SetFilePath(LPCSTR lpszNewName);

  BOOL GetStatus(CFileStatus& rStatus) const;
  static BOOL PASCAL GetStatus(LPCSTR lpszFileName, CFileStatus& rStatus);
  static void PASCAL Rename(LPCSTR lpszOldName, LPCSTR lpszNewName); // throws
  static void PASCAL Remove(LPCSTR lpszFileName);                   // throws

  HANDLE m_hFile;

protected:
  BOOL m_bCloseOnDelete;
  CString m_strFileName;
};

// ---------------------------------------------------------------------------
// CStdioFile: a buffered file through the C runtime's stream, in text mode
// (CR LF on disk, LF in memory; Ctrl-Z ends the text) unless typeBinary is given.
// ---------------------------------------------------------------------------

class AFX_API CStdioFile : public CFile {
  DECLARE_DYNAMIC(CStdioFile)
public:
  CStdioFile();
  CStdioFile(LPCSTR lpszFileName, UINT nOpenFlags); // throws CFileException* on failure
  virtual ~CStdioFile();

  virtual BOOL Open(LPCSTR lpszFileName, UINT nOpenFlags, CFileException* pError = NULL);

  // Writes the text as it stands (no line end is added).
  virtual void WriteString(LPCSTR lpsz);
  // Reads up to nMax - 1 characters of one line, keeping its '\n'; NULL at the end.
  virtual LPSTR ReadString(LPSTR lpsz, UINT nMax);
  // Reads one line without its line end; FALSE at the end of the file.
  virtual BOOL ReadString(CString& rString);

  virtual UINT Read(void* lpBuf, UINT nCount);
  virtual void Write(const void* lpBuf, UINT nCount);
  virtual ULONGLONG Seek(LONGLONG lOff, UINT nFrom);
  virtual ULONGLONG GetPosition() const;
  virtual ULONGLONG GetLength() const;
  virtual void Flush();
  virtual void Close();
  virtual void Abort();

  FILE* m_pStream;
};

// The collection classes come with afx.h, as they do in MFC programs.
#include "afxcoll.h"
