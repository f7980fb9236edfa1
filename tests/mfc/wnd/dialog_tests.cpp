// The resource chain of extension modules, dialogs from an extension DLL's
// template with data exchange, modeless child dialogs, and message boxes.
#include "afxwin.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "dialog_script.h"
#include "testres.h"

namespace {

const char kExtDll[] = "mfc_wnd_testext.dll";

// The extension DLL stays loaded for the dialog tests; the chain test loads and
// unloads it on its own first.
class ExtensionChainTest : public ::testing::Test {};

TEST_F(ExtensionChainTest, ResourcesOfALoadedExtensionDllAreFoundAndGoneAfterUnload) {
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
  static HMODULE s_hExt;
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
  CDialogScript script;
  script.Then([&](HWND hDlg) {
    shown = CDialogScript::ItemText(hDlg, IDC_NAME) + "|" + CDialogScript::ItemText(hDlg, IDC_COUNT) + "|" +
            CDialogScript::ItemText(hDlg, IDC_FACTOR) + "|" + std::to_string(::IsDlgButtonChecked(hDlg, IDC_ACTIVE)) +
            std::to_string(::IsDlgButtonChecked(hDlg, IDC_RADIO2)) +
            std::to_string(::SendDlgItemMessageA(hDlg, IDC_KIND, CB_GETCURSEL, 0, 0));
    ::SetDlgItemTextA(hDlg, IDC_NAME, "Neu");
    ::SetDlgItemTextA(hDlg, IDC_COUNT, " 345 ");
    ::CheckDlgButton(hDlg, IDC_ACTIVE, BST_UNCHECKED);
    ::CheckRadioButton(hDlg, IDC_RADIO1, IDC_RADIO3, IDC_RADIO3);
    ::SendDlgItemMessageA(hDlg, IDC_KIND, CB_SETCURSEL, 0, 0);
    ::SetDlgItemTextA(hDlg, IDC_FACTOR, "-2.25");
    CDialogScript::Click(hDlg, IDOK);
  });
  EXPECT_EQ(IDOK, dlg.DoModal());
  EXPECT_TRUE(script.Done());
  EXPECT_EQ("Alt|12|1.5|112", shown);
  EXPECT_STREQ("Neu", dlg.m_strName);
  EXPECT_EQ(345, dlg.m_nCount);
  EXPECT_EQ(0, dlg.m_bActive);
  EXPECT_EQ(2, dlg.m_nRadio);
  EXPECT_EQ(0, dlg.m_nKind);
  EXPECT_DOUBLE_EQ(-2.25, dlg.m_dFactor);
}

TEST_F(DialogTest, CancelKeepsTheMembers) {
  CDataDlg dlg;
  dlg.m_nCount = 5;
  CDialogScript script;
  script.Then([](HWND hDlg) {
    ::SetDlgItemTextA(hDlg, IDC_COUNT, "77");
    CDialogScript::Click(hDlg, IDCANCEL);
  });
  EXPECT_EQ(IDCANCEL, dlg.DoModal());
  EXPECT_EQ(5, dlg.m_nCount);
}

TEST_F(DialogTest, InputThatCannotBeTakenIsRefusedWithAGermanPromptAndTheDialogStays) {
  struct {
    int nID;
    const char* text;   // typed into the field, the fields before hold good values
    const char* prompt; // the box that refuses it
  } const cases[] = {
      {IDC_COUNT, "12x", "Geben Sie eine ganze Zahl ein."},
      {IDC_COUNT, "5000", "Geben Sie eine ganze Zahl zwischen 0 und 1000 ein."},
      {IDC_NAME, "viel zu langer Name", "Geben Sie nicht mehr als 10 Zeichen ein."},
      {IDC_FACTOR, "zwei", "Geben Sie eine Zahl ein."},
  };
  CDataDlg dlg;
  std::vector<int> focus;
  CDialogScript script;
  for (size_t i = 0; i <= 4; ++i) {
    script.Then([&, i](HWND hDlg) {
      if (i > 0) focus.push_back(::GetDlgCtrlID(::GetFocus()));
      ::SetDlgItemTextA(hDlg, IDC_COUNT, "50");
      ::SetDlgItemTextA(hDlg, IDC_NAME, "kurz");
      ::SetDlgItemTextA(hDlg, IDC_FACTOR, "2");
      if (i < 4) ::SetDlgItemTextA(hDlg, cases[i].nID, cases[i].text);
      CDialogScript::Click(hDlg, IDOK);
    });
    if (i < 4) script.AnswerBox(IDOK);
  }
  EXPECT_EQ(IDOK, dlg.DoModal());
  EXPECT_TRUE(script.Done());
  ASSERT_EQ(4u, script.Boxes().size());
  for (size_t i = 0; i < 4; ++i) EXPECT_EQ(cases[i].prompt, script.Boxes()[i].text);
  EXPECT_EQ("Fenstertest", script.Boxes()[0].caption);
  EXPECT_EQ((std::vector<int>{IDC_COUNT, IDC_COUNT, IDC_NAME, IDC_FACTOR}), focus); // on the refused field
  EXPECT_EQ(50, dlg.m_nCount);
  EXPECT_STREQ("kurz", dlg.m_strName);
  EXPECT_DOUBLE_EQ(2.0, dlg.m_dFactor);
}

TEST_F(DialogTest, EndDialogInOnInitDialogReturnsItsResultWithoutShowing) {
  CDataDlg dlg;
  dlg.m_nEndInInit = 42;
  EXPECT_EQ(42, dlg.DoModal());
  EXPECT_EQ(NULL, dlg.m_hWnd);
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
  EXPECT_EQ(page.GetDlgItem(IDC_SECOND)->m_hWnd, page.m_editSecond.m_hWnd);
  CString str;
  page.GetDlgItemText(IDC_FIRST, str);
  EXPECT_STREQ("erstes", str);

  frame.SetActiveWindow();
  page.GetDlgItem(IDC_FIRST)->SetFocus();
  ASSERT_EQ(page.GetDlgItem(IDC_FIRST)->m_hWnd, ::GetFocus());
  ::PostMessageA(::GetFocus(), WM_KEYDOWN, VK_TAB, 0x000F0001);
  ::PostMessageA(::GetFocus(), WM_KEYUP, VK_TAB, 0xC00F0001);
  PumpFor(200);
  EXPECT_EQ(page.m_editSecond.m_hWnd, ::GetFocus());

  page.GetDlgItem(IDC_FIRST)->SetWindowText("eins");
  EXPECT_TRUE(page.UpdateData(TRUE));
  EXPECT_STREQ("eins", page.m_strFirst);
  page.DestroyWindow();
  EXPECT_EQ(NULL, page.m_editSecond.m_hWnd);
  frame.DestroyWindow();
}

class CSilentException : public CException {
public:
  virtual BOOL GetErrorMessage(LPSTR, UINT, PUINT) const { return FALSE; }
};

class CTextException : public CException {
public:
  virtual BOOL GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT) const {
    lstrcpynA(lpszError, "Datei fehlt", nMaxError);
    return TRUE;
  }
};

TEST_F(DialogTest, MessageBoxesAndReportErrorTakeTextsFromTheExceptionOrTheChain) {
  CDialogScript script;
  script.AnswerBox(IDNO).AnswerBox(IDOK).AnswerBox(IDOK).AnswerBox(IDOK);
  EXPECT_EQ(IDNO, AfxMessageBox("Weiter?", MB_YESNO));
  CTextException textEx;
  CSilentException silentEx;
  EXPECT_EQ(IDOK, textEx.ReportError(MB_OK, IDS_EXT_ONLY));
  EXPECT_EQ(IDOK, silentEx.ReportError(MB_OK, IDS_EXT_ONLY));
  EXPECT_EQ(IDOK, silentEx.ReportError());
  ASSERT_EQ(4u, script.Boxes().size());
  EXPECT_EQ("Fenstertest", script.Boxes()[0].caption);
  EXPECT_EQ("Datei fehlt", script.Boxes()[1].text);
  EXPECT_EQ("Nur in der Erweiterung: Gr\xFC\xDF" "e", script.Boxes()[2].text);
  EXPECT_EQ("Es ist ein Fehler aufgetreten.", script.Boxes()[3].text);
}

} // namespace
