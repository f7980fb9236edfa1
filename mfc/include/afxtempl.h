// The MFC collection templates: CArray (a growable array), CList (a doubly
// linked list iterated by POSITION) and CMap (a hash table iterated by
// POSITION), plus the type-safe pointer wrappers CTypedPtrArray/List/Map.
//
// Elements are constructed and destroyed properly, so class types such as
// CString are fine. An index outside the array is a caller error and fails
// an ASSERT. References to elements are invalidated when the array grows.
#include "afx.h"

#ifndef QO_AFXTEMPL_H
#define QO_AFXTEMPL_H

#include <new>
#include <utility>

// ---------------------------------------------------------------------------
// Helpers that the templates call for their elements; specialise them for
// key types of your own.
// ---------------------------------------------------------------------------

template <class TYPE, class ARG_TYPE>
inline BOOL AFXAPI CompareElements(const TYPE* pElement1, const ARG_TYPE* pElement2) {
  return *pElement1 == *pElement2;
}

template <class ARG_KEY>
inline UINT AFXAPI HashKey(ARG_KEY key) {
  // Integers and pointers: mix the bits so that neighbouring keys spread out.
  ULONGLONG n = (ULONGLONG)(UINT_PTR)key;
  n ^= n >> 17;
  n *= 0x9E3779B97F4A7C15ULL;
  return (UINT)(n >> 32);
}

template <>
inline UINT AFXAPI HashKey<LPCSTR>(LPCSTR key) {
  UINT nHash = 2166136261u; // FNV-1a
  if (key != NULL)
    for (; *key; ++key) nHash = (nHash ^ (BYTE)*key) * 16777619u;
  return nHash;
}
template <>
inline UINT AFXAPI HashKey<LPSTR>(LPSTR key) { return HashKey<LPCSTR>(key); }
template <>
inline UINT AFXAPI HashKey<const CString&>(const CString& key) { return HashKey<LPCSTR>(key); }
template <>
inline UINT AFXAPI HashKey<CString>(CString key) { return HashKey<LPCSTR>(key); }
template <>
inline UINT AFXAPI HashKey<CString&>(CString& key) { return HashKey<LPCSTR>(key); }

// ---------------------------------------------------------------------------
// CArray
// ---------------------------------------------------------------------------

template <class TYPE, class ARG_TYPE = const TYPE&>
class CArray : public CObject {
public:
  CArray() : m_pData(NULL), m_nSize(0), m_nMaxSize(0), m_nGrowBy(-1) {}
  virtual ~CArray() { RemoveAll(); }

  INT_PTR GetSize() const { return m_nSize; }
  INT_PTR GetCount() const { return m_nSize; }
  BOOL IsEmpty() const { return m_nSize == 0; }
  INT_PTR GetUpperBound() const { return m_nSize - 1; }

  // New size; new elements are value-initialised (0 for numbers), removed ones
  // destroyed. nGrowBy: elements to add on each reallocation (-1 keeps the
  // current setting; the default grows by an eighth, between 4 and 1024).
  void SetSize(INT_PTR nNewSize, INT_PTR nGrowBy = -1);
  void FreeExtra();
  void RemoveAll() { SetSize(0, -1); }

  const TYPE& GetAt(INT_PTR nIndex) const { ASSERT(nIndex >= 0 && nIndex < m_nSize); return m_pData[nIndex]; }
  TYPE& GetAt(INT_PTR nIndex) { ASSERT(nIndex >= 0 && nIndex < m_nSize); return m_pData[nIndex]; }
  void SetAt(INT_PTR nIndex, ARG_TYPE newElement) { ASSERT(nIndex >= 0 && nIndex < m_nSize); m_pData[nIndex] = newElement; }
  const TYPE& ElementAt(INT_PTR nIndex) const { return GetAt(nIndex); }
  TYPE& ElementAt(INT_PTR nIndex) { return GetAt(nIndex); }
  const TYPE& operator[](INT_PTR nIndex) const { return GetAt(nIndex); }
  TYPE& operator[](INT_PTR nIndex) { return GetAt(nIndex); }

