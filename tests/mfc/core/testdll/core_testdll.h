// Classes of a DLL other than the MFC DLL and the tests, used to check that
// run-time class information and exceptions work across modules.
#pragma once

#include <afx.h>

#ifdef QO_BUILDING_CORE_TESTDLL
#define CORE_TESTDLL_API __declspec(dllexport)
#else
#define CORE_TESTDLL_API __declspec(dllimport)
#endif

class CORE_TESTDLL_API CTestShape : public CObject {
  DECLARE_DYNCREATE(CTestShape)
public:
  CTestShape();
  virtual int Sides() const;
};

class CORE_TESTDLL_API CTestSquare : public CTestShape {
  DECLARE_DYNCREATE(CTestSquare)
public:
  virtual int Sides() const;
};

// Has run-time class information but cannot be created dynamically.
class CORE_TESTDLL_API CTestFixedShape : public CTestShape {
  DECLARE_DYNAMIC(CTestFixedShape)
public:
  explicit CTestFixedShape(int nSides);
  virtual int Sides() const;

private:
  int m_nSides;
};

// Throws new CFileException(fileNotFound, ERROR_FILE_NOT_FOUND, lpszName).
CORE_TESTDLL_API void TestDllThrowFileException(LPCSTR lpszName);
// A CTestSquare made inside the DLL.
CORE_TESTDLL_API CObject* TestDllMakeSquare();
