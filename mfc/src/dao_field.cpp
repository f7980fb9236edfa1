// Fields of the engine: DAO's types as SQLite declares them, the catalogue of
// attributes SQLite cannot declare, and the conversions of values between
// their stored form, text and variants.
#include "dao_private.h"

#include <errno.h>
#include <limits.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

namespace qodao {

namespace {

CString UpperTrim(const CString& str) {
  CString strUpper = str;
  strUpper.Trim();
  strUpper.MakeUpper();
  return strUpper;
}

// The n of "NAME(n)" (0 when there is none or it is out of bounds).
long SizeIn(const CString& strType, long lMax) {
  int nOpen = strType.Find('(');
  if (nOpen < 0) return 0;
  long lSize = atol((LPCSTR)strType + nOpen + 1);
  return lSize > 0 && lSize <= lMax ? lSize : 0;
}

bool StartsWith(const CString& str, LPCSTR lpszPrefix) { return str.Left(lstrlenA(lpszPrefix)) == lpszPrefix; }

[[noreturn]] void ThrowConversion() { Throw(3421, "Data type conversion error."); }

CString TrimmedText(LPCTSTR lpszText) {
  CString str = lpszText != NULL ? lpszText : "";
  str.Trim(" \t");
  return str;
}

// A decimal number as C reads it: "-12.5", "3e4"; a lone ',' is taken as the
// decimal separator, as German users write it.
bool NormalizeNumber(CString& str) {
  if (str.Find('.') < 0 && str.Find(',') >= 0 && str.Find(',') == str.ReverseFind(',')) str.Replace(',', '.');
  if (str.IsEmpty()) return false;
  for (int i = 0; i < str.GetLength(); ++i)
    if (strchr("0123456789+-.eE", str[i]) == NULL) return false;
  return true;
}

CString FormatDate(DATE dt) {
  SYSTEMTIME st;
  if (!VariantTimeToSystemTime(dt, &st)) ThrowConversion();
  CString str;
  str.Format("%04u-%02u-%02u %02u:%02u:%02u", st.wYear, st.wMonth, st.wDay, st.wHour, st.wMinute, st.wSecond);
  return str;
}

bool ParseDate(const CString& str, DATE& dt) {
  int y = 0, mo = 0, d = 0, h = 0, mi = 0, s = 0;
  char chSep = 0;
  int nRead = sscanf(str, "%4d-%2d-%2d%c%2d:%2d:%2d", &y, &mo, &d, &chSep, &h, &mi, &s);
  if (nRead == 3 || (nRead >= 6 && (chSep == ' ' || chSep == 'T'))) {
    COleDateTime date(y, mo, d, h, mi, s);
    if (date.GetStatus() != COleDateTime::valid) return false;
    dt = date.m_dt;
    return true;
  }
  y = mo = d = h = mi = s = 0;
  nRead = sscanf(str, "%2d.%2d.%4d %2d:%2d:%2d", &d, &mo, &y, &h, &mi, &s);
  if (nRead == 3 || nRead >= 5) {
    COleDateTime date(y, mo, d, h, mi, s);
    if (date.GetStatus() != COleDateTime::valid) return false;
    dt = date.m_dt;
    return true;
  }
  return false;
}

CString FormatCurrency(const CY& cy) {
  LONGLONG v = cy.int64;
  bool bNegative = v < 0;
  unsigned long long u = bNegative ? (unsigned long long)(-(v + 1)) + 1 : (unsigned long long)v;
  CString str;
  str.Format("%s%llu.%04llu", bNegative ? "-" : "", u / 10000, u % 10000);
  return str;
}

CString TextOfBstr(BSTR bstr) {
  // A text variant of this subset holds single-byte text; a wide BSTR (made
  // with VT_BSTR from text) is told apart by its zero bytes, which
  // Windows-1252 text never contains.
  UINT nBytes = SysStringByteLen(bstr);
  const char* p = (const char*)bstr;
  bool bWide = (nBytes % 2) == 0 && memchr(p, 0, nBytes) != NULL;
  if (!bWide) return CString(p, (int)nBytes);
  return qodb::Narrow(bstr, (int)SysStringLen(bstr));
}

} // namespace

CString Quote(const Engine& engine, const CString& strName) {
  if (engine.kind == kindMdb) {
    // The driver knows no escape for ']' inside a bracketed name.
    if (strName.Find(']') >= 0) Throw(3125, "'" + strName + "' ist kein gültiger Name für diese Access-Datei.");
    return "[" + strName + "]";
  }
  CString str = strName;
  str.Replace("\"", "\"\"");
  return "\"" + str + "\"";
}

CString QuoteLiteral(const CString& strText) {
  CString str = strText;
  str.Replace("'", "''");
  return "'" + str + "'";
}

long DefaultSize(short nType) {
  switch (nType) {
  case dbBoolean:
  case dbByte: return 1;
  case dbInteger: return 2;
  case dbLong:
  case dbSingle: return 4;
  case dbCurrency:
  case dbDouble:
  case dbDate: return 8;
  case dbText: return 50;
  case dbBinary: return kMaxBinarySize;
  case dbGUID: return 16;
  default: return 0;
  }
}

CString DeclaredType(short nType, long lSize) {
  CString str;
  switch (nType) {
  case dbBoolean: return "BIT";
  case dbByte: return "TINYINT";
  case dbInteger: return "SMALLINT";
  case dbLong: return "INTEGER";
  case dbCurrency: return "DECIMAL(19,4)";
  case dbSingle: return "REAL";
  case dbDouble: return "DOUBLE";
  case dbDate: return "DATETIME";
  case dbMemo: return "TEXT";
  case dbLongBinary: return "BLOB";
  case dbText:
    if (lSize <= 0) lSize = DefaultSize(dbText);
    if (lSize > kMaxTextSize) Throw(3047, "Die Größe eines Textfelds muss zwischen 1 und 255 liegen.");
    str.Format("VARCHAR(%ld)", lSize);
    return str;
  case dbBinary:
    if (lSize <= 0) lSize = DefaultSize(dbBinary);
    if (lSize > kMaxBinarySize) Throw(3047, "Die Größe eines Binärfelds muss zwischen 1 und 510 liegen.");
    str.Format("VARBINARY(%ld)", lSize);
    return str;
  default:
    str.Format("Invalid field data type (%d).", (int)nType);
    Throw(3259, str);
  }
}

void FromDeclaredType(const CString& strDeclared, FieldDef& field) {
  CString str = UpperTrim(strDeclared);
  field.lSize = 0;
  if (StartsWith(str, "VARCHAR") || StartsWith(str, "CHAR") || StartsWith(str, "NVARCHAR") ||
      StartsWith(str, "NCHAR")) {
    long lSize = SizeIn(str, kMaxTextSize);
    field.nType = lSize > 0 ? dbText : dbMemo;
    field.lSize = lSize;
  } else if (StartsWith(str, "VARBINARY") || StartsWith(str, "BINARY")) {
    long lSize = SizeIn(str, kMaxBinarySize);
    field.nType = lSize > 0 ? dbBinary : dbLongBinary;
    field.lSize = lSize;
  } else if (str == "BIT" || StartsWith(str, "BOOL")) {
    field.nType = dbBoolean;
  } else if (str == "TINYINT") {
    field.nType = dbByte;
  } else if (str == "SMALLINT") {
    field.nType = dbInteger;
  } else if (str.Find("INT") >= 0) {
    field.nType = dbLong;
  } else if (str == "DECIMAL(19,4)" || str == "CURRENCY" || str == "MONEY") {
    field.nType = dbCurrency;
  } else if (str == "REAL" || str == "SINGLE" || str == "FLOAT4") {
    field.nType = dbSingle;
  } else if (StartsWith(str, "DOUB") || StartsWith(str, "FLOA") || StartsWith(str, "NUMERIC") ||
             StartsWith(str, "DECIMAL")) {
    field.nType = dbDouble;
  } else if (StartsWith(str, "DATE") || StartsWith(str, "TIME")) {
    field.nType = dbDate;
  } else if (str == "BLOB") {
    field.nType = dbLongBinary;
  } else {
    // TEXT, CLOB, or no declared type at all: a column that holds anything
    // is read as text.
    field.nType = dbMemo;
  }
  if (field.lSize == 0) field.lSize = DefaultSize(field.nType);
  field.lAttributes = (field.nType == dbText || field.nType == dbMemo || field.nType == dbBinary ||
                       field.nType == dbLongBinary
                           ? dbVariableField
                           : dbFixedField) |
                      dbUpdatableField;
}

void FromSqlType(SWORD nSqlType, SQLULEN nPrecision, SWORD nScale, FieldDef& field) {
  switch (nSqlType) {
  case SQL_BIT: field.nType = dbBoolean; break;
  case SQL_TINYINT: field.nType = dbByte; break;
  case SQL_SMALLINT: field.nType = dbInteger; break;
  case SQL_INTEGER:
  case SQL_BIGINT: field.nType = dbLong; break;
  case SQL_REAL: field.nType = dbSingle; break;
  case SQL_FLOAT:
  case SQL_DOUBLE: field.nType = dbDouble; break;
  case SQL_DECIMAL:
  case SQL_NUMERIC: field.nType = nScale == 4 ? dbCurrency : dbDouble; break;
  case SQL_TYPE_DATE:
  case SQL_TYPE_TIME:
  case SQL_TYPE_TIMESTAMP:
  case SQL_DATE:
  case SQL_TIME:
  case SQL_TIMESTAMP: field.nType = dbDate; break;
  case SQL_BINARY:
  case SQL_VARBINARY:
    field.nType = nPrecision > 0 && nPrecision <= (SQLULEN)kMaxBinarySize ? dbBinary : dbLongBinary;
    break;
  case SQL_LONGVARBINARY: field.nType = dbLongBinary; break;
  case SQL_CHAR:
  case SQL_VARCHAR:
  case SQL_WCHAR:
  case SQL_WVARCHAR:
    field.nType = nPrecision > 0 && nPrecision <= (SQLULEN)kMaxTextSize ? dbText : dbMemo;
    break;
  default: field.nType = dbMemo; break;
  }
  field.lSize = (field.nType == dbText || field.nType == dbBinary) ? (long)nPrecision : DefaultSize(field.nType);
  field.lAttributes = (field.nType == dbText || field.nType == dbMemo || field.nType == dbBinary ||
                       field.nType == dbLongBinary
                           ? dbVariableField
                           : dbFixedField);
}

void FillFieldInfo(const FieldDef& field, int nOrdinal, CDaoFieldInfo& info, DWORD dwInfoOptions) {
  info.m_strName = field.strName;
  info.m_nType = field.nType;
  info.m_lSize = field.lSize;
  info.m_lAttributes = field.lAttributes;
  if (dwInfoOptions & AFX_DAO_SECONDARY_INFO) {
    info.m_nOrdinalPosition = (short)nOrdinal;
    info.m_bRequired = field.bRequired;
    info.m_bAllowZeroLength = field.bAllowZeroLength;
    info.m_lCollatingOrder = 0;
    info.m_strForeignName.Empty();
    info.m_strSourceField = field.strName;
    info.m_strSourceTable.Empty();
  }
  if ((dwInfoOptions & AFX_DAO_ALL_INFO) == AFX_DAO_ALL_INFO) {
    info.m_strValidationRule.Empty();
    info.m_strValidationText.Empty();
    info.m_strDefaultValue = field.strDefault;
  }
}

int FindField(const std::vector<FieldDef>& fields, LPCTSTR lpszName) {
  CString strName = qodb::BareName(lpszName);
  for (size_t i = 0; i < fields.size(); ++i)
    if (fields[i].strName.CompareNoCase(strName) == 0) return (int)i;
  return -1;
}

int FieldIndex(const std::vector<FieldDef>& fields, LPCTSTR lpszName) {
  int n = FindField(fields, lpszName);
  if (n < 0) {
    CString strError;
    strError.Format("Item not found in this collection ('%s').", lpszName);
    Throw(3265, strError);
  }
  return n;
}

void FieldInfoAt(const std::vector<FieldDef>& fields, int nIndex, CDaoFieldInfo& info, DWORD dwInfoOptions) {
  if (nIndex < 0 || (size_t)nIndex >= fields.size()) Throw(3265, "Item not found in this collection.");
  FillFieldInfo(fields[(size_t)nIndex], nIndex, info, dwInfoOptions);
}

std::vector<CString> ObjectNames(Engine& engine, BOOL bViews) {
  std::vector<CString> names;
  if (engine.kind == kindMdb) {
    // Access's own catalogue tells tables (type 1) from queries (type 5);
    // the driver lists both as tables. System objects are flagged or named
    // MSys..., hidden queries (record sources of forms) start with '~'.
    Cursor cursor(engine, "select Name, Type, Flags from MSysObjects");
    while (cursor.Next() && names.size() < (size_t)kMaxObjects) {
      CString strName(cursor.Get(0).bytes.c_str());
      long lType = atol(cursor.Get(1).bytes.c_str());
      long lFlags = atol(cursor.Get(2).bytes.c_str());
      if (strName.IsEmpty() || strName.Left(4).CompareNoCase("MSys") == 0 || strName[0] == '~') continue;
      if (bViews ? lType != 5 : (lType != 1 || (lFlags & 0x80000002L) != 0)) continue;
      names.push_back(strName);
    }
    return names;
  }
  Cursor cursor(engine, bViews ? "select name from sqlite_master where type = 'view' order by rowid"
                               : "select name from sqlite_master where type = 'table' and name not like 'sqlite\\_%' "
                                 "escape '\\' and name not like 'qo\\_dao\\_%' escape '\\' order by rowid");
  while (cursor.Next() && names.size() < (size_t)kMaxObjects)
    names.push_back(CString(cursor.Get(0).bytes.data(), (int)cursor.Get(0).bytes.size()));
  return names;
}

BOOL FindTable(Engine& engine, const CString& strName, BOOL bView, CString* pstrStored) {
  CString strBare = qodb::BareName(strName);
  ThrowIfFailedSheet(engine, strBare);
  for (const CString& strStored : ObjectNames(engine, bView)) {
    if (strStored.CompareNoCase(strBare) == 0) {
      if (pstrStored != NULL) *pstrStored = strStored;
      return TRUE;
    }
  }
  return FALSE;
}

std::vector<FieldDef> TableFields(Engine& engine, const CString& strTable) {
  CString strStored;
  if (!FindTable(engine, strTable, FALSE, &strStored) && !FindTable(engine, strTable, TRUE, &strStored)) {
    CString strError;
    strError.Format("The Microsoft Jet database engine cannot find the input table or query '%s'. Make sure it "
                    "exists and that its name is spelled correctly.",
                    (LPCSTR)qodb::BareName(strTable));
    Throw(3011, strError);
  }
  std::vector<FieldDef> fields;
  if (engine.kind == kindMdb) {
    // The driver's catalogue leaves sizes out: the result's description has them.
    Cursor cursor(engine, "select * from " + Quote(engine, strStored));
    for (const Cursor::Column& column : cursor.Columns()) {
      if (fields.size() >= (size_t)kMaxFields) break;
      FieldDef field;
      field.strName = column.strName;
      SQLULEN nPrecision = column.nPrecision;
      // Jet 4 keeps text as UTF-16 and the driver counts its bytes.
      if ((column.nSqlType == SQL_VARCHAR || column.nSqlType == SQL_CHAR) && engine.nJetVersion >= 1) nPrecision /= 2;
      FromSqlType(column.nSqlType, nPrecision, column.nScale, field);
      field.lAttributes &= ~dbUpdatableField;
      fields.push_back(field);
    }
    return fields;
  }
  Cursor info(engine, "PRAGMA table_info(" + Quote(engine, strStored) + ")");
  while (info.Next() && fields.size() < (size_t)kMaxFields) {
    FieldDef field;
    field.strName = CString(info.Get(1).bytes.data(), (int)info.Get(1).bytes.size());
    FromDeclaredType(CString(info.Get(2).bytes.data(), (int)info.Get(2).bytes.size()), field);
    field.bRequired = !info.Get(3).bNull && info.Get(3).bytes == "1";
    if (!info.Get(4).bNull) field.strDefault = CString(info.Get(4).bytes.data(), (int)info.Get(4).bytes.size());
    fields.push_back(field);
  }
  Cursor catalogue(engine, "select fld, attributes, required, allowzero from qo_dao_fields where tbl = " +
                               QuoteLiteral(strStored));
  while (catalogue.Next()) {
    int n = FindField(fields, CString(catalogue.Get(0).bytes.data(), (int)catalogue.Get(0).bytes.size()));
    if (n < 0) continue;
    fields[(size_t)n].lAttributes = atol(catalogue.Get(1).bytes.c_str());
    fields[(size_t)n].bRequired = atol(catalogue.Get(2).bytes.c_str()) != 0;
    fields[(size_t)n].bAllowZeroLength = atol(catalogue.Get(3).bytes.c_str()) != 0;
  }
  return fields;
}

// ---------------------------------------------------------------------------
// Values
// ---------------------------------------------------------------------------

void ToVariant(const FieldDef& field, const Value& value, COleVariant& var) {
  var.Clear();
  if (value.bNull) {
    var.vt = VT_NULL;
    return;
  }
  const char* p = value.bytes.c_str();
  char* pEnd = NULL;
  errno = 0;
  switch (field.nType) {
  case dbBoolean: {
    long l = strtol(p, &pEnd, 10);
    if (*p == '\0' || *pEnd != '\0') break;
    var.vt = VT_BOOL;
    var.boolVal = l != 0 ? VARIANT_TRUE : VARIANT_FALSE;
    return;
  }
  case dbByte:
  case dbInteger:
  case dbLong: {
    long long ll = strtoll(p, &pEnd, 10);
    if (*p == '\0' || *pEnd != '\0' || errno != 0) break;
    if (field.nType == dbByte && ll >= 0 && ll <= 255) {
      var.vt = VT_UI1;
      var.bVal = (BYTE)ll;
      return;
    }
    if (field.nType == dbInteger && ll >= SHRT_MIN && ll <= SHRT_MAX) {
      var.vt = VT_I2;
      var.iVal = (SHORT)ll;
      return;
    }
    if (ll >= LONG_MIN && ll <= LONG_MAX) {
      var.vt = VT_I4;
      var.lVal = (LONG)ll;
      return;
    }
    var.vt = VT_R8;   // a 64-bit value another program stored
    var.dblVal = (double)ll;
    return;
  }
  case dbSingle:
  case dbDouble: {
    double d = strtod(p, &pEnd);
    if (*p == '\0' || *pEnd != '\0') break;
    if (field.nType == dbSingle) {
      var.vt = VT_R4;
      var.fltVal = (float)d;
    } else {
      var.vt = VT_R8;
      var.dblVal = d;
    }
    return;
  }
  case dbCurrency: {
    std::wstring wide = qodb::Widen(p, (int)value.bytes.size());
    CY cy;
    if (FAILED(VarCyFromStr(const_cast<OLECHAR*>(wide.c_str()), LOCALE_INVARIANT, 0, &cy))) break;
    var.vt = VT_CY;
    var.cyVal = cy;
    return;
  }
  case dbDate: {
    DATE dt = 0;
    if (!ParseDate(p, dt)) break;
    var.vt = VT_DATE;
    var.date = dt;
    return;
  }
  case dbBinary:
  case dbLongBinary:
    if (value.bytes.size() > (size_t)UINT_MAX) break;
    var.SetBytes(value.bytes.data(), (UINT)value.bytes.size());
    return;
  default: break;
  }
  // Text, or a value another program stored that does not fit the declared
  // type: handed out as the text it is rather than lost.
  var.vt = VT_BSTR;
  var.bstrVal = SysAllocStringByteLen(value.bytes.data(), (UINT)value.bytes.size());
  if (var.bstrVal == NULL) AfxThrowMemoryException();
}

Value FromText(const FieldDef& field, LPCTSTR lpszText) {
  Value value;
  FromText(field, lpszText, value);
  return value;
}

// Called for every field of every appended row: the common cases (text, a
// whole number) fill the value's buffer without building strings on the way.
void FromText(const FieldDef& field, LPCTSTR lpszText, Value& value) {
  LPCSTR p = lpszText != NULL ? lpszText : "";
  if (field.nType == dbText || field.nType == dbMemo || field.nType == dbBinary || field.nType == dbLongBinary) {
    size_t nLength = strlen(p);
    long lMax = field.nType == dbText || field.nType == dbBinary ? field.lSize : 0;
    if (lMax > 0 && nLength > (size_t)lMax)
      Throw(3163, "The field is too small to accept the amount of data you attempted to add. Try inserting or "
                  "pasting less data.");
    value.bNull = false;
    value.bytes.assign(p, nLength);
    return;
  }
  while (*p == ' ' || *p == '\t') ++p;
  size_t nLength = strlen(p);
  while (nLength > 0 && (p[nLength - 1] == ' ' || p[nLength - 1] == '\t')) --nLength;
  // An empty entry in a number or date field means no value.
  if (nLength == 0) {
    value.bNull = true;
    value.bytes.clear();
    return;
  }
  if (field.nType == dbByte || field.nType == dbInteger || field.nType == dbLong) {
    // Sign and digits, at most ten of them without leading zeros: then the
    // value is checked against the field's range in 64 bits.
    size_t i = 0;
    bool bNegative = p[0] == '-';
    if (p[0] == '+' || p[0] == '-') ++i;
    if (i == nLength) ThrowConversion();
    for (size_t k = i; k < nLength; ++k)
      if (p[k] < '0' || p[k] > '9') ThrowConversion();
    while (i + 1 < nLength && p[i] == '0') ++i;
    if (nLength - i > 10) Throw(3349, "Numeric field overflow.");
    long long ll = 0;
    for (size_t k = i; k < nLength; ++k) ll = ll * 10 + (p[k] - '0');
    if (bNegative) ll = -ll;
    long long llMin = field.nType == dbByte ? 0 : field.nType == dbInteger ? SHRT_MIN : LONG_MIN;
    long long llMax = field.nType == dbByte ? 255 : field.nType == dbInteger ? SHRT_MAX : LONG_MAX;
    if (ll < llMin || ll > llMax) Throw(3349, "Numeric field overflow.");
    value.bNull = false;
    value.bytes.clear();
    if (ll < 0) value.bytes += '-';
    value.bytes.append(p + i, nLength - i);
    if (ll == 0) value.bytes = "0";
    return;
  }
  CString str(p, (int)nLength);
  CString strValue;
  switch (field.nType) {
  case dbBoolean: {
    CString strUpper = str;
    strUpper.MakeLower();
    if (strUpper == "1" || strUpper == "-1" || strUpper == "true" || strUpper == "wahr" || strUpper == "ja" ||
        strUpper == "yes")
      strValue = "1";
    else if (strUpper == "0" || strUpper == "false" || strUpper == "falsch" || strUpper == "nein" || strUpper == "no")
      strValue = "0";
    else
      ThrowConversion();
    break;
  }
  case dbSingle:
  case dbDouble: {
    if (!NormalizeNumber(str)) ThrowConversion();
    char* pEnd = NULL;
    strtod(str, &pEnd);
    if (*pEnd != '\0') ThrowConversion();
    // The checked text as it is: SQLite reads it into the field's REAL.
    strValue = str;
    break;
  }
  case dbCurrency: {
    if (!NormalizeNumber(str)) ThrowConversion();
    std::wstring wide = qodb::Widen(str, str.GetLength());
    CY cy;
    if (FAILED(VarCyFromStr(const_cast<OLECHAR*>(wide.c_str()), LOCALE_INVARIANT, 0, &cy))) ThrowConversion();
    strValue = FormatCurrency(cy);
    break;
  }
  case dbDate: {
    DATE dt = 0;
    if (!ParseDate(str, dt)) {
      COleDateTime date;
      if (!date.ParseDateTime(str)) ThrowConversion();
      dt = date.m_dt;
    }
    strValue = FormatDate(dt);
    break;
  }
  default: ThrowConversion();
  }
  value.bNull = false;
  value.bytes.assign((LPCSTR)strValue, (size_t)strValue.GetLength());
}

Value FromVariant(const FieldDef& field, const VARIANT& var) {
  VARTYPE vt = V_VT(&var);
  if (vt == VT_NULL || vt == VT_EMPTY) return Value();
  if (vt == VT_BSTR) return FromText(field, TextOfBstr(V_BSTR(&var)));
  if (vt == (VT_ARRAY | VT_UI1)) {
    if (field.nType != dbBinary && field.nType != dbLongBinary && field.nType != dbText && field.nType != dbMemo)
      ThrowConversion();
    SAFEARRAY* psa = V_ARRAY(&var);
    LONG lLower = 0, lUpper = -1;
    SafeArrayGetLBound(psa, 1, &lLower);
    SafeArrayGetUBound(psa, 1, &lUpper);
    long long llCount = (long long)lUpper - lLower + 1;
    if (llCount < 0 || llCount > qodb::kMaxValueBytes) ThrowConversion();
    if ((field.nType == dbBinary || field.nType == dbText) && llCount > field.lSize)
      Throw(3163, "The field is too small to accept the amount of data you attempted to add. Try inserting or "
                  "pasting less data.");
    Value value;
    value.bNull = false;
    void* pData = NULL;
    if (SUCCEEDED(SafeArrayAccessData(psa, &pData))) {
      value.bytes.assign((const char*)pData, (size_t)llCount);
      SafeArrayUnaccessData(psa);
    }
    // Text holds no NUL: bytes with one are no text and would be cut there.
    if ((field.nType == dbText || field.nType == dbMemo) && value.bytes.find('\0') != std::string::npos)
      ThrowConversion();
    return value;
  }
  COleVariant converted;
  VARTYPE vtTarget;
  switch (field.nType) {
  case dbBoolean: vtTarget = VT_BOOL; break;
  case dbByte:
  case dbInteger:
  case dbLong: vtTarget = VT_I4; break;
  case dbSingle:
  case dbDouble: vtTarget = VT_R8; break;
  case dbCurrency: vtTarget = VT_CY; break;
  case dbDate: vtTarget = VT_DATE; break;
  case dbText:
  case dbMemo: vtTarget = VT_BSTR; break;
  default: ThrowConversion();
  }
  HRESULT hr = VariantChangeTypeEx(&converted, const_cast<VARIANT*>(&var), LOCALE_INVARIANT, 0, vtTarget);
  if (FAILED(hr)) {
    if (hr == DISP_E_OVERFLOW) Throw(3349, "Numeric field overflow.");
    ThrowConversion();
  }
  CString str;
  switch (vtTarget) {
  case VT_BOOL: str = converted.boolVal ? "1" : "0"; break;
  case VT_I4: str.Format("%ld", (long)converted.lVal); return FromText(field, str);
  case VT_R8: str.Format(field.nType == dbSingle ? "%.9g" : "%.17g", converted.dblVal); break;
  case VT_CY: str = FormatCurrency(converted.cyVal); break;
  case VT_DATE: str = FormatDate(converted.date); break;
  case VT_BSTR: return FromText(field, qodb::Narrow(converted.bstrVal, (int)SysStringLen(converted.bstrVal)));
  }
  Value value;
  value.bNull = false;
  value.bytes.assign((LPCSTR)str, (size_t)str.GetLength());
  return value;
}

} // namespace qodao
