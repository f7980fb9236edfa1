// The file dialog over the system's open and save dialogs: the '|' filter,
// the initial name, the default extension, and what the caller reads back.
#include <gtest/gtest.h>

#include <afxdlgs.h>

#include <cstring>
#include <fstream>
#include <string>

#include "DialogDriver.h"

namespace {

// The explorer-style dialog's file name field: a combo box, or an edit in older layouts.
int NameField(HWND hDlg)
{
    return ::GetDlgItem(hDlg, 0x47c) != NULL ? 0x47c : 0x480;
}

std::string TempFolder()
{
    char dir[MAX_PATH] = "";
    ::GetTempPathA(MAX_PATH, dir);
    return dir;
}

}  // namespace

TEST(FileDialog, OpenHandsBackTheChosenFileInItsParts)
{
    const std::string path = TempFolder() + "Kunden Liste.2024.txt";
    std::ofstream(path).close();
    CFileDialog dlg(TRUE, NULL, "vorschlag.txt", OFN_FILEMUSTEXIST | OFN_HIDEREADONLY,
                    "Textdateien (*.txt)|*.txt|Alle Dateien (*.*)|*.*||");
    // The filter reaches the system as NUL-separated pairs ending in two NULs.
    const char* p = dlg.m_ofn.lpstrFilter;
    ASSERT_NE(nullptr, p);
    for (const char* part : {"Textdateien (*.txt)", "*.txt", "Alle Dateien (*.*)", "*.*"}) {
        EXPECT_STREQ(part, p);
        p += strlen(p) + 1;
    }
    EXPECT_EQ('\0', *p);

    std::string proposed;
    qotest::DialogDriver driver;
    driver.Expect([&](qotest::Dialog& d) {
        proposed = d.Text(NameField(d.Hwnd()));
        d.SetText(NameField(d.Hwnd()), path);
        d.Press(IDOK);
    });
    EXPECT_EQ(IDOK, dlg.DoModal());
    EXPECT_EQ("vorschlag.txt", proposed);
    EXPECT_STRCASEEQ(path.c_str(), dlg.GetPathName());
    EXPECT_EQ(CString("Kunden Liste.2024.txt"), dlg.GetFileName());
    EXPECT_EQ(CString("txt"), dlg.GetFileExt());
    EXPECT_EQ(CString("Kunden Liste.2024"), dlg.GetFileTitle());
    ::DeleteFileA(path.c_str());
}

TEST(FileDialog, SaveAddsTheDefaultExtensionAndCancelAnswersCancel)
{
    CFileDialog save(FALSE, "csv", NULL, OFN_HIDEREADONLY | OFN_OVERWRITEPROMPT, "CSV (*.csv)|*.csv");
    qotest::DialogDriver driver;
    driver.Expect([&](qotest::Dialog& d) {
        d.SetText(NameField(d.Hwnd()), TempFolder() + "bericht");
        d.Press(IDOK);
    });
    EXPECT_EQ(IDOK, save.DoModal());
    EXPECT_STRCASEEQ((TempFolder() + "bericht.csv").c_str(), save.GetPathName());

    CFileDialog cancelled(TRUE);
    driver.Expect([](qotest::Dialog& d) { d.Press(IDCANCEL); });
    EXPECT_EQ(IDCANCEL, cancelled.DoModal());
    EXPECT_EQ(CString(""), cancelled.GetPathName());
}
