// The ready-made MFC collections: arrays of pointers, objects, strings and
// numbers, lists and maps with POSITION iteration. They are the templates of
// afxtempl.h with MFC's names and argument types.
#include "afx.h"

#ifndef QO_AFXCOLL_H
#define QO_AFXCOLL_H

#include "afxtempl.h"

class CPtrArray : public CArray<void*, void*> {};
class CObArray : public CArray<CObject*, CObject*> {};
class CStringArray : public CArray<CString, const CString&> {};
class CDWordArray : public CArray<DWORD, DWORD> {};
class CWordArray : public CArray<WORD, WORD> {};
class CUIntArray : public CArray<UINT, UINT> {};
class CByteArray : public CArray<BYTE, BYTE> {};

class CPtrList : public CList<void*, void*> {
public:
  explicit CPtrList(INT_PTR nBlockSize = 10) : CList<void*, void*>(nBlockSize) {}
};
class CObList : public CList<CObject*, CObject*> {
public:
  explicit CObList(INT_PTR nBlockSize = 10) : CList<CObject*, CObject*>(nBlockSize) {}
};
class CStringList : public CList<CString, const CString&> {
public:
  explicit CStringList(INT_PTR nBlockSize = 10) : CList<CString, const CString&>(nBlockSize) {}
};

// Maps with string keys compare the keys case-sensitively (as strcmp).
#define QO_DECLARE_MAP(name, KEY, ARG_KEY, VALUE, ARG_VALUE)                      \
  class name : public CMap<KEY, ARG_KEY, VALUE, ARG_VALUE> {                      \
  public:                                                                         \
    typedef KEY BaseKey;                                                          \
    typedef VALUE BaseValue;                                                      \
    explicit name(INT_PTR nBlockSize = 10) : CMap<KEY, ARG_KEY, VALUE, ARG_VALUE>(nBlockSize) {} \
  };

QO_DECLARE_MAP(CMapStringToPtr, CString, LPCSTR, void*, void*)
QO_DECLARE_MAP(CMapStringToOb, CString, LPCSTR, CObject*, CObject*)
QO_DECLARE_MAP(CMapStringToString, CString, LPCSTR, CString, LPCSTR)
QO_DECLARE_MAP(CMapWordToPtr, WORD, WORD, void*, void*)
QO_DECLARE_MAP(CMapWordToOb, WORD, WORD, CObject*, CObject*)
QO_DECLARE_MAP(CMapPtrToPtr, void*, void*, void*, void*)
QO_DECLARE_MAP(CMapPtrToWord, void*, void*, WORD, WORD)

#undef QO_DECLARE_MAP

#endif // QO_AFXCOLL_H