  const TYPE* GetData() const { return m_pData; }
  TYPE* GetData() { return m_pData; }

  // Sets the element, growing the array when nIndex is beyond its end.
  void SetAtGrow(INT_PTR nIndex, ARG_TYPE newElement);
  INT_PTR Add(ARG_TYPE newElement) { INT_PTR nIndex = m_nSize; SetAtGrow(nIndex, newElement); return nIndex; }
  INT_PTR Append(const CArray& src); // index of the first appended element
  void Copy(const CArray& src);

  // Inserts nCount copies at nIndex (which may be beyond the end: the array grows).
  void InsertAt(INT_PTR nIndex, ARG_TYPE newElement, INT_PTR nCount = 1);
  void InsertAt(INT_PTR nStartIndex, CArray* pNewArray);
  void RemoveAt(INT_PTR nIndex, INT_PTR nCount = 1);

protected:
  TYPE* m_pData;
  INT_PTR m_nSize;
  INT_PTR m_nMaxSize;
  INT_PTR m_nGrowBy;

private:
  void Reallocate(INT_PTR nNewMax);
  static TYPE* Allocate(INT_PTR n) { return static_cast<TYPE*>(::operator new(sizeof(TYPE) * (size_t)n)); }
};

template <class TYPE, class ARG_TYPE>
void CArray<TYPE, ARG_TYPE>::Reallocate(INT_PTR nNewMax) {
  ASSERT(nNewMax >= m_nSize);
  TYPE* pNewData = nNewMax > 0 ? Allocate(nNewMax) : NULL;
  INT_PTR i = 0;
  try {
    for (; i < m_nSize; ++i) ::new ((void*)(pNewData + i)) TYPE(std::move_if_noexcept(m_pData[i]));
  } catch (...) {
    while (i-- > 0) pNewData[i].~TYPE();
    ::operator delete(pNewData);
    throw;
  }
  for (i = 0; i < m_nSize; ++i) m_pData[i].~TYPE();
  ::operator delete(m_pData);
  m_pData = pNewData;
  m_nMaxSize = nNewMax;
}

template <class TYPE, class ARG_TYPE>
void CArray<TYPE, ARG_TYPE>::SetSize(INT_PTR nNewSize, INT_PTR nGrowBy) {
  ASSERT(nNewSize >= 0);
  if (nNewSize < 0) nNewSize = 0;
  if (nGrowBy >= 0) m_nGrowBy = nGrowBy;

  if (nNewSize == 0) {
    for (INT_PTR i = 0; i < m_nSize; ++i) m_pData[i].~TYPE();
    ::operator delete(m_pData);
    m_pData = NULL;
    m_nSize = m_nMaxSize = 0;
    return;
  }
  if (nNewSize > m_nMaxSize) {
    INT_PTR nGrow = m_nGrowBy;
    if (nGrow <= 0) {
      nGrow = m_nSize / 8;
      nGrow = nGrow < 4 ? 4 : (nGrow > 1024 ? 1024 : nGrow);
    }
    INT_PTR nNewMax = m_nMaxSize + nGrow;
    if (nNewMax < nNewSize) nNewMax = nNewSize;
    if (m_pData == NULL) nNewMax = nNewSize; // the first allocation is exact, as in MFC
    Reallocate(nNewMax);
  }
  while (m_nSize < nNewSize) {
    ::new ((void*)(m_pData + m_nSize)) TYPE();
    ++m_nSize;
  }
  while (m_nSize > nNewSize) {
    --m_nSize;
    m_pData[m_nSize].~TYPE();
  }
}

template <class TYPE, class ARG_TYPE>
void CArray<TYPE, ARG_TYPE>::FreeExtra() {
  if (m_nSize != m_nMaxSize) Reallocate(m_nSize);
}

