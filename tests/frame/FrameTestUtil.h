// Shared pieces of the frame tests: a scratch folder per test, reading the
// log back line by line, and a log pointed at a fresh file for each test.
#pragma once

#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace frametest {

// A new empty folder below the system's temp folder, removed at the end.
class ScratchDir
{
public:
    ScratchDir();
    ~ScratchDir();
    const std::string& Path() const { return m_path; }
    std::string File(const char* name) const { return m_path + "\\" + name; }

private:
    std::string m_path;
};

std::string ReadFile(const std::string& path);
void WriteFile(const std::string& path, const std::string& bytes);
bool FileExists(const std::string& path);

// The lines of a file written in text mode: split at CR LF, and every line
// must end with CR LF.
std::vector<std::string> ReadLines(const std::string& path);

// The part of a log line after its time prefix ("Dec 06 2026, 07:21:03 > ");
// fails the test when the line has none.
std::string AfterPrefix(const std::string& line);

// A fixture whose _theLog writes to a fresh file in a scratch folder.
class LogFixture : public ::testing::Test
{
protected:
    void SetUp() override;
    void TearDown() override;
    std::vector<std::string> Lines() const { return ReadLines(m_log); }
    // The log's entries without their time prefix.
    std::vector<std::string> Entries() const;

    ScratchDir m_dir;
    std::string m_log;
};

}  // namespace frametest
