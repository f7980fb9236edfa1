// The input filter's common state and the defaults of its operations.
#include "CQoInputFilter.h"

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "CQoInterActive.h"

#include <cstdio>

CQoInputFilter::CQoInputFilter()
    : m_nCharSet(CQoFile::ansi)
{
}

CQoInputFilter::CQoInputFilter(CQoInputFilter const &other) = default;
CQoInputFilter &CQoInputFilter::operator=(CQoInputFilter const &other) = default;

CQoInputFilter::~CQoInputFilter() = default;

void CQoInputFilter::Delete()
{
    delete this;
}

char const *CQoInputFilter::FileName() const
{
    return m_strFileName;
}

CQoString CQoInputFilter::DefaultColName(int col) const
{
    if (col >= 0 && col < static_cast<int>(m_colNames.size()) && !m_colNames[col].IsEmpty())
        return m_colNames[col];
    CQoString name;
    name.Format("Feld %d", col + 1);
    return name;
}

void CQoInputFilter::ColName(int col, CQoString &name)
{
    if (col < 0 || col >= NumCols()) {
        name.Empty();
        return;
    }
    name = DefaultColName(col);
}

void CQoInputFilter::SetColName(int col, CQoString const &name)
{
    if (col < 0 || col >= NumCols())
        return;
    if (static_cast<int>(m_colNames.size()) <= col)
        m_colNames.resize(col + 1);
    if (m_colNames[col] != name) {
        m_colNames[col] = name;
        m_bModified = true;
    }
}

void CQoInputFilter::SetNumColsInternal(int cols)
{
    if (cols < 0)
        cols = 0;
    m_nNumCols = cols;
    m_colNames.resize(cols);
}

int CQoInputFilter::NumCols()
{
    return m_nNumCols;
}

long CQoInputFilter::NumRows()
{
    return CalculateRecordCount();
}

long CQoInputFilter::CalculateRecordCount()
{
    if (m_bNumRowsKnown)
        return m_lNumRows;
    long count = 0;
    for (bool ok = FirstRow(); ok; ok = NextRow())
        ++count;
    m_lNumRows = count;
    m_bNumRowsKnown = true;
    return m_lNumRows;
}

void CQoInputFilter::SetNumRows(long rows)
{
    m_lNumRows = rows > 0 ? rows : 0;
    m_bNumRowsKnown = rows > 0;
}

bool CQoInputFilter::FirstRow()
{
    m_lCurrentRow = -1;
    return false;
}

bool CQoInputFilter::NextRow()
{
    return false;
}

bool CQoInputFilter::AbsoluteRow(long row)
{
    if (row < 0)
        return false;
    if (m_lCurrentRow < 0 || row < m_lCurrentRow) {
        if (!FirstRow())
            return false;
    }
    // Rows are counted here, so that derived filters without a row number
    // of their own can use this walk as well.
    long at = m_lCurrentRow < 0 ? 0 : m_lCurrentRow;
    while (at < row) {
        if (!NextRow())
            return false;
        ++at;
    }
    m_lCurrentRow = row;
    return true;
}

void CQoInputFilter::Value(int col, CQoString &value)
{
    value.Empty();
}

bool CQoInputFilter::EmptyRow()
{
    CQoString value;
    int cols = NumCols();
    for (int c = 0; c < cols; ++c) {
        Value(c, value);
        if (!value.IsEmpty())
            return false;
    }
    return true;
}

void CQoInputFilter::Init(CQoString const &name)
{
    m_strFileName = name;
    m_lCurrentRow = -1;
    m_lWrongInputs = 0;
    m_strLastWrongInput.Empty();
}

int CQoInputFilter::InputFilterType() const
{
    return m_fileType;
}

void CQoInputFilter::BeginDescription()
{
    m_description.clear();
    m_nextDescription = 0;
    AddDescription(CQoString("Datei: ") + m_strFileName);
    CQoString line;
    line.Format("Spalten: %d", m_nNumCols);
    AddDescription(line);
    char const *set = m_nCharSet == CQoFile::ascii     ? "DOS Ascii"
                      : m_nCharSet == CQoFile::ansimix ? "Ansi/Ascii"
                                                       : "Windows Ansi";
    AddDescription(CQoString("Zeichensatz: ") + set);
    AddDescription(m_bFirstRowHasNames ? "Erste Zeile enth\xE4lt Feldbezeichnungen"
                                       : "Erste Zeile enth\xE4lt Daten");
}

