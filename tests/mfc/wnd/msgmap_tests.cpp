// Message maps on real windows: commands, ranges, WM_NOTIFY, registered
// messages, reflection to the control, exceptions in handlers, and windows'
// lifetimes.
#include "afxwin.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "DialogDriver.h"

namespace {

const UINT ID_BASE_ONLY = 100;
const UINT ID_BOTH = 101;
const UINT ID_RANGE_FIRST = 200;
const UINT ID_RANGE_LAST = 209;
const UINT IDC_REFLECT_EDIT = 302;
const UINT IDC_NOTIFIER = 304;
const UINT WM_APP_SUM = WM_APP + 1;
const UINT WM_APP_THROW_STD = WM_APP + 2;
const UINT WM_APP_THROW_USER = WM_APP + 3;
const UINT WM_APP_THROW_INT = WM_APP + 4;

UINT g_nRegistered = ::RegisterWindowMessageA("QoMfcWndTests.Registered");

class CProbeBase : public CWnd {
public:
  std::vector<std::string> m_log;
  void Log(const std::string& s) { m_log.push_back(s); }

protected:
  afx_msg void OnBaseOnly() { Log("base-only"); }
  afx_msg void OnBothInBase() { Log("both-in-base"); }
  DECLARE_MESSAGE_MAP()
};

BEGIN_MESSAGE_MAP(CProbeBase, CWnd)
  ON_COMMAND(ID_BASE_ONLY, OnBaseOnly)
  ON_COMMAND(ID_BOTH, OnBothInBase)
END_MESSAGE_MAP()

class CProbeWnd : public CProbeBase {
public:
  BOOL m_bAttachedInCreate = FALSE;
  BOOL m_bPostNcDestroy = FALSE;

protected:
  afx_msg int OnCreate(LPCREATESTRUCT lpcs) {
    m_bAttachedInCreate = FromHandlePermanent(m_hWnd) == this;
    return CWnd::OnCreate(lpcs);
  }
  afx_msg void OnBoth() { Log("both"); }
  afx_msg void OnRange(UINT nID) { Log("range " + std::to_string(nID)); }
  afx_msg void OnReflectEditChange() { Log("parent-saw-reflected-edit"); }
  afx_msg void OnNotifier(NMHDR* pNMHDR, LRESULT* pResult) {
    Log("notify " + std::to_string((int)pNMHDR->code));
    *pResult = 5;
  }
  afx_msg void OnNotifyRange(UINT nID, NMHDR*, LRESULT* pResult) {
    Log("notify-range " + std::to_string(nID));
    *pResult = 6;
  }
  afx_msg LRESULT OnSum(WPARAM wParam, LPARAM lParam) { return (LRESULT)(wParam + lParam); }
  afx_msg LRESULT OnRegistered(WPARAM wParam, LPARAM) { return 1000 + (LRESULT)wParam; }
  afx_msg LRESULT OnThrowStd(WPARAM, LPARAM) { throw std::runtime_error("kaputt im Handler"); }
  afx_msg LRESULT OnThrowUser(WPARAM, LPARAM) { AfxThrowUserException(); return 1; }
  afx_msg LRESULT OnThrowInt(WPARAM, LPARAM) { throw 42; }
  virtual void PostNcDestroy() { m_bPostNcDestroy = TRUE; }
  DECLARE_MESSAGE_MAP()
};

BEGIN_MESSAGE_MAP(CProbeWnd, CProbeBase)
  ON_WM_CREATE()
  ON_COMMAND(ID_BOTH, OnBoth)
  ON_COMMAND_RANGE(ID_RANGE_FIRST, ID_RANGE_LAST, OnRange)
  ON_EN_CHANGE(IDC_REFLECT_EDIT, OnReflectEditChange)
  ON_NOTIFY(NM_CLICK, IDC_NOTIFIER, OnNotifier)
  ON_NOTIFY_RANGE(NM_DBLCLK, 400, 409, OnNotifyRange)
  ON_MESSAGE(WM_APP_SUM, OnSum)
  ON_REGISTERED_MESSAGE(g_nRegistered, OnRegistered)
  ON_MESSAGE(WM_APP_THROW_STD, OnThrowStd)
  ON_MESSAGE(WM_APP_THROW_USER, OnThrowUser)
  ON_MESSAGE(WM_APP_THROW_INT, OnThrowInt)
END_MESSAGE_MAP()

// An edit control that handles its own change notification.
class CReflectEdit : public CEdit {
public:
  int m_nChanges = 0;

protected:
  afx_msg void OnChange() { m_nChanges++; }
  DECLARE_MESSAGE_MAP()
};

BEGIN_MESSAGE_MAP(CReflectEdit, CEdit)
  ON_CONTROL_REFLECT(EN_CHANGE, OnChange)
END_MESSAGE_MAP()

class MessageMapTest : public ::testing::Test {
protected:
  void SetUp() override {
    // Hidden: showing top-level windows is slow under Xvfb.
    ASSERT_TRUE(m_wnd.CreateEx(0, NULL, "Probe", WS_OVERLAPPEDWINDOW, 10, 10, 400, 300, NULL, NULL));
  }
  void TearDown() override {
    if (::IsWindow(m_wnd.m_hWnd)) m_wnd.DestroyWindow();
  }
  CProbeWnd m_wnd;
};

// Commands go to the most derived entry and fall back to the base map;
// notifications, single and in ranges, bring their results back; a control
// that reflects a notification handles it without its parent.
TEST_F(MessageMapTest, CommandsNotificationsAndReflection) {
  EXPECT_TRUE(m_wnd.m_bAttachedInCreate); // the object is known from WM_CREATE on
  m_wnd.SendMessage(WM_COMMAND, ID_BOTH, 0);
  m_wnd.SendMessage(WM_COMMAND, ID_BASE_ONLY, 0);
  m_wnd.SendMessage(WM_COMMAND, ID_RANGE_FIRST + 3, 0);
  m_wnd.SendMessage(WM_COMMAND, ID_RANGE_LAST + 1, 0); // no handler
  HWND hFrom = ::CreateWindowExA(0, "STATIC", "", WS_CHILD, 0, 0, 10, 10, m_wnd.m_hWnd, (HMENU)(UINT_PTR)IDC_NOTIFIER,
                                 NULL, NULL);
  auto notify = [&](UINT nID, int nCode) {
    NMHDR hdr = {hFrom, nID, (UINT)nCode};
    return m_wnd.SendMessage(WM_NOTIFY, nID, (LPARAM)&hdr);
  };
  EXPECT_EQ(5, notify(IDC_NOTIFIER, NM_CLICK));
  EXPECT_EQ(6, notify(404, NM_DBLCLK));
  EXPECT_EQ(0, notify(410, NM_DBLCLK)); // outside the range
  const std::vector<std::string> log = {"both", "base-only", "range 203", "notify -2", "notify-range 404"};
  EXPECT_EQ(log, m_wnd.m_log);

  CReflectEdit edit;
  ASSERT_TRUE(edit.Create(WS_CHILD | WS_VISIBLE | ES_AUTOHSCROLL, CRect(10, 10, 100, 30), &m_wnd, IDC_REFLECT_EDIT));
  edit.SetWindowText("x");
  EXPECT_EQ(1, edit.m_nChanges);
  EXPECT_EQ(log, m_wnd.m_log) << "the parent must not see a reflected notification";
}

TEST_F(MessageMapTest, ExceptionsInHandlersAreCaughtAndReported) {
  qotest::DialogDriver driver;
  std::vector<std::string> boxes;
  for (int i = 0; i < 2; ++i) {
    driver.Expect([&](qotest::Dialog& d) {
      boxes.push_back(d.MessageText());
      d.Press(IDOK);
    });
  }
  EXPECT_EQ(0, m_wnd.SendMessage(WM_APP_THROW_STD));
  EXPECT_EQ(0, m_wnd.SendMessage(WM_APP_THROW_USER)); // already told the user: no box
  EXPECT_EQ(0, m_wnd.SendMessage(WM_APP_THROW_INT));
  ASSERT_EQ(2u, boxes.size());
  EXPECT_NE(std::string::npos, boxes[0].find("kaputt im Handler"));
  EXPECT_NE(std::string::npos, boxes[1].find("unbekannte Ausnahme"));
  // The window still works; its handlers' results come back.
  EXPECT_EQ(7, m_wnd.SendMessage(WM_APP_SUM, 3, 4));
  EXPECT_EQ(1005, m_wnd.SendMessage(g_nRegistered, 5, 0));
}

class CFailingCreate : public CWnd {
public:
  BOOL m_bPostNcDestroy = FALSE;

protected:
  afx_msg int OnCreate(LPCREATESTRUCT) {
    AfxThrowUserException();
    return 0;
  }
  virtual void PostNcDestroy() { m_bPostNcDestroy = TRUE; }
  DECLARE_MESSAGE_MAP()
};

BEGIN_MESSAGE_MAP(CFailingCreate, CWnd)
  ON_WM_CREATE()
END_MESSAGE_MAP()

TEST(WindowLifetimeTest, ExceptionInOnCreateFailsTheCreation) {
  CFailingCreate wnd;
  EXPECT_FALSE(wnd.CreateEx(0, NULL, "x", WS_POPUP, 0, 0, 10, 10, NULL, NULL));
  EXPECT_EQ(NULL, wnd.m_hWnd);
  EXPECT_TRUE(wnd.m_bPostNcDestroy);
}

// DestroyWindow detaches the object; an object destroyed first takes its window along.
TEST(WindowLifetimeTest, DestroyDetachesAndCallsPostNcDestroy) {
  HWND hWnd;
  {
    CProbeWnd wnd;
    ASSERT_TRUE(wnd.CreateEx(0, NULL, "x", WS_POPUP, 0, 0, 10, 10, NULL, NULL));
    hWnd = wnd.m_hWnd;
    EXPECT_TRUE(wnd.DestroyWindow());
    EXPECT_EQ(NULL, wnd.m_hWnd);
    EXPECT_EQ(NULL, CWnd::FromHandlePermanent(hWnd));
    EXPECT_TRUE(wnd.m_bPostNcDestroy);
    ASSERT_TRUE(wnd.CreateEx(0, NULL, "x", WS_POPUP, 0, 0, 10, 10, NULL, NULL));
    hWnd = wnd.m_hWnd;
  }
  EXPECT_FALSE(::IsWindow(hWnd));
  EXPECT_EQ(NULL, CWnd::FromHandlePermanent(hWnd));
}

TEST(WindowLifetimeTest, TemporaryWrappersAndAttachDetach) {
  HWND hWnd = ::CreateWindowExA(0, "STATIC", "fremd", WS_POPUP, 0, 0, 10, 10, NULL, NULL, NULL, NULL);
  ASSERT_NE((HWND)NULL, hWnd);
  CWnd* pTemp = CWnd::FromHandle(hWnd);
  EXPECT_EQ(pTemp, CWnd::FromHandle(hWnd)); // one wrapper per handle

  CWnd wnd;
  ASSERT_TRUE(wnd.Attach(hWnd));
  EXPECT_EQ(&wnd, CWnd::FromHandle(hWnd)); // the permanent object wins
  AfxDeleteTempMaps();
  EXPECT_TRUE(::IsWindow(hWnd)); // freeing a wrapper never destroys the window
  EXPECT_EQ(hWnd, wnd.Detach());
  EXPECT_EQ(NULL, CWnd::FromHandlePermanent(hWnd));
  ::DestroyWindow(hWnd);
}

class CCountedFrame : public CFrameWnd {
public:
  explicit CCountedFrame(int* pDeleted) : m_pDeleted(pDeleted) {}
  ~CCountedFrame() override { ++*m_pDeleted; }

private:
  int* m_pDeleted;
};

TEST(WindowLifetimeTest, FrameDeletesItselfWhenItsWindowIsDestroyed) {
  int deleted = 0;
  CCountedFrame* pFrame = new CCountedFrame(&deleted);
  ASSERT_TRUE(pFrame->CreateEx(0, AfxRegisterWndClass(0), "Rahmen", WS_OVERLAPPEDWINDOW, 0, 0, 200, 100, NULL, NULL));
  ::DestroyWindow(pFrame->m_hWnd); // as when the user closes it
  EXPECT_EQ(1, deleted);
}

} // namespace
