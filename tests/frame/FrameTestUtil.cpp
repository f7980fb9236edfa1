#include "FrameTestUtil.h"

#include <windows.h>
#include <shellapi.h>

#include <cstdio>
#include <fstream>
#include <iterator>

#include <CQoLog.h>

namespace frametest {

ScratchDir::ScratchDir()
{
    char temp[MAX_PATH];
    GetTempPathA(MAX_PATH, temp);
    static int counter = 0;
    char name[MAX_PATH];
    snprintf(name, sizeof name, "%sqoframe_%lu_%d", temp, GetCurrentProcessId(), ++counter);
    m_path = name;
    CreateDirectoryA(m_path.c_str(), NULL);
}

ScratchDir::~ScratchDir()
{
    std::string from = m_path + std::string(2, '\0');
    SHFILEOPSTRUCTA op = {};
    op.wFunc = FO_DELETE;
    op.pFrom = from.c_str();
    op.fFlags = FOF_NOCONFIRMATION | FOF_NOERRORUI | FOF_SILENT;
    SHFileOperationA(&op);
}

std::string ReadFile(const std::string& path)
{
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

void WriteFile(const std::string& path, const std::string& bytes)
{
    std::ofstream out(path, std::ios::binary);
    ASSERT_TRUE(out.write(bytes.data(), bytes.size())) << path;
}

bool FileExists(const std::string& path)
{
    return GetFileAttributesA(path.c_str()) != INVALID_FILE_ATTRIBUTES;
}

std::vector<std::string> ReadLines(const std::string& path)
{
    std::vector<std::string> lines;
    std::string bytes = ReadFile(path);
    size_t start = 0;
    while (start < bytes.size()) {
        size_t end = bytes.find("\r\n", start);
        if (end == std::string::npos) {
            ADD_FAILURE() << "line without CR LF at the end of " << path;
            lines.push_back(bytes.substr(start));
            break;
        }
        lines.push_back(bytes.substr(start, end - start));
        start = end + 2;
    }
    return lines;
}

std::string AfterPrefix(const std::string& line)
{
    // "Mmm dd yyyy, hh:mm:ss > "; the time itself is checked by the log's own test.
    const size_t n = 24;
    if (line.size() < n || line.compare(n - 3, 3, " > ") != 0 || line[11] != ',') {
        ADD_FAILURE() << "no time prefix: '" << line << "'";
        return line;
    }
    return line.substr(n);
}

void LogFixture::SetUp()
{
    m_log = m_dir.File("test.log");
    _theLog.Close();
    _theLog.Open(m_log.c_str());
}

void LogFixture::TearDown()
{
    _theLog.Close();
}

std::vector<std::string> LogFixture::Entries() const
{
    std::vector<std::string> entries;
    for (const std::string& line : Lines())
        entries.push_back(AfterPrefix(line));
    return entries;
}

}  // namespace frametest
