// A folder of its own for each test, removed afterwards.
#pragma once

#include <filesystem>
#include <fstream>
#include <iterator>
#include <random>
#include <string>
#include <system_error>

class TempFolder {
public:
    TempFolder()
    {
        std::random_device random;
        m_path = std::filesystem::temp_directory_path() /
                 ("qotools_test_" + std::to_string(random()) + "_" + std::to_string(random()));
        std::filesystem::create_directories(m_path);
    }
    ~TempFolder()
    {
        std::error_code ignored;
        std::filesystem::remove_all(m_path, ignored);
    }
    TempFolder(TempFolder const &) = delete;
    TempFolder &operator=(TempFolder const &) = delete;

    std::string Path(char const *name) const { return (m_path / name).string(); }
    std::filesystem::path const &Folder() const { return m_path; }

private:
    std::filesystem::path m_path;
};

// Whole files as bytes, written and read without any library code in between.
inline std::string ReadBytes(std::string const &path)
{
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

inline void WriteBytes(std::string const &path, std::string const &data)
{
    std::ofstream(path, std::ios::binary) << data;
}
