#include "CQoOutputFilterDao.h"

#include <CQoConfigFile.h>
#include <CQoException.h>
#include <CQoLog.h>

#include "CQoPasswortDlg.h"
#include "QoDaoError.h"
#include "QoSqlName.h"
#include "resource.h"

#include <climits>
#include <cstring>
#include <exception>
#include <string>

namespace {

const int kMaxNameLength = 64;   // the engine's longest name

// The run's table: the same name for every run on one table, whatever the
// letter case (the engine's names ignore it), so that the next run finds
// and drops what a killed one left.
CString NewTableName(const CString& table)
{
    std::string folded((const char*)table, (size_t)table.GetLength());
    if (!folded.empty())
        CharLowerBuffA(&folded[0], (DWORD)folded.size());
    return CString(QoRunTableName(CQoString(folded.c_str(), (int)folded.size())).GetString());
}

// "CON", "nul.mdb", "C:\\daten\\COM1.db": names Windows gives to devices in every folder.
bool IsDeviceName(const char* path)
{
    const char* leaf = path;
    for (const char* p = path; *p; ++p)
        if (*p == '\\' || *p == '/' || *p == ':')
            leaf = p + 1;
    CString stem(leaf);
    int dot = stem.Find('.');
    if (dot >= 0)
        stem = stem.Left(dot);
    stem.TrimRight(' ');
    stem.MakeUpper();
    if (stem == "CON" || stem == "PRN" || stem == "AUX" || stem == "NUL")
        return true;
    return stem.GetLength() == 4 && (stem.Left(3) == "COM" || stem.Left(3) == "LPT") && stem[3] >= '1' &&
           stem[3] <= '9';
}

[[noreturn]] void RaiseInRun(long lCode, const CString& text)
{
    AfxThrowDaoError(lCode, text);
    __builtin_unreachable();
}

} // namespace

CQoOutputFilterDao::CQoOutputFilterDao(CQoFile::fileType type)
    : m_pRecordset(NULL), m_database(&m_workspace), m_pOwnFile(NULL), m_bRowFailed(false), m_lRecord(0)
{
    if (type == CQoFile::typeExcel)
        m_strConnectPrefix = "Excel 8.0;";
}

