// The process log: line format, and what happens to pending pieces when the
// file name changes or is cleared.
#include <windows.h>

#include <ctime>

#include <CQoLog.h>
#include <CScopeLogger.h>

#include "FrameTestUtil.h"

using namespace frametest;
using Log = LogFixture;

TEST_F(Log, EntryIsOneLineWithTimePrefixAndCrLf)
{
    _theLog << "Konvertierung " << 42L << " von " << -7L << CQoLog::endl;
    _theLog << "zweite" << CQoLog::endl;
    std::vector<std::string> entries = Entries();
    ASSERT_EQ(2u, entries.size());
    EXPECT_EQ("Konvertierung 42 von -7", entries[0]);
    EXPECT_EQ("zweite", entries[1]);
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

TEST_F(Log, EmptyEntryWritesPrefixOnly)
{
    _theLog << CQoLog::endl;
    std::vector<std::string> entries = Entries();
    ASSERT_EQ(1u, entries.size());
    EXPECT_EQ("", entries[0]);
}

TEST_F(Log, OtherManipulatorValuesDoNothing)
{
    _theLog << "a" << static_cast<CQoLog::specials>(1) << "b" << CQoLog::endl;
    EXPECT_EQ(std::vector<std::string>{"ab"}, Entries());
}

TEST_F(Log, WithoutFileNameEntriesAreDroppedAndTheNextStartsEmpty)
{
    _theLog.Close();
    _theLog << "verloren" << CQoLog::endl;
    _theLog.Open(m_log.c_str());
    _theLog << "danach" << CQoLog::endl;
    EXPECT_EQ(std::vector<std::string>{"danach"}, Entries());
}

TEST_F(Log, CloseDiscardsPendingPieces)
{
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

TEST_F(Log, FileIsClosedBetweenEntriesAndRecreatedWhenDeleted)
{
    _theLog << "eins" << CQoLog::endl;
    // Another program may delete the file between two entries.
    ASSERT_TRUE(DeleteFileA(m_log.c_str()));
    _theLog << "zwei" << CQoLog::endl;
    EXPECT_EQ(std::vector<std::string>{"zwei"}, Entries());
}

TEST_F(Log, AppendsToExistingFile)
{
    WriteFile(m_log, "alt\r\n");
    _theLog << "neu" << CQoLog::endl;
    std::vector<std::string> lines = Lines();
    ASSERT_EQ(2u, lines.size());
    EXPECT_EQ("alt", lines[0]);
    EXPECT_EQ("neu", AfterPrefix(lines[1]));
}

TEST_F(Log, UnwritableFileLosesTheEntryOnly)
{
    std::string folder = m_dir.File("ordner");
    CreateDirectoryA(folder.c_str(), NULL);
    _theLog.Open(folder.c_str());  // a folder cannot be opened as a file
    _theLog << "verloren" << CQoLog::endl;
    _theLog.Open(m_log.c_str());
    _theLog << "weiter" << CQoLog::endl;
    EXPECT_EQ(std::vector<std::string>{"weiter"}, Entries());
}

TEST_F(Log, ScopeLoggerRecordsNothing)
{
    {
        CScopeLogger scope(3, "Bereich", "Text");
        CScopeLogger copy(scope);
        copy = scope;
    }
    EXPECT_EQ(0, CScopeLogger::m_lLevel);
    EXPECT_FALSE(FileExists(m_log));
}
