#include "CConversion.h"

#include <CQoException.h>
#include <CQoFile.h>
#include <CQoInterActive.h>
#include <CQoLog.h>
#include <CQoInputFilterDao.h>
#include <CQoInputFilterODBC.h>
#include <CQoOutputFilterDao.h>
#include <CQoInputFilterDbase34.h>
#include <CQoInputFilterTextFix.h>
#include <CQoInputFilterTextVF.h>
#include <CQoInputFilterTextVar.h>
#include <CQoOutputFilterDbase.h>
#include <CQoOutputFilterODBC.h>
#include <CQoOutputFilterTextFix.h>
#include <CQoOutputFilterTextVar.h>
#include <QoSqlName.h>

#include "../columns/CInputRecords.h"

#include <memory>
#include <vector>

namespace {
const char kInput[] = "Eingabe";
const char kOutput[] = "Ausgabe";
const char kInputFilter[] = "Eingabefilter";
const char kOutputFilter[] = "Ausgabefilter";
}

// The delimited input of a run. Every record that does not fit leaves one
// line in the log: where it is and what is wrong (the filter's own message,
// complete only once the filter has acted on the answer), how it begins, and
// what became of it.
class CConversionInput : public CQoInputFilterTextVar
{
public:
    explicit CConversionInput(CConversion& job) : m_job(job), m_answer(0), m_bPending(false) {}
    ~CConversionInput() override { Flush(); }

    int ReportWrongInput(CQoString& data, int& nextPos) override
    {
        Flush();
        // The record as it stood in the file, up to the presumed next one.
        m_excerpt = data.Left(nextPos > 0 && nextPos < kExcerpt ? nextPos : kExcerpt);
        m_excerpt.TrimNewline();
        int answer = CQoInputFilterTextVar::ReportWrongInput(data, nextPos);
        if (answer == CQoInterActive::repairNoHandler && m_job.m_bSkipDefective)
            answer = CQoInterActive::repairSkip;   // the presumed next record follows
        if (answer == CQoInterActive::repairSkip)
            ++m_job.m_lSkipped;
        m_answer = answer;
        m_bPending = true;
        return answer;
    }

    void Flush()
    {
        if (!m_bPending)
            return;
        m_bPending = false;
        const char* what;
        switch (m_answer) {
        case CQoInterActive::repairSkip:     what = "\xFC" "bersprungen"; break;
        case CQoInterActive::repairTakeOver: what = "korrigiert \xFC" "bernommen"; break;
        case CQoInterActive::repairStop:     what = "Einlesen abgebrochen"; break;
        default:                             what = "nicht lesbar, Konvertierung beendet"; break;
        }
        _theLog << "Fehlerhafter Satz " << what << ": " << LastWrongInput().GetString() << ", Anfang: "
                << m_excerpt.GetString() << CQoLog::endl;
    }

private:
    enum { kExcerpt = 100 };
    CConversion& m_job;
    CQoString m_excerpt;
    int m_answer;
    bool m_bPending;
};

CConversion::CConversion()
    : m_bSkipDefective(false), m_pProgress(nullptr), m_lSkipped(0), m_bInputFromMemory(false)
{
    Clear();
}

void CConversion::Clear()
{
    m_inputFile.Empty();
    m_inputFormat = inputDelimited;
    m_inputCharset = charsetAnsi;
    m_outputFile.Empty();
    m_outputCharset = charsetAnsi;
    m_inputConnect.Empty();
    m_inputTable.Empty();
    m_inputSql.Empty();
    m_outputConnect.Empty();
    m_outputTable.Empty();
    m_inputDatabase.Empty();
    m_outputDatabase.Empty();
    m_inputPassword.Empty();
    m_outputPassword.Empty();
    m_outputFormat = formatDelimited;
    m_filterSettings.Clear();
    m_bFilters = false;
}

