// The directory tree over the real drives and folders of the machine (under Wine
// drive Z: is the host's root), and the chooser dialog around it.
#include <afxcmn.h>

#include <string>
#include <vector>

#include "CDirectoryChooser.h"
#include "CDirectoryTreeCtrl.h"
#include "MfcTestHost.h"

namespace {

// Hides every folder named "Versteckt" and the drive given.
class CHidingTree : public CDirectoryTreeCtrl {
public:
    std::string m_hiddenDrive;
    BOOL CanDisplay(const char* lpszPath) override
    {
        const std::string path = lpszPath;
        if (!m_hiddenDrive.empty() && _stricmp(path.c_str(), m_hiddenDrive.c_str()) == 0) return FALSE;
        return path.size() < 10 || path.compare(path.size() - 10, 10, "\\Versteckt") != 0;
    }
};

std::string Lower(std::string s)
{
    for (char& c : s) c = static_cast<char>(tolower(static_cast<unsigned char>(c)));
    return s;
}

class DirectoryTreeTest : public qotest::HostFrameTest {
protected:
    DirectoryTreeTest() : HostFrameTest("Verzeichnisse", 360, 460) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        m_base = qotest::TempPath("qo-dirtree");
        for (const char* dir : {"", "\\Alpha", "\\Alpha\\BETA", "\\Alpha\\BETA\\Leer", "\\Alpha\\Gamma",
                                "\\Alpha\\Gamma\\Delta", "\\Alpha\\mIXED", "\\Alpha\\Versteckt"})
            ::CreateDirectoryA((m_base + dir).c_str(), NULL);
        ASSERT_TRUE(m_tree.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | TVS_HASBUTTONS | TVS_HASLINES |
                                      TVS_LINESATROOT | TVS_SHOWSELALWAYS,
                                  CRect(5, 5, 340, 420), m_pFrame, 4000));
    }
    void TearDown() override
    {
        m_tree.DestroyWindow();
        HostFrameTest::TearDown();
    }
    HTREEITEM ChildNamed(HTREEITEM hParent, const char* text)
    {
        for (HTREEITEM h = m_tree.GetChildItem(hParent); h != NULL; h = m_tree.GetNextSiblingItem(h))
            if (m_tree.GetItemText(h) == text) return h;
        return NULL;
    }
    std::vector<std::string> Texts(HTREEITEM hParent)
    {
        std::vector<std::string> texts;
        for (HTREEITEM h = hParent ? m_tree.GetChildItem(hParent) : m_tree.GetRootItem(); h != NULL;
             h = m_tree.GetNextSiblingItem(h))
            texts.push_back(std::string(m_tree.GetItemText(h)));
        return texts;
    }

    std::string m_base;  // ...\Temp\qo-dirtree, without a backslash at the end
    CHidingTree m_tree;
};

}  // namespace

TEST_F(DirectoryTreeTest, OpensAlongTheStartPathOrFallsBack)
{
    // The first fixed drive as the tree lists it, and a drive letter the machine does not have.
    std::string fixed, missing;
    char drives[512] = "";
    ::GetLogicalDriveStringsA(sizeof(drives), drives);
    for (const char* p = drives; *p && fixed.empty(); p += strlen(p) + 1)
        if (::GetDriveTypeA(p) == DRIVE_FIXED) fixed = std::string(p, 2) + "\\";
    for (int i = 'Q' - 'A'; i < 26 && missing.empty(); ++i)
        if ((::GetLogicalDrives() & (1u << i)) == 0) missing = std::string(1, char('A' + i)) + ":";
    ASSERT_FALSE(missing.empty());
    struct Case {
        std::string start, selected;
    };
    const std::vector<Case> cases = {
        {m_base + "\\Alpha\\BETA", m_base + "\\Alpha\\Beta\\"},
        {m_base + "\\Alpha\\Fehlt", "\\"},
        {m_base + "\\Alpha\\Versteckt", "\\"},
        {missing + "\\Daten", fixed},
    };
    for (const Case& c : cases) {
        m_tree.InitDirectoryTreeCtrl(c.start.c_str());
        EXPECT_EQ(Lower(c.selected), Lower(std::string(m_tree.GetSelectedPath()))) << c.start;
    }
    // A drive the derived class hides is neither listed nor opened, and a
    // start path on it cannot be followed: nothing is selected, no other drive.
    bool listed = false;
    for (const std::string& text : Texts(NULL)) listed |= text.substr(0, 2) == "Z:";
    ASSERT_TRUE(listed);
    m_tree.m_hiddenDrive = "Z:";
    m_tree.InitDirectoryTreeCtrl("Z:\\tmp");
    for (const std::string& text : Texts(NULL)) EXPECT_NE("Z:", text.substr(0, 2));
    EXPECT_EQ(nullptr, m_tree.GetSelectedItem());
    EXPECT_EQ("\\", std::string(m_tree.GetSelectedPath()));
    m_tree.m_hiddenDrive.clear();

    m_tree.InitDirectoryTreeCtrl((m_base + "\\Alpha\\Gamma").c_str());
    HTREEITEM hGamma = m_tree.GetSelectedItem();
    ASSERT_NE(nullptr, hGamma);
    HTREEITEM hParent = m_tree.GetParentItem(hGamma);
    // Capitals only become title case, other names stay; hidden folders are not listed.
    EXPECT_EQ((std::vector<std::string>{"Beta", "Gamma", "mIXED"}), Texts(hParent));

    // A folder is read when it is first opened, and one without subfolders loses its button.
    HTREEITEM hBeta = ChildNamed(hParent, "Beta");
    ASSERT_NE(nullptr, hBeta);
    EXPECT_TRUE(m_tree.ItemHasChildren(hBeta));
    EXPECT_EQ(nullptr, m_tree.GetChildItem(hBeta));
    m_tree.Expand(hBeta, TVE_EXPAND);
    EXPECT_EQ((std::vector<std::string>{"Leer"}), Texts(hBeta));
    HTREEITEM hLeer = ChildNamed(hBeta, "Leer");
    m_tree.Expand(hLeer, TVE_EXPAND);
    EXPECT_FALSE(m_tree.ItemHasChildren(hLeer));
    m_tree.Expand(hBeta, TVE_COLLAPSE);
    m_tree.Expand(hBeta, TVE_EXPAND);
    EXPECT_EQ((std::vector<std::string>{"Leer"}), Texts(hBeta)) << "read once only";
}

TEST_F(DirectoryTreeTest, TheChooserShowsTheTextAndHandsBackTheFolderAfterOkOrCancel)
{
    for (int answer : {IDCANCEL, IDOK}) {
        CDirectoryChooser dlg("Wohin sollen die Dateien geschrieben werden?", NULL, (m_base + "\\Alpha\\BETA").c_str());
        INT_PTR result = 0;
        qotest::Answering({[&](qotest::Dialog& d) {
                              EXPECT_EQ("Verzeichnis w\xE4hlen", d.Title());
                              EXPECT_EQ("Wohin sollen die Dateien geschrieben werden?", d.Text(4001));
                              if (answer == IDCANCEL)
                                  qotest::CaptureWindow(d.Hwnd(),
                                                        qotest::CapturePath("directory-chooser-4006.png").c_str());
                              d.Press(answer);
                          }},
                          [&] { result = dlg.DoModal(); });
        EXPECT_EQ(answer, result);
        EXPECT_EQ(Lower(m_base + "\\Alpha\\Beta\\"), Lower(std::string(dlg.GetDirectory())));
    }
}
