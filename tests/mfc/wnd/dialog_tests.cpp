// The resource chain of extension modules, dialogs from an extension DLL's
// template with data exchange, modeless child dialogs, and message boxes.
#include "afxwin.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "MfcTestHost.h"
#include "testres.h"

namespace {

const char kExtDll[] = "mfc_wnd_testext.dll";

// Runs before DialogTest keeps the extension DLL loaded.
TEST(ExtensionChainTest, ResourcesOfALoadedExtensionDllAreFoundAndGoneAfterUnload) {
  ASSERT_EQ(NULL, ::GetModuleHandleA(kExtDll)) << "run this test before the DLL is loaded for good";
  CString str;
  EXPECT_FALSE(str.LoadString(IDS_EXT_ONLY));

  HMODULE hExt = ::LoadLibraryA(kExtDll);
  ASSERT_NE((HMODULE)NULL, hExt);
  EXPECT_EQ(hExt, AfxFindStringResourceHandle(IDS_EXT_ONLY));
  EXPECT_TRUE(str.LoadString(IDS_EXT_ONLY));
  EXPECT_STREQ("Nur in der Erweiterung: Gr\xFC\xDF" "e", str);
  // The application's own resources come first.
  EXPECT_TRUE(str.LoadString(IDS_BOTH));
  EXPECT_STREQ("Text der Anwendung", str);
  // A run-time class of the DLL is known by name while it is loaded.
  EXPECT_NE(nullptr, CRuntimeClass::FromName("CExtOnlyObject"));

  ASSERT_TRUE(::FreeLibrary(hExt));
  EXPECT_EQ(NULL, AfxFindStringResourceHandle(IDS_EXT_ONLY));
  EXPECT_FALSE(str.LoadString(IDS_EXT_ONLY));
}

class CDataDlg : public CDialog {
public:
  CDataDlg() : CDialog(IDD_EXT_DATA) {}
  CString m_strName;
  int m_nCount = 0;
  int m_bActive = 0;
  int m_nRadio = 0;
  int m_nKind = 0;
  double m_dFactor = 0;
  int m_nEndInInit = 0;

protected:
  virtual void DoDataExchange(CDataExchange* pDX) {
    DDX_Text(pDX, IDC_NAME, m_strName);
    DDV_MaxChars(pDX, m_strName, 10);
    DDX_Text(pDX, IDC_COUNT, m_nCount);
    DDV_MinMaxInt(pDX, m_nCount, 0, 1000);
    DDX_Check(pDX, IDC_ACTIVE, m_bActive);
    DDX_Radio(pDX, IDC_RADIO1, m_nRadio);
    DDX_CBIndex(pDX, IDC_KIND, m_nKind);
    DDX_Text(pDX, IDC_FACTOR, m_dFactor);
  }
  virtual BOOL OnInitDialog() {
    CComboBox* pKind = (CComboBox*)GetDlgItem(IDC_KIND);
    pKind->AddString("Text");
    pKind->AddString("dBase");
    pKind->AddString("ODBC");
    CDialog::OnInitDialog();
    if (m_nEndInInit != 0) EndDialog(m_nEndInInit);
    return TRUE;
  }
};

class DialogTest : public ::testing::Test {
protected:
  static void SetUpTestSuite() { s_hExt = ::LoadLibraryA(kExtDll); }
  static void TearDownTestSuite() {
    if (s_hExt != NULL) ::FreeLibrary(s_hExt);
  }
  void SetUp() override { ASSERT_NE((HMODULE)NULL, s_hExt); }
  // Answers the next message box with nButton, keeping its text and caption.
  void AnswerBox(int nButton) {
    m_driver.Expect([this, nButton](qotest::Dialog& d) {
      m_boxes.push_back(d.MessageText());
      m_captions.push_back(d.Title());
      d.Press(nButton);
    });
  }
  static HMODULE s_hExt;
  qotest::DialogDriver m_driver;
  std::vector<std::string> m_boxes, m_captions;
};
HMODULE DialogTest::s_hExt = NULL;

TEST_F(DialogTest, ModalDialogFromTheExtensionTemplateExchangesItsData) {
  CDataDlg dlg;
  dlg.m_strName = "Alt";
  dlg.m_nCount = 12;
  dlg.m_bActive = 1;
  dlg.m_nRadio = 1;
  dlg.m_nKind = 2;
  dlg.m_dFactor = 1.5;
  std::string shown; // name|count|factor|active radio2 kind
  m_driver.Expect([&](qotest::Dialog& d) {
    shown = d.Text(IDC_NAME) + "|" + d.Text(IDC_COUNT) + "|" + d.Text(IDC_FACTOR) + "|" +
            std::to_string(d.IsChecked(IDC_ACTIVE)) + std::to_string(d.IsChecked(IDC_RADIO2)) +
            std::to_string(d.Selection(IDC_KIND));
    d.SetText(IDC_NAME, "Neu");
    d.SetText(IDC_COUNT, " 345 ");
    d.Check(IDC_ACTIVE, false);
    d.Check(IDC_RADIO3);
    d.Select(IDC_KIND, 0);
    d.SetText(IDC_FACTOR, "-2.25");
    d.Press(IDOK);
  });
  EXPECT_EQ(IDOK, dlg.DoModal());
  EXPECT_EQ("Alt|12|1.5|112", shown);
  EXPECT_STREQ("Neu", dlg.m_strName);
  EXPECT_EQ(345, dlg.m_nCount);
  EXPECT_EQ(0, dlg.m_bActive);
  EXPECT_EQ(2, dlg.m_nRadio);
  EXPECT_EQ(0, dlg.m_nKind);
  EXPECT_DOUBLE_EQ(-2.25, dlg.m_dFactor);
  // EndDialog in OnInitDialog returns its result without showing the dialog.
  dlg.m_nEndInInit = 42;
  EXPECT_EQ(42, dlg.DoModal());
  EXPECT_EQ(NULL, dlg.m_hWnd);
}

TEST_F(DialogTest, InputThatCannotBeTakenIsRefusedWithAGermanPromptAndTheDialogStays) {
  struct {
    int nID;
    const char* text;   // typed into the field, the other fields hold good values
    const char* prompt; // the box that refuses it
  } const cases[] = {
      {IDC_COUNT, "12x", "Geben Sie eine ganze Zahl ein."},
      {IDC_COUNT, "5000", "Geben Sie eine ganze Zahl zwischen 0 und 1000 ein."},
      {IDC_NAME, "viel zu langer Name", "Geben Sie nicht mehr als 10 Zeichen ein."},
  };
  CDataDlg dlg;
  std::vector<int> focus;
  m_driver.Expect([&](qotest::Dialog& d) {
    d.SetText(IDC_NAME, cases[2].text);
    EXPECT_EQ("viel zu la", d.Text(IDC_NAME)); // typing stops at the limit; the program's text does not
    auto set = [&](int nID, const char* text) { d.Send(nID, WM_SETTEXT, 0, (LPARAM)text); };
    for (size_t i = 0; i <= 3; ++i) {
      set(IDC_COUNT, "50");
      set(IDC_NAME, "kurz");
      if (i == 3) break;
      set(cases[i].nID, cases[i].text);
      d.Press(IDOK);
      qotest::WaitFor([&] { return m_boxes.size() > i && ::IsWindowEnabled(d.Hwnd()); }, 5000);
      focus.push_back(::GetDlgCtrlID(::GetFocus()));
    }
    d.Press(IDOK);
  });
  for (int i = 0; i < 3; ++i) AnswerBox(IDOK);
  EXPECT_EQ(IDOK, dlg.DoModal());
  ASSERT_EQ(3u, m_boxes.size());
  for (size_t i = 0; i < 3; ++i) EXPECT_EQ(cases[i].prompt, m_boxes[i]);
  EXPECT_EQ("Fenstertest", m_captions[0]);
  EXPECT_EQ((std::vector<int>{IDC_COUNT, IDC_COUNT, IDC_NAME}), focus); // on the refused field
  EXPECT_EQ(50, dlg.m_nCount);
  EXPECT_STREQ("kurz", dlg.m_strName);
}

// A modeless child page: keyboard navigation works through PreTranslateMessage.
class CChildPage : public CDialog {
public:
  CChildPage() : CDialog(IDD_EXT_CHILD) {}
  CString m_strFirst = "erstes";
  CEdit m_editSecond;

protected:
  virtual void DoDataExchange(CDataExchange* pDX) {
    DDX_Control(pDX, IDC_SECOND, m_editSecond);
    DDX_Text(pDX, IDC_FIRST, m_strFirst);
  }
};

TEST_F(DialogTest, ModelessChildDialogIsCreatedAndTabMovesTheFocus) {
  CWnd frame;
  ASSERT_TRUE(frame.CreateEx(WS_EX_CONTROLPARENT, NULL, "Rahmen", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 50, 50, 400,
                             300, NULL, NULL));
  CChildPage page;
  ASSERT_TRUE(page.Create(IDD_EXT_CHILD, &frame));
  qotest::Focus(page.GetDlgItem(IDC_FIRST)->m_hWnd);
  ASSERT_EQ(page.GetDlgItem(IDC_FIRST)->m_hWnd, ::GetFocus());
  qotest::PressKey(VK_TAB);
  EXPECT_EQ(page.m_editSecond.m_hWnd, ::GetFocus()); // the control the page attached
  page.DestroyWindow();
  EXPECT_EQ(NULL, page.m_editSecond.m_hWnd);
  frame.DestroyWindow();
}

// An exception with a text of its own, or none (then the caller's resource id counts).
class CTextException : public CException {
public:
  explicit CTextException(LPCSTR lpszText) : m_lpszText(lpszText) {}
  virtual BOOL GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT) const {
    if (m_lpszText == NULL) return FALSE;
    lstrcpynA(lpszError, m_lpszText, nMaxError);
    return TRUE;
  }
  LPCSTR m_lpszText;
};

TEST_F(DialogTest, MessageBoxesAndReportErrorTakeTextsFromTheExceptionOrTheChain) {
  for (int nButton : {IDNO, IDOK, IDOK}) AnswerBox(nButton);
  EXPECT_EQ(IDNO, AfxMessageBox("Weiter?", MB_YESNO));
  CTextException textEx("Datei fehlt"), silentEx(NULL);
  EXPECT_EQ(IDOK, textEx.ReportError(MB_OK, IDS_EXT_ONLY));
  EXPECT_EQ(IDOK, silentEx.ReportError(MB_OK, IDS_EXT_ONLY));
  EXPECT_EQ((std::vector<std::string>{"Weiter?", "Datei fehlt", "Nur in der Erweiterung: Gr\xFC\xDF" "e"}), m_boxes);
}

} // namespace