void CConversion::ReadConfig(CQoConfigFile& config)
{
    Clear();
    config.GetValue(kInput, "Datei", m_inputFile);
    ReadCharset(config, kInput, m_inputCharset);
    config.GetValue(kOutput, "Datei", m_outputFile);
    ReadCharset(config, kOutput, m_outputCharset);
    config.GetValue(kInput, "ODBC", m_inputConnect);
    config.GetValue(kInput, "Tabelle", m_inputTable);
    config.GetValue(kInput, "SQL", m_inputSql);
    config.GetValue(kOutput, "ODBC", m_outputConnect);
    config.GetValue(kOutput, "Tabelle", m_outputTable);
    config.GetValue(kInput, "Datenbank", m_inputDatabase);
    config.GetValue(kOutput, "Datenbank", m_outputDatabase);
    config.GetValue(kInput, "Passwort", m_inputPassword);
    config.GetValue(kOutput, "Passwort", m_outputPassword);
    // A statement of blanks only is no statement.
    m_inputSql.Trim();
    ReadFormat(config, kInput, inputDbase,
               "0 Trennzeichen, 1 feste Satzl\xE4nge, 2 feste Spalten, 3 dBase", m_inputFormat);
    ReadFormat(config, kOutput, formatDbase, "0 Trennzeichen, 1 feste L\xE4nge, 2 dBase", m_outputFormat);
    m_filterSettings.CopySection(config, kInputFilter);
    m_filterSettings.CopySection(config, kOutputFilter);
    m_bFilters = config.HasSection(kInputFilter) || config.HasSection(kOutputFilter)
                 || config.HasKey(kOutput, "Format") || config.HasKey(kInput, "Format");
    if (InputIsDatabase() && m_inputTable.IsEmpty() && m_inputSql.IsEmpty())
        CQoException::Throw("Zur Datenbank-Eingabe fehlt die Tabelle (Tabelle=) oder die Abfrage (SQL=).", "Eingabe");
    if (OutputIsDatabase() && m_outputTable.IsEmpty())
        CQoException::Throw("Zur Datenbank-Ausgabe fehlt die Tabelle (Tabelle=).", "Ausgabe");
    m_columns.ReadConfig(config);
}

void CConversion::ReadFormat(CQoConfigFile& config, const char* section, int last, const char* allowed, int& format)
{
    if (!config.HasKey(section, "Format"))
        return;
    CQoString text;
    config.GetValue(section, "Format", text);
    int value = -1;
    if (!config.GetValue(section, "Format", value) || value < 0 || value > last) {
        CQoString message;
        message.Format("Unbekanntes %sformat '%s' in [%s] (erlaubt: %s).", section, (const char*)text, section, allowed);
        CQoException::Throw(message, "Format");
    }
    format = value;
}

void CConversion::ReadCharset(CQoConfigFile& config, const char* section, int& charset)
{
    CQoString text;
    if (!config.GetValue(section, "Zeichensatz", text))
        return;
    // A value the program does not know must not turn into Windows Ansi
    // silently: the converted file would be wrong without a word.
    int value = -1;
    if (!config.GetValue(section, "Zeichensatz", value) || value < charsetAnsi || value > charsetMixed) {
        CQoString message;
        message.Format("Unbekannter Zeichensatz '%s' in [%s] (erlaubt: 0 Windows Ansi, 1 DOS Ascii, 2 Ansi/Ascii).",
                       (const char*)text, section);
        CQoException::Throw(message, "Zeichensatz");
    }
    charset = value;
}

namespace {
// A setting the project does not use leaves no empty key behind.
void Store(CQoConfigFile& config, const char* section, const char* key, const CQoString& value)
{
    if (value.IsEmpty())
        config.DeleteKey(section, key);
    else
        config.SetValue(section, key, value);
}
}

void CConversion::WriteConfig(CQoConfigFile& config) const
{
    Store(config, kInput, "Datei", m_inputFile);
    config.SetValue(kInput, "Zeichensatz", m_inputCharset);
    Store(config, kOutput, "Datei", m_outputFile);
    config.SetValue(kOutput, "Zeichensatz", m_outputCharset);
    Store(config, kInput, "Datenbank", m_inputDatabase);
    Store(config, kInput, "ODBC", m_inputConnect);
    Store(config, kInput, "Tabelle", m_inputTable);
    Store(config, kInput, "SQL", m_inputSql);
    Store(config, kOutput, "Datenbank", m_outputDatabase);
    Store(config, kOutput, "ODBC", m_outputConnect);
    Store(config, kOutput, "Tabelle", m_outputTable);
    Store(config, kInput, "Passwort", m_inputPassword);
    Store(config, kOutput, "Passwort", m_outputPassword);
    if (m_bFilters) {
        config.SetValue(kInput, "Format", m_inputFormat);
        config.SetValue(kOutput, "Format", m_outputFormat);
        // The sections are replaced whole: keys of another kind of filter
        // do not stay behind.
        config.CopySection(m_filterSettings, kInputFilter);
        config.CopySection(m_filterSettings, kOutputFilter);
    }
    m_columns.WriteConfig(config);
}

namespace {
// Where a kind of input or output is: a connect string, a database file or
// a file; the other two are empty.
void Place(int kind, int odbc, int database, const CQoString& location, CQoString& file, CQoString& databaseFile,
           CQoString& connect)
{
    file.Empty();
    databaseFile.Empty();
    connect.Empty();
    (kind == odbc ? connect : kind == database ? databaseFile : file) = location;
}
}

