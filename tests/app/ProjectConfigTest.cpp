// The project's configuration file: where it lives, what reading and writing
// report, and that a failed write leaves the stored file as it was.
#include <gtest/gtest.h>

#include <windows.h>

#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "CProjectConfig.h"

namespace {

// Shows the protected path.
class CPathProbe : public CProjectConfig {
public:
    using CProjectConfig::CProjectConfig;
    using CProjectConfig::GetConfigFilePath;
};

std::string ReadFile(const std::string& path)
{
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// A projects directory of its own for every test, with the project folder
// Kunden in it; removed afterwards.
class ProjectFolder : public ::testing::Test {
protected:
    void SetUp() override
    {
        char temp[MAX_PATH];
        GetTempPathA(MAX_PATH, temp);
        m_dir = std::string(temp) + "qo_projects_" + std::to_string(GetCurrentProcessId());
        CreateDirectoryA(m_dir.c_str(), nullptr);
        CreateDirectoryA((m_dir + "\\Kunden").c_str(), nullptr);
    }
    void TearDown() override
    {
        for (const std::string& name : Listing()) DeleteFileA((m_dir + "\\Kunden\\" + name).c_str());
        RemoveDirectoryA((m_dir + "\\Kunden").c_str());
        RemoveDirectoryA(m_dir.c_str());
    }
    // The files in the project folder.
    std::vector<std::string> Listing() const
    {
        std::vector<std::string> names;
        WIN32_FIND_DATAA found;
        HANDLE h = FindFirstFileA((m_dir + "\\Kunden\\*").c_str(), &found);
        for (BOOL more = h != INVALID_HANDLE_VALUE; more; more = FindNextFileA(h, &found))
            if (!(found.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY)) names.push_back(found.cFileName);
        if (h != INVALID_HANDLE_VALUE) FindClose(h);
        return names;
    }
    std::string m_dir;
};

}  // namespace

TEST(ProjectConfig, FilePathFromDirectoryNameAndFile)
{
    struct Case {
        const char* dir;
        const char* name;
        const char* file;
        const char* path;
    } const cases[] = {
        {"C:\\Projekte\\", "Kunden", "projekt.cfg", "C:\\Projekte\\Kunden\\projekt.cfg"},
        {"C:\\Projekte", "", "projekt.cfg", "C:\\Projekte\\projekt.cfg"},
        {"", "Kunden", "projekt.cfg", ""},  // no directory: no place to guess
    };
    for (const Case& c : cases) {
        CPathProbe project(c.dir, c.name, c.file);
        EXPECT_STREQ(c.path, (const char*)project.GetConfigFilePath()) << c.dir << "|" << c.name;
    }
}

TEST(ProjectConfig, MissingKeysAndCopiedSections)
{
    CProjectConfig original("C:\\Projekte", "Kunden", "projekt.cfg");
    original.SetValue("Ausgabe", "Format", "fest");

    // A missing key leaves a number as it was.
    CString text;
    int number = 7;
    original.GetValue("Eingabe", "fehlt", number);
    EXPECT_EQ(7, number);

    // A section copied from another project (not from nothing) takes its keys.
    CProjectConfig copy(original);
    copy.SetValue("Ausgabe", "Format", "csv");
    original.CopySection(nullptr, "Ausgabe");
    original.GetValue("Ausgabe", "Format", text);
    EXPECT_STREQ("fest", (const char*)text);
    original.CopySection(&copy, "Ausgabe");
    original.GetValue("Ausgabe", "Format", text);
    EXPECT_STREQ("csv", (const char*)text);
}

TEST_F(ProjectFolder, WrittenFileIsReadBackByAnotherProject)
{
    CProjectConfig project(m_dir.c_str(), "Kunden", "projekt.cfg");
    project.SetValue("Eingabe", "Datei", "K\xFCnden ; \xE4\xF6\xFC.txt");
    project.SetValue("Eingabe", "Zeilen", -3);
    ASSERT_TRUE(project.WriteConfigFile());

    CProjectConfig reader((m_dir + "\\").c_str(), "Kunden", "projekt.cfg");
    reader.SetValue("Alt", "weg", 1);
    ASSERT_TRUE(reader.ReadConfigFile());
    CString text;
    int number = 0;
    reader.GetValue("Eingabe", "Datei", text);
    reader.GetValue("Eingabe", "Zeilen", number);
    EXPECT_STREQ("K\xFCnden ; \xE4\xF6\xFC.txt", (const char*)text);
    EXPECT_EQ(-3, number);
    EXPECT_FALSE(reader.ConfigFile().HasSection("Alt"));
    // A project whose file does not exist yet reads as empty.
    EXPECT_TRUE(CProjectConfig(m_dir.c_str(), "Kunden", "neu.cfg").ReadConfigFile());
}

TEST_F(ProjectFolder, WritesThatCannotBeDoneAnswerFalseAndLeaveTheStoredFileWhole)
{
    // No project folder, no projects directory: nothing is created.
    CProjectConfig missing(m_dir.c_str(), "Lieferanten", "projekt.cfg");
    missing.SetValue("Eingabe", "Datei", "a.txt");
    EXPECT_FALSE(missing.WriteConfigFile());
    EXPECT_EQ(INVALID_FILE_ATTRIBUTES, GetFileAttributesA((m_dir + "\\Lieferanten").c_str()));

    CProjectConfig project(m_dir.c_str(), "Kunden", "projekt.cfg");
    project.SetValue("Eingabe", "Datei", "alt.txt");
    ASSERT_TRUE(project.WriteConfigFile());
    std::string path = m_dir + "\\Kunden\\projekt.cfg";
    std::string before = ReadFile(path);

    project.SetValue("Eingabe", "Datei", "neu.txt");
    // Another program holds the file open without sharing it.
    HANDLE hLock = CreateFileA(path.c_str(), GENERIC_READ, 0, nullptr, OPEN_EXISTING, 0, nullptr);
    ASSERT_NE(INVALID_HANDLE_VALUE, hLock);
    EXPECT_FALSE(project.WriteConfigFile());
    CloseHandle(hLock);
    EXPECT_EQ(before, ReadFile(path));
    EXPECT_EQ(std::vector<std::string>{"projekt.cfg"}, Listing());

    // A file marked read-only is not replaced (as Windows refuses it).
    SetFileAttributesA(path.c_str(), FILE_ATTRIBUTE_READONLY);
    EXPECT_FALSE(project.WriteConfigFile());
    EXPECT_EQ(before, ReadFile(path));
    EXPECT_EQ(std::vector<std::string>{"projekt.cfg"}, Listing());
    SetFileAttributesA(path.c_str(), FILE_ATTRIBUTE_NORMAL);

    // Once the file is free again, the write goes through.
    EXPECT_TRUE(project.WriteConfigFile());
    EXPECT_NE(std::string::npos, ReadFile(path).find("neu.txt"));
}
