// Run-time class information across DLLs: IsKindOf, downcasts, CreateObject,
// FromName, and a module that is unloaded.
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

TEST(RuntimeClass, KindsAcrossTheDllDowncastsCreateObjectAndFromName) {
  EXPECT_TRUE(RUNTIME_CLASS(CTestSquare)->IsDerivedFrom(RUNTIME_CLASS(CObject)));
  CTestTriangle triangle;
  EXPECT_TRUE(triangle.IsKindOf(RUNTIME_CLASS(CTestShape)));
  EXPECT_FALSE(triangle.IsKindOf(RUNTIME_CLASS(CTestSquare)));

  CObject* p = TestDllMakeSquare();
  EXPECT_EQ(RUNTIME_CLASS(CTestSquare), p->GetRuntimeClass());
  CTestShape* pShape = DYNAMIC_DOWNCAST(CTestShape, p);
  ASSERT_NE(nullptr, pShape);
  EXPECT_EQ(4, pShape->Sides());
  EXPECT_EQ(nullptr, DYNAMIC_DOWNCAST(CTestTriangle, p));
  EXPECT_EQ(nullptr, DYNAMIC_DOWNCAST(CTestShape, (CObject*)NULL));
  delete p;

  p = CRuntimeClass::CreateObject("CTestTriangle");
  ASSERT_NE(nullptr, p);
  EXPECT_EQ(3, static_cast<CTestShape*>(p)->Sides());
  delete p;
  EXPECT_EQ(nullptr, RUNTIME_CLASS(CTestFixedShape)->CreateObject()); // DYNAMIC only: no default construction
  EXPECT_EQ(nullptr, CRuntimeClass::CreateObject("CGibtEsNicht"));
  EXPECT_EQ(RUNTIME_CLASS(CTestSquare), CRuntimeClass::FromName("CTestSquare"));
  EXPECT_EQ(nullptr, CRuntimeClass::FromName(NULL));
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
  EXPECT_EQ(pfn(), CRuntimeClass::FromName("CPluginThing"));

  ASSERT_TRUE(FreeLibrary(hPlugin));
  ASSERT_EQ(nullptr, GetModuleHandleA("mfc_core_plugin.dll"));
  EXPECT_EQ(nullptr, CRuntimeClass::FromName("CPluginThing"));
  EXPECT_EQ(RUNTIME_CLASS(CTestSquare), CRuntimeClass::FromName("CTestSquare"));
}

} // namespace
