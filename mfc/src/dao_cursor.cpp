// The engine's cursor: a statement read forward on a handle of its own, one
// row held at a time. Text is read as UTF-16 and turned into Windows-1252, the
// one form every driver here delivers correctly (MDBTools' narrow text is
// UTF-8, SQLite's stored text is UTF-8 too).
#include "dao_private.h"

#include <charconv>
#include <errno.h>
#include <limits.h>
#include <math.h>
#include <stdlib.h>
#include <string.h>

namespace qodao {

Cursor::Cursor(Engine& engine, const CString& strSQL) : m_engine(engine) {
  m_sql = qodb::ToDriver(engine.db.GetTextForm(), strSQL);
  if (m_sql.size() > (size_t)INT_MAX) Throw(3000, "Die SQL-Anweisung ist zu lang.");
  Execute();
  if (engine.kind == kindSqlite && IsSelect(strSQL)) ReadRealsExactly();
}

// The SQLite driver hands out a floating-point value only as SQLite's text of
// it, 15 significant digits, whatever C type is asked for: a workbook's
// 0.1 + 0.2 would come back as 0.3. So a statement with such columns runs
// wrapped: each of them yields "R<m> <e>", the value as m * 2^e with whole
// numbers (exact, and within 2^54), or "T" and the value's own text when it
// is not a finite, non-zero floating-point value. The columns keep the
// names and types of the statement itself. A statement the wrapping does not
// fit (more columns than SQLite takes, a trailing semicolon, a driver
// without SQLite's math functions) runs as it is.
void Cursor::ReadRealsExactly() {
  std::vector<bool> exact(m_columns.size(), false);
  bool bAny = false;
  for (size_t i = 0; i < m_columns.size(); ++i) {
    SWORD nType = m_columns[i].nSqlType;
    exact[i] = nType == SQL_DOUBLE || nType == SQL_FLOAT || nType == SQL_REAL;
    bAny = bAny || exact[i];
  }
  if (!bAny) return;
  std::string names, select;
  for (size_t i = 0; i < m_columns.size(); ++i) {
    char szName[32];
    wsprintfA(szName, "qo_c%u", (unsigned)(i + 1));
    std::string c = szName;
    names += (i > 0 ? "," : "") + c;
    select += i > 0 ? ", " : "";
    if (!exact[i]) {
      select += c;
      continue;
    }
    // k puts the value's highest bit at 2^53 or 2^54 (log2 may be one off
    // near a power of two); 2^k is applied in two halves so that neither
    // overflows for the smallest and largest doubles.
    std::string k = "(53 - cast(floor(log2(abs(" + c + "))) as integer))";
    select += "case when typeof(" + c + ") = 'real' and " + c + " <> 0 and " + c + " - " + c + " = 0 then 'R' || cast(" +
              c + " * pow(2, " + k + " / 2) * pow(2, " + k + " - " + k + " / 2) as integer) || ' ' || (-" + k +
              ") else 'T' || " + c + " end";
  }
  std::string original = m_sql;
  m_sql = "with qo_rows(" + names + ") as (\n" + original + "\n) select " + select + " from qo_rows";
  try {
    Execute();
    m_exactReal.swap(exact);
  } catch (CDaoException* e) {
    e->Delete();
    m_sql = original;
    Execute();
  }
}

Cursor::~Cursor() { CDatabase::FreeStatement(m_hstmt); }

void Cursor::Execute() {
  Guard([&] {
    CDatabase::FreeStatement(m_hstmt);
    m_hstmt = SQL_NULL_HSTMT;
    // A fresh handle for every run: MDBTools returns garbage on a reused one.
    m_hstmt = m_engine.db.AllocStatement();
    m_engine.db.Check(SQLExecDirect(m_hstmt, (SQLCHAR*)m_sql.data(), (SQLINTEGER)m_sql.size()), m_hstmt,
                      "SQLExecDirect");
    SQLSMALLINT nCols = 0;
    m_engine.db.Check(SQLNumResultCols(m_hstmt, &nCols), m_hstmt, "SQLNumResultCols");
    if (nCols < 0 || nCols > qodb::kMaxColumns) Throw(3000, "Der ODBC-Treiber meldet eine ungültige Spaltenzahl.");
    if (!m_columns.empty() && (size_t)nCols != m_columns.size())
      Throw(3000, "Der ODBC-Treiber meldet eine andere Spaltenzahl als zuvor.");
    if (m_columns.empty()) {
      for (SQLSMALLINT i = 1; i <= nCols; ++i) {
        SQLCHAR szName[512] = {0};
        SQLSMALLINT nName = 0, nType = 0, nScale = 0, nNullable = 0;
        SQLULEN nSize = 0;
        m_engine.db.Check(SQLDescribeCol(m_hstmt, (SQLUSMALLINT)i, szName, (SQLSMALLINT)sizeof(szName), &nName, &nType,
                                         &nSize, &nScale, &nNullable),
                          m_hstmt, "SQLDescribeCol");
        if (nName < 0 || nName >= (SQLSMALLINT)sizeof(szName)) nName = (SQLSMALLINT)strnlen((char*)szName, sizeof(szName) - 1);
        Column column;
        column.strName = qodb::FromDriver(m_engine.db.GetTextForm(), (const char*)szName, nName);
        column.nSqlType = nType;
        column.nPrecision = nSize;
        column.nScale = nScale;
        m_columns.push_back(column);
      }
    }
    m_row.assign(m_columns.size(), Value());
  });
  m_lRow = -1;
  m_bAtEnd = false;
  m_bRowRead = false;
}

void Cursor::Restart() { Execute(); }

bool Cursor::Next() {
  if (m_bAtEnd) return false;
  return Guard([&] {
    SQLRETURN rc = SQLFetch(m_hstmt);
    if (rc == SQL_NO_DATA) {
      m_bAtEnd = true;
      ++m_lRow;   // stands after the last row
      // A finished read holds no lock on the file: another connection of
      // this program (an output into the same file) can commit.
      SQLFreeStmt(m_hstmt, SQL_CLOSE);
      return false;
    }
    m_engine.db.Check(rc, m_hstmt, "SQLFetch");
    ++m_lRow;
    m_bRowRead = false;
    return true;
  });
}

const Value& Cursor::Get(size_t nColumn) {
  ASSERT(nColumn < m_columns.size() && m_lRow >= 0 && !m_bAtEnd);
  if (!m_bRowRead) {
    // Every column in order: drivers hand out values by SQLGetData only so.
    Guard([&] {
      for (size_t i = 0; i < m_columns.size(); ++i) ReadValue((SQLUSMALLINT)(i + 1), m_row[i]);
    });
    m_bRowRead = true;
  }
  return m_row[nColumn];
}

void Cursor::ReadValue(SQLUSMALLINT nColumn, Value& value) {
  SWORD nType = m_columns[nColumn - 1].nSqlType;
  const bool bBinary = nType == SQL_BINARY || nType == SQL_VARBINARY || nType == SQL_LONGVARBINARY;
  const SQLSMALLINT nCType = bBinary ? SQL_C_BINARY : SQL_C_WCHAR;
  const SQLLEN nTerm = bBinary ? 0 : (SQLLEN)sizeof(WCHAR);
  std::vector<char> buffer(4096);
  std::string bytes;
  value.bNull = false;
  for (;;) {
    SQLLEN nIndicator = 0;
    SQLRETURN rc = SQLGetData(m_hstmt, nColumn, nCType, buffer.data(), (SQLLEN)buffer.size(), &nIndicator);
    if (rc == SQL_NO_DATA) break;
    m_engine.db.Check(rc, m_hstmt, "SQLGetData");
    if (nIndicator == SQL_NULL_DATA) {
      value.bNull = true;
      value.bytes.clear();
      return;
    }
    SQLLEN nRoom = (SQLLEN)buffer.size() - nTerm;
    SQLLEN nPiece;
    bool bMore = false;
    if (nIndicator >= 0 && nIndicator <= nRoom) {
      nPiece = nIndicator;
    } else if (nIndicator == SQL_NO_TOTAL || (nIndicator > nRoom && rc == SQL_SUCCESS_WITH_INFO)) {
      nPiece = nRoom;
      bMore = rc == SQL_SUCCESS_WITH_INFO;
      if (!bMore && !bBinary)
        nPiece = (SQLLEN)(wcsnlen((const WCHAR*)buffer.data(), (size_t)nRoom / sizeof(WCHAR)) * sizeof(WCHAR));
    } else {
      Throw(3000, "Der ODBC-Treiber hat eine ungültige Länge eines Werts gemeldet.");
    }
    if ((SQLLEN)bytes.size() + nPiece > qodb::kMaxValueBytes) {
      CString strError;
      strError.Format("Ein Wert der Spalte %u ist länger als %ld MB und wird nicht gelesen.", (unsigned)nColumn,
                      (long)(qodb::kMaxValueBytes >> 20));
      Throw(3000, strError);
    }
    bytes.append(buffer.data(), (size_t)nPiece);
    if (!bMore) break;
    if (buffer.size() < (1u << 20)) buffer.resize(buffer.size() * 4);
  }
  if (bBinary) {
    value.bytes.swap(bytes);
  } else {
    CString strText = qodb::Narrow((const WCHAR*)bytes.data(), (int)(bytes.size() / sizeof(WCHAR)));
    value.bytes.assign((LPCSTR)strText, (size_t)strText.GetLength());
  }
  if (nColumn <= m_exactReal.size() && m_exactReal[nColumn - 1]) ExactReal(value);
}

// A value of a wrapped floating-point column back in the engine's form.
void Cursor::ExactReal(Value& value) {
  if (value.bytes.empty()) return;
  if (value.bytes[0] == 'T') {
    value.bytes.erase(0, 1);
    return;
  }
  const char* p = value.bytes.c_str() + 1;
  char* pEnd = NULL;
  errno = 0;
  long long llMantissa = strtoll(p, &pEnd, 10);
  const char* pExponent = pEnd;
  long lExponent = strtol(pExponent, &pEnd, 10);
  if (value.bytes[0] != 'R' || errno != 0 || pExponent == p || *pEnd != '\0' || llabs(llMantissa) > (1LL << 55) ||
      lExponent < -1200 || lExponent > 1100)
    Throw(3000, "Der ODBC-Treiber hat eine Zahl in unerwarteter Form geliefert.");
  CString strText = RoundTripText(ldexp((double)llMantissa, (int)lExponent));
  value.bytes.assign((LPCSTR)strText, (size_t)strText.GetLength());
}

// Shortest form, fixed or with an exponent, whichever is shorter: "0.1",
// "123456789.12345679", "1e+300". No printf: under Wine it costs more than
// reading the value.
CString RoundTripText(double d) {
  char sz[64];
  std::to_chars_result result = std::to_chars(sz, sz + sizeof(sz), d);
  return CString(sz, (int)(result.ptr - sz));
}

Value QueryValue(Engine& engine, const CString& strSQL) {
  Cursor cursor(engine, strSQL);
  if (cursor.Columns().empty() || !cursor.Next()) return Value();
  return cursor.Get(0);
}

long ExecuteWith(Engine& engine, const CString& strSQL, const std::vector<Value>& params,
                 const std::vector<bool>& binary) {
  ASSERT(params.size() == binary.size());
  return Guard([&] {
    const int nTextForm = engine.db.GetTextForm();
    std::string sql = qodb::ToDriver(nTextForm, strSQL);
    qodb::StatementHandle stmt(engine.db.AllocStatement());
    engine.db.Check(SQLPrepare(stmt.get(), (SQLCHAR*)sql.data(), (SQLINTEGER)sql.size()), stmt.get(), "SQLPrepare");
    // The values in the driver's form, kept alive until SQLExecute.
    std::vector<std::string> data(params.size());
    std::vector<SQLLEN> lengths(params.size());
    for (size_t i = 0; i < params.size(); ++i) {
      if (params[i].bNull) {
        lengths[i] = SQL_NULL_DATA;
      } else {
        data[i] = binary[i] ? params[i].bytes : qodb::ToDriver(nTextForm, params[i].bytes.c_str(), (int)params[i].bytes.size());
        lengths[i] = (SQLLEN)data[i].size();
      }
      SQLSMALLINT nC = binary[i] ? SQL_C_BINARY : SQL_C_CHAR;
      SQLSMALLINT nSql = binary[i] ? SQL_LONGVARBINARY : SQL_VARCHAR;
      SQLULEN nSize = data[i].size() > 0 ? data[i].size() : 1;
      engine.db.Check(SQLBindParameter(stmt.get(), (SQLUSMALLINT)(i + 1), SQL_PARAM_INPUT, nC, nSql, nSize, 0,
                                       (SQLPOINTER)data[i].data(), (SQLLEN)data[i].size(), &lengths[i]),
                      stmt.get(), "SQLBindParameter");
    }
    SQLRETURN rc = SQLExecute(stmt.get());
    if (rc == SQL_NO_DATA) return 0L;
    engine.db.Check(rc, stmt.get(), "SQLExecute");
    SQLLEN nRows = 0;
    if (!SQL_SUCCEEDED(SQLRowCount(stmt.get(), &nRows)) || nRows < 0) nRows = 0;
    return (long)(nRows > LONG_MAX ? LONG_MAX : nRows);
  });
}

} // namespace qodao