template <class TYPE, class ARG_TYPE>
void CArray<TYPE, ARG_TYPE>::SetAtGrow(INT_PTR nIndex, ARG_TYPE newElement) {
  ASSERT(nIndex >= 0);
  if (nIndex < 0) return;
  if (nIndex >= m_nSize) {
    // The argument may refer into this array: copy it before the array moves.
    TYPE copy(newElement);
    SetSize(nIndex + 1, -1);
    m_pData[nIndex] = std::move(copy);
  } else {
    m_pData[nIndex] = newElement;
  }
}

template <class TYPE, class ARG_TYPE>
INT_PTR CArray<TYPE, ARG_TYPE>::Append(const CArray& src) {
  INT_PTR nOldSize = m_nSize;
  if (&src == this) {
    // Appending to itself: copy first so that growing does not invalidate the source.
    CArray copy;
    copy.Copy(src);
    return Append(copy);
  }
  SetSize(m_nSize + src.m_nSize);
  for (INT_PTR i = 0; i < src.m_nSize; ++i) m_pData[nOldSize + i] = src.m_pData[i];
  return nOldSize;
}

template <class TYPE, class ARG_TYPE>
void CArray<TYPE, ARG_TYPE>::Copy(const CArray& src) {
  if (&src == this) return;
  SetSize(src.m_nSize);
  for (INT_PTR i = 0; i < src.m_nSize; ++i) m_pData[i] = src.m_pData[i];
}

template <class TYPE, class ARG_TYPE>
void CArray<TYPE, ARG_TYPE>::InsertAt(INT_PTR nIndex, ARG_TYPE newElement, INT_PTR nCount) {
  ASSERT(nIndex >= 0 && nCount > 0);
  if (nIndex < 0 || nCount <= 0) return;
  TYPE copy(newElement); // may refer into this array
  if (nIndex >= m_nSize) {
    SetSize(nIndex + nCount, -1);
  } else {
    INT_PTR nOldSize = m_nSize;
    SetSize(m_nSize + nCount, -1);
    for (INT_PTR i = nOldSize - 1; i >= nIndex; --i) m_pData[i + nCount] = std::move(m_pData[i]);
  }
  for (INT_PTR i = 0; i < nCount; ++i) m_pData[nIndex + i] = copy;
}

template <class TYPE, class ARG_TYPE>
void CArray<TYPE, ARG_TYPE>::InsertAt(INT_PTR nStartIndex, CArray* pNewArray) {
  ASSERT(pNewArray != NULL && nStartIndex >= 0);
  if (pNewArray == NULL || nStartIndex < 0 || pNewArray->GetSize() == 0) return;
  CArray copy;
  copy.Copy(*pNewArray); // the source may be this array
  INT_PTR nCount = copy.GetSize();
  InsertAt(nStartIndex, copy.GetAt(0), nCount);
  for (INT_PTR i = 1; i < nCount; ++i) m_pData[nStartIndex + i] = copy.m_pData[i];
}

template <class TYPE, class ARG_TYPE>
void CArray<TYPE, ARG_TYPE>::RemoveAt(INT_PTR nIndex, INT_PTR nCount) {
  ASSERT(nIndex >= 0 && nCount >= 0 && nIndex + nCount <= m_nSize);
  if (nIndex < 0 || nCount < 0 || nIndex + nCount > m_nSize) return;
  for (INT_PTR i = nIndex; i + nCount < m_nSize; ++i) m_pData[i] = std::move(m_pData[i + nCount]);
  for (INT_PTR i = 0; i < nCount; ++i) {
    --m_nSize;
    m_pData[m_nSize].~TYPE();
  }
}

// ---------------------------------------------------------------------------
// CList
// ---------------------------------------------------------------------------

template <class TYPE, class ARG_TYPE = const TYPE&>
class CList : public CObject {
protected:
  struct CNode {
    CNode* pNext;
    CNode* pPrev;
    TYPE data;
    explicit CNode(ARG_TYPE value) : pNext(NULL), pPrev(NULL), data(value) {}
  };

public:
  explicit CList(INT_PTR nBlockSize = 10) : m_pNodeHead(NULL), m_pNodeTail(NULL), m_nCount(0) { (void)nBlockSize; }
  virtual ~CList() { RemoveAll(); }

