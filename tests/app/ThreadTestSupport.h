// Paths and files shared by the tests that start helper programs and modules.
#pragma once

#include <windows.h>

#include <fstream>
#include <string>
#include <vector>

namespace apptest {

// The folder of the test program, where the helpers are built.
inline std::string BinDir()
{
    char szPath[MAX_PATH];
    DWORD n = ::GetModuleFileNameA(NULL, szPath, MAX_PATH);
    std::string strPath(szPath, n);
    return strPath.substr(0, strPath.rfind('\\'));
}

// A path in the temporary folder; an old file of that name is deleted.
inline std::string TempFile(const char* pszName)
{
    char szDir[MAX_PATH];
    ::GetTempPathA(MAX_PATH, szDir);
    std::string strPath = std::string(szDir) + pszName;
    ::DeleteFileA(strPath.c_str());
    return strPath;
}

inline std::vector<std::string> ReadLines(const std::string& strPath)
{
    std::vector<std::string> lines;
    std::ifstream in(strPath);
    for (std::string line; std::getline(in, line);)
        lines.push_back(line);
    return lines;
}

} // namespace apptest
