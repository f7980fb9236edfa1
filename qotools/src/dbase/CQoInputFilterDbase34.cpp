#include "CQoInputFilterDbase34.h"

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "DbaseFormat.h"

#include <algorithm>
#include <cstdio>
#include <limits>
#include <memory>

namespace {

// A small buffer: the filter jumps around in the file as often as it reads
// through it, and every record is read whole into m_record anyway.
int const kBufferBlocks = 1;

char const *CharSetName(int charSet)
{
    if (charSet == CQoFile::ascii)
        return "DOS (850)";
    if (charSet == CQoFile::ansimix)
        return "Ansi/Ascii gemischt";
    return "Windows (1252)";
}

} // namespace

CQoInputFilterDbase34::CQoInputFilterDbase34() : m_file(kBufferBlocks)
{
    m_fileType = filterDbase3;
    CharSet(CQoFile::ascii);
    m_nRecordCharSet = CQoFile::ascii;
    SetModified(false);
}

CQoInputFilterDbase34::~CQoInputFilterDbase34()
{
    try {
        m_file.Close();
    } catch (CQoException const &) {
        // nothing was written; a failing close of a file we read loses nothing
    }
}

void CQoInputFilterDbase34::SkipDeleted(bool skip)
{
    if (skip == m_bSkipDeleted)
        return;
    m_bSkipDeleted = skip;
    SetModified(true);
    // Row numbers change their meaning: no current row, and a count only
    // when it is known for the new setting.
    m_physical = -1;
    m_lCurrentRow = -1;
    if (!skip && m_file.IsOpen()) {
        m_lNumRows = static_cast<long>(m_header.recordCount);
        m_bNumRowsKnown = true;
    } else if (skip && m_bDeletedKnown) {
        m_lNumRows = static_cast<long>(m_header.recordCount - m_deleted.size());
        m_bNumRowsKnown = true;
    } else {
        m_lNumRows = 0;
        m_bNumRowsKnown = false;
    }
}

// ---------------------------------------------------------------------------
// opening

namespace {
std::uint32_t RecordsHeld(std::int64_t fileLength, qodbase::Header const &header, char const *name)
{
    // The declared count is checked against the file's size: a damaged or
    // cut file must not claim billions of rows (nor a negative count where a
    // row number has 32 bits).
    std::int64_t body = fileLength - header.headerLength;
    // Whole records, and a cut one unless it is the lone end mark.
    std::int64_t held = 0;
    if (body > 0)
        held = body / header.recordLength + (body % header.recordLength > 1 ? 1 : 0);
    std::int64_t rows = std::min<std::int64_t>(header.recordCount, held + 1);
    if (rows > std::numeric_limits<long>::max()) {
        char text[200];
        std::snprintf(text, sizeof text, "Die dBase-Datei hat mehr S\344tze (%lld), als gelesen werden k\366nnen",
                      static_cast<long long>(rows));
        CQoException::Throw(text, name);
    }
    return static_cast<std::uint32_t>(rows);
}
} // namespace

