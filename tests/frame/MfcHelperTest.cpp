// The shell helpers on real files and folders, with the shell's own windows.
#include <afxwin.h>

#include <CQoMfcHelper.h>
#include <DialogDriver.h>

#include "FrameTestUtil.h"

using namespace frametest;

namespace {

using MfcHelper = LogFixture;

FILETIME WriteTime(const std::string& path)
{
    WIN32_FILE_ATTRIBUTE_DATA data = {};
    GetFileAttributesExA(path.c_str(), GetFileExInfoStandard, &data);
    return data.ftLastWriteTime;
}

std::string SystemText(DWORD code)
{
    char* text = nullptr;
    FormatMessageA(FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS,
                   NULL, code, MAKELANGID(LANG_NEUTRAL, SUBLANG_DEFAULT), (LPSTR)&text, 0, NULL);
    std::string result = text ? text : "";
    if (text)
        LocalFree(text);
    return result;
}

// Shows the error text and returns what the message box showed.
std::string ShownError(long code, const char* prefix)
{
    std::string shown;
    qotest::DialogDriver driver;
    driver.Expect([&](qotest::Dialog& d) {
        shown = d.MessageText();
        EXPECT_EQ(qotest::IconKind::Error, d.Icon());
        d.Press(IDOK);
    });
    CQoMfcHelper::ShowGetLastError(code, prefix);
    EXPECT_TRUE(driver.Done());
    return shown;
}

}  // namespace

TEST_F(MfcHelper, CopyReplacesTheTarget)
{
    std::string source = m_dir.File("quelle.txt"), target = m_dir.File("ziel.txt");
    WriteFile(source, "neuer Inhalt\r\n");
    WriteFile(target, "alter Inhalt, l\xE4nger als der neue\r\n");
    EXPECT_TRUE(CQoMfcHelper::CopyFileA(source.c_str(), target.c_str(), false));
    EXPECT_EQ("neuer Inhalt\r\n", ReadFile(target));
}

TEST_F(MfcHelper, CopyThatNeedNotOrCannotRunTouchesNothing)
{
    std::string source = m_dir.File("quelle.txt"), target = m_dir.File("ziel.txt");
    WriteFile(source, "x");
    FILETIME before = WriteTime(source);
    Sleep(20);
    // Nothing to do: success.
    EXPECT_TRUE(CQoMfcHelper::CopyFileA(source.c_str(), source.c_str(), false));
    FILETIME after = WriteTime(source);
    EXPECT_EQ(0, CompareFileTime(&before, &after));
    EXPECT_TRUE(CQoMfcHelper::CopyFileA("", source.c_str(), false));

    // A missing source fails quietly; paths longer than the shell's buffer are refused.
    qotest::DialogDriver driver;
    EXPECT_FALSE(CQoMfcHelper::CopyFileA(m_dir.File("fehlt.txt").c_str(), target.c_str(), false));
    std::string longPath = m_dir.Path() + "\\" + std::string(600, 'a') + ".txt";
    EXPECT_FALSE(CQoMfcHelper::CopyFileA(source.c_str(), longPath.c_str(), false));
    EXPECT_FALSE(CQoMfcHelper::CopyFileA(longPath.c_str(), source.c_str(), false));
    EXPECT_FALSE(CQoMfcHelper::RemoveFile(longPath.c_str(), true));
    qotest::PumpFor(100);
    EXPECT_EQ(0, driver.Seen());
    EXPECT_FALSE(FileExists(target));
    EXPECT_EQ("x", ReadFile(source));
}

TEST_F(MfcHelper, RemovingAFileOrAFolderWithItsContentsIsLogged)
{
    std::string file = m_dir.File("weg.txt"), folder = m_dir.File("projekt");
    WriteFile(file, "x");
    CreateDirectoryA(folder.c_str(), NULL);
    CreateDirectoryA((folder + "\\unter").c_str(), NULL);
    WriteFile(folder + "\\unter\\daten.txt", "1;2;3\r\n");
    EXPECT_TRUE(CQoMfcHelper::RemoveFile(file.c_str(), true));
    EXPECT_TRUE(CQoMfcHelper::RemoveDirectoryA(folder.c_str(), true));
    EXPECT_FALSE(FileExists(file));
    EXPECT_FALSE(FileExists(folder));
    EXPECT_EQ((std::vector<std::string>{"L\xF6sche Verzeichnis/Datei " + file, "L\xF6sche Verzeichnis/Datei " + folder}),
              Entries());
}

TEST_F(MfcHelper, ShowGetLastErrorPutsThePrefixAboveTheSystemText)
{
    EXPECT_FALSE(SystemText(ERROR_FILE_NOT_FOUND).empty());
    EXPECT_EQ("Kopieren fehlgeschlagen\n" + SystemText(ERROR_FILE_NOT_FOUND),
              ShownError(ERROR_FILE_NOT_FOUND, "Kopieren fehlgeschlagen"));
    // A code without system text shows the prefix and the line feed alone.
    EXPECT_EQ("Vorsilbe\n", ShownError(0x2FFFFFF0, "Vorsilbe"));
}