  INT_PTR GetCount() const { return m_nCount; }
  INT_PTR GetSize() const { return m_nCount; }
  BOOL IsEmpty() const { return m_nCount == 0; }

  TYPE& GetHead() { ASSERT(m_pNodeHead != NULL); return m_pNodeHead->data; }
  const TYPE& GetHead() const { ASSERT(m_pNodeHead != NULL); return m_pNodeHead->data; }
  TYPE& GetTail() { ASSERT(m_pNodeTail != NULL); return m_pNodeTail->data; }
  const TYPE& GetTail() const { ASSERT(m_pNodeTail != NULL); return m_pNodeTail->data; }

  TYPE RemoveHead();
  TYPE RemoveTail();

  POSITION AddHead(ARG_TYPE newElement) { return InsertBefore(GetHeadPosition(), newElement); }
  POSITION AddTail(ARG_TYPE newElement) { return InsertAfter(GetTailPosition(), newElement); }
  void AddHead(CList* pNewList);
  void AddTail(CList* pNewList);
  void RemoveAll();

  POSITION GetHeadPosition() const { return (POSITION)m_pNodeHead; }
  POSITION GetTailPosition() const { return (POSITION)m_pNodeTail; }
  // The element at rPosition; rPosition moves to the next (previous) one, NULL at the end.
  TYPE& GetNext(POSITION& rPosition) { CNode* p = Node(rPosition); rPosition = (POSITION)p->pNext; return p->data; }
  const TYPE& GetNext(POSITION& rPosition) const { CNode* p = Node(rPosition); rPosition = (POSITION)p->pNext; return p->data; }
  TYPE& GetPrev(POSITION& rPosition) { CNode* p = Node(rPosition); rPosition = (POSITION)p->pPrev; return p->data; }
  const TYPE& GetPrev(POSITION& rPosition) const { CNode* p = Node(rPosition); rPosition = (POSITION)p->pPrev; return p->data; }

  TYPE& GetAt(POSITION position) { return Node(position)->data; }
  const TYPE& GetAt(POSITION position) const { return Node(position)->data; }
  void SetAt(POSITION pos, ARG_TYPE newElement) { Node(pos)->data = newElement; }
  void RemoveAt(POSITION position);

  // NULL position: at the head (InsertBefore) or the tail (InsertAfter).
  POSITION InsertBefore(POSITION position, ARG_TYPE newElement);
  POSITION InsertAfter(POSITION position, ARG_TYPE newElement);

  // First element equal to searchValue after startAfter (NULL: from the head).
  POSITION Find(ARG_TYPE searchValue, POSITION startAfter = NULL) const;
  // Position of the zero-based nIndex-th element; NULL when out of range.
  POSITION FindIndex(INT_PTR nIndex) const;

protected:
  static CNode* Node(POSITION pos) { ASSERT(pos != NULL); return (CNode*)pos; }

  CNode* m_pNodeHead;
  CNode* m_pNodeTail;
  INT_PTR m_nCount;
};

template <class TYPE, class ARG_TYPE>
TYPE CList<TYPE, ARG_TYPE>::RemoveHead() {
  ASSERT(m_pNodeHead != NULL);
  TYPE value(std::move(m_pNodeHead->data));
  RemoveAt((POSITION)m_pNodeHead);
  return value;
}

template <class TYPE, class ARG_TYPE>
TYPE CList<TYPE, ARG_TYPE>::RemoveTail() {
  ASSERT(m_pNodeTail != NULL);
  TYPE value(std::move(m_pNodeTail->data));
  RemoveAt((POSITION)m_pNodeTail);
  return value;
}

