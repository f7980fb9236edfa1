// The process log: line format, and what happens to pending pieces when the
// file name changes or is cleared.
#include <windows.h>

#include <ctime>

#include <CQoLog.h>

#include "FrameTestUtil.h"

using namespace frametest;
using Log = LogFixture;

TEST_F(Log, EntryIsOneLineWithTimePrefixAndCrLf)
{
    _theLog << "Konvertierung " << 42L << " von " << -7L << CQoLog::endl;
    _theLog << CQoLog::endl;  // the prefix alone
    EXPECT_EQ((std::vector<std::string>{"Konvertierung 42 von -7", ""}), Entries());
}

TEST_F(Log, PrefixIsTheLocalTimeOfTheFinish)
{
    __time64_t before = _time64(nullptr);
    _theLog << "x" << CQoLog::endl;
    __time64_t after = _time64(nullptr);
    std::string line = Lines().at(0);

    // Either second may have been the one written.
    bool matched = false;
    for (__time64_t t = before; t <= after && !matched; ++t) {
        struct tm local;
        _localtime64_s(&local, &t);
        char expected[128];
        strftime(expected, sizeof expected, "%b %d %Y, %H:%M:%S > x", &local);
        matched = line == expected;
    }
    EXPECT_TRUE(matched) << line;
}

TEST_F(Log, EntriesWithoutAUsableFileAreLostAndCloseDiscardsPendingPieces)
{
    _theLog.Close();
    _theLog << "ohne Datei" << CQoLog::endl;
    std::string folder = m_dir.File("ordner");
    CreateDirectoryA(folder.c_str(), NULL);
    _theLog.Open(folder.c_str());  // a folder cannot be opened as a file
    _theLog << "in den Ordner" << CQoLog::endl;
    _theLog.Open(m_log.c_str());
    _theLog << "halb";
    _theLog.Close();
    _theLog << CQoLog::endl;  // no file name: nothing written
    EXPECT_FALSE(FileExists(m_log));
    _theLog.Open(m_log.c_str());
    _theLog << "neu" << CQoLog::endl;
    EXPECT_EQ(std::vector<std::string>{"neu"}, Entries());
}

TEST_F(Log, OpenWithNewNameSendsPendingEntryThere)
{
    std::string second = m_dir.File("second.log");
    _theLog << "erst ";
    _theLog.Open(second.c_str());
    _theLog << "dann" << CQoLog::endl;
    EXPECT_FALSE(FileExists(m_log));
    std::vector<std::string> lines = ReadLines(second);
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("erst dann", AfterPrefix(lines[0]));
}

TEST_F(Log, AppendsAndRecreatesTheFileWhenDeletedBetweenEntries)
{
    WriteFile(m_log, "alt\r\n");
    _theLog << "eins" << CQoLog::endl;
    std::vector<std::string> lines = Lines();
    ASSERT_EQ(2u, lines.size());
    EXPECT_EQ("alt", lines[0]);
    EXPECT_EQ("eins", AfterPrefix(lines[1]));
    // Another program may delete the file between two entries.
    ASSERT_TRUE(DeleteFileA(m_log.c_str()));
    _theLog << "zwei" << CQoLog::endl;
    EXPECT_EQ(std::vector<std::string>{"zwei"}, Entries());
}
