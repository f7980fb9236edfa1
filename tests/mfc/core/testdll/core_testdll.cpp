#include "core_testdll.h"

IMPLEMENT_DYNCREATE(CTestShape, CObject)
IMPLEMENT_DYNCREATE(CTestSquare, CTestShape)
IMPLEMENT_DYNAMIC(CTestFixedShape, CTestShape)

CTestShape::CTestShape() {}
int CTestShape::Sides() const { return 0; }
int CTestSquare::Sides() const { return 4; }
CTestFixedShape::CTestFixedShape(int nSides) : m_nSides(nSides) {}
int CTestFixedShape::Sides() const { return m_nSides; }

void TestDllThrowFileException(LPCSTR lpszName) {
  AfxThrowFileException(CFileException::fileNotFound, ERROR_FILE_NOT_FOUND, lpszName);
}

CObject* TestDllMakeSquare() { return new CTestSquare; }