template <class TYPE, class ARG_TYPE>
void CList<TYPE, ARG_TYPE>::AddHead(CList* pNewList) {
  ASSERT(pNewList != NULL && pNewList != this);
  if (pNewList == NULL || pNewList == this) return;
  POSITION pos = pNewList->GetTailPosition();
  while (pos != NULL) AddHead(pNewList->GetPrev(pos));
}

template <class TYPE, class ARG_TYPE>
void CList<TYPE, ARG_TYPE>::AddTail(CList* pNewList) {
  ASSERT(pNewList != NULL && pNewList != this);
  if (pNewList == NULL || pNewList == this) return;
  POSITION pos = pNewList->GetHeadPosition();
  while (pos != NULL) AddTail(pNewList->GetNext(pos));
}

template <class TYPE, class ARG_TYPE>
void CList<TYPE, ARG_TYPE>::RemoveAll() {
  CNode* p = m_pNodeHead;
  while (p != NULL) {
    CNode* pNext = p->pNext;
    delete p;
    p = pNext;
  }
  m_pNodeHead = m_pNodeTail = NULL;
  m_nCount = 0;
}

template <class TYPE, class ARG_TYPE>
void CList<TYPE, ARG_TYPE>::RemoveAt(POSITION position) {
  CNode* p = Node(position);
  if (p->pPrev) p->pPrev->pNext = p->pNext; else m_pNodeHead = p->pNext;
  if (p->pNext) p->pNext->pPrev = p->pPrev; else m_pNodeTail = p->pPrev;
  delete p;
  --m_nCount;
}

template <class TYPE, class ARG_TYPE>
POSITION CList<TYPE, ARG_TYPE>::InsertBefore(POSITION position, ARG_TYPE newElement) {
  CNode* pNew = new CNode(newElement);
  CNode* pOld = (CNode*)position;
  if (pOld == NULL) pOld = m_pNodeHead;
  if (pOld == NULL) {
    m_pNodeHead = m_pNodeTail = pNew;
  } else {
    pNew->pNext = pOld;
    pNew->pPrev = pOld->pPrev;
    if (pOld->pPrev) pOld->pPrev->pNext = pNew; else m_pNodeHead = pNew;
    pOld->pPrev = pNew;
  }
  ++m_nCount;
  return (POSITION)pNew;
}

template <class TYPE, class ARG_TYPE>
POSITION CList<TYPE, ARG_TYPE>::InsertAfter(POSITION position, ARG_TYPE newElement) {
  CNode* pNew = new CNode(newElement);
  CNode* pOld = (CNode*)position;
  if (pOld == NULL) pOld = m_pNodeTail;
  if (pOld == NULL) {
    m_pNodeHead = m_pNodeTail = pNew;
  } else {
    pNew->pPrev = pOld;
    pNew->pNext = pOld->pNext;
    if (pOld->pNext) pOld->pNext->pPrev = pNew; else m_pNodeTail = pNew;
    pOld->pNext = pNew;
  }
  ++m_nCount;
  return (POSITION)pNew;
}

template <class TYPE, class ARG_TYPE>
POSITION CList<TYPE, ARG_TYPE>::Find(ARG_TYPE searchValue, POSITION startAfter) const {
  CNode* p = startAfter == NULL ? m_pNodeHead : ((CNode*)startAfter)->pNext;
  for (; p != NULL; p = p->pNext) {
    const TYPE& value = searchValue;
    if (CompareElements<TYPE, TYPE>(&p->data, &value)) return (POSITION)p;
  }
  return NULL;
}

template <class TYPE, class ARG_TYPE>
POSITION CList<TYPE, ARG_TYPE>::FindIndex(INT_PTR nIndex) const {
  if (nIndex < 0 || nIndex >= m_nCount) return NULL;
  CNode* p = m_pNodeHead;
  while (nIndex-- > 0) p = p->pNext;
  return (POSITION)p;
}

// ---------------------------------------------------------------------------
// CMap
// ---------------------------------------------------------------------------