void CQoInputFilterDbase34::Init(CQoString const &name)
{
    CloseFile();
    m_strFileName = name;
    m_header = HeaderData();
    m_deleted.clear();
    m_bDeletedKnown = false;
    m_lNumRows = 0;
    m_bNumRowsKnown = false;
    m_lCurrentRow = -1;
    m_lWrongInputs = 0;
    m_strLastWrongInput.Empty();
    SetNumColsInternal(0);

    m_file.OpenOrThrow(name, CQoFile::read | CQoFile::binary | CQoFile::ansi);
    try {
        unsigned char first[qodbase::headerSize];
        std::size_t got = m_file.Read(first, sizeof first);
        qodbase::Header header;
        if (got < sizeof first) {
            qodbase::ParseHeader(first, got, name, header); // raises: too short
        }
        std::size_t length = std::size_t(std::max(qodbase::HeaderLength(first), int(qodbase::headerSize)));
        std::unique_ptr<unsigned char[]> bytes(new unsigned char[length]);
        std::copy(first, first + qodbase::headerSize, bytes.get());
        got = qodbase::headerSize + m_file.Read(bytes.get() + qodbase::headerSize, length - qodbase::headerSize);
        qodbase::ParseHeader(bytes.get(), got, name, header);

        m_header.version = header.version;
        m_header.declaredCount = header.recordCount;
        m_header.recordCount = RecordsHeld(m_file.Length(), header, name);
        m_header.headerLength = header.headerLength;
        m_header.recordLength = header.recordLength;
        m_header.languageDriver = header.languageDriver;
        m_header.fields = header.fields;
        m_header.offsets = header.offsets;
    } catch (...) {
        m_file.Close();
        throw;
    }

    m_fileType = (m_header.version & 0x07) == 4 ? filterDbase4 : filterDbase3;
    m_nRecordCharSet = qodbase::CharSetOfLanguageDriver(m_header.languageDriver, CharSet());
    m_file.FileCharSet(m_nRecordCharSet);
    m_record.assign(std::size_t(m_header.recordLength), ' ');

    int count = NumFields();
    SetNumColsInternal(count);
    for (int i = 0; i < count; ++i) {
        // Field names are text of the file's code page as much as the values.
        CDbaseField &field = m_header.fields[std::size_t(i)];
        std::string name(field.Name().Str());
        CQoFile::ConvertToAnsi(m_nRecordCharSet, &name[0], name.size());
        field.Name(name.c_str());
        m_colNames[std::size_t(i)] = field.Name();
    }
    m_physical = -1;
    m_nextRead = -1;
    if (!m_bSkipDeleted) {
        // Every record is a row: the count is the header's.
        m_lNumRows = static_cast<long>(m_header.recordCount);
        m_bNumRowsKnown = true;
    }
}

bool CQoInputFilterDbase34::CloseFile()
{
    m_file.Close();
    m_lCurrentRow = -1;
    m_physical = -1;
    m_nextRead = -1;
    return true;
}

void CQoInputFilterDbase34::RequireOpen() const
{
    if (!m_file.IsOpen())
        CQoException::Throw(CQoException::notOpen, m_strFileName);
}

std::int64_t CQoInputFilterDbase34::RecordOffset(std::uint32_t record) const
{
    return std::int64_t(m_header.headerLength) + std::int64_t(record) * m_header.recordLength;
}

// ---------------------------------------------------------------------------
// records

bool CQoInputFilterDbase34::ReadRecord(std::uint32_t record)
{
    if (record >= m_header.recordCount)
        return false;
    if (m_nextRead != std::int64_t(record))
        m_file.Seek(RecordOffset(record));
    m_nextRead = -1;
    std::size_t want = std::size_t(m_header.recordLength);
    std::size_t got = m_file.Read(&m_record[0], want);
    if (got > 0 && static_cast<unsigned char>(m_record[0]) == qodbase::endOfFile && got < want) {
        // The end mark where a record should be: the file ends early.
        got = 0;
    }
    if (got < want) {
        char text[200];
        std::snprintf(text, sizeof text,
                      "Die dBase-Datei endet vorzeitig: Satz %lu von %lu fehlt oder ist unvollst\344ndig",
                      static_cast<unsigned long>(record) + 1, static_cast<unsigned long>(m_header.declaredCount));
        m_physical = -1;
        m_lCurrentRow = -1;
        CQoException::Throw(text, m_strFileName);
    }
    m_nextRead = std::int64_t(record) + 1;
    return true;
}

bool CQoInputFilterDbase34::ReadLiveFrom(std::uint32_t record, long row)
{
    // A filter without an open file has no rows (a preview stays empty).
    if (!m_file.IsOpen())
        return false;
    for (std::uint32_t r = record; r < m_header.recordCount; ++r) {
        if (!ReadRecord(r))
            break;
        if (m_bSkipDeleted && m_record[0] == qodbase::deletedFlag)
            continue;
        m_physical = r;
        m_lCurrentRow = row;
        return true;
    }
    m_physical = -1;
    m_lCurrentRow = -1;
    return false;
}

