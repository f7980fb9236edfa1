// CFrameWnd: its run-time class, no accelerators until given some, and the
// object going with its window as MFC's frames do.
#include "afxwin.h"

#include <gtest/gtest.h>

namespace {

class CCountedFrame : public CFrameWnd {
public:
  explicit CCountedFrame(int* pDeleted) : m_pDeleted(pDeleted) {}
  ~CCountedFrame() override { ++*m_pDeleted; }

private:
  int* m_pDeleted;
};

TEST(FrameWnd, IsADynamicallyCreatableWindowWithoutAccelerators) {
  EXPECT_STREQ("CFrameWnd", RUNTIME_CLASS(CFrameWnd)->m_lpszClassName);
  CObject* pObject = RUNTIME_CLASS(CFrameWnd)->CreateObject();
  ASSERT_NE(nullptr, pObject);
  EXPECT_TRUE(pObject->IsKindOf(RUNTIME_CLASS(CWnd)));
  EXPECT_FALSE(pObject->IsKindOf(RUNTIME_CLASS(CDialog)));
  CFrameWnd* pFrame = DYNAMIC_DOWNCAST(CFrameWnd, pObject);
  ASSERT_NE(nullptr, pFrame);
  EXPECT_EQ(NULL, pFrame->m_hAccelTable);
  delete pFrame;  // no window yet: nobody else deletes it

  CWnd plain;
  EXPECT_EQ(nullptr, DYNAMIC_DOWNCAST(CFrameWnd, &plain));
}

TEST(FrameWnd, DeletesItselfWhenItsWindowIsDestroyed) {
  int deleted = 0;
  CCountedFrame* pFrame = new CCountedFrame(&deleted);
  ASSERT_TRUE(pFrame->CreateEx(0, AfxRegisterWndClass(0), "Rahmen", WS_OVERLAPPEDWINDOW, 0, 0, 200, 100, NULL, NULL));
  HWND hWnd = pFrame->m_hWnd;
  EXPECT_EQ(0, deleted);
  ::DestroyWindow(hWnd);  // as when the user closes it
  EXPECT_EQ(1, deleted);
  EXPECT_EQ(nullptr, CWnd::FromHandlePermanent(hWnd));
}

}  // namespace