int CConversion::InputKind() const
{
    if (!m_inputConnect.IsEmpty())
        return inputOdbc;
    return m_inputDatabase.IsEmpty() ? m_inputFormat : int(inputDatabase);
}

int CConversion::OutputKind() const
{
    if (!m_outputConnect.IsEmpty())
        return outputOdbc;
    return m_outputDatabase.IsEmpty() ? m_outputFormat : int(outputDatabase);
}

const CQoString& CConversion::InputLocation() const
{
    return !m_inputConnect.IsEmpty() ? m_inputConnect : !m_inputDatabase.IsEmpty() ? m_inputDatabase : m_inputFile;
}

const CQoString& CConversion::OutputLocation() const
{
    return !m_outputConnect.IsEmpty() ? m_outputConnect : !m_outputDatabase.IsEmpty() ? m_outputDatabase : m_outputFile;
}

void CConversion::SetInput(int kind, const CQoString& location)
{
    if (kind != InputKind()) {
        m_filterSettings.DeleteSection(kInputFilter);
        m_inputTable.Empty();
        m_inputSql.Empty();
    }
    Place(kind, inputOdbc, inputDatabase, location, m_inputFile, m_inputDatabase, m_inputConnect);
    if (kind < inputDatabase)
        m_inputFormat = kind >= 0 ? kind : int(inputDelimited);
    m_bFilters = true;
}

void CConversion::SetOutput(int kind, const CQoString& location)
{
    if (kind != OutputKind())
        m_filterSettings.DeleteSection(kOutputFilter);
    Place(kind, outputOdbc, outputDatabase, location, m_outputFile, m_outputDatabase, m_outputConnect);
    if (kind < outputDatabase)
        m_outputFormat = kind >= 0 ? kind : int(formatDelimited);
    m_bFilters = true;
}

CQoString CConversion::InFolder(const CQoString& folder, const CQoString& file)
{
    bool absolute = (file.GetLength() >= 2 && file.GetAt(1) == ':')
                    || (!file.IsEmpty() && (file.GetAt(0) == '\\' || file.GetAt(0) == '/'));
    return absolute || file.IsEmpty() || folder.IsEmpty() ? file : folder + "\\" + file;
}

namespace {
// One key=value part of a connect string: as written, and its key and value
// (a value in braces may hold ';').
struct ConnectPart {
    CQoString text;   // as written; rebuilt from key and value when one changes
    CQoString key;    // trimmed
    CQoString value;
};

std::vector<ConnectPart> SplitConnect(const CQoString& connect)
{
    std::vector<ConnectPart> parts;
    const char* p = connect.GetString();
    const char* const end = p + connect.GetLength();
    while (p < end) {
        const char* start = p;
        bool braced = false;
        while (p < end && (braced || *p != ';')) {
            if (*p == '{')
                braced = true;
            else if (*p == '}')
                braced = false;
            ++p;
        }
        ConnectPart part;
        part.text = CQoString(start, static_cast<int>(p - start));
        if (p < end)
            ++p;   // the ';'
        int equals = part.text.Find('=');
        if (equals >= 0) {
            part.key = part.text.Left(equals);
            part.key.Trim();
            part.value = part.text.Mid(equals + 1);
        }
        parts.push_back(part);
    }
    return parts;
}

CQoString JoinConnect(const std::vector<ConnectPart>& parts)
{
    CQoString text;
    for (size_t i = 0; i < parts.size(); ++i) {
        if (i > 0)
            text += ";";
        text += parts[i].text;
    }
    return text;
}

void SetPart(ConnectPart& part, const CQoString& value)
{
    part.value = value;
    part.text = part.key + "=" + value;
}

// The value of `key` (without braces), empty when the string has none.
CQoString ConnectValue(const CQoString& connect, const char* key)
{
    for (const ConnectPart& part : SplitConnect(connect)) {
        if (_stricmp(part.key, key) != 0)
            continue;
        CQoString value = part.value;
        value.Trim();
        if (value.GetLength() >= 2 && value.GetAt(0) == '{' && value.GetAt(value.GetLength() - 1) == '}')
            value = value.Mid(1, value.GetLength() - 2);
        return value;
    }
    return CQoString();
}

// Drivers whose Database= names a file (the others name a database of a server).
bool IsFileDriver(const CQoString& connect)
{
    CQoString driver = ConnectValue(connect, "Driver");
    driver.MakeLower();
    static const char* const kFileDrivers[] = {"sqlite", "mdb", "access", "excel", "dbase", "text", "paradox"};
    for (const char* kind : kFileDrivers)
        if (driver.Find(kind) >= 0)
            return true;
    return false;
}

// The SQLite file a connect string names, empty for any other source.
CQoString SqliteFile(const CQoString& connect)
{
    CQoString driver = ConnectValue(connect, "Driver");
    driver.MakeLower();
    return driver.Find("sqlite") >= 0 ? ConnectValue(connect, "Database") : CQoString();
}

// The connect string with `key` set to `value` (replaced when present).
CQoString WithKey(const CQoString& connect, const char* key, const char* value)
{
    std::vector<ConnectPart> parts = SplitConnect(connect);
    bool found = false;
    for (ConnectPart& part : parts)
        if (_stricmp(part.key, key) == 0) {
            SetPart(part, value);
            found = true;
        }
    if (!found) {
        ConnectPart part;
        part.key = key;
        SetPart(part, value);
        parts.push_back(part);
    }
    return JoinConnect(parts);
}

// A file database's file named in DBQ= (always a file) or, for drivers of
// files, in Database=, made absolute against the project folder like the
// file names; a server's database name stays as it is.
CQoString ConnectInFolder(const CQoString& folder, const CQoString& connect)
{
    if (folder.IsEmpty())
        return connect;
    std::vector<ConnectPart> parts = SplitConnect(connect);
    const bool fileDriver = IsFileDriver(connect);
    for (ConnectPart& part : parts) {
        if (_stricmp(part.key, "DBQ") == 0 || (fileDriver && _stricmp(part.key, "Database") == 0)) {
            CQoString value = part.value;
            value.Trim();
            if (!value.IsEmpty() && value.GetAt(0) != '{')
                SetPart(part, CConversion::InFolder(folder, value));
        }
    }
    return JoinConnect(parts);
}
}

