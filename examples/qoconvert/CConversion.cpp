#include "CConversion.h"

#include <CQoException.h>
#include <CQoFile.h>
#include <CQoInterActive.h>
#include <CQoLog.h>
#include <CQoInputFilterDao.h>
#include <CQoInputFilterODBC.h>
#include <CQoOutputFilterDao.h>
#include <CQoInputFilterTextVar.h>
#include <CQoOutputFilterODBC.h>
#include <CQoOutputFilterTextFix.h>
#include <CQoOutputFilterTextVar.h>

#include "CInputRecords.h"

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
    : m_bSkipDefective(false), m_inputCharset(charsetAnsi), m_outputCharset(charsetAnsi),
      m_outputFormat(formatDelimited), m_bTextFilters(false), m_pProgress(nullptr), m_lSkipped(0)
{
}

void CConversion::ReadConfig(CQoConfigFile& config)
{
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
    if (config.HasKey(kOutput, "Format")) {
        CQoString text;
        config.GetValue(kOutput, "Format", text);
        int format = -1;
        if (!config.GetValue(kOutput, "Format", format) || (format != formatDelimited && format != formatFixed)) {
            CQoString message;
            message.Format("Unbekanntes Ausgabeformat '%s' in [Ausgabe] (erlaubt: 0 Trennzeichen, 1 feste L\xE4nge).",
                           (const char*)text);
            CQoException::Throw(message, "Format");
        }
        m_outputFormat = format;
    }
    m_filterSettings.Clear();
    m_filterSettings.CopySection(config, kInputFilter);
    m_filterSettings.CopySection(config, kOutputFilter);
    m_bTextFilters = config.HasSection(kInputFilter) || config.HasSection(kOutputFilter)
                     || config.HasKey(kOutput, "Format");
    if (InputIsDatabase() && m_inputTable.IsEmpty() && m_inputSql.IsEmpty())
        CQoException::Throw("Zur Datenbank-Eingabe fehlt die Tabelle (Tabelle=) oder die Abfrage (SQL=).", "Eingabe");
    if (OutputIsDatabase() && m_outputTable.IsEmpty())
        CQoException::Throw("Zur Datenbank-Ausgabe fehlt die Tabelle (Tabelle=).", "Ausgabe");
    m_columns.ReadConfig(config);
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

void CConversion::WriteConfig(CQoConfigFile& config) const
{
    config.SetValue(kInput, "Datei", m_inputFile);
    config.SetValue(kInput, "Zeichensatz", m_inputCharset);
    config.SetValue(kOutput, "Datei", m_outputFile);
    config.SetValue(kOutput, "Zeichensatz", m_outputCharset);
    config.SetValue(kInput, "Datenbank", m_inputDatabase);
    config.SetValue(kInput, "Tabelle", m_inputTable);
    config.SetValue(kOutput, "Datenbank", m_outputDatabase);
    config.SetValue(kOutput, "Tabelle", m_outputTable);
    if (m_bTextFilters) {
        config.SetValue(kOutput, "Format", m_outputFormat);
        config.CopySection(m_filterSettings, kInputFilter);
        config.CopySection(m_filterSettings, kOutputFilter);
    }
    m_columns.WriteConfig(config);
}

CQoString CConversion::InFolder(const CQoString& folder, const CQoString& file)
{
    bool absolute = (file.GetLength() >= 2 && file.GetAt(1) == ':')
                    || (!file.IsEmpty() && (file.GetAt(0) == '\\' || file.GetAt(0) == '/'));
    return absolute || file.IsEmpty() ? file : folder + "\\" + file;
}

namespace {
// The value of Database= or DBQ= in a connect string, made absolute against
// the project folder like the file names.
CQoString ConnectInFolder(const CQoString& folder, const CQoString& connect)
{
    CQoString result;
    int start = 0;
    while (start <= connect.GetLength()) {
        int end = connect.Find(';', start);
        if (end < 0)
            end = connect.GetLength();
        CQoString part = connect.Mid(start, end - start);
        int equals = part.Find('=');
        if (equals > 0) {
            CQoString key = part.Left(equals);
            key.Trim();
            if (_stricmp(key, "Database") == 0 || _stricmp(key, "DBQ") == 0)
                part = part.Left(equals + 1) + CConversion::InFolder(folder, part.Mid(equals + 1));
        }
        if (!result.IsEmpty() || start > 0)
            result += ";";
        result += part;
        start = end + 1;
    }
    return result;
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
    return InputIsDatabase() || OutputIsDatabase() || m_bTextFilters || m_columns.IsDefined() ? RunRecords()
                                                                                             : RunLines();
}

namespace {
// A column name as SQL takes it whatever it holds: in double quotes.
CQoString Quoted(const CQoString& name)
{
    CQoString quoted = "\"";
    for (int i = 0; i < name.GetLength(); ++i) {
        quoted += CQoString(name.GetString() + i, 1);
        if (name.GetAt(i) == '"')
            quoted += "\"";
    }
    return quoted + "\"";
}
}

CQoInputFilter* CConversion::NewInput() const
{
    if (!m_inputDatabase.IsEmpty()) {
        CQoString extension = m_inputDatabase.Right(5);
        bool excel = _stricmp(extension, ".xlsx") == 0;
        std::unique_ptr<CQoInputFilterDao> dao(new CQoInputFilterDao(excel ? CQoFile::typeExcel : CQoFile::typeAccess));
        if (m_inputSql.IsEmpty()) {
            dao->SetTableName(m_inputTable);
            dao->SetTableType(CQoInputFilterDB::tableTable);
        } else {
            dao->SetTableName(m_inputSql);
            dao->SetTableType(CQoInputFilterDB::tableSql);
        }
        dao->Init(m_inputDatabase);
        if (!dao->GetDatabase().IsOpen())
            CQoException::Throw("Die Datenbank ist nicht ge\xF6" "ffnet.", m_inputDatabase);
        return dao.release();
    }
    if (InputIsDatabase()) {
        std::unique_ptr<CQoInputFilterODBC> odbc(new CQoInputFilterODBC(m_inputConnect));
        odbc->Init("");
        if (m_inputSql.IsEmpty())
            odbc->InitTable(m_inputTable, CQoInputFilterDB::tableTable, false);
        else
            odbc->InitTable(m_inputSql, CQoInputFilterDB::tableSql, false);
        return odbc.release();
    }
    std::unique_ptr<CQoInputFilterTextVar> text(new CConversionInput(*const_cast<CConversion*>(this)));
    ConfigureInput(*text);
    text->Init(m_inputFile);
    return text.release();
}

void CConversion::ConfigureInput(CQoInputFilterTextVar& filter) const
{
    filter.Delimiter(';');
    filter.SetFirstRowHasNames(true);
    filter.CharSet(FileMode(m_inputCharset));
    if (m_filterSettings.HasSection(kInputFilter)) {
        CQoConfigFile settings(m_filterSettings);   // the filters read from a file they may change
        filter.ReadConfig(settings, kInputFilter);
    }
}

CQoOutputFilter* CConversion::NewTextOutput() const
{
    std::unique_ptr<CQoOutputFilter> text;
    if (m_outputFormat == formatFixed) {
        text.reset(new CQoOutputFilterTextFix);
    } else {
        CQoOutputFilterTextVar* delimited = new CQoOutputFilterTextVar;
        text.reset(delimited);
        delimited->WriteHeaderFlag(true);
    }
    text->FileCharSet(FileMode(m_outputCharset));
    if (m_filterSettings.HasSection(kOutputFilter)) {
        CQoConfigFile settings(m_filterSettings);
        text->ReadConfig(settings, kOutputFilter);
    }
    return text.release();
}

void CConversion::TakeFilterSettings(CQoInputFilter& input, CQoOutputFilter& output)
{
    m_filterSettings.Clear();
    input.WriteConfig(m_filterSettings, kInputFilter);
    output.WriteConfig(m_filterSettings, kOutputFilter);
    m_bTextFilters = true;
}

CQoOutputFilter* CConversion::NewOutput(CQoOutputSource& source, CQoFile& file, std::string& temp)
{
    // The output: a table (text columns wide enough for any value read), or
    // a text file written beside its target and put in place at the end.
    int const columns = source.GetNumColumns();
    CQoString name;
    if (!m_outputDatabase.IsEmpty()) {
        std::unique_ptr<CQoOutputFilterDao> dao(new CQoOutputFilterDao);
        dao->SetTableName(m_outputTable);
        dao->NumCols(columns);
        for (int c = 0; c < columns; ++c) {
            source.GetColumnName(c, name);
            dao->ColumnName(c, name);
            dao->SetType(c, CQoOutputFilterDB::dbtypeText);
            dao->SetLength(c, 255);
        }
        dao->UseDB(m_outputDatabase);
        return dao.release();
    }
    if (OutputIsDatabase()) {
        std::unique_ptr<CQoOutputFilterODBC> odbc(new CQoOutputFilterODBC);
        odbc->SetTableName(m_outputTable);
        odbc->NumCols(columns);
        for (int c = 0; c < columns; ++c) {
            source.GetColumnName(c, name);
            odbc->ColumnName(c, Quoted(name));
            odbc->SetType(c, CQoOutputFilterDB::dbtypeText);
            odbc->SetLength(c, 255);
        }
        odbc->UseDB(m_outputConnect);
        return odbc.release();
    }
    // The stored settings keep the lengths of the columns they know; a
    // column the input has gained gets the filter's default.
    std::unique_ptr<CQoOutputFilter> text(NewTextOutput());
    text->NumCols(columns);
    for (int c = 0; c < columns; ++c) {
        source.GetColumnName(c, name);
        text->ColumnName(c, name);
    }
    temp = OpenOutputBeside(file, CQoFile::binary);
    text->UseFile(&file, true);
    return text.release();
}

long CConversion::RunRecords()
{
    // The output table is replaced before the input is read: the same table
    // of the same database would be emptied before it is read.
    if (!m_inputDatabase.IsEmpty() && !m_outputDatabase.IsEmpty()
        && CQoFile::SameFile(m_inputDatabase, m_outputDatabase) && m_inputSql.IsEmpty()
        && _stricmp(m_inputTable, m_outputTable) == 0)
        CQoException::Throw("Die Ausgabetabelle ist die Eingabetabelle; sie w\xFCrde geleert.", m_outputTable);

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
        if (OutputIsDatabase() && m_outputDatabase.IsEmpty())
            static_cast<CQoOutputFilterODBC*>(output.get())->ReleaseDB();
        else
            output->ReleaseFile();   // a table: closing it stores what is queued
    } catch (...) {
        if (logged != nullptr)
            logged->Flush();
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
