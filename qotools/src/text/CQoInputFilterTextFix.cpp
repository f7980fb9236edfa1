#include "CQoInputFilterTextFix.h"

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoInterActive.h"
#include "QoLimits.h"
#include "QoTextReader.h"

#include <cstring>

CQoInputFilterTextFix::CQoInputFilterTextFix()
    : m_reader(new QoTextReader)
{
    m_fileType = filterTextFix;
}

CQoInputFilterTextFix::CQoInputFilterTextFix(CQoInputFilterTextFix const &other)
    : CQoInputFilter(other), m_reader(new QoTextReader), m_nRecordLen(other.m_nRecordLen),
      m_widths(other.m_widths)
{
    m_lCurrentRow = -1;
    m_bNumRowsKnown = false;
}

CQoInputFilterTextFix &CQoInputFilterTextFix::operator=(CQoInputFilterTextFix const &other)
{
    if (this != &other) {
        CQoInputFilter::operator=(other);
        m_reader->Close();
        m_nRecordLen = other.m_nRecordLen;
        m_widths = other.m_widths;
        m_lCurrentRow = -1;
        m_bNumRowsKnown = false;
    }
    return *this;
}

CQoInputFilterTextFix::~CQoInputFilterTextFix() = default;

void CQoInputFilterTextFix::RecordLen(int length)
{
    if (length < 1)
        length = 1;
    qolimits::Checked("recordlen", length, 1, qolimits::maxRecordLength);
    if (length != m_nRecordLen) {
        m_nRecordLen = length;
        m_bModified = true;
        m_bNumRowsKnown = false;
    }
}

void CQoInputFilterTextFix::SetNumCols(int cols)
{
    if (m_widths.SetCount(cols))
        m_bModified = true;
    SetNumColsInternal(m_widths.Count());
}

int CQoInputFilterTextFix::ColLen(int col) const
{
    return m_widths.Get(col);
}

void CQoInputFilterTextFix::ColLen(int col, int length)
{
    if (m_widths.Set(col, length))
        m_bModified = true;
}

long long CQoInputFilterTextFix::RowOffset(long row) const
{
    return m_dataStart + (static_cast<long long>(row) + (m_bFirstRowHasNames ? 1 : 0)) * m_nRecordLen;
}

// What may follow the last record without being data.
static bool IsTrailer(char const *data, std::size_t length)
{
    for (std::size_t i = 0; i < length; ++i)
        if (data[i] != '\r' && data[i] != '\n' && data[i] != ' ' && data[i] != 0x1A)
            return false;
    return true;
}

void CQoInputFilterTextFix::Init(CQoString const &name)
{
    CQoInputFilter::Init(name);
    m_reader->Close();
    m_corrections.clear();
    m_shortSkipped = false;
    m_shortRow = -1;
    m_bNumRowsKnown = false;
    m_lNumRows = 0;
    m_record.Empty();
    m_reader->Open(m_strFileName, m_nCharSet);
    m_dataStart = m_reader->BomLength();
    m_fileLength = m_reader->Length();
    m_colNames.assign(static_cast<std::size_t>(m_widths.Count()), CQoString());
    LoadColumnNames();
}

void CQoInputFilterTextFix::LoadColumnNames()
{
    if (!m_reader->IsOpen() || !m_bFirstRowHasNames)
        return;
    m_reader->SeekTo(m_dataStart);
    std::size_t have = m_reader->Ensure(static_cast<std::size_t>(m_nRecordLen));
    if (have > static_cast<std::size_t>(m_nRecordLen))
        have = static_cast<std::size_t>(m_nRecordLen);
    CQoString header(m_reader->Data(), static_cast<int>(have));
    m_colNames.assign(static_cast<std::size_t>(m_widths.Count()), CQoString());
    for (int i = 0; i < m_widths.Count() && m_widths.Offset(i) < static_cast<int>(have); ++i) {
        CQoString name = header.Mid(m_widths.Offset(i), m_widths.Get(i));
        name.TrimRight(" ");
        m_colNames[static_cast<std::size_t>(i)] = name;
    }
    m_lCurrentRow = -1;
}

long CQoInputFilterTextFix::CalculateRecordCount()
{
    if (m_bNumRowsKnown)
        return m_lNumRows;
    if (!m_reader->IsOpen())
        return 0;
    long long dataStart = RowOffset(0);
    long long rest = m_fileLength > dataStart ? m_fileLength - dataStart : 0;
    long rows = static_cast<long>(rest / m_nRecordLen);
    long long tail = rest % m_nRecordLen;
    if (tail > 0) {
        // A short last record counts when it is data (and not skipped).
        m_reader->SeekTo(dataStart + rest - tail);
        std::size_t have = m_reader->Ensure(static_cast<std::size_t>(tail));
        if (!IsTrailer(m_reader->Data(), have) && !m_shortSkipped)
            ++rows;
        if (m_lCurrentRow >= 0)
            ReadRecord(m_lCurrentRow);
    }
    m_lNumRows = rows;
    m_bNumRowsKnown = true;
    return rows;
}

