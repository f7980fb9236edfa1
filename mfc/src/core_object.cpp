// CObject, run-time class records and their process-wide registry, and the
// diagnostics behind ASSERT and TRACE.
#include "afx.h"

#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include <algorithm>
#include <vector>

// ---------------------------------------------------------------------------
// Diagnostics
// ---------------------------------------------------------------------------

BOOL AFXAPI AfxAssertFailedLine(LPCSTR lpszFileName, int nLine) {
  char szMessage[600];
  snprintf(szMessage, sizeof(szMessage), "Assertion failed: %s(%d)\n",
           lpszFileName != NULL ? lpszFileName : "?", nLine);
  ::OutputDebugStringA(szMessage);
  fputs(szMessage, stderr);
  fflush(stderr);
  return TRUE;
}

void AFXAPI AfxDebugBreak() {
  if (::IsDebuggerPresent()) ::DebugBreak();
  // No dialog (batch runs must not block) and no further code of a broken
  // program. The status is the one an unhandled breakpoint ends a process
  // with: small codes are results that callers of a program read as their own.
  ::TerminateProcess(::GetCurrentProcess(), (UINT)STATUS_BREAKPOINT);
}

void AFX_CDECL AfxTrace(LPCSTR lpszFormat, ...) {
  if (lpszFormat == NULL) return;
  va_list args;
  va_start(args, lpszFormat);
  CString str;
  str.FormatV(lpszFormat, args);
  va_end(args);
  ::OutputDebugStringA(str);
}

void AFXAPI AfxAssertValidObject(const CObject* pOb, LPCSTR lpszFileName, int nLine) {
  if (pOb == NULL) {
    if (AfxAssertFailedLine(lpszFileName, nLine)) AfxDebugBreak();
    return;
  }
  pOb->AssertValid();
}

BOOL AFXAPI AfxIsValidAddress(const void* lp, UINT_PTR nBytes, BOOL bReadWrite) {
  (void)nBytes;
  (void)bReadWrite;
  return lp != NULL;
}

BOOL AFXAPI AfxIsValidString(LPCSTR lpsz, int nLength) {
  (void)nLength;
  return lpsz != NULL;
}

CDumpContext afxDump;

CDumpContext::CDumpContext() : m_nDepth(0) {}

CDumpContext& CDumpContext::operator<<(LPCSTR lpsz) {
  ::OutputDebugStringA(lpsz != NULL ? lpsz : "(NULL)");
  return *this;
}
CDumpContext& CDumpContext::operator<<(const CString& str) { return *this << (LPCSTR)str; }

template <class T>
static CDumpContext& DumpFormatted(CDumpContext& dc, LPCSTR lpszFormat, T value) {
  CString str;
  str.Format(lpszFormat, value);
  return dc << str;
}

CDumpContext& CDumpContext::operator<<(const void* lp) { return DumpFormatted(*this, "$%p", lp); }
CDumpContext& CDumpContext::operator<<(int n) { return DumpFormatted(*this, "%d", n); }
CDumpContext& CDumpContext::operator<<(UINT n) { return DumpFormatted(*this, "%u", n); }
CDumpContext& CDumpContext::operator<<(LONG n) { return DumpFormatted(*this, "%ld", n); }
CDumpContext& CDumpContext::operator<<(DWORD n) { return DumpFormatted(*this, "%lu", n); }
CDumpContext& CDumpContext::operator<<(LONGLONG n) { return DumpFormatted(*this, "%lld", n); }
CDumpContext& CDumpContext::operator<<(ULONGLONG n) { return DumpFormatted(*this, "%llu", n); }
CDumpContext& CDumpContext::operator<<(double d) { return DumpFormatted(*this, "%g", d); }
void CDumpContext::Flush() {}

// ---------------------------------------------------------------------------
// The registry of run-time classes for FromName. Every module registers its
// classes while it is loaded and removes them when it is unloaded.
// ---------------------------------------------------------------------------