template <class KEY, class ARG_KEY, class VALUE, class ARG_VALUE>
class CMap : public CObject {
protected:
  struct CAssoc {
    CAssoc* pNext;
    UINT nHashValue;
    KEY key;
    VALUE value;
    CAssoc(ARG_KEY k, UINT nHash) : pNext(NULL), nHashValue(nHash), key(k), value() {}
  };

public:
  explicit CMap(INT_PTR nBlockSize = 10)
      : m_pHashTable(NULL), m_nHashTableSize(17), m_nCount(0) { (void)nBlockSize; }
  virtual ~CMap() { RemoveAll(); }

  INT_PTR GetCount() const { return m_nCount; }
  INT_PTR GetSize() const { return m_nCount; }
  BOOL IsEmpty() const { return m_nCount == 0; }

  BOOL Lookup(ARG_KEY key, VALUE& rValue) const {
    CAssoc* p = GetAssocAt(key);
    if (p == NULL) return FALSE;
    rValue = p->value;
    return TRUE;
  }
  // The value for the key, inserted (value-initialised) when the key is new.
  VALUE& operator[](ARG_KEY key);
  void SetAt(ARG_KEY key, ARG_VALUE newValue) { (*this)[key] = newValue; }
  BOOL RemoveKey(ARG_KEY key);
  void RemoveAll();

  POSITION GetStartPosition() const { return m_nCount == 0 ? NULL : BEFORE_START_POSITION; }
  void GetNextAssoc(POSITION& rNextPosition, KEY& rKey, VALUE& rValue) const;

  UINT GetHashTableSize() const { return m_nHashTableSize; }
  // Sets the number of buckets; allowed while the map is empty.
  void InitHashTable(UINT hashSize, BOOL bAllocNow = TRUE);

protected:
  CAssoc* GetAssocAt(ARG_KEY key) const;
  void Grow();

  CAssoc** m_pHashTable;
  UINT m_nHashTableSize;
  INT_PTR m_nCount;
};

template <class KEY, class ARG_KEY, class VALUE, class ARG_VALUE>
void CMap<KEY, ARG_KEY, VALUE, ARG_VALUE>::InitHashTable(UINT hashSize, BOOL bAllocNow) {
  ASSERT(m_nCount == 0 && hashSize > 0);
  if (m_nCount != 0 || hashSize == 0) return;
  delete[] m_pHashTable;
  m_pHashTable = NULL;
  m_nHashTableSize = hashSize;
  if (bAllocNow) {
    m_pHashTable = new CAssoc*[hashSize];
    for (UINT i = 0; i < hashSize; ++i) m_pHashTable[i] = NULL;
  }
}

template <class KEY, class ARG_KEY, class VALUE, class ARG_VALUE>
typename CMap<KEY, ARG_KEY, VALUE, ARG_VALUE>::CAssoc*
CMap<KEY, ARG_KEY, VALUE, ARG_VALUE>::GetAssocAt(ARG_KEY key) const {
  if (m_pHashTable == NULL) return NULL;
  UINT nHash = HashKey<ARG_KEY>(key);
  for (CAssoc* p = m_pHashTable[nHash % m_nHashTableSize]; p != NULL; p = p->pNext)
    if (p->nHashValue == nHash && CompareElements(&p->key, &key)) return p;
  return NULL;
}

template <class KEY, class ARG_KEY, class VALUE, class ARG_VALUE>
void CMap<KEY, ARG_KEY, VALUE, ARG_VALUE>::Grow() {
  // Keep chains short: double the buckets once there are twice as many entries.
  UINT nNewSize = m_nHashTableSize * 2 + 1;
  CAssoc** pNew = new CAssoc*[nNewSize];
  for (UINT i = 0; i < nNewSize; ++i) pNew[i] = NULL;
  for (UINT i = 0; i < m_nHashTableSize; ++i) {
    CAssoc* p = m_pHashTable[i];
    while (p != NULL) {
      CAssoc* pNext = p->pNext;
      p->pNext = pNew[p->nHashValue % nNewSize];
      pNew[p->nHashValue % nNewSize] = p;
      p = pNext;
    }
  }
  delete[] m_pHashTable;
  m_pHashTable = pNew;
  m_nHashTableSize = nNewSize;
}

