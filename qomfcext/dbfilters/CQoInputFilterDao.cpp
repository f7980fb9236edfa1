#include "CQoInputFilterDao.h"

#include <CQoConfigFile.h>
#include <CQoException.h>
#include <CQoInterActive.h>

#include "CQoPasswortDlg.h"
#include "QoBatchMessageBox.h"
#include "QoDaoError.h"
#include "QoWorkbookReader.h"
#include "resource.h"

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {

const char* const kTypeNames[] = {"VT_EMPTY", "VT_NULL", "VT_I2", "VT_I4", "VT_R4", "VT_R8", "VT_CY",
                                  "VT_DATE", "VT_BSTR", "VT_DISPATCH", "VT_ERROR", "VT_BOOL", "VT_VARIANT",
                                  "VT_UNKNOWN"};
const char* const kTypeNames16[] = {"VT_I1", "VT_UI1", "VT_UI2", "VT_UI4", "VT_I8", "VT_UI8", "VT_INT", "VT_UINT",
                                    "VT_VOID", "VT_HRESULT", "VT_PTR", "VT_SAFEARRAY", "VT_CARRAY",
                                    "VT_USERDEFINED", "VT_LPSTR", "VT_LPWSTR"};
const char* const kTypeNames64[] = {"VT_FILETIME", "VT_BLOB", "VT_STREAM", "VT_STORAGE", "VT_STREAMED_OBJECT",
                                    "VT_STORED_OBJECT", "VT_BLOB_OBJECT", "VT_CF", "VT_CLSID"};

// The name of a plain type, or null for one that has none here.
const char* TypeName(unsigned type)
{
    if (type <= 13)
        return kTypeNames[type];
    if (type >= 16 && type <= 31)
        return kTypeNames16[type - 16];
    if (type >= 64 && type <= 72)
        return kTypeNames64[type - 64];
    return nullptr;
}

// "%e" as the platform's formatter writes it: at least three exponent
// digits. The six digits after the point grow until the text reads back as
// the same value in the value's own precision, so that no digit of the
// number is lost and none is made up: a single holds about seven digits, and
// widened to a double it would show binary noise (0.1f as 1.0000000149e-001).
CQoString Exponential(double value, bool single)
{
    char text[64];
    for (int digits = 6; digits <= 16; ++digits) {
        std::snprintf(text, sizeof text, "%.*e", digits, value);
        if (!std::isfinite(value))
            break;
        const double back = std::strtod(text, nullptr);
        if (single ? static_cast<float>(back) == static_cast<float>(value) : back == value)
            break;
    }
    CQoString result = text;
    int e = result.Find('e');
    if (e >= 0 && e + 2 < result.GetLength()) {
        CQoString exponent = result.Mid(e + 2);
        while (exponent.GetLength() < 3)
            exponent = "0" + exponent;
        result = result.Left(e + 2) + exponent;
    }
    return result;
}

void Real(double value, bool single, CQoString& out)
{
    if (std::isfinite(value) && value > -2147483649.0 && value < 2147483648.0) {
        int whole = static_cast<int>(value);   // toward zero
        if (value - whole == 0) {
            out.Format("%d", whole);
            return;
        }
    }
    out = Exponential(value, single);
}

} // namespace