bool CQoInputFilterDbase34::FirstRow() { return ReadLiveFrom(0, 0); }

bool CQoInputFilterDbase34::NextRow()
{
    if (m_physical < 0)
        return false;
    return ReadLiveFrom(std::uint32_t(m_physical + 1), m_lCurrentRow + 1);
}

bool CQoInputFilterDbase34::AbsoluteRow(long row)
{
    if (row < 0 || !m_file.IsOpen())
        return false;
    if (row == m_lCurrentRow && m_physical >= 0)
        return true;
    if (!m_bSkipDeleted) {
        if (std::uint32_t(row) >= m_header.recordCount)
            return false;
        return ReadLiveFrom(std::uint32_t(row), row) && m_lCurrentRow == row;
    }
    if (m_bNoCache) {
        // No index: walk from the first row.
        bool ok = FirstRow();
        while (ok && m_lCurrentRow < row)
            ok = NextRow();
        return ok;
    }
    if (row >= NumRows())
        return false;
    // Live row n sits behind the deleted records that precede it: deleted
    // record i has (m_deleted[i] - i) live records before it.
    std::size_t lo = 0, hi = m_deleted.size();
    while (lo < hi) {
        std::size_t mid = (lo + hi) / 2;
        if (std::int64_t(m_deleted[mid]) - std::int64_t(mid) <= row)
            lo = mid + 1;
        else
            hi = mid;
    }
    std::uint32_t physical = std::uint32_t(row + long(lo));
    if (!ReadRecord(physical))
        return false;
    m_physical = physical;
    m_lCurrentRow = row;
    return true;
}

bool CQoInputFilterDbase34::IsDeleted() const { return m_physical >= 0 && m_record[0] == qodbase::deletedFlag; }

void CQoInputFilterDbase34::Value(int col, CQoString &value)
{
    value.Empty();
    if (m_physical < 0 || col < 0 || col >= NumFields())
        return;
    CDbaseField const &field = m_header.fields[std::size_t(col)];
    char const *start = m_record.data() + m_header.offsets[std::size_t(col)];
    char const *end = start + field.Length();
    // Text keeps its leading blanks; every other type is padded on either side.
    while (end > start && (end[-1] == ' ' || end[-1] == '\0'))
        --end;
    if (field.Type() != 'C')
        while (start < end && start[0] == ' ')
            ++start;
    value.Assign(start, std::size_t(end - start));
}

bool CQoInputFilterDbase34::GetFieldDesc(int col, CDbaseField &field) const
{
    if (col < 0 || col >= NumFields())
        return false;
    field = m_header.fields[std::size_t(col)];
    return true;
}

// ---------------------------------------------------------------------------
// counting and the index of deleted records

void CQoInputFilterDbase34::ScanDeleted()
{
    RequireOpen();
    m_deleted.clear();
    std::size_t recordLength = std::size_t(m_header.recordLength);
    std::size_t perChunk = std::max<std::size_t>(1, (std::size_t(1) << 20) / recordLength);
    std::unique_ptr<char[]> chunk(new char[perChunk * recordLength]);
    m_file.Seek(RecordOffset(0));
    m_nextRead = -1;
    for (std::uint32_t done = 0; done < m_header.recordCount;) {
        std::size_t want = std::min<std::size_t>(perChunk, m_header.recordCount - done);
        std::size_t got = m_file.Read(chunk.get(), want * recordLength);
        std::size_t whole = got / recordLength;
        for (std::size_t i = 0; i < whole; ++i) {
            char flag = chunk[i * recordLength];
            if (flag == qodbase::deletedFlag)
                m_deleted.push_back(done + std::uint32_t(i));
        }
        done += std::uint32_t(whole);
        if (whole < want) {
            // The file ends before its declared records. The missing ones
            // count as rows: reading one of them raises, the rows before
            // stay readable.
            break;
        }
    }
    m_deleted.shrink_to_fit();
    m_bDeletedKnown = true;
}

