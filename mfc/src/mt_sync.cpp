// Synchronisation objects: CSyncObject, CEvent, CSingleLock, CMultiLock.
#include "afxmt.h"

IMPLEMENT_DYNAMIC(CSyncObject, CObject)
IMPLEMENT_DYNAMIC(CEvent, CSyncObject)

// ---------------------------------------------------------------------------
// CSyncObject
// ---------------------------------------------------------------------------

CSyncObject::CSyncObject(LPCTSTR pstrName) : m_hObject(NULL) { (void)pstrName; }

CSyncObject::~CSyncObject() {
  if (m_hObject != NULL) {
    ::CloseHandle(m_hObject);
    m_hObject = NULL;
  }
}

BOOL CSyncObject::Lock(DWORD dwTimeout) {
  DWORD dwRet = ::WaitForSingleObject(m_hObject, dwTimeout);
  return dwRet == WAIT_OBJECT_0 || dwRet == WAIT_ABANDONED;
}

BOOL CSyncObject::Unlock(LONG, LPLONG) { return TRUE; }

// ---------------------------------------------------------------------------
// CEvent
// ---------------------------------------------------------------------------

CEvent::CEvent(BOOL bInitiallyOwn, BOOL bManualReset, LPCTSTR lpszName, LPSECURITY_ATTRIBUTES lpsaAttribute)
    : CSyncObject(lpszName) {
  m_hObject = ::CreateEventA(lpsaAttribute, bManualReset, bInitiallyOwn, lpszName);
  if (m_hObject == NULL) AfxThrowResourceException();
  // Nothing may run after CreateEvent here: callers read GetLastError() to
  // learn whether a named event existed already.
}

CEvent::~CEvent() {}

BOOL CEvent::Unlock() { return TRUE; }

// ---------------------------------------------------------------------------
// CSingleLock
// ---------------------------------------------------------------------------

CSingleLock::CSingleLock(CSyncObject* pObject, BOOL bInitialLock)
    : m_pObject(pObject), m_hObject(NULL), m_bAcquired(FALSE) {
  ASSERT(pObject != NULL);
  m_hObject = pObject->m_hObject;
  if (bInitialLock) Lock();
}

BOOL CSingleLock::Lock(DWORD dwTimeOut) {
  ASSERT(m_pObject != NULL);
  m_bAcquired = m_pObject->Lock(dwTimeOut);
  return m_bAcquired;
}

BOOL CSingleLock::Unlock() {
  if (m_bAcquired) m_bAcquired = !m_pObject->Unlock();
  return !m_bAcquired;
}

BOOL CSingleLock::Unlock(LONG lCount, LPLONG lPrevCount) {
  if (m_bAcquired) m_bAcquired = !m_pObject->Unlock(lCount, lPrevCount);
  return !m_bAcquired;
}

// ---------------------------------------------------------------------------
// CMultiLock
// ---------------------------------------------------------------------------

CMultiLock::CMultiLock(CSyncObject* ppObjects[], DWORD dwCount, BOOL bInitialLock)
    : m_ppObjectArray(ppObjects), m_pHandleArray(NULL), m_bLockedArray(NULL), m_dwCount(dwCount) {
  // WaitForMultipleObjects takes no more; a larger count is a caller's error.
  ASSERT(ppObjects != NULL && dwCount > 0 && dwCount <= MAXIMUM_WAIT_OBJECTS);
  m_pHandleArray = new HANDLE[dwCount];
  m_bLockedArray = new BOOL[dwCount];
  for (DWORD i = 0; i < dwCount; ++i) {
    ASSERT(ppObjects[i] != NULL);
    m_pHandleArray[i] = ppObjects[i]->m_hObject;
    m_bLockedArray[i] = FALSE;
  }
  if (bInitialLock) Lock();
}

CMultiLock::~CMultiLock() {
  Unlock();
  delete[] m_pHandleArray;
  delete[] m_bLockedArray;
}

DWORD CMultiLock::Lock(DWORD dwTimeOut, BOOL bWaitForAll, DWORD dwWakeMask) {
  DWORD dwResult;
  if (dwWakeMask == 0)
    dwResult = ::WaitForMultipleObjects(m_dwCount, m_pHandleArray, bWaitForAll, dwTimeOut);
  else
    dwResult = ::MsgWaitForMultipleObjects(m_dwCount, m_pHandleArray, bWaitForAll, dwTimeOut, dwWakeMask);

  DWORD dwIndex = m_dwCount; // none
  if (dwResult >= WAIT_OBJECT_0 && dwResult < WAIT_OBJECT_0 + m_dwCount)
    dwIndex = dwResult - WAIT_OBJECT_0;
  else if (dwResult >= WAIT_ABANDONED_0 && dwResult < WAIT_ABANDONED_0 + m_dwCount)
    dwIndex = dwResult - WAIT_ABANDONED_0; // an abandoned mutex is owned all the same
  if (dwIndex < m_dwCount) {
    if (bWaitForAll) {
      for (DWORD i = 0; i < m_dwCount; ++i) m_bLockedArray[i] = TRUE;
    } else {
      m_bLockedArray[dwIndex] = TRUE;
    }
  }
  return dwResult;
}

BOOL CMultiLock::Unlock() {
  for (DWORD i = 0; i < m_dwCount; ++i)
    if (m_bLockedArray[i]) m_bLockedArray[i] = !m_ppObjectArray[i]->Unlock();
  return TRUE;
}

BOOL CMultiLock::Unlock(LONG lCount, LPLONG lPrevCount) {
  BOOL bGotOne = FALSE;
  for (DWORD i = 0; i < m_dwCount; ++i) {
    if (m_bLockedArray[i]) {
      m_bLockedArray[i] = !m_ppObjectArray[i]->Unlock(lCount, lPrevCount);
      bGotOne = TRUE;
    }
  }
  return bGotOne;
}

BOOL CMultiLock::IsLocked(DWORD dwItem) const {
  ASSERT(dwItem < m_dwCount);
  return dwItem < m_dwCount && m_bLockedArray[dwItem];
}
