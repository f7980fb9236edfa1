// Support of the DAO engine tests: a fresh database file per test, and the
// DAO error number (with its description) that a call raised.
#pragma once

#include "afxdao.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <random>
#include <string>
#include <vector>

// What a call raised: DAO's number ("0" when it raised nothing), and the description.
struct DaoFailure {
  long lCode = 0;
  CString strDescription;
};

template <typename F>
DaoFailure DaoError(F&& f) {
  DaoFailure failure;
  try {
    f();
  } catch (CDaoException* e) {
    failure.lCode = e->m_pErrorInfo != nullptr ? e->m_pErrorInfo->m_lErrorCode : -1;
    if (e->m_pErrorInfo != nullptr) failure.strDescription = e->m_pErrorInfo->m_strDescription;
    e->Delete();
  }
  return failure;
}

inline std::string TempFile(const char* pszExtension) {
  std::random_device random;
  return (std::filesystem::temp_directory_path() /
          ("qo_dao_" + std::to_string(random()) + "_" + std::to_string(random()) + pszExtension))
      .string();
}

// The text of a variant the engine handed out (single-byte text in a BSTR).
inline CString TextOf(const COleVariant& var) {
  EXPECT_EQ(VT_BSTR, var.vt);
  return var.vt == VT_BSTR ? CString((LPCSTR)var.bstrVal, (int)SysStringByteLen(var.bstrVal)) : CString();
}

// The names of the database's tables, in the engine's order.
inline std::vector<CString> TableNames(CDaoDatabase& db) {
  std::vector<CString> names;
  for (short i = 0; i < db.GetTableDefCount(); ++i) {
    CDaoTableDefInfo info;
    db.GetTableDefInfo(i, info);
    names.push_back(info.m_strName);
  }
  return names;
}

// A database file made by the test and removed after it.
class DaoFileTest : public testing::Test {
protected:
  void SetUp() override { m_file = TempFile(".db"); }
  void TearDown() override {
    m_db.Close();
    std::error_code ignored;
    std::filesystem::permissions(m_file, std::filesystem::perms::owner_all, ignored);
    std::filesystem::remove(m_file, ignored);
  }

  // A table T with the given fields ("Name", type, size) made through CDaoTableDef.
  void MakeTable(LPCTSTR lpszName, std::initializer_list<std::tuple<LPCTSTR, short, long>> fields) {
    CDaoTableDef td(&m_db);
    td.Create(lpszName);
    for (const auto& field : fields) td.CreateField(std::get<0>(field), std::get<1>(field), std::get<2>(field));
    td.Append();
  }

  // An index over the given fields, made on an open table.
  static void MakeIndex(CDaoTableDef& td, LPCTSTR lpszName, std::initializer_list<CDaoIndexFieldInfo> fields,
                        BOOL bUnique = FALSE, BOOL bPrimary = FALSE) {
    std::vector<CDaoIndexFieldInfo> keys(fields);
    CDaoIndexInfo index;
    index.m_strName = lpszName;
    index.m_pFieldInfos = keys.data();
    index.m_nFields = (short)keys.size();
    index.m_bUnique = bUnique;
    index.m_bPrimary = bPrimary;
    td.CreateIndex(index);
  }

  std::string m_file;
  CDaoDatabase m_db;
};
