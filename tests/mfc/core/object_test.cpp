// Run-time class information within one module and across DLLs: RUNTIME_CLASS,
// IsKindOf, CreateObject, FromName, downcasts, and a module that is unloaded.
#include <afx.h>

#include <gtest/gtest.h>

#include "core_testdll.h"

namespace {

// A class of the test program derived from a class of the DLL.
class CTestTriangle : public CTestShape {
  DECLARE_DYNCREATE(CTestTriangle)
public:
  virtual int Sides() const { return 3; }
};
IMPLEMENT_DYNCREATE(CTestTriangle, CTestShape)

TEST(RuntimeClass, RecordsAndKinds) {
  CRuntimeClass* pSquare = RUNTIME_CLASS(CTestSquare);
  EXPECT_STREQ("CTestSquare", pSquare->m_lpszClassName);
  EXPECT_EQ((int)sizeof(CTestSquare), pSquare->m_nObjectSize);
  EXPECT_TRUE(pSquare->IsDerivedFrom(RUNTIME_CLASS(CTestShape)));
  EXPECT_TRUE(pSquare->IsDerivedFrom(RUNTIME_CLASS(CObject)));
  EXPECT_FALSE(RUNTIME_CLASS(CTestShape)->IsDerivedFrom(pSquare));
  EXPECT_FALSE(pSquare->IsDerivedFrom(RUNTIME_CLASS(CFile)));

  CTestTriangle triangle;
  EXPECT_EQ(RUNTIME_CLASS(CTestTriangle), triangle.GetRuntimeClass());
  EXPECT_TRUE(triangle.IsKindOf(RUNTIME_CLASS(CTestShape)));
  EXPECT_TRUE(triangle.IsKindOf(RUNTIME_CLASS(CObject)));
  EXPECT_FALSE(triangle.IsKindOf(RUNTIME_CLASS(CTestSquare)));
  EXPECT_FALSE(triangle.IsKindOf(RUNTIME_CLASS(CException)));

  CFileException fe;
  EXPECT_TRUE(fe.IsKindOf(RUNTIME_CLASS(CException)));
  EXPECT_FALSE(fe.IsKindOf(RUNTIME_CLASS(CMemoryException)));
  CStdioFile sf;
  EXPECT_TRUE(sf.IsKindOf(RUNTIME_CLASS(CFile)));
  EXPECT_FALSE(sf.IsSerializable());
}

TEST(RuntimeClass, ObjectsMadeInTheDllKnowTheirClass) {
  CObject* p = TestDllMakeSquare();
  EXPECT_EQ(RUNTIME_CLASS(CTestSquare), p->GetRuntimeClass());
  EXPECT_TRUE(p->IsKindOf(RUNTIME_CLASS(CTestShape)));
  CTestShape* pShape = DYNAMIC_DOWNCAST(CTestShape, p);
  ASSERT_NE(nullptr, pShape);
  EXPECT_EQ(4, pShape->Sides());
  EXPECT_EQ(nullptr, DYNAMIC_DOWNCAST(CTestTriangle, p));
  EXPECT_EQ(nullptr, DYNAMIC_DOWNCAST(CTestShape, (CObject*)NULL));
  EXPECT_EQ(pShape, STATIC_DOWNCAST(CTestShape, p));
  delete p;
}

TEST(RuntimeClass, CreateObjectAndFromName) {
  CObject* p = RUNTIME_CLASS(CTestSquare)->CreateObject();
  ASSERT_NE(nullptr, p);
  EXPECT_EQ(4, static_cast<CTestShape*>(p)->Sides());
  delete p;

  p = RUNTIME_CLASS(CTestTriangle)->CreateObject();
  ASSERT_NE(nullptr, p);
  EXPECT_EQ(3, static_cast<CTestShape*>(p)->Sides());
  delete p;

  // DYNAMIC only: no default construction.
  EXPECT_EQ(nullptr, RUNTIME_CLASS(CTestFixedShape)->CreateObject());
  EXPECT_EQ(nullptr, RUNTIME_CLASS(CFile)->CreateObject());

  EXPECT_EQ(RUNTIME_CLASS(CTestSquare), CRuntimeClass::FromName("CTestSquare"));
  EXPECT_EQ(RUNTIME_CLASS(CTestTriangle), CRuntimeClass::FromName("CTestTriangle"));
  EXPECT_EQ(RUNTIME_CLASS(CFileException), CRuntimeClass::FromName("CFileException"));
  EXPECT_EQ(RUNTIME_CLASS(CObject), CRuntimeClass::FromName("CObject"));
  EXPECT_EQ(nullptr, CRuntimeClass::FromName("CGibtEsNicht"));
  EXPECT_EQ(nullptr, CRuntimeClass::FromName(NULL));

  p = CRuntimeClass::CreateObject("CTestSquare");
  ASSERT_NE(nullptr, p);
  EXPECT_TRUE(p->IsKindOf(RUNTIME_CLASS(CTestSquare)));
  delete p;
  EXPECT_EQ(nullptr, CRuntimeClass::CreateObject("CGibtEsNicht"));
}

TEST(RuntimeClass, ClassesOfAnUnloadedModuleAreForgotten) {
  char szPath[MAX_PATH];
  DWORD n = GetModuleFileNameA(NULL, szPath, MAX_PATH);
  ASSERT_GT(n, 0u);
  CString strDir(szPath);
  strDir = strDir.Left(strDir.ReverseFind('\\') + 1);

  HMODULE hPlugin = LoadLibraryA(strDir + "mfc_core_plugin.dll");
  ASSERT_NE(nullptr, hPlugin);
  typedef CRuntimeClass* (*PFN)();
  PFN pfn = (PFN)(void*)GetProcAddress(hPlugin, "PluginThingClass");
  ASSERT_NE(nullptr, pfn);
  CRuntimeClass* pClass = CRuntimeClass::FromName("CPluginThing");
  EXPECT_EQ(pfn(), pClass);
  CObject* p = CRuntimeClass::CreateObject("CPluginThing");
  ASSERT_NE(nullptr, p);
  EXPECT_TRUE(p->IsKindOf(pClass));
  delete p;

  ASSERT_TRUE(FreeLibrary(hPlugin));
  ASSERT_EQ(nullptr, GetModuleHandleA("mfc_core_plugin.dll"));
  EXPECT_EQ(nullptr, CRuntimeClass::FromName("CPluginThing"));
  EXPECT_EQ(RUNTIME_CLASS(CTestSquare), CRuntimeClass::FromName("CTestSquare"));
}

} // namespace
