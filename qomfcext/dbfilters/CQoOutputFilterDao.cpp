#include "CQoOutputFilterDao.h"

#include <CQoConfigFile.h>
#include <CQoException.h>
#include <CQoLog.h>

#include "CQoPasswortDlg.h"
#include "QoDaoError.h"
#include "resource.h"

#include <climits>

CQoOutputFilterDao::CQoOutputFilterDao(CQoFile::fileType type)
    : m_pRecordset(NULL), m_pOwnFile(NULL)
{
    if (type == CQoFile::typeExcel)
        m_strConnectPrefix = "Excel 8.0;";
}

CQoOutputFilterDao::~CQoOutputFilterDao()
{
    try {
        ReleaseDB();
        ReleaseFile();
    } catch (const CQoException& e) {
        // A destructor cannot raise; the loss is recorded at least.
        _theLog << "ERR: " << e.Message() << CQoLog::endl;
    }
    delete m_pOwnFile;
}

void CQoOutputFilterDao::Password(const CQoString& password)
{
    if (password.IsEmpty())
        m_strPassword.Empty();
    else
        m_strPassword = CString(";PWD=") + password.GetString();
}

bool CQoOutputFilterDao::HasOpenRecordset() const
{
    return m_pRecordset && m_pRecordset->IsOpen();
}

void CQoOutputFilterDao::DiscardRecordset()
{
    if (!m_pRecordset)
        return;
    CDaoRecordset* recordset = m_pRecordset;
    m_pRecordset = NULL;
    try {
        if (recordset->IsOpen())
            recordset->Close();   // stores what is still queued
    } catch (CDaoException* e) {
        delete recordset;
        QoDaoShowOrRaise(e, GetShowError());
        return;
    }
    delete recordset;
}

void CQoOutputFilterDao::UseDB(const char* path)
{
    CQoOutputFilterDB::UseDB(path);
    delete m_pOwnFile;
    m_pOwnFile = new CQoFile(path, CQoFile::read | CQoFile::binary, 8);
    if (!m_pOwnFile->IsOpen())
        m_pOwnFile->Open(path, CQoFile::write | CQoFile::create | CQoFile::binary);
    UseFile(m_pOwnFile, false);
}

void CQoOutputFilterDao::UseFile(CQoFile* file, bool)
{
    if (!file)
        return;
    CString path = file->FileName();
    for (;;) {
        try {
            m_database.Open(path, FALSE, FALSE, m_strConnectPrefix + m_strPassword);
            return;
        } catch (CDaoException* e) {
            long code = QoDaoCode(e);
            if (code == 3029 || code == 3031) {
                e->Delete();
                CString password;
                if (!CQoPasswortDlg::Ask(path, password))
                    return;   // cancelled: the database stays closed
                Password((const char*)password);
                continue;
            }
            // Only a file with nothing in it (new, or just made by UseDB)
            // becomes a new database. Anything else may be a user's file that
            // is no database: it is refused, not deleted.
            bool empty = file->IsOpen() && file->Length() == 0;
            if (!empty && CQoFile::Exists(path)) {
                QoDaoShowOrRaise(e, GetShowError());
                return;
            }
            e->Delete();
            break;
        }
    }
    if (file->IsOpen())
        file->Close();
    if (file == m_pOwnFile) {
        delete m_pOwnFile;
        m_pOwnFile = NULL;
    }
    CFile::Remove(path);
    try {
        m_database.Create(path, dbLangGeneral, 0);
    } catch (CDaoException* e) {
        QoDaoShowOrRaise(e, GetShowError());
    }
}

void CQoOutputFilterDao::ReleaseFile()
{
    CQoString failure;
    try {
        DiscardRecordset();
    } catch (const CQoException& e) {
        failure = e.Message();
    }
    if (m_database.IsOpen())
        m_database.Close();
    if (!failure.IsEmpty())
        CQoException::Throw(failure, nullptr);
}

void CQoOutputFilterDao::ReleaseDB()
{
    if (!m_pOwnFile)
        return;
    ReleaseFile();
    delete m_pOwnFile;
    m_pOwnFile = NULL;
}