template <class KEY, class ARG_KEY, class VALUE, class ARG_VALUE>
VALUE& CMap<KEY, ARG_KEY, VALUE, ARG_VALUE>::operator[](ARG_KEY key) {
  CAssoc* p = GetAssocAt(key);
  if (p != NULL) return p->value;
  if (m_pHashTable == NULL) InitHashTable(m_nHashTableSize);
  else if ((UINT_PTR)m_nCount >= (UINT_PTR)m_nHashTableSize * 2) Grow();
  UINT nHash = HashKey<ARG_KEY>(key);
  p = new CAssoc(key, nHash);
  p->pNext = m_pHashTable[nHash % m_nHashTableSize];
  m_pHashTable[nHash % m_nHashTableSize] = p;
  ++m_nCount;
  return p->value;
}

template <class KEY, class ARG_KEY, class VALUE, class ARG_VALUE>
BOOL CMap<KEY, ARG_KEY, VALUE, ARG_VALUE>::RemoveKey(ARG_KEY key) {
  if (m_pHashTable == NULL) return FALSE;
  UINT nHash = HashKey<ARG_KEY>(key);
  CAssoc** ppPrev = &m_pHashTable[nHash % m_nHashTableSize];
  for (CAssoc* p = *ppPrev; p != NULL; p = p->pNext) {
    if (p->nHashValue == nHash && CompareElements(&p->key, &key)) {
      *ppPrev = p->pNext;
      delete p;
      --m_nCount;
      return TRUE;
    }
    ppPrev = &p->pNext;
  }
  return FALSE;
}

template <class KEY, class ARG_KEY, class VALUE, class ARG_VALUE>
void CMap<KEY, ARG_KEY, VALUE, ARG_VALUE>::RemoveAll() {
  if (m_pHashTable != NULL) {
    for (UINT i = 0; i < m_nHashTableSize; ++i) {
      CAssoc* p = m_pHashTable[i];
      while (p != NULL) {
        CAssoc* pNext = p->pNext;
        delete p;
        p = pNext;
      }
    }
    delete[] m_pHashTable;
    m_pHashTable = NULL;
  }
  m_nCount = 0;
}

template <class KEY, class ARG_KEY, class VALUE, class ARG_VALUE>
void CMap<KEY, ARG_KEY, VALUE, ARG_VALUE>::GetNextAssoc(POSITION& rNextPosition, KEY& rKey,
                                                         VALUE& rValue) const {
  ASSERT(m_pHashTable != NULL && rNextPosition != NULL);
  CAssoc* p = (CAssoc*)rNextPosition;
  if (p == (CAssoc*)BEFORE_START_POSITION) {
    p = NULL;
    for (UINT i = 0; i < m_nHashTableSize && p == NULL; ++i) p = m_pHashTable[i];
    ASSERT(p != NULL);
  }
  CAssoc* pNext = p->pNext;
  for (UINT i = p->nHashValue % m_nHashTableSize + 1; pNext == NULL && i < m_nHashTableSize; ++i)
    pNext = m_pHashTable[i];
  rNextPosition = (POSITION)pNext;
  rKey = p->key;
  rValue = p->value;
}

// ---------------------------------------------------------------------------
// Type-safe wrappers of the pointer collections of afxcoll.h
// ---------------------------------------------------------------------------