CQoOutputFilterDao::~CQoOutputFilterDao()
{
    try {
        // A run that an exception leaves behind is not completed: its rows
        // may be what the exception is about.
        if (!m_strNewTable.IsEmpty() && std::uncaught_exceptions() > 0)
            Discard();
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

void CQoOutputFilterDao::CheckPath(const char* path)
{
    const char* why = nullptr;
    CString folder;
    if (!path || !*path) {
        why = "es ist kein Dateiname angegeben.";
    } else if (std::strlen(path) >= MAX_PATH) {
        why = "der Pfad ist l\xE4nger als 259 Zeichen.";
    } else if ((path[0] == '\\' || path[0] == '/') && (path[1] == '\\' || path[1] == '/')) {
        why = "Netzwerkpfade werden nicht unterst\xFCtzt; verbinden Sie die Freigabe mit einem Laufwerksbuchstaben.";
    } else if (IsDeviceName(path)) {
        why = "der Name bezeichnet ein Ger\xE4t, keine Datei.";
    } else {
        DWORD attributes = GetFileAttributesA(path);
        char full[MAX_PATH * 2] = "";
        char* leaf = nullptr;
        DWORD length = GetFullPathNameA(path, sizeof full, full, &leaf);
        if (attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY)) {
            why = "das ist ein Ordner, keine Datei.";
        } else if (length == 0 || length >= sizeof full || !leaf || leaf == full) {
            why = "der Pfad ist ung\xFCltig.";
        } else {
            folder = CString(full, (int)(leaf - full));
            DWORD folderAttributes = GetFileAttributesA(folder);
            if (folderAttributes == INVALID_FILE_ATTRIBUTES || !(folderAttributes & FILE_ATTRIBUTE_DIRECTORY))
                why = "den Ordner gibt es nicht.";
        }
    }
    if (!why)
        return;
    m_strLastError.Format("Die Datenbank '%s' kann weder ge\xF6""ffnet noch angelegt werden: %s", path ? path : "", why);
    CQoException::Throw(m_strLastError, nullptr);
}

void CQoOutputFilterDao::UseDB(const char* path)
{
    // Before anything is made: a refused path must not leave an empty file.
    CheckPath(path);
    CQoOutputFilterDB::UseDB(path);
    delete m_pOwnFile;
    m_pOwnFile = new CQoFile(path, CQoFile::read | CQoFile::binary, 8);
    if (!m_pOwnFile->IsOpen())
        m_pOwnFile->Open(path, CQoFile::write | CQoFile::create | CQoFile::binary);
    UseFile(m_pOwnFile, false);
}

void CQoOutputFilterDao::Refuse(CDaoException* e)
{
    m_strLastError = QoDaoMessage(e);
    QoDaoShowOrRaise(e, GetShowError());
}

void CQoOutputFilterDao::UseFile(CQoFile* file, bool)
{
    if (!file)
        return;
    m_strLastError.Empty();
    CString path = file->FileName();
    CheckPath(path);
    for (;;) {
        try {
            m_database.Open(path, FALSE, FALSE, m_strConnectPrefix + m_strPassword);
            return;
        } catch (CDaoException* e) {
            long code = QoDaoCode(e);
            if (code == 3029 || code == 3031) {
                e->Delete();
                CString password;
                if (!CQoPasswortDlg::Ask(path, password)) {
                    // Cancelled (or batch mode): the database stays closed.
                    m_strLastError = (const char*)CQoPasswortDlg::RefusedText(path);
                    return;
                }
                Password((const char*)password);
                continue;
            }
            // Only a file with nothing in it (new, or just made by UseDB)
            // becomes a new database. Anything else may be a user's file that
            // is no database: it is refused, not deleted.
            bool empty = file->IsOpen() && file->Length() == 0;
            if (!empty && CQoFile::Exists(path)) {
                Refuse(e);
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
        Refuse(e);
    }
}

void CQoOutputFilterDao::DropTable(const CString& name)
{
    if (!m_database.IsOpen())
        return;
    try {
        m_database.DeleteTableDef(name);
    } catch (CDaoException* e) {
        if (QoDaoCode(e) == 3265) {
            e->Delete();   // not there: nothing to drop
            return;
        }
        // Left for the next run on this table, which drops it first.
        _theLog << "ERR: Die Tabelle '" << (const char*)name << "' konnte nicht entfernt werden: "
                << QoDaoTakeMessage(e) << CQoLog::endl;
    }
}

void CQoOutputFilterDao::AbandonRun()
{
    if (m_pRecordset) {
        CDaoRecordset* recordset = m_pRecordset;
        m_pRecordset = NULL;
        try {
            if (recordset->IsOpen())
                recordset->Close();
        } catch (CDaoException* e) {
            e->Delete();   // its rows are given up with the table
        }
        delete recordset;
    }
    if (!m_strNewTable.IsEmpty()) {
        DropTable(m_strNewTable);
        m_strNewTable.Empty();
    }
}

void CQoOutputFilterDao::Discard()
{
    try {
        AbandonRun();
        if (m_database.IsOpen())
            m_database.Close();
    } catch (CException* e) {
        char text[512] = "";
        e->GetErrorMessage(text, sizeof text);
        e->Delete();
        _theLog << "ERR: " << text << CQoLog::endl;
    } catch (const CQoException& e) {
        _theLog << "ERR: " << e.Message() << CQoLog::endl;
    }
}

void CQoOutputFilterDao::Finish()
{
    if (m_strNewTable.IsEmpty())
        return;
    CString unchanged;
    unchanged.Format("Die Tabelle '%s' bleibt unver\xE4ndert: ", m_strTarget.GetString());
    if (m_bRowFailed) {
        AbandonRun();
        try {
            RaiseInRun(3000, unchanged + "nicht jeder Satz konnte geschrieben werden; die neuen S\xE4tze sind verworfen.");
        } catch (CDaoException* e) {
            QoDaoShowOrRaise(e, GetShowError());
        }
        return;
    }
    try {
        // The last queued rows first: a failure here still finds the old table.
        CDaoRecordset* recordset = m_pRecordset;
        m_pRecordset = NULL;
        try {
            if (recordset && recordset->IsOpen())
                recordset->Close();
        } catch (CDaoException*) {
            delete recordset;
            throw;
        }
        delete recordset;
        m_workspace.BeginTrans();
        try {
            try {
                m_database.DeleteTableDef(m_strTarget);
            } catch (CDaoException* e) {
                if (QoDaoCode(e) != 3265)
                    throw;
                e->Delete();   // a first run: there is no old table
            }
            CDaoTableDef table(&m_database);
            table.Open(m_strNewTable);
            table.SetName(m_strTarget);
            for (int i = 0; i < NumCols(); ++i) {
                if (!GetIndexed(i))
                    continue;
                CQoString name;
                GetColumnName(i, name);
                CDaoIndexFieldInfo indexField;
                indexField.m_strName = name.GetString();
                indexField.m_bDescending = FALSE;
                CDaoIndexInfo index;
                index.m_strName.Format("%s%i", m_strTarget.GetString(), i);
                index.m_pFieldInfos = &indexField;
                index.m_nFields = 1;
                index.m_bPrimary = FALSE;
                index.m_bUnique = FALSE;
                index.m_bIgnoreNulls = TRUE;
                index.m_bRequired = FALSE;
                try {
                    table.CreateIndex(index);
                } catch (CDaoException*) {
                    index.m_pFieldInfos = NULL;
                    throw;
                }
                index.m_pFieldInfos = NULL;
            }
            m_workspace.CommitTrans();
        } catch (CDaoException*) {
            try {
                m_workspace.Rollback();
            } catch (CDaoException* e) {
                e->Delete();   // a failed commit has already rolled back
            }
            throw;
        }
        m_strNewTable.Empty();
    } catch (CDaoException* e) {
        AbandonRun();
        QoDaoPrefix(e, (const char*)unchanged);
        QoDaoShowOrRaise(e, GetShowError());
    }
}

void CQoOutputFilterDao::ReleaseFile()
{
    CQoString failure;
    bool failed = false;
    try {
        Finish();
        DiscardRecordset();
    } catch (const CQoException& e) {
        failure = e.Message();
        failed = true;
    }
    if (m_database.IsOpen())
        m_database.Close();
    if (failed)
        CQoException::Throw(failure, nullptr);
}

void CQoOutputFilterDao::ReleaseDB()
{
    if (!m_pOwnFile) {
        // The database stays open, but the run is complete.
        Finish();
        return;
    }
    ReleaseFile();
    delete m_pOwnFile;
    m_pOwnFile = NULL;
}

void CQoOutputFilterDao::DefineTable(CDaoTableDef& table)
{
    // Under the target's name first: the engine checks it, and every field,
    // without making anything.
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
        if (GetIndexed(i)) {
            CString index;
            index.Format("%s%i", m_strTableName.GetString(), i);
            if (index.GetLength() > kMaxNameLength)
                RaiseInRun(3125, "'" + index + "' is not a valid name. Make sure that it does not include invalid "
                                               "characters or punctuation and that it is not too long.");
        }
    }
    CDaoQueryDefInfo query;
    bool isQuery = true;
    try {
        m_database.GetQueryDefInfo(m_strTableName, query);
    } catch (CDaoException* e) {
        e->Delete();
        isQuery = false;
    }
    if (isQuery)
        RaiseInRun(3010, "Table '" + CString(m_strTableName.GetString()) + "' already exists: eine gespeicherte Abfrage tr\xE4gt diesen Namen.");
}

bool CQoOutputFilterDao::Init()
{
    if (m_strTableName.IsEmpty() || !m_database.IsOpen())
        return false;
    // Every column must fit before anything is made.
    for (int i = 0; i < NumCols(); ++i) {
        int type = GetType(i);
        if (type != dbtypeInteger && type != dbtypeText) {
            CString text;
            text.LoadString(IDS_UNKNOWN_COLUMN_TYPE);
            CQoString message = (const char*)text;
            CQoException::Throw(message, nullptr);
        }
    }
    // Init again gives up the run begun before, as a new table replaces it.
    AbandonRun();
    DiscardRecordset();
    CString newTable = NewTableName(m_strTableName.GetString());
    bool appended = false;
    CDaoTableDef table(&m_database);
    try {
        DefineTable(table);
        DropTable(newTable);   // what a killed run left
        table.SetName(newTable);
        table.Append();
        appended = true;
        m_pRecordset = new CDaoRecordset(&m_database);
        m_pRecordset->Open(&table, dbOpenTable, 0);
        m_strNewTable = newTable;
        m_strTarget = m_strTableName.GetString();
        m_bRowFailed = false;
        m_lRecord = 0;
    } catch (CDaoException* e) {
        if (m_pRecordset && !m_pRecordset->IsOpen()) {
            delete m_pRecordset;
            m_pRecordset = NULL;
        }
        if (appended) {
            table.Close();
            DropTable(newTable);
        }
        QoDaoShowOrRaise(e, GetShowError());
    }
    return true;
}

bool CQoOutputFilterDao::Fail(CDaoException* e, int col)
{
    m_bRowFailed = true;
    CQoString prefix;
    if (col >= 0 && col < NumCols()) {
        CQoString name;
        GetColumnName(col, name);
        prefix.Format("Satz %ld, Spalte %s: ", m_lRecord, name.GetString());
    } else {
        prefix.Format("Satz %ld: ", m_lRecord);
    }
    QoDaoPrefix(e, prefix);
    return QoDaoShowOrRaise(e, GetShowError());
}

void CQoOutputFilterDao::InitRow()
{
    CQoOutputFilter::InitRow();
    ++m_lRecord;
    if (!m_database.IsOpen() || !HasOpenRecordset())
        return;
    try {
        m_pRecordset->AddNew();
    } catch (CDaoException* e) {
        Fail(e, -1);
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
        // The engine takes text up to its first NUL: the rest would be lost unseen.
        if (std::memchr(text.GetString(), 0, (size_t)text.GetLength()))
            RaiseInRun(3000, "Der Wert enth\xE4lt ein NUL-Zeichen und kann nicht vollst\xE4ndig gespeichert werden.");
        m_pRecordset->SetFieldValue(col, text.GetString());
    } catch (CDaoException* e) {
        Fail(e, col);
    }
}

bool CQoOutputFilterDao::WriteRow(CQoString*)
{
    if (!m_database.IsOpen() || !HasOpenRecordset())
        return false;
    try {
        m_pRecordset->Update();
    } catch (CDaoException* e) {
        return Fail(e, -1);
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
