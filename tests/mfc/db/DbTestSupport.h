// Support of the ODBC class tests: one fixture per driver (an SQLite file
// made by the test; the PostgreSQL server named by QO_PG_CONNECT), and a
// recordset that binds every column of its result as text, as the library's
// filters do.
#pragma once

#include "afxdb.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <random>
#include <sstream>
#include <string>
#include <vector>

enum class Driver { SQLite, PostgreSQL };

inline std::string DriverName(const testing::TestParamInfo<Driver>& info) {
  return info.param == Driver::SQLite ? "SQLite" : "PostgreSQL";
}

// Binds each result column, by the name the driver reports, to a CString.
class CTextSet : public CRecordset {
public:
  explicit CTextSet(CDatabase* pDatabase) : CRecordset(pDatabase) {}

  void DoFieldExchange(CFieldExchange* pFX) override {
    if (pFX->m_nOperation == CFieldExchange::BindFieldToColumn && m_nFields == 0) {
      m_nFields = (UINT)GetODBCFieldCount();
      m_values.resize(m_nFields);
      for (short i = 0; i < (short)m_nFields; ++i) {
        CODBCFieldInfo info;
        GetODBCFieldInfo(i, info);
        m_names.push_back(info.m_strName);
      }
    }
    pFX->SetFieldType(CFieldExchange::outputColumn);
    for (UINT i = 0; i < m_nFields; ++i) RFX_Text(pFX, m_names[i], m_values[i], 50);
  }

  std::vector<CString> m_values;
  std::vector<CString> m_names;
};

// What a CDBException said, or "" when the call did not raise one.
template <typename F>
CString DbError(F&& f, long* plFirstRowNotStored = nullptr, CString* pstrState = nullptr) {
  try {
    f();
  } catch (CDBException* e) {
    CString strError = e->m_strError;
    if (plFirstRowNotStored != nullptr) *plFirstRowNotStored = e->m_lFirstRowNotStored;
    if (pstrState != nullptr) *pstrState = e->m_strSqlState;
    e->Delete();
    return strError.IsEmpty() ? CString("(empty message)") : strError;
  }
  return CString();
}

inline std::string UniqueLeaf(const char* prefix) {
  std::random_device random;
  return std::string(prefix) + std::to_string(random()) + "_" + std::to_string(random());
}

// A database of the kind the parameter names, connected in SetUp.
class DbTest : public testing::TestWithParam<Driver> {
protected:
  void SetUp() override {
    if (GetParam() == Driver::PostgreSQL) {
      const char* pszConnect = std::getenv("QO_PG_CONNECT");
      if (pszConnect == nullptr || *pszConnect == '\0')
        GTEST_SKIP() << "QO_PG_CONNECT names no PostgreSQL server (tools/test.sh starts one)";
      m_strConnect = pszConnect;
    } else {
      m_file = (std::filesystem::temp_directory_path() / (UniqueLeaf("qo_db_") + ".db")).string();
      m_strConnect = ("Driver=SQLite3;Database=" + m_file).c_str();
    }
    m_db.OpenEx(m_strConnect, CDatabase::noOdbcDialog);
  }

  void TearDown() override {
    m_db.Close();
    if (!m_file.empty()) {
      std::error_code ignored;
      std::filesystem::remove(m_file, ignored);
    }
  }

  bool IsPostgres() const { return GetParam() == Driver::PostgreSQL; }

  // A fresh table of text columns ("create table NAME (COLUMNS)").
  void MakeTable(const CString& strName, const CString& strColumns) {
    m_db.ExecuteSQL("drop table if exists " + strName);
    m_db.ExecuteSQL("create table " + strName + " (" + strColumns + ")");
  }

  long Count(const CString& strTable) {
    CTextSet rs(&m_db);
    rs.Open(CRecordset::forwardOnly, "select count(*) as n from " + strTable, CRecordset::readOnly);
    return atol(rs.m_values[0]);
  }

  CString m_strConnect;
  std::string m_file;
  CDatabase m_db;
};

inline std::string ReadWholeFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  std::ostringstream all;
  all << in.rdbuf();
  return all.str();
}