template <class BASE_CLASS, class TYPE>
class CTypedPtrArray : public BASE_CLASS {
public:
  TYPE GetAt(INT_PTR nIndex) const { return (TYPE)BASE_CLASS::GetAt(nIndex); }
  TYPE& ElementAt(INT_PTR nIndex) { return (TYPE&)BASE_CLASS::ElementAt(nIndex); }
  void SetAt(INT_PTR nIndex, TYPE ptr) { BASE_CLASS::SetAt(nIndex, ptr); }
  void SetAtGrow(INT_PTR nIndex, TYPE newElement) { BASE_CLASS::SetAtGrow(nIndex, newElement); }
  INT_PTR Add(TYPE newElement) { return BASE_CLASS::Add(newElement); }
  INT_PTR Append(const CTypedPtrArray& src) { return BASE_CLASS::Append(src); }
  void Copy(const CTypedPtrArray& src) { BASE_CLASS::Copy(src); }
  void InsertAt(INT_PTR nIndex, TYPE newElement, INT_PTR nCount = 1) { BASE_CLASS::InsertAt(nIndex, newElement, nCount); }
  void InsertAt(INT_PTR nStartIndex, CTypedPtrArray* pNewArray) { BASE_CLASS::InsertAt(nStartIndex, pNewArray); }
  TYPE* GetData() { return (TYPE*)BASE_CLASS::GetData(); }
  const TYPE* GetData() const { return (const TYPE*)BASE_CLASS::GetData(); }
  TYPE operator[](INT_PTR nIndex) const { return GetAt(nIndex); }
  TYPE& operator[](INT_PTR nIndex) { return ElementAt(nIndex); }
};

template <class BASE_CLASS, class TYPE>
class CTypedPtrList : public BASE_CLASS {
public:
  explicit CTypedPtrList(INT_PTR nBlockSize = 10) : BASE_CLASS(nBlockSize) {}
  TYPE GetHead() const { return (TYPE)BASE_CLASS::GetHead(); }
  TYPE GetTail() const { return (TYPE)BASE_CLASS::GetTail(); }
  TYPE RemoveHead() { return (TYPE)BASE_CLASS::RemoveHead(); }
  TYPE RemoveTail() { return (TYPE)BASE_CLASS::RemoveTail(); }
  TYPE GetNext(POSITION& rPosition) const { return (TYPE)BASE_CLASS::GetNext(rPosition); }
  TYPE GetPrev(POSITION& rPosition) const { return (TYPE)BASE_CLASS::GetPrev(rPosition); }
  TYPE GetAt(POSITION position) const { return (TYPE)BASE_CLASS::GetAt(position); }
  POSITION AddHead(TYPE newElement) { return BASE_CLASS::AddHead(newElement); }
  POSITION AddTail(TYPE newElement) { return BASE_CLASS::AddTail(newElement); }
  void SetAt(POSITION pos, TYPE newElement) { BASE_CLASS::SetAt(pos, newElement); }
  POSITION InsertBefore(POSITION position, TYPE newElement) { return BASE_CLASS::InsertBefore(position, newElement); }
  POSITION InsertAfter(POSITION position, TYPE newElement) { return BASE_CLASS::InsertAfter(position, newElement); }
};

template <class BASE_CLASS, class KEY, class VALUE>
class CTypedPtrMap : public BASE_CLASS {
public:
  explicit CTypedPtrMap(INT_PTR nBlockSize = 10) : BASE_CLASS(nBlockSize) {}
  BOOL Lookup(KEY key, VALUE& rValue) const {
    typename BASE_CLASS::BaseValue value = NULL;
    BOOL bFound = BASE_CLASS::Lookup(key, value);
    rValue = (VALUE)value;
    return bFound;
  }
  VALUE& operator[](KEY key) { return (VALUE&)BASE_CLASS::operator[](key); }
  void SetAt(KEY key, VALUE newValue) { BASE_CLASS::SetAt(key, newValue); }
  BOOL RemoveKey(KEY key) { return BASE_CLASS::RemoveKey(key); }
  void GetNextAssoc(POSITION& rPosition, KEY& rKey, VALUE& rValue) const {
    typename BASE_CLASS::BaseKey key;
    typename BASE_CLASS::BaseValue value = NULL;
    BASE_CLASS::GetNextAssoc(rPosition, key, value);
    rKey = (KEY)key;
    rValue = (VALUE)value;
  }
};

#endif // QO_AFXTEMPL_H
