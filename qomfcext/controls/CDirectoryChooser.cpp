#include "CDirectoryChooser.h"

#include "resource.h"

IMPLEMENT_DYNAMIC(CDirectoryChooser, CDialog)

BEGIN_MESSAGE_MAP(CDirectoryChooser, CDialog)
    ON_WM_DESTROY()
END_MESSAGE_MAP()

CDirectoryChooser::CDirectoryChooser(const char* lpszText, CWnd* pParent, const char* lpszStartDir)
    : CDialog(IDD, pParent),
      m_strText(lpszText != NULL ? lpszText : ""),
      m_strDirectory(lpszStartDir != NULL ? lpszStartDir : "")
{
}

CDirectoryChooser::~CDirectoryChooser() {}

void CDirectoryChooser::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_DIRECTORY_TREE, m_tree);
    DDX_Text(pDX, IDC_DIRECTORY_TEXT, m_strText);
}

BOOL CDirectoryChooser::OnInitDialog()
{
    CDialog::OnInitDialog();
    m_tree.InitDirectoryTreeCtrl(m_strDirectory);
    return TRUE;
}

void CDirectoryChooser::OnDestroy()
{
    CDialog::OnDestroy();
    m_strDirectory = m_tree.GetSelectedPath();
}