void CQoInputFilterDao::ConvertOleVariant(const COleVariant& value, CQoString& out)
{
    out = "Fish";
    const VARTYPE vt = value.vt;
    const unsigned plain = vt & VT_TYPEMASK;
    if (vt & (VT_ARRAY | VT_BYREF)) {
        if (vt & VT_ARRAY)
            out = "Array of ";
        if (vt & VT_BYREF)
            out = (vt & VT_ARRAY) ? CQoString("Array of Pointer to ") : CQoString("Pointer to ");
        if (const char* name = TypeName(plain))
            out += name;
        return;
    }
    if (vt & ~VT_TYPEMASK)
        return;   // other flags (VT_VECTOR): not recognised
    switch (plain) {
    case VT_EMPTY:
    case VT_NULL:
        out.Empty();
        return;
    case VT_I2:
        out.Format("%hd", value.iVal);
        return;
    case VT_I4:
        out.Format("%d", (int)value.lVal);
        return;
    case VT_R4:
        Real(value.fltVal, true, out);
        return;
    case VT_R8:
        Real(value.dblVal, false, out);
        return;
    case VT_CY: {
        COleCurrency currency(value.cyVal);
        out = (const char*)currency.Format(0, LANG_USER_DEFAULT);
        return;
    }
    case VT_DATE: {
        // Month, day and the four-digit year; the time when there is one. A
        // two-digit year and a dropped time would lose what the field holds.
        COleDateTime date(value.date);
        CString text = date.Format("%m %d %Y");
        if (date.GetHour() || date.GetMinute() || date.GetSecond())
            text += date.Format(" %H:%M:%S");
        out = (const char*)text;
        return;
    }
    case VT_BSTR:
        out.Assign(value.bstrVal ? (const char*)value.bstrVal : "",
                   value.bstrVal ? SysStringByteLen(value.bstrVal) : 0);
        return;
    case VT_BOOL:
        out = value.boolVal ? "true" : "false";
        return;
    case VT_UI1:
        out.Format("0x%02hX", (unsigned short)value.bVal);
        return;
    case VT_I1:
    default:
        if (plain == VT_DECIMAL || (plain > 13 && plain < 16) || (plain > 31 && plain < 64) || plain > 72)
            return;   // "Fish"
        if (const char* name = TypeName(plain))
            out = name;
        return;
    }
}

CQoInputFilterDao::CQoInputFilterDao(CQoFile::fileType type)
    : m_pQueryDef(NULL), m_pRecordset(NULL), m_pTableDef(NULL), m_bShowError(true), m_nFileType(type)
{
    // Workbooks are read by the library's own reader.
    QoRegisterWorkbookReader();
    if (type == CQoFile::typeExcel)
        m_strConnectPrefix = "Excel 8.0;";
    m_fileType = type == CQoFile::typeExcel ? filterExcel : filterAccess;
    m_strFileName.Empty();
    m_strDatabaseName.Empty();
    m_strTableName.Empty();
    m_tableType = tableNone;
    SetFirstRowHasNames(true);
}

CQoInputFilterDao::CQoInputFilterDao()
    : CQoInputFilterDao(CQoFile::typeAccess)
{
}

CQoInputFilterDao::~CQoInputFilterDao()
{
    CloseResources();
}

const char* CQoInputFilterDao::FileName() const
{
    return m_strFileName;
}

void CQoInputFilterDao::Password(const CQoString& password)
{
    if (password.IsEmpty())
        m_strPassword.Empty();
    else
        m_strPassword = CQoString(";PWD=") + password;
}

void CQoInputFilterDao::Init(const CQoString& name)
{
    m_strFileName = name;
    m_strDatabaseName = name;
    m_strLastError.Empty();
    CloseResources();
    CQoInputFilter::Init(name);
    for (;;) {
        try {
            CQoString connect = m_strConnectPrefix + m_strPassword;
            m_database.Open(name, FALSE, FALSE, connect);
            break;
        } catch (CDaoException* e) {
            long code = QoDaoCode(e);
            if (code == 3029 || code == 3031) {
                e->Delete();
                CString password;
                if (!CQoPasswortDlg::Ask(name, password)) {
                    // Cancelled (or batch mode): the filter stays closed.
                    m_strLastError = (const char*)CQoPasswortDlg::RefusedText(name);
                    return;
                }
                Password((const char*)password);
                continue;
            }
            if (code == 3161 && m_nFileType == CQoFile::typeExcel) {
                e->Delete();
                CString text;
                text.LoadString(IDS_EXCEL_UNREADABLE);
                m_strLastError = (const char*)text;
                QoBatchMessageBox(0, IDOK, text, MB_OK);
                return;
            }
            m_strLastError = QoDaoTakeMessage(e);
            if (!CQoInterActive::IsQuiet())
                CQoException::Throw(m_strLastError, nullptr);
            break;   // batch mode: closed, every read finds nothing; LastError says why
        }
    }
    if (!m_strTableName.IsEmpty() && m_tableType != tableNone)
        InitTable(m_strTableName, m_tableType, true);
}