void CConversion::PlaceInFolder(const CQoString& folder)
{
    m_inputFile = InFolder(folder, m_inputFile);
    m_outputFile = InFolder(folder, m_outputFile);
    m_inputConnect = ConnectInFolder(folder, m_inputConnect);
    m_outputConnect = ConnectInFolder(folder, m_outputConnect);
    m_inputDatabase = InFolder(folder, m_inputDatabase);
    m_outputDatabase = InFolder(folder, m_outputDatabase);
}

int CConversion::FileMode(int charset)
{
    switch (charset) {
    case charsetAscii: return CQoFile::ascii;
    case charsetMixed: return CQoFile::ansimix;
    default:           return CQoFile::ansi;
    }
}

long CConversion::Run()
{
    return InputIsDatabase() || OutputIsDatabase() || m_bFilters || m_columns.IsDefined() ? RunRecords()
                                                                                             : RunLines();
}

namespace {
[[noreturn]] void RefuseName(const char* what, const CQoString& name, const CQoString& problem)
{
    CQoString text;
    text.Format("%s '%s' kann nicht in SQL stehen: %s", what, name.GetString(), problem.GetString());
    CQoException::Throw(text, what);
}

// A table or column name as the driver takes it: a name the user quoted
// already (", [ or `) must be one clean name as it stands; any other is put
// in the driver's identifier quote whole, so that no name can end a
// statement or start another.
CQoString SqlName(const CQoString& name, const CString& quote, const char* what)
{
    CQoString problem;
    if (name.IsEmpty()) {
        problem = "der Name ist leer";
        RefuseName(what, name, problem);
    }
    for (int i = 0; i < name.GetLength(); ++i)
        if (static_cast<unsigned char>(name.GetAt(i)) < 0x20) {
            problem = "er enth\xE4lt ein Steuerzeichen";
            RefuseName(what, name, problem);
        }
    const bool quoted = strchr("\"[`", name.GetAt(0)) != nullptr;
    if (quoted || quote.IsEmpty()) {
        if (!QoCheckSqlName(name, problem))
            RefuseName(what, name, problem);
        return name;
    }
    return QoQuoteSqlName(name, quote);
}

// A file database the filter could not open, with the reason it gave.
[[noreturn]] void RefuseClosedDatabase(const CQoString& file, const CQoString& why)
{
    CQoString text;
    text.Format("Die Datenbank '%s' ist nicht ge\xF6" "ffnet: %s", file.GetString(),
                why.IsEmpty() ? "die Passworteingabe wurde abgebrochen" : why.GetString());
    CQoException::Throw(text, file);
}

// A table name of an Access-type database: brackets are Access's way of
// quoting a name in SQL, not part of it.
CQoString AccessName(const CQoString& name)
{
    CQoString text = name;
    text.Trim();
    if (text.GetLength() >= 2 && text.GetAt(0) == '[' && text.GetAt(text.GetLength() - 1) == ']') {
        text = text.Mid(1, text.GetLength() - 2);
        text.Replace("]]", "]");
    }
    return text;
}
}