long CQoInputFilterDbase34::CalculateRecordCount()
{
    if (m_bNumRowsKnown)
        return m_lNumRows;
    if (!m_file.IsOpen())
        return 0;
    if (!m_bSkipDeleted) {
        m_lNumRows = static_cast<long>(m_header.recordCount);
    } else {
        std::int64_t keep = m_physical;
        long keepRow = m_lCurrentRow;
        ScanDeleted();
        m_lNumRows = static_cast<long>(m_header.recordCount - m_deleted.size());
        // The scan moved the file; the current record stays as it was read.
        m_physical = keep;
        m_lCurrentRow = keepRow;
    }
    m_bNumRowsKnown = true;
    return m_lNumRows;
}

bool CQoInputFilterDbase34::CreateIndexFile()
{
    if (!m_file.IsOpen())
        return false;
    if (m_bSkipDeleted && !m_bDeletedKnown) {
        m_bNumRowsKnown = false;
        CalculateRecordCount();
    }
    return true;
}

long long CQoInputFilterDbase34::getActPosInFile()
{
    if (m_physical < 0 || !m_file.IsOpen())
        return -1;
    return RecordOffset(std::uint32_t(m_physical));
}

// ---------------------------------------------------------------------------
// settings

bool CQoInputFilterDbase34::StartDescription(CQoString &line)
{
    m_describe.clear();
    m_nextDescribe = 0;
    CQoString text;
    if (!m_file.IsOpen() && m_header.fields.empty()) {
        text = "dBase-Datei (nicht ge\366ffnet)";
        m_describe.push_back(text);
    } else {
        text.Format("dBase %s-Datei %s", m_fileType == filterDbase4 ? "IV" : "III", m_strFileName.GetString());
        m_describe.push_back(text);
        text.Format("%d Felder, %lu S\344tze, Satzl\344nge %d", NumFields(),
                    static_cast<unsigned long>(m_header.declaredCount), m_header.recordLength);
        m_describe.push_back(text);
        text.Format("Zeichensatz: %s", CharSetName(m_nRecordCharSet));
        m_describe.push_back(text);
        m_describe.push_back(m_bSkipDeleted ? CQoString("Gel\366schte S\344tze werden \374bersprungen")
                                            : CQoString("Gel\366schte S\344tze werden gelesen"));
        for (CDbaseField const &field : m_header.fields) {
            if (field.IsNumeric())
                text.Format("%s %c(%d,%d)", field.Name().GetString(), field.Type(), field.Length(), field.Decimals());
            else
                text.Format("%s %c(%d)", field.Name().GetString(), field.Type(), field.Length());
            m_describe.push_back(text);
        }
    }
    return NextDescription(line);
}

bool CQoInputFilterDbase34::NextDescription(CQoString &line)
{
    if (m_nextDescribe >= m_describe.size())
        return false;
    line = m_describe[m_nextDescribe++];
    return true;
}

void CQoInputFilterDbase34::CopyFrom(CQoInputFilter const &other)
{
    CQoInputFilter::CopyFrom(other);
    if (auto const *dbf = dynamic_cast<CQoInputFilterDbase34 const *>(&other))
        m_bSkipDeleted = dbf->m_bSkipDeleted;
}

void CQoInputFilterDbase34::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilter::WriteConfig(cfg, section);
    cfg.SetValue(section, "skipdeleted", m_bSkipDeleted ? 1 : 0);
}

void CQoInputFilterDbase34::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilter::ReadConfig(cfg, section);
    int skip = m_bSkipDeleted ? 1 : 0;
    cfg.GetValue(section, "skipdeleted", skip);
    m_bSkipDeleted = skip != 0;
}