namespace {

struct ClassRegistry {
  CRITICAL_SECTION cs;
  std::vector<CRuntimeClass*> classes;
  ClassRegistry() { ::InitializeCriticalSection(&cs); }
};

ClassRegistry& Registry() {
  // Never destroyed: modules may unregister during process exit in any order.
  static ClassRegistry* pRegistry = new ClassRegistry;
  return *pRegistry;
}

struct RegistryLock {
  RegistryLock() { ::EnterCriticalSection(&Registry().cs); }
  ~RegistryLock() { ::LeaveCriticalSection(&Registry().cs); }
};

} // namespace

AFX_CLASSINIT::AFX_CLASSINIT(CRuntimeClass* pNewClass) : m_pClass(pNewClass) {
  RegistryLock lock;
  Registry().classes.push_back(pNewClass);
}

AFX_CLASSINIT::~AFX_CLASSINIT() {
  RegistryLock lock;
  std::vector<CRuntimeClass*>& classes = Registry().classes;
  auto it = std::find(classes.begin(), classes.end(), m_pClass);
  if (it != classes.end()) classes.erase(it);
}

CRuntimeClass* PASCAL CRuntimeClass::FromName(LPCSTR lpszClassName) {
  if (lpszClassName == NULL) return NULL;
  RegistryLock lock;
  for (CRuntimeClass* pClass : Registry().classes)
    if (strcmp(pClass->m_lpszClassName, lpszClassName) == 0) return pClass;
  return NULL;
}

CObject* PASCAL CRuntimeClass::CreateObject(LPCSTR lpszClassName) {
  CRuntimeClass* pClass = FromName(lpszClassName);
  return pClass == NULL ? NULL : pClass->CreateObject();
}

CObject* CRuntimeClass::CreateObject() {
  if (m_pfnCreateObject == NULL) {
    TRACE("CRuntimeClass::CreateObject: %s is not DECLARE_DYNCREATE\n", m_lpszClassName);
    return NULL;
  }
  try {
    return (*m_pfnCreateObject)();
  } catch (CException* e) {
    e->Delete();
    return NULL;
  }
}

BOOL CRuntimeClass::IsDerivedFrom(const CRuntimeClass* pBaseClass) const {
  ASSERT(pBaseClass != NULL);
  for (const CRuntimeClass* pClass = this; pClass != NULL;
       pClass = pClass->m_pfnGetBaseClass != NULL ? (*pClass->m_pfnGetBaseClass)() : NULL) {
    if (pClass == pBaseClass) return TRUE;
  }
  return FALSE;
}

// ---------------------------------------------------------------------------
// CObject
// ---------------------------------------------------------------------------

const CRuntimeClass CObject::classCObject = {"CObject", (int)sizeof(CObject), 0xFFFF, NULL, NULL, NULL};
static AFX_CLASSINIT _init_CObject(const_cast<CRuntimeClass*>(&CObject::classCObject));

CRuntimeClass* PASCAL CObject::GetThisClass() { return const_cast<CRuntimeClass*>(&classCObject); }
CRuntimeClass* PASCAL CObject::_GetBaseClass() { return NULL; }
CRuntimeClass* CObject::GetRuntimeClass() const { return GetThisClass(); }

CObject::CObject() {}
CObject::~CObject() {}

BOOL CObject::IsSerializable() const { return GetRuntimeClass()->m_wSchema != 0xFFFF; }

BOOL CObject::IsKindOf(const CRuntimeClass* pClass) const {
  return GetRuntimeClass()->IsDerivedFrom(pClass);
}

void CObject::AssertValid() const {}

void CObject::Dump(CDumpContext& dc) const {
  dc << "a " << GetRuntimeClass()->m_lpszClassName << " at " << (const void*)this << "\n";
}

CObject* AFXAPI AfxDynamicDownCast(CRuntimeClass* pClass, CObject* pObject) {
  return pObject != NULL && pObject->IsKindOf(pClass) ? pObject : NULL;
}

CObject* AFXAPI AfxStaticDownCast(CRuntimeClass* pClass, CObject* pObject) {
  ASSERT(pObject == NULL || pObject->IsKindOf(pClass));
  return pObject;
}