bool CQoOutputFilterDao::Init()
{
    if (m_strTableName.IsEmpty() || !m_database.IsOpen())
        return false;
    // Every column must fit before the old table is deleted.
    for (int i = 0; i < NumCols(); ++i) {
        int type = GetType(i);
        if (type != dbtypeInteger && type != dbtypeText) {
            CString text;
            text.LoadString(IDS_UNKNOWN_COLUMN_TYPE);
            CQoException::Throw((const char*)text, nullptr);
        }
    }
    DiscardRecordset();
    try {
        m_database.DeleteTableDef(m_strTableName);
    } catch (CDaoException* e) {
        e->Delete();   // there may be no such table yet
    }

    CDaoTableDef table(&m_database);
    try {
        table.Create(m_strTableName, 0, NULL, NULL);
        for (int i = 0; i < NumCols(); ++i) {
            CQoString name;
            GetColumnName(i, name);
            CDaoFieldInfo field;
            field.m_strName = name.GetString();
            field.m_nOrdinalPosition = 0;
            field.m_bRequired = FALSE;
            field.m_lCollatingOrder = 0;
            if (GetType(i) == dbtypeInteger) {
                field.m_nType = dbLong;
                field.m_lSize = 4;
                field.m_lAttributes = dbFixedField;
                field.m_bAllowZeroLength = FALSE;
            } else {
                field.m_nType = dbText;
                field.m_lSize = GetLength(i);
                field.m_lAttributes = dbVariableField;
                field.m_bAllowZeroLength = TRUE;
            }
            table.CreateField(field);
        }
        table.Append();
        for (int i = 0; i < NumCols(); ++i) {
            if (!GetIndexed(i))
                continue;
            CQoString name;
            GetColumnName(i, name);
            CDaoIndexFieldInfo indexField;
            indexField.m_strName = name.GetString();
            indexField.m_bDescending = FALSE;
            CDaoIndexInfo index;
            index.m_strName.Format("%s%i", m_strTableName.GetString(), i);
            index.m_pFieldInfos = &indexField;
            index.m_nFields = 1;
            index.m_bPrimary = FALSE;
            index.m_bUnique = FALSE;
            index.m_bIgnoreNulls = TRUE;
            index.m_bRequired = FALSE;
            table.CreateIndex(index);
            index.m_pFieldInfos = NULL;
        }
        m_pRecordset = new CDaoRecordset(&m_database);
        m_pRecordset->Open(&table, dbOpenTable, 0);
    } catch (CDaoException* e) {
        if (m_pRecordset && !m_pRecordset->IsOpen()) {
            delete m_pRecordset;
            m_pRecordset = NULL;
        }
        QoDaoShowOrRaise(e, GetShowError());
    }
    return true;
}

void CQoOutputFilterDao::InitRow()
{
    CQoOutputFilter::InitRow();
    if (!m_database.IsOpen() || !HasOpenRecordset())
        return;
    try {
        m_pRecordset->AddNew();
    } catch (CDaoException* e) {
        QoDaoShowOrRaise(e, GetShowError());
    }
}

void CQoOutputFilterDao::Value(int col, const CQoString& value)
{
    if (!m_database.IsOpen() || !HasOpenRecordset())
        return;
    CQoString text = value;
    if (GetType(col) == dbtypeText && text.GetLength() > GetLength(col))
        text = text.Left(GetLength(col));
    try {
        m_pRecordset->SetFieldValue(col, text.GetString());
    } catch (CDaoException* e) {
        QoDaoShowOrRaise(e, GetShowError());
    }
}

bool CQoOutputFilterDao::WriteRow(CQoString*)
{
    if (!m_database.IsOpen() || !HasOpenRecordset())
        return false;
    try {
        m_pRecordset->Update();
    } catch (CDaoException* e) {
        return QoDaoShowOrRaise(e, GetShowError());
    }
    return true;
}

void CQoOutputFilterDao::WriteConfig(CQoConfigFile& cfg, const CQoString& section)
{
    cfg.SetValue(section, "table", m_strTableName);
    cfg.SetValue(section, "columns", NumCols());
    CQoString key;
    for (int i = 0; i < NumCols(); ++i) {
        CQoString name;
        GetColumnName(i, name);
        key.Format("column%d_name", i);
        cfg.SetValue(section, key, name);
        key.Format("column%d_type", i);
        cfg.SetValue(section, key, GetType(i));
        key.Format("column%d_len", i);
        cfg.SetValue(section, key, GetLength(i));
        key.Format("column%d_index", i);
        cfg.SetValue(section, key, GetIndexed(i) ? 1 : 0);
    }
}

void CQoOutputFilterDao::ReadConfig(CQoConfigFile& cfg, const CQoString& section)
{
    CQoString table;
    cfg.GetValue(section, "table", table);
    SetTableName(table);
    int columns = 0;
    cfg.GetValue(section, "columns", columns, 0, 255);   // an Access table has at most 255 fields
    NumCols(columns);
    CQoString key;
    for (int i = 0; i < columns; ++i) {
        CQoString name;
        key.Format("column%d_name", i);
        cfg.GetValue(section, key, name);
        ColumnName(i, name);
        int type = 0, length = 0, indexed = 0;
        key.Format("column%d_type", i);
        cfg.GetValue(section, key, type, INT_MIN, INT_MAX);
        key.Format("column%d_len", i);
        cfg.GetValue(section, key, length, 0, 255);   // a text field holds at most 255 characters
        key.Format("column%d_index", i);
        cfg.GetValue(section, key, indexed, INT_MIN, INT_MAX);
        SetType(i, type);
        SetLength(i, length);
        SetIndexed(i, indexed != 0);
    }
}
