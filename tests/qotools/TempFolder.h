// A folder of its own for each test, removed afterwards.
#pragma once

#include <cstdio>
#include <filesystem>
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
    std::string data;
    if (std::FILE *fp = std::fopen(path.c_str(), "rb")) {
        char chunk[4096];
        std::size_t n;
        while ((n = std::fread(chunk, 1, sizeof chunk, fp)) > 0)
            data.append(chunk, n);
        std::fclose(fp);
    }
    return data;
}

inline void WriteBytes(std::string const &path, std::string const &data)
{
    std::FILE *fp = std::fopen(path.c_str(), "wb");
    if (fp) {
        std::fwrite(data.data(), 1, data.size(), fp);
        std::fclose(fp);
    }
}
