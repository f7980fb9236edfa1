// Synchronisation objects of the MFC subset: an event (CEvent) on the common
// base of waitable kernel objects (CSyncObject), and the lock helpers that
// wait on one object (CSingleLock) or on several at once (CMultiLock).
//
// Use:
//   - a CEvent owns its kernel handle and closes it when destroyed; a named
//     event opens the existing object of that name, and GetLastError() right
//     after the construction tells ERROR_ALREADY_EXISTS as CreateEvent does;
//     a handle that cannot be made throws CResourceException;
//   - CMultiLock waits for all objects or for any one of them, optionally
//     also for queue input (dwWakeMask), and answers WaitForMultipleObjects'
//     code: WAIT_OBJECT_0 + index, WAIT_TIMEOUT, WAIT_FAILED, or
//     WAIT_OBJECT_0 + count for input in the queue;
//   - both locks remember what they hold and release it when they are
//     destroyed. Releasing an event does nothing: it is signalled by SetEvent.
#pragma once

#include "afx.h"

// ---------------------------------------------------------------------------
// CSyncObject: a waitable kernel object owned by the object.
// ---------------------------------------------------------------------------

class AFX_API CSyncObject : public CObject {
  DECLARE_DYNAMIC(CSyncObject)
public:
  explicit CSyncObject(LPCTSTR pstrName);
  virtual ~CSyncObject();

  CSyncObject(const CSyncObject&) = delete;
  CSyncObject& operator=(const CSyncObject&) = delete;

  operator HANDLE() const { return m_hObject; }

  // TRUE when the object was signalled within dwTimeout milliseconds.
  virtual BOOL Lock(DWORD dwTimeout = INFINITE);
  virtual BOOL Unlock() = 0;
  virtual BOOL Unlock(LONG lCount, LPLONG lpPrevCount = NULL);

  HANDLE m_hObject;
};

// ---------------------------------------------------------------------------
// CEvent
// ---------------------------------------------------------------------------

class AFX_API CEvent : public CSyncObject {
  DECLARE_DYNAMIC(CEvent)
public:
  // bInitiallyOwn: signalled at once; bManualReset FALSE: an auto-reset event
  // that releases one waiter and falls back to non-signalled by itself.
  explicit CEvent(BOOL bInitiallyOwn = FALSE, BOOL bManualReset = FALSE, LPCTSTR lpszName = NULL,
                  LPSECURITY_ATTRIBUTES lpsaAttribute = NULL);
  virtual ~CEvent();

  BOOL SetEvent() { return ::SetEvent(m_hObject); }
  BOOL PulseEvent() { return ::PulseEvent(m_hObject); }
  BOOL ResetEvent() { return ::ResetEvent(m_hObject); }
  virtual BOOL Unlock();
};

// ---------------------------------------------------------------------------
// CSingleLock: waits for one object.
// ---------------------------------------------------------------------------

class AFX_API CSingleLock {
public:
  explicit CSingleLock(CSyncObject* pObject, BOOL bInitialLock = FALSE);
  ~CSingleLock() { Unlock(); }

  CSingleLock(const CSingleLock&) = delete;
  CSingleLock& operator=(const CSingleLock&) = delete;

  BOOL Lock(DWORD dwTimeOut = INFINITE);
  BOOL Unlock();
  BOOL Unlock(LONG lCount, LPLONG lPrevCount = NULL);
  BOOL IsLocked() const { return m_bAcquired; }

protected:
  CSyncObject* m_pObject;
  HANDLE m_hObject;
  BOOL m_bAcquired;
};

// ---------------------------------------------------------------------------
// CMultiLock: waits for several objects (at most MAXIMUM_WAIT_OBJECTS).
// ---------------------------------------------------------------------------

class AFX_API CMultiLock {
public:
  // The objects are not owned; they must outlive the lock.
  CMultiLock(CSyncObject* ppObjects[], DWORD dwCount, BOOL bInitialLock = FALSE);
  ~CMultiLock();

  CMultiLock(const CMultiLock&) = delete;
  CMultiLock& operator=(const CMultiLock&) = delete;

  // bWaitForAll FALSE: returns when any one object is signalled, with its
  // index added to WAIT_OBJECT_0. A non-zero dwWakeMask also returns for
  // input of those kinds (QS_...) with WAIT_OBJECT_0 + count.
  DWORD Lock(DWORD dwTimeOut = INFINITE, BOOL bWaitForAll = TRUE, DWORD dwWakeMask = 0);
  BOOL Unlock();
  BOOL Unlock(LONG lCount, LPLONG lPrevCount = NULL);
  BOOL IsLocked(DWORD dwItem) const;

protected:
  CSyncObject** m_ppObjectArray;
  HANDLE* m_pHandleArray;
  BOOL* m_bLockedArray;
  DWORD m_dwCount;
};
