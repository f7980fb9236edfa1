// The data sources the ODBC filter tests run against: a new SQLite file per
// test, and the loopback PostgreSQL server of the test run when
// QO_PG_CONNECT names it (the test is skipped otherwise, and says so).
#pragma once

#include <gtest/gtest.h>

#include <CQoODBCDatabase.h>

#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>

namespace odbctest {

enum Kind { sqlite, postgres };

inline const char* KindName(Kind kind) { return kind == sqlite ? "SQLite" : "PostgreSQL"; }

// A folder under the host's /tmp (Z:\tmp under Wine), removed afterwards.
class Folder {
public:
    Folder()
    {
        std::random_device random;
        std::string leaf = "qo_odbc_" + std::to_string(random()) + "_" + std::to_string(random());
        std::filesystem::path base = std::filesystem::is_directory("Z:\\tmp") ? std::filesystem::path("Z:\\tmp")
                                                                              : std::filesystem::temp_directory_path();
        m_path = base / leaf;
        std::filesystem::create_directories(m_path);
    }
    ~Folder()
    {
        std::error_code ignored;
        std::filesystem::remove_all(m_path, ignored);
    }
    std::string Path(const char* name) const { return (m_path / name).string(); }

private:
    std::filesystem::path m_path;
};

// The connect string of a data source of the kind, or "" when there is none.
inline std::string Connect(Kind kind, const Folder& folder)
{
    if (kind == sqlite)
        return "Driver=SQLite3;Database=" + folder.Path("test.db");
    const char* pg = std::getenv("QO_PG_CONNECT");
    return pg ? pg : "";
}

// Runs one statement on its own connection.
inline void Sql(const std::string& connect, const std::string& sql)
{
    CQoODBCDatabase db(connect.c_str());
    db.Open(false);
    db.ExecuteSql(sql.c_str());
}

} // namespace odbctest

#define SKIP_WITHOUT(connect) \
    if ((connect).empty()) GTEST_SKIP() << "no PostgreSQL server (QO_PG_CONNECT is not set)"