void CQoInputFilterDao::DeleteObjects()
{
    delete m_pRecordset;
    m_pRecordset = NULL;
    delete m_pTableDef;
    m_pTableDef = NULL;
    delete m_pQueryDef;
    m_pQueryDef = NULL;
}

void CQoInputFilterDao::InitTable(const char* name, tabletype type, bool countRows)
{
    if (!m_database.IsOpen())
        return;
    m_bNumRowsKnown = false;
    m_lNumRows = 0;
    try {
        if (type == tableTable) {
            delete m_pTableDef;
            m_pTableDef = NULL;
            m_pTableDef = new CDaoTableDef(&m_database);
            m_pTableDef->Open(name);
            SetNumColsInternal(m_pTableDef->GetFieldCount());
            m_lNumRows = m_pTableDef->GetRecordCount();
            delete m_pRecordset;
            m_pRecordset = NULL;
            m_pRecordset = new CDaoRecordset(&m_database);
            m_pRecordset->Open(m_pTableDef, dbOpenTable, 0);
            if (m_lNumRows == 0)
                m_lNumRows = m_pRecordset->GetRecordCount();
            m_bNumRowsKnown = true;
        } else if (type == tableQuery || type == tableSql) {
            delete m_pQueryDef;
            m_pQueryDef = NULL;
            m_pQueryDef = new CDaoQueryDef(&m_database);
            if (type == tableQuery)
                m_pQueryDef->Open(name);
            else
                m_pQueryDef->Create(NULL, name);
            SetNumColsInternal(m_pQueryDef->GetFieldCount());
            delete m_pRecordset;
            m_pRecordset = NULL;
            m_pRecordset = new CDaoRecordset();
            if (!countRows)
                m_bNumRowsKnown = true;
        } else {
            CloseResources();
        }
    } catch (CDaoException* e) {
        if (QoDaoCode(e) != 3021)
            QoDaoRaise(e);
        e->Delete();
    }
    m_tableType = type;
    m_strTableName = name ? name : "";
    SetModified(true);
    m_lCurrentRow = 0;
}

bool CQoInputFilterDao::OpenRecordSet()
{
    if (!m_pRecordset)
        return false;
    if (!m_pRecordset->IsOpen()) {
        try {
            if (m_tableType == tableTable && m_pTableDef)
                m_pRecordset->Open(m_pTableDef, dbOpenTable, 0);
            else if ((m_tableType == tableQuery || m_tableType == tableSql) && m_pQueryDef)
                m_pRecordset->Open(m_pQueryDef, dbOpenDynaset, 0);
        } catch (CDaoException* e) {
            e->Delete();
        }
    }
    return m_pRecordset->IsOpen() != FALSE;
}

long CQoInputFilterDao::CalculateRecordCount()
{
    if (m_bNumRowsKnown)
        return m_lNumRows;
    m_lNumRows = 0;
    if (m_pRecordset && OpenRecordSet()) {
        try {
            if (!m_pRecordset->IsEOF())
                m_pRecordset->MoveLast();
            if (!m_pRecordset->IsBOF())
                m_pRecordset->MoveFirst();
            m_lNumRows = m_pRecordset->GetRecordCount();
            m_bNumRowsKnown = true;
            // Back to the row the reader stands on: counting in the middle of
            // a walk must not end the walk.
            if (m_lCurrentRow > 0 && m_lCurrentRow < m_lNumRows)
                m_pRecordset->SetAbsolutePosition(m_lCurrentRow);
        } catch (CDaoException* e) {
            QoDaoRaise(e);
        }
    }
    return m_lNumRows;
}