CQoInputFilter* CConversion::NewInputFilter() const
{
    return MakeInputFilter(false);
}

CQoInputFilter* CConversion::MakeInputFilter(bool run) const
{
    std::unique_ptr<CQoInputFilter> filter;
    switch (InputKind()) {
    case inputOdbc: {
        CQoInputFilterODBC* odbc = new CQoInputFilterODBC(m_inputConnect);
        filter.reset(odbc);
        odbc->SetTableName(m_inputSql.IsEmpty() ? m_inputTable : m_inputSql);
        odbc->SetTableType(m_inputSql.IsEmpty() ? CQoInputFilterDB::tableTable : CQoInputFilterDB::tableSql);
        return filter.release();
    }
    case inputDatabase: {
        bool excel = _stricmp(m_inputDatabase.Right(5), ".xlsx") == 0;
        CQoInputFilterDao* dao = new CQoInputFilterDao(excel ? CQoFile::typeExcel : CQoFile::typeAccess);
        filter.reset(dao);
        dao->Password(m_inputPassword);
        // A project names its table with its keys; the page's pick comes back
        // through TakeInputSettings.
        if (!m_inputSql.IsEmpty()) {
            dao->SetTableName(m_inputSql);
            dao->SetTableType(CQoInputFilterDB::tableSql);
        } else if (!m_inputTable.IsEmpty()) {
            dao->SetTableName(AccessName(m_inputTable));
            dao->SetTableType(CQoInputFilterDB::tableTable);
        }
        return filter.release();
    }
    case inputFixed:
        filter.reset(new CQoInputFilterTextFix);
        break;
    case inputColumns:
        filter.reset(new CQoInputFilterTextVF);
        break;
    case inputDbase:
        filter.reset(new CQoInputFilterDbase34);
        break;
    default: {
        // The delimited input of a run logs its defective records.
        CQoInputFilterTextVar* text = run ? new CConversionInput(*const_cast<CConversion*>(this))
                                          : new CQoInputFilterTextVar;
        filter.reset(text);
        text->Delimiter(';');
        text->SetFirstRowHasNames(true);
        break;
    }
    }
    filter->CharSet(FileMode(m_inputCharset));
    if (m_filterSettings.HasSection(kInputFilter)) {
        CQoConfigFile settings(m_filterSettings);   // the filters read from a file they may change
        filter->ReadConfig(settings, kInputFilter);
    }
    return filter.release();
}

void CConversion::OpenInputFilter(CQoInputFilter& filter, const CQoString& folder, bool numbered) const
{
    switch (InputKind()) {
    case inputOdbc: {
        // The rows of a table are counted (a large table is read once more
        // for it) only when they are to be reached by number.
        CQoInputFilterODBC& odbc = static_cast<CQoInputFilterODBC&>(filter);
        CQoString table = odbc.GetTableName();
        CQoInputFilterDB::tabletype type = odbc.GetTableType();
        odbc.SetTableName(CQoString());
        CQoString connect = ConnectInFolder(folder, m_inputConnect);
        // The SQLite driver answers from memory when it does not step: the
        // file is then not locked while the output writes into it.
        if (m_bInputFromMemory)
            connect = WithKey(connect, "StepAPI", "0");
        odbc.Init(connect);
        if (!odbc.GetDatabase().IsOpen()) {
            CQoString text;
            text.Format("Die ODBC-Eingabe kann nicht verbunden werden: %s", odbc.LastError().GetString());
            CQoException::Throw(text, "ODBC");
        }
        odbc.SetTableName(table);
        if (!table.IsEmpty()) {
            if (type == CQoInputFilterDB::tableTable) {
                odbc.InitTable(SqlName(table, odbc.GetDatabase().GetIdentifierQuote(), "Die Eingabetabelle"), type,
                               numbered);
                odbc.SetTableName(table);   // the project keeps the name as the user wrote it
            } else {
                odbc.InitTable(table, type, numbered);
            }
        }
        break;
    }
    case inputDatabase: {
        CQoInputFilterDao& dao = static_cast<CQoInputFilterDao&>(filter);
        CQoString name = InFolder(folder, m_inputDatabase);
        dao.Init(name);
        if (!dao.GetDatabase().IsOpen())
            RefuseClosedDatabase(name, dao.LastError());
        break;
    }
    default:
        filter.Init(InFolder(folder, m_inputFile));
        break;
    }
}

CQoInputFilter* CConversion::NewInput()
{
    std::unique_ptr<CQoInputFilter> filter(MakeInputFilter(true));
    OpenInputFilter(*filter);
    return filter.release();
}