void CQoInputFilter::AddDescription(CQoString const &line)
{
    m_description.push_back(line);
}

bool CQoInputFilter::StartDescription(CQoString &line)
{
    BeginDescription();
    return NextDescription(line);
}

bool CQoInputFilter::NextDescription(CQoString &line)
{
    if (m_nextDescription >= m_description.size())
        return false;
    line = m_description[m_nextDescription++];
    return true;
}

void CQoInputFilter::CopyFrom(CQoInputFilter const &other)
{
    if (&other == this)
        return;
    m_nCharSet = other.m_nCharSet;
    m_bFirstRowHasNames = other.m_bFirstRowHasNames;
    m_bNoCache = other.m_bNoCache;
    m_bModified = true;
}

// Keys of the common settings.
static char const keyFile[] = "file";
static char const keyCharSet[] = "charset";
static char const keyFirstRow[] = "firstrownames";

void CQoInputFilter::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    cfg.SetValue(section, keyFile, m_strFileName);
    cfg.SetValue(section, keyCharSet, m_nCharSet);
    cfg.SetValue(section, keyFirstRow, m_bFirstRowHasNames ? 1 : 0);
}

void CQoInputFilter::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    cfg.GetValue(section, keyFile, m_strFileName);
    int charSet = m_nCharSet;
    if (cfg.GetValue(section, keyCharSet, charSet))
        CharSet(charSet);
    int firstRow = m_bFirstRowHasNames ? 1 : 0;
    if (cfg.GetValue(section, keyFirstRow, firstRow))
        m_bFirstRowHasNames = firstRow != 0;
}

bool CQoInputFilter::GetFirstRowHasNames() const
{
    return m_bFirstRowHasNames;
}

void CQoInputFilter::LoadColumnNames()
{
}

bool CQoInputFilter::CreateIndexFile()
{
    return false;
}

int CQoInputFilter::ReportWrongInput(CQoString &data, int &nextPos)
{
    ++m_lWrongInputs;
    long row = m_lCurrentRow + 1;
    CQoString shown = data.Left(nextPos > 0 && nextPos < 80 ? nextPos : 80);
    shown.TrimNewline();
    m_strLastWrongInput.Format("Fehlerhafter Satz nach Zeile %ld in %s: %s", row,
                               m_strFileName.GetString(), shown.GetString());
    return CQoInterActive::RepairRecord(m_strFileName, data, nextPos);
}

void CQoInputFilter::NoCache(bool noCache)
{
    m_bNoCache = noCache;
}

void CQoInputFilter::replaceFile(char const *newFile)
{
    if (!newFile || !*newFile || m_strFileName.IsEmpty())
        CQoException::Throw(CQoException::replaceError, m_strFileName);
    CloseFile();
    // One step: the old file stays in place unless the new one takes it.
    if (!CQoFile::MoveOver(newFile, m_strFileName)) {
        ReopenFile();
        CQoException::Throw(CQoException::replaceError, m_strFileName);
    }
    m_bNumRowsKnown = false;
    m_lNumRows = 0;
    ReopenFile();
}

long long CQoInputFilter::getActPosInFile()
{
    return -1;
}

void CQoInputFilter::CharSet(int charSet)
{
    if (charSet != CQoFile::ansi && charSet != CQoFile::ascii && charSet != CQoFile::ansimix)
        return;
    if (charSet != m_nCharSet) {
        m_nCharSet = charSet;
        m_bModified = true;
    }
}

void CQoInputFilter::SetFirstRowHasNames(bool hasNames)
{
    if (hasNames != m_bFirstRowHasNames) {
        m_bFirstRowHasNames = hasNames;
        m_bModified = true;
    }
}

bool CQoInputFilter::CloseFile()
{
    m_lCurrentRow = -1;
    return true;
}

bool CQoInputFilter::ReopenFile()
{
    Init(CQoString(m_strFileName));
    return true;
}
