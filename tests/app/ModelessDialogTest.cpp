// A page embedded in a real main frame: the frame's shortcuts while the focus
// is in the page, ordinary dialog keys, and Enter and Escape leaving the page
// where it is. Keys are real keyboard input, read by a loop that gives the
// windows' PreTranslateMessage its turn as the application's own loop does.
#include <gtest/gtest.h>

#include <string>

#include "AppTestRes.h"
#include "CModelessDialog.h"
#include "DialogDriver.h"
#include "Input.h"
#include "MfcTestHost.h"

namespace {

const UINT ID_CMD_CTRL_K = 32801;
const UINT ID_CMD_F5 = 32802;

class CTestFrame : public CFrameWnd {
public:
    int m_nCtrlK = 0;
    int m_nF5 = 0;

protected:
    afx_msg void OnCtrlK() { ++m_nCtrlK; }
    afx_msg void OnF5() { ++m_nF5; }
    DECLARE_MESSAGE_MAP()
};

BEGIN_MESSAGE_MAP(CTestFrame, CFrameWnd)
    ON_COMMAND(ID_CMD_CTRL_K, OnCtrlK)
    ON_COMMAND(ID_CMD_F5, OnF5)
END_MESSAGE_MAP()

// A page that counts Enter and Escape and then leaves them to the base.
class CTestPage : public CModelessDialog {
public:
    explicit CTestPage(CWnd* pParent) : CModelessDialog(IDD_TEST_PAGE, pParent) {}
    int m_nOk = 0;
    int m_nCancel = 0;

protected:
    void OnOK() override
    {
        ++m_nOk;
        CModelessDialog::OnOK();
    }
    void OnCancel() override
    {
        ++m_nCancel;
        CModelessDialog::OnCancel();
    }
};

using qotest::PressKey;
using qotest::PumpApp;
using qotest::WindowText;

class ModelessDialogTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        m_pFrame = new CTestFrame;
        ASSERT_TRUE(qotest::CreateHostFrame(m_pFrame, "Hauptfenster", 480, 300, COLOR_WINDOW));
        ACCEL keys[] = {{FVIRTKEY | FCONTROL, 'K', (WORD)ID_CMD_CTRL_K}, {FVIRTKEY, VK_F5, (WORD)ID_CMD_F5}};
        m_hAccel = CreateAcceleratorTableA(keys, 2);
        m_pFrame->m_hAccelTable = m_hAccel;
        AfxGetApp()->m_pMainWnd = m_pFrame;

        m_pPage = new CTestPage(m_pFrame);
        ASSERT_TRUE(m_pPage->Create(IDD_TEST_PAGE, m_pFrame));
        ASSERT_FALSE(m_pPage->IsWindowVisible());  // the application shows it
        m_pPage->SetWindowPos(NULL, 10, 10, 0, 0, SWP_NOSIZE | SWP_NOZORDER);
        m_pPage->ShowWindow(SW_SHOW);
        m_hFirst = ::GetDlgItem(m_pPage->m_hWnd, IDC_PAGE_FIRST);
        m_hSecond = ::GetDlgItem(m_pPage->m_hWnd, IDC_PAGE_SECOND);
        qotest::BringToFront(m_pFrame->m_hWnd);
        qotest::Focus(m_hFirst);
        ASSERT_EQ(m_hFirst, GetFocus());
    }

    void TearDown() override
    {
        if (m_pPage != NULL) {
            if (m_pPage->m_hWnd != NULL) m_pPage->DestroyWindow();
            delete m_pPage;
        }
        AfxGetApp()->m_pMainWnd = NULL;  // else its end would end the program's loop
        qotest::DestroyHostFrame(m_pFrame);
        if (m_hAccel != NULL) DestroyAcceleratorTable(m_hAccel);
    }

    CTestFrame* m_pFrame = nullptr;
    CTestPage* m_pPage = nullptr;
    HACCEL m_hAccel = NULL;
    HWND m_hFirst = NULL, m_hSecond = NULL;
};

TEST_F(ModelessDialogTest, FrameShortcutsRunTheFramesCommandAndTheEditDoesNotSeeThem)
{
    PressKey('K', true);
    EXPECT_EQ(1, m_pFrame->m_nCtrlK);
    PressKey(VK_F5);
    EXPECT_EQ(1, m_pFrame->m_nF5);
    EXPECT_EQ("", WindowText(m_hFirst));
    EXPECT_EQ(m_hFirst, GetFocus());

    // Keys that are no shortcut are the page's as in any dialog.
    PressKey('A');
    EXPECT_EQ("a", WindowText(m_hFirst));
    PressKey(VK_TAB);
    EXPECT_EQ(m_hSecond, GetFocus());
}

TEST_F(ModelessDialogTest, WithoutAFrameAsMainWindowTheKeysStayWithThePage)
{
    // No main window, or one that is no frame.
    CWnd plain;
    ASSERT_TRUE(plain.CreateEx(0, AfxRegisterWndClass(0), "kein Rahmen", WS_POPUP, 0, 0, 10, 10, NULL, NULL));
    for (CWnd* pMain : {(CWnd*)NULL, &plain}) {
        SCOPED_TRACE(pMain == NULL ? "none" : "plain window");
        AfxGetApp()->m_pMainWnd = pMain;
        ::SetWindowTextA(m_hFirst, "");
        qotest::Focus(m_hFirst);
        PressKey('K', true);  // Ctrl+K in an edit types nothing either
        PressKey(VK_F5);
        PressKey('C');
        EXPECT_EQ(0, m_pFrame->m_nCtrlK);
        EXPECT_EQ(0, m_pFrame->m_nF5);
        EXPECT_EQ("c", WindowText(m_hFirst));
    }
    AfxGetApp()->m_pMainWnd = m_pFrame;
    plain.DestroyWindow();
}

TEST_F(ModelessDialogTest, EnterAndEscapeReachThePageAndLeaveItOpen)
{
    PressKey('X');
    PressKey(VK_RETURN);
    EXPECT_EQ(1, m_pPage->m_nOk);
    PressKey(VK_ESCAPE);
    EXPECT_EQ(1, m_pPage->m_nCancel);
    // The user closing the page's window (no caption: only by message) is Cancel too.
    m_pPage->SendMessage(WM_CLOSE);
    PumpApp(100);
    EXPECT_EQ(2, m_pPage->m_nCancel);

    EXPECT_TRUE(::IsWindow(m_pPage->m_hWnd));
    EXPECT_TRUE(m_pPage->IsWindowVisible());
    EXPECT_EQ("x", WindowText(m_hFirst));
    EXPECT_EQ(0, m_pFrame->m_nCtrlK + m_pFrame->m_nF5);
}

}  // namespace