namespace {
// The ODBC output keeps only its column names in a project; its table's
// columns are kept as the file-database output keeps them, so that types,
// lengths and indexes set on its page are not lost.
void TransferColumns(CQoOutputFilterDB& from, CQoOutputFilterDB& to)
{
    to.SetTableName(from.GetTableName());
    to.NumCols(from.NumCols());
    CQoString name;
    for (int c = 0; c < from.NumCols(); ++c) {
        from.GetColumnName(c, name);
        to.ColumnName(c, name);
        to.SetType(c, from.GetType(c));
        to.SetLength(c, from.GetLength(c));
        to.SetIndexed(c, from.GetIndexed(c));
    }
}
}

CQoOutputFilter* CConversion::NewOutputFilter() const
{
    std::unique_ptr<CQoOutputFilter> filter;
    CQoConfigFile settings(m_filterSettings);   // the filters read from a file they may change
    const bool stored = m_filterSettings.HasSection(kOutputFilter);
    switch (OutputKind()) {
    case outputOdbc: {
        CQoOutputFilterODBC* odbc = new CQoOutputFilterODBC;
        filter.reset(odbc);
        if (stored) {
            CQoOutputFilterDao columns;
            columns.ReadConfig(settings, kOutputFilter);
            TransferColumns(columns, *odbc);
        }
        odbc->SetTableName(m_outputTable);
        return filter.release();
    }
    case outputDatabase: {
        CQoOutputFilterDao* dao = new CQoOutputFilterDao;
        filter.reset(dao);
        dao->Password(m_outputPassword);
        if (stored)
            dao->ReadConfig(settings, kOutputFilter);
        dao->SetTableName(AccessName(m_outputTable));
        return filter.release();
    }
    case formatDbase:
        filter.reset(new CQoOutputFilterDbase);
        break;
    case formatFixed:
        filter.reset(new CQoOutputFilterTextFix);
        filter->FileCharSet(FileMode(m_outputCharset));
        break;
    default: {
        CQoOutputFilterTextVar* delimited = new CQoOutputFilterTextVar;
        filter.reset(delimited);
        delimited->WriteHeaderFlag(true);
        filter->FileCharSet(FileMode(m_outputCharset));
        break;
    }
    }
    if (stored)
        filter->ReadConfig(settings, kOutputFilter);
    return filter.release();
}

void CConversion::FitOutputColumns(CQoOutputFilter& output, CQoOutputSource& source) const
{
    const int known = output.NumCols();
    const int columns = source.GetNumColumns();
    output.NumCols(columns);
    CQoString name;
    for (int c = 0; c < columns; ++c) {
        source.GetColumnName(c, name);
        output.ColumnName(c, name);
    }
    // A table's new column takes any value read (the filter's default would cut it).
    if (CQoOutputFilterDB* table = dynamic_cast<CQoOutputFilterDB*>(&output)) {
        for (int c = known; c < columns; ++c) {
            table->SetType(c, CQoOutputFilterDB::dbtypeText);
            table->SetLength(c, 255);
        }
    }
}

void CConversion::TakeInputSettings(CQoInputFilter& input)
{
    m_filterSettings.DeleteSection(kInputFilter);
    if (CQoInputFilterDB* table = dynamic_cast<CQoInputFilterDB*>(&input)) {
        // A database input is named by the project's keys alone.
        if (table->GetTableType() == CQoInputFilterDB::tableSql) {
            m_inputSql = table->GetTableName();
            m_inputTable.Empty();
        } else {
            m_inputTable = table->GetTableName();
            m_inputSql.Empty();
        }
    } else {
        input.WriteConfig(m_filterSettings, kInputFilter);
    }
    m_bFilters = true;
}

void CConversion::TakeOutputSettings(CQoOutputFilter& output)
{
    m_filterSettings.DeleteSection(kOutputFilter);
    if (CQoOutputFilterODBC* odbc = dynamic_cast<CQoOutputFilterODBC*>(&output)) {
        CQoOutputFilterDao columns;
        TransferColumns(*odbc, columns);
        columns.WriteConfig(m_filterSettings, kOutputFilter);
    } else {
        output.WriteConfig(m_filterSettings, kOutputFilter);
    }
    if (CQoOutputFilterDB* table = dynamic_cast<CQoOutputFilterDB*>(&output))
        m_outputTable = table->GetTableName();
    m_bFilters = true;
}