bool CQoInputFilterDao::FirstRow()
{
    if (!m_pRecordset)
        return false;
    if (!OpenRecordSet())
        return false;
    try {
        m_pRecordset->MoveFirst();
    } catch (CDaoException* e) {
        e->Delete();
        return false;
    }
    m_lCurrentRow = 0;
    return true;
}

bool CQoInputFilterDao::NextRow()
{
    if (!m_pRecordset || !m_pRecordset->IsOpen() || m_pRecordset->IsEOF())
        return false;
    if (!OpenRecordSet())
        return false;
    try {
        m_pRecordset->MoveNext();
    } catch (CDaoException* e) {
        e->Delete();
        return false;
    }
    if (m_pRecordset->IsEOF())
        return false;
    ++m_lCurrentRow;
    return true;
}

bool CQoInputFilterDao::AbsoluteRow(long row)
{
    if (!m_pRecordset || !OpenRecordSet())
        return false;
    try {
        if (row < 0 || row >= NumRows())
            return false;
        if (row == 0)
            return FirstRow();
        // An absolute move: counting may have left the cursor elsewhere than
        // the current row number says.
        m_pRecordset->SetAbsolutePosition(row);
        m_lCurrentRow = row;
        return !m_pRecordset->IsEOF() && !m_pRecordset->IsBOF();
    } catch (CDaoException* e) {
        e->Delete();
        return false;
    } catch (const CQoException&) {
        return false;   // the count could not be made
    }
}

void CQoInputFilterDao::Value(int col, CQoString& value)
{
    if (col < 0 || col >= NumCols() || !m_pRecordset) {
        value.Empty();
        return;
    }
    try {
        COleVariant field;
        m_pRecordset->GetFieldValue(col, field);
        ConvertOleVariant(field, value);
    } catch (CDaoException* e) {
        e->Delete();
        value.Empty();
    }
}

void CQoInputFilterDao::ColName(int col, CQoString& name)
{
    name.Empty();
    if (col < 0 || col >= NumCols())
        return;
    CDaoFieldInfo info;
    try {
        if (m_tableType == tableTable && m_pTableDef)
            m_pTableDef->GetFieldInfo(col, info, AFX_DAO_PRIMARY_INFO);
        else if ((m_tableType == tableQuery || m_tableType == tableSql) && m_pQueryDef)
            m_pQueryDef->GetFieldInfo(col, info, AFX_DAO_PRIMARY_INFO);
        else
            return;
    } catch (CDaoException* e) {
        QoDaoRaise(e);
    }
    name = (const char*)info.m_strName;
}

void CQoInputFilterDao::CloseResources()
{
    DeleteObjects();
    if (m_database.IsOpen())
        m_database.Close();
    CQoInputFilterDB::CloseResources();
}

bool CQoInputFilterDao::CloseFile()
{
    CloseResources();
    CQoInputFilter::CloseFile();
    return true;
}

void CQoInputFilterDao::WriteConfig(CQoConfigFile& cfg, const CQoString& section)
{
    cfg.SetValue(section, "database", m_strDatabaseName);
    cfg.SetValue(section, "table", m_strTableName);
    cfg.SetValue(section, "tabletype", (int)m_tableType);
    cfg.SetValue(section, "filetype", m_nFileType);
}

void CQoInputFilterDao::ReadConfig(CQoConfigFile& cfg, const CQoString& section)
{
    CQoString database, table;
    cfg.GetValue(section, "database", database);
    cfg.GetValue(section, "table", table);
    m_strDatabaseName = database;
    m_strFileName = database;
    m_strTableName = table;
    int type = 0;
    // Only the types the filter knows; 0 keeps what was set before.
    if (cfg.GetValue(section, "tabletype", type, 0, tableSql) && type != 0)
        m_tableType = (tabletype)type;
    int fileType = 0;
    if (cfg.GetValue(section, "filetype", fileType, 0, 1000) && fileType != 0)
        m_nFileType = fileType;
}