bool CQoInputFilterTextFix::HandleShortRecord(long row, long long offset, std::size_t have)
{
    auto known = m_corrections.find(row);
    if (known != m_corrections.end()) {
        m_record = known->second;
        return true;
    }
    if (m_shortSkipped && row == m_shortRow)
        return false;
    CQoString data(m_reader->Data(), static_cast<int>(have));
    int pos = static_cast<int>(have);
    int answer = ReportWrongInput(data, pos);
    m_strLastWrongInput.Format("Satz %ld: %d statt %d Zeichen (%s)", row + 1, static_cast<int>(have),
                               m_nRecordLen, m_strFileName.GetString());
    switch (answer) {
    case CQoInterActive::repairTakeOver: {
        CQoString record = data;
        record.TrimNewline();
        if (record.GetLength() > m_nRecordLen)
            record = record.Left(m_nRecordLen);
        while (record.GetLength() < m_nRecordLen)
            record += ' ';
        m_corrections[row] = record;
        m_record = record;
        return true;
    }
    case CQoInterActive::repairSkip:
        m_shortSkipped = true;
        m_shortRow = row;
        if (m_bNumRowsKnown && m_lNumRows > row)
            m_lNumRows = row;
        return false;
    case CQoInterActive::repairStop:
        CQoException::Throw("Einlesen abgebrochen", m_strFileName);
    default:
        CQoException::Throw(CQoException::formatError, m_strLastWrongInput);
    }
}

bool CQoInputFilterTextFix::ReadRecord(long row)
{
    if (row < 0 || !m_reader->IsOpen())
        return false;
    long long offset = RowOffset(row);
    m_reader->SeekTo(offset);
    std::size_t want = static_cast<std::size_t>(m_nRecordLen);
    std::size_t have = m_reader->Ensure(want);
    if (have >= want) {
        m_record.Assign(m_reader->Data(), want);
        return true;
    }
    if (have == 0 || IsTrailer(m_reader->Data(), have))
        return false;
    return HandleShortRecord(row, offset, have);
}

bool CQoInputFilterTextFix::FirstRow()
{
    return AbsoluteRow(0);
}

bool CQoInputFilterTextFix::NextRow()
{
    if (m_lCurrentRow < 0)
        return false;
    return AbsoluteRow(m_lCurrentRow + 1);
}

bool CQoInputFilterTextFix::AbsoluteRow(long row)
{
    if (row == m_lCurrentRow && row >= 0)
        return true;
    if (!ReadRecord(row)) {
        m_lCurrentRow = -1;
        return false;
    }
    m_lCurrentRow = row;
    return true;
}

void CQoInputFilterTextFix::Value(int col, CQoString &value)
{
    value.Empty();
    if (m_lCurrentRow < 0 || col < 0 || col >= m_widths.Count())
        return;
    int start = m_widths.Offset(col);
    if (start >= m_record.GetLength())
        return;
    int end = start + m_widths.Get(col);
    if (end > m_record.GetLength())
        end = m_record.GetLength();
    char const *data = m_record.GetString();
    while (end > start && data[end - 1] == ' ')
        --end;
    value.Assign(data + start, static_cast<std::size_t>(end - start));
}

bool CQoInputFilterTextFix::CreateIndexFile()
{
    return m_reader->IsOpen();
}

long long CQoInputFilterTextFix::getActPosInFile()
{
    return m_lCurrentRow >= 0 ? RowOffset(m_lCurrentRow) : -1;
}

bool CQoInputFilterTextFix::CloseFile()
{
    m_reader->Close();
    return CQoInputFilter::CloseFile();
}

bool CQoInputFilterTextFix::StartDescription(CQoString &line)
{
    BeginDescription();
    CQoString text;
    text.Format("Satzl\xE4nge: %d", m_nRecordLen);
    AddDescription(text);
    for (int i = 0; i < m_widths.Count(); ++i)
        AddDescription(m_widths.Description(i));
    return NextDescription(line);
}

void CQoInputFilterTextFix::CopyFrom(CQoInputFilter const &other)
{
    CQoInputFilter::CopyFrom(other);
    if (auto const *fix = dynamic_cast<CQoInputFilterTextFix const *>(&other)) {
        m_nRecordLen = fix->m_nRecordLen;
        m_widths = fix->m_widths;
        SetNumColsInternal(m_widths.Count());
    }
}

void CQoInputFilterTextFix::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilter::WriteConfig(cfg, section);
    cfg.SetValue(section, "recordlen", m_nRecordLen);
    m_widths.WriteConfig(cfg, section);
}

void CQoInputFilterTextFix::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilter::ReadConfig(cfg, section);
    int length = m_nRecordLen;
    if (cfg.GetValue(section, "recordlen", length, 1, qolimits::maxRecordLength))
        RecordLen(length);
    if (m_widths.ReadConfig(cfg, section))
        m_bModified = true;
    SetNumColsInternal(m_widths.Count());
}