CQoOutputFilter* CConversion::NewOutput(CQoOutputSource& source, CQoFile& file, std::string& temp)
{
    // The output: a table, or a file written beside its target and put in
    // place at the end.
    std::unique_ptr<CQoOutputFilter> output(NewOutputFilter());
    FitOutputColumns(*output, source);
    switch (OutputKind()) {
    case outputOdbc: {
        CQoOutputFilterODBC* odbc = static_cast<CQoOutputFilterODBC*>(output.get());
        odbc->UseDB(m_outputConnect);
        // Every name in the connected driver's quote: a column name read
        // from a file's first line, or a table name of a project, is a name
        // and nothing else.
        const CString quote = odbc->GetDatabase().GetIdentifierQuote();
        odbc->SetTableName(SqlName(m_outputTable, quote, "Die Ausgabetabelle"));
        CQoString name;
        for (int c = 0; c < output->NumCols(); ++c) {
            output->GetColumnName(c, name);
            output->ColumnName(c, SqlName(name, quote, "Die Ausgabespalte"));
        }
        return output.release();
    }
    case outputDatabase: {
        CQoOutputFilterDao* dao = static_cast<CQoOutputFilterDao*>(output.get());
        dao->UseDB(m_outputDatabase);
        // An open refused (a password missing or wrong, the prompt cancelled)
        // leaves the database closed with the reason.
        if (!dao->LastError().IsEmpty())
            RefuseClosedDatabase(m_outputDatabase, dao->LastError());
        return output.release();
    }
    default:
        temp = OpenOutputBeside(file, CQoFile::binary);
        output->UseFile(&file, true);
        return output.release();
    }
}

namespace {
// A table's rows go into a new table that takes the old one's place only at
// the end (ReleaseDB, ReleaseFile); Discard leaves the old table as it was.
void FinishOutput(CQoOutputFilter& output)
{
    if (CQoOutputFilterODBC* odbc = dynamic_cast<CQoOutputFilterODBC*>(&output))
        odbc->ReleaseDB();
    else
        output.ReleaseFile();   // a table of a file database, or a file: closing stores what is queued
}

void DiscardOutput(CQoOutputFilter& output)
{
    if (CQoOutputFilterODBC* odbc = dynamic_cast<CQoOutputFilterODBC*>(&output))
        odbc->Discard();
    else if (CQoOutputFilterDao* dao = dynamic_cast<CQoOutputFilterDao*>(&output))
        dao->Discard();
}
}

CQoString CConversion::InputSqliteFile() const
{
    if (!m_inputConnect.IsEmpty())
        return SqliteFile(m_inputConnect);
    return m_inputDatabase;
}

CQoString CConversion::OutputSqliteFile() const
{
    if (!m_outputConnect.IsEmpty())
        return SqliteFile(m_outputConnect);
    return m_outputDatabase;   // a file database is written as an SQLite file
}

void CConversion::CheckSameDatabase()
{
    // The output fills a new table while the input reads; the old table is
    // replaced only after the input has let go of it, so one table can be
    // read and replaced in one run. SQLite locks the whole file, though: a
    // reader that steps through its rows keeps a writer from committing.
    m_bInputFromMemory = false;
    const CQoString in = InputSqliteFile();
    const CQoString out = OutputSqliteFile();
    if (in.IsEmpty() || out.IsEmpty() || !CQoFile::SameFile(in, out))
        return;
    if (!m_inputConnect.IsEmpty()) {
        m_bInputFromMemory = true;   // the driver reads the whole result at once
        _theLog << "Eingabe und Ausgabe liegen in derselben Datenbankdatei; die Eingabe wird vorab ganz gelesen"
                << CQoLog::endl;
        return;
    }
    CQoString text;
    text.Format("Eingabe und Ausgabe liegen in derselben Datenbankdatei '%s'. Als Datei-Datenbank kann sie nicht "
                "zugleich gelesen und geschrieben werden; lesen Sie die Eingabe \xFC" "ber ODBC "
                "(ODBC=Driver=SQLite3;Database=...).",
                out.GetString());
    CQoException::Throw(text, "CConversion::Run");
}

long CConversion::RunRecords()
{
    // Refused or arranged before anything is read or written.
    CheckSameDatabase();

    m_lSkipped = 0;
    std::unique_ptr<CQoInputFilter> input(NewInput());
    CConversionInput* logged = dynamic_cast<CConversionInput*>(input.get());
    if (input->NumCols() == 0)
        CQoException::Throw("Die Eingabe hat keine Spalten.", "CConversion::Run");
    // One pass from the first record to the last: no row index is needed,
    // so memory stays flat whatever the input's size.
    input->NoCache(true);
    CInputRecords records(input.get());
    records.FreezeView();
    // The output columns: composed of the input's, chosen and ordered.
    m_columns.Build(records);
    for (const CQoString& missing : m_columns.MissingSources())
        _theLog << "W: " << missing.GetString() << CQoLog::endl;
    CColumnView& view = m_columns.View();
    int const columns = view.GetNumColumns();
    if (columns == 0)
        CQoException::Throw("Im Projekt ist keine Ausgabespalte ausgew\xE4hlt.", "Spaltenauswahl");
    view.FreezeView();

    CQoFile file;
    std::string temp;
    std::unique_ptr<CQoOutputFilter> output(NewOutput(view, file, temp));
    long written = 0;
    try {
        if (!output->Init())
            CQoException::Throw("Die Ausgabe kann nicht geschrieben werden.", "CConversion::Run");
        output->WriteHeader();
        CQoString value;
        long row = 0;
        for (bool ok = input->FirstRow(); ok; ok = input->NextRow(), ++row) {
            records.StandsOn(row);
            output->InitRow();
            for (int c = 0; c < columns; ++c) {
                view.GetValue(row, c, value);
                output->Value(c, value);
            }
            if (!output->WriteRow())
                CQoException::Throw("Ein Satz wurde nicht gespeichert.", "CConversion::Run");
            ++written;
            if (m_pProgress != nullptr && !m_pProgress->Advance(written, input->getActPosInFile()))
                throw CConversionCancelled();
        }
        if (logged != nullptr)
            logged->Flush();
        // The input lets go of its table before the output's new table
        // takes the old one's place (it may be the same table).
        if (CQoInputFilterDB* table = dynamic_cast<CQoInputFilterDB*>(input.get()))
            table->CloseResources();
        FinishOutput(*output);
    } catch (...) {
        if (logged != nullptr)
            logged->Flush();
        DiscardOutput(*output);
        if (!temp.empty()) {
            try {
                output->ReleaseFile();
            } catch (const CQoException&) {
            }
            CQoFile::Remove(temp.c_str());
        }
        throw;
    }
    if (!temp.empty())
        PutOutputInPlace(temp);
    return written;
}

std::string CConversion::OpenOutputBeside(CQoFile& file, int mode)
{
    // Writing over the input would destroy it before it is read: the same
    // file under another spelling (case, "..", "./") counts as the same.
    if (CQoFile::SameFile(m_inputFile, m_outputFile)) {
        CQoString text;
        text.Format("Die Ausgabedatei '%s' ist die Eingabedatei '%s'; sie w\xFCrde \xFC" "berschrieben.",
                    (const char*)m_outputFile, (const char*)m_inputFile);
        CQoException::Throw(text, "CConversion::Run");
    }
    // The output is written beside the target and takes its place only when
    // complete: a stopped run or a full disk leaves the previous output.
    std::string temp = CQoFile::NewTempFileBeside(m_outputFile);
    if (temp.empty() || !file.Open(temp.c_str(), CQoFile::write | CQoFile::create | mode)) {
        if (!temp.empty())
            CQoFile::Remove(temp.c_str());
        CQoString text;
        text.Format("Die Ausgabedatei '%s' kann nicht angelegt werden.", (const char*)m_outputFile);
        CQoException::Throw(text, "CConversion::Run");
    }
    return temp;
}

void CConversion::PutOutputInPlace(const std::string& temp)
{
    if (!CQoFile::MoveOver(temp.c_str(), m_outputFile)) {
        CQoFile::Remove(temp.c_str());
        CQoString text;
        text.Format("Die Ausgabedatei '%s' kann nicht ersetzt werden.", (const char*)m_outputFile);
        CQoException::Throw(text, "CConversion::Run");
    }
}

long CConversion::RunLines()
{
    CQoFile output;
    std::string temp = OpenOutputBeside(output, FileMode(m_outputCharset));
    CQoFile input;
    if (!input.Open(m_inputFile, CQoFile::read | FileMode(m_inputCharset))) {
        output.Close();
        CQoFile::Remove(temp.c_str());
        CQoString text;
        text.Format("Die Eingabedatei '%s' kann nicht ge\xF6" "ffnet werden.", (const char*)m_inputFile);
        CQoException::Throw(text, "CConversion::Run");
    }


    long records = 0;
    try {
        CQoString line;
        while (input.ReadString(line)) {
            line += "\r\n";
            output.Write(line);
            ++records;
            if (m_pProgress != nullptr && !m_pProgress->Advance(records, input.Tell()))
                throw CConversionCancelled();
        }
        output.Flush(true);
        output.Close();
    } catch (...) {
        try {
            output.Close();
        } catch (const CQoException&) {
            // the write already failed; that error is the one to report
        }
        CQoFile::Remove(temp.c_str());
        throw;
    }
    input.Close();
    PutOutputInPlace(temp);
    return records;
}
