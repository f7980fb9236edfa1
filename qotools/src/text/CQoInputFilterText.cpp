// Record reading, the row index and record repair of the text filters.
#include "CQoInputFilterText.h"

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoInterActive.h"
#include "QoLimits.h"
#include "QoTextReader.h"

#include <algorithm>
#include <cstring>

namespace {
// A record larger than this is taken as defective (a runaway encloser), so
// that a damaged file cannot make the filter hold the rest of it in memory.
constexpr std::size_t kMaxRecord = qolimits::maxRecordLength;
// How much of the data after a defective record the repair hook gets.
constexpr std::size_t kRepairData = 64u << 10;
// Rows whose field counts set the column count of a file without names.
constexpr int kSampleRows = 100;
// Attempts of the one-line correction before reading stops.
constexpr int kMaxCorrections = 100;

[[noreturn]] void ThrowStopped(CQoString const &file)
{
    CQoException::Throw("Einlesen abgebrochen", file);
}
}

CQoInputFilterText::CQoInputFilterText()
    : m_reader(new QoTextReader)
{
}

// A copy takes the settings; it opens its own file with Init.
CQoInputFilterText::CQoInputFilterText(CQoInputFilterText const &other)
    : CQoInputFilter(other), m_reader(new QoTextReader), m_nSkip(other.m_nSkip)
{
    ResetRows();
    m_nNumCols = other.m_nNumCols;
}

CQoInputFilterText &CQoInputFilterText::operator=(CQoInputFilterText const &other)
{
    if (this != &other) {
        CQoInputFilter::operator=(other);
        m_reader->Close();
        m_nSkip = other.m_nSkip;
        ResetRows();
    }
    return *this;
}

CQoInputFilterText::~CQoInputFilterText() = default;

void CQoInputFilterText::ResetRows()
{
    m_nFields = 0;
    m_scratch.clear();
    m_recordBase = nullptr;
    m_recordInReader = false;
    m_index.clear();
    m_indexComplete = false;
    m_repairs.clear();
    m_lCurrentRow = -1;
    m_curOffset = -1;
    m_nextOffset = 0;
    m_dataStart = 0;
    m_bNumRowsKnown = false;
    m_lNumRows = 0;
}

void CQoInputFilterText::Skip(int lines)
{
    if (lines < 0)
        lines = 0;
    if (lines != m_nSkip) {
        m_nSkip = lines;
        m_bModified = true;
    }
}

// --- fields --------------------------------------------------------------------

void CQoInputFilterText::GrowFields()
{
    m_fields.resize(m_fields.empty() ? 32 : m_fields.size() * 2);
}

void CQoInputFilterText::EndScratchField()
{
    if (m_nFields == m_fields.size())
        GrowFields();
    m_fields[m_nFields++] = {static_cast<std::uint32_t>(m_scratchStart),
                             static_cast<std::uint32_t>(m_scratch.size() - m_scratchStart), true};
}

// --- parsing at the reader's position ----------------------------------------------

int CQoInputFilterText::ParseHere(std::size_t &used)
{
    std::size_t want = 4096;
    for (;;) {
        std::size_t avail = m_reader->Ensure(want);
        // The parser sees no more than the longest record and its line end,
        // so the limit holds exactly, however much the reader has read.
        bool const capped = avail > kMaxRecord + 2;
        if (capped)
            avail = kMaxRecord + 2;
        char const *begin = m_reader->Data();
        m_recordBase = begin;
        m_recordInReader = true;
        ClearFields();
        int result = ParseRecord(begin, begin + avail, m_reader->AtEof() && !capped, used);
        if (result != parseMore)
            return result;
        if (avail >= kMaxRecord)
            return parseUnterminated;
        want = avail * 2;
    }
}

int CQoInputFilterText::ParseText(CQoString const &text, std::size_t &used)
{
    m_correction = text;
    char const *begin = m_correction.GetString();
    m_recordBase = begin;
    m_recordInReader = false;
    ClearFields();
    int result = ParseRecord(begin, begin + m_correction.GetLength(), true, used);
    return result == parseMore ? parseUnterminated : result;
}

long long CQoInputFilterText::SkipLines(long long offset, int lines)
{
    m_reader->SeekTo(offset);
    for (int i = 0; i < lines; ++i) {
        for (;;) {
            std::size_t avail = m_reader->Ensure(1);
            if (avail == 0)
                return m_reader->Tell();
            char const *data = m_reader->Data();
            char const *nl = static_cast<char const *>(std::memchr(data, '\n', avail));
            char const *cr = static_cast<char const *>(std::memchr(data, '\r', nl ? nl - data : avail));
            if (cr) {
                m_reader->Advance(cr - data + 1);
                if (m_reader->Ensure(1) && *m_reader->Data() == '\n')
                    m_reader->Advance(1);
                break;
            }
            if (nl) {
                m_reader->Advance(nl - data + 1);
                break;
            }
            m_reader->Advance(avail);
        }
    }
    return m_reader->Tell();
}

CQoString CQoInputFilterText::CheckRecord()
{
    return CQoString();
}

bool CQoInputFilterText::ReadRecordAt(long long offset, bool checkLayout)
{
    if (!m_reader->IsOpen())
        CQoException::Throw(CQoException::notOpen, m_strFileName);
    for (;;) {
        auto repair = m_repairs.empty() ? m_repairs.end() : m_repairs.find(offset);
        if (repair != m_repairs.end()) {
            if (!repair->second.takeOver) {
                offset = repair->second.next;
                continue;
            }
            std::size_t used = 0;
            ParseText(repair->second.record, used);
            m_curOffset = offset;
            m_nextOffset = repair->second.next;
            return true;
        }
        m_reader->SeekTo(offset);
        std::size_t used = 0;
        int result = ParseHere(used);
        if (result == parseEnd)
            return false;
        if (result == parseRecord) {
            CQoString why = checkLayout ? CheckRecord() : CQoString();
            if (why.IsEmpty()) {
                m_reader->Advance(used);
                m_curOffset = offset;
                m_nextOffset = offset + static_cast<long long>(used);
                return true;
            }
            HandleDefect(offset, why, result);
        } else {
            HandleDefect(offset, DefectOfUnterminated(), result);
        }
        // The decision is stored now; read again with it.
    }
}

CQoString CQoInputFilterText::DefectOfUnterminated()
{
    // The parser ran out of file or of the size limit inside a record. When
    // the record has no line break in it, no encloser kept a line end
    // from ending it: it is simply too long.
    std::size_t avail = std::min(m_reader->Avail(), kMaxRecord);
    char const *data = m_reader->Data();
    bool lineBreak = std::memchr(data, '\n', avail) || std::memchr(data, '\r', avail);
    if (avail >= kMaxRecord && !lineBreak) {
        CQoString why;
        why.Format("Satz l\xE4nger als %u Zeichen", static_cast<unsigned>(kMaxRecord));
        return why;
    }
    return "Begrenzer nicht geschlossen";
}

bool CQoInputFilterText::HandleDefect(long long offset, CQoString const &why, int)
{
    // The defective record and what follows it, and the next line as the
    // presumed start of the next record.
    m_reader->SeekTo(offset);
    std::size_t avail = m_reader->Ensure(kRepairData);
    if (avail > kRepairData)
        avail = kRepairData;
    CQoString data(m_reader->Data(), static_cast<int>(avail));
    int pos = static_cast<int>(avail);
    for (std::size_t i = 0; i < avail; ++i) {
        char c = data.GetString()[i];
        if (c == '\n' || c == '\r') {
            std::size_t next = i + 1;
            if (c == '\r' && next < avail && data.GetString()[next] == '\n')
                ++next;
            pos = static_cast<int>(next);
            break;
        }
    }
    int const presumed = pos;
    int answer = ReportWrongInput(data, pos);
    // Rows are counted from 1 in messages, as the user counts them.
    CQoString row;
    if (m_lReadingRow >= 0)
        row.Format("Satz %ld: ", m_lReadingRow + 1);
    else
        row = "Kopfzeile: ";
    m_strLastWrongInput = row + why + " (" + m_strFileName + ")";
    if (pos <= 0 || pos > static_cast<int>(avail))
        pos = presumed;
    Repair decision{false, CQoString(), offset + pos};
    switch (answer) {
    case CQoInterActive::repairSkip:
        break;
    case CQoInterActive::repairTakeOver: {
        CQoString record = data;
        for (int attempt = 0;; ++attempt) {
            std::size_t used = 0;
            int result = ParseText(record, used);
            bool fits = result == parseRecord && CheckRecord().IsEmpty();
            if (fits) {
                // The rest after the record may only be its line end.
                CQoString rest = record.Mid(static_cast<int>(used));
                rest.TrimNewline();
                fits = rest.IsEmpty();
            }
            if (fits)
                break;
            if (attempt >= kMaxCorrections || CQoInterActive::CorrectRepair(record) != 1)
                ThrowStopped(m_strFileName);
        }
        record.TrimNewline();
        decision.takeOver = true;
        decision.record = record;
        break;
    }
    case CQoInterActive::repairStop:
        ThrowStopped(m_strFileName);
    default:
        CQoException::Throw(CQoException::formatError, m_strLastWrongInput);
    }
    m_repairs[offset] = decision;
    return true;
}

// --- opening -------------------------------------------------------------------------

void CQoInputFilterText::Init(CQoString const &name)
{
    CQoInputFilter::Init(name);
    ResetRows();
    m_reader->Close();
    m_reader->Open(m_strFileName, m_nCharSet, true);
    m_lReadingRow = -1;
    long long offset = SkipLines(m_reader->BomLength(), m_nSkip);
    if (m_bFirstRowHasNames) {
        if (ReadRecordAt(offset, false)) {
            std::vector<CQoString> names(m_nFields);
            for (int i = 0; i < NumFields(); ++i) {
                char const *data;
                std::size_t length;
                FieldAt(i, data, length);
                names[i].Assign(data, length);
            }
            m_colNames = names;
            offset = m_nextOffset;
        }
    } else {
        m_colNames.clear();
    }
    m_dataStart = offset;
    m_nextOffset = offset;
    DetermineColumns();
    m_colNames.resize(m_nNumCols);
    m_lCurrentRow = -1;
}

void CQoInputFilterText::DetermineColumns()
{
    if (m_bFirstRowHasNames) {
        m_nNumCols = static_cast<int>(m_colNames.size());
        return;
    }
    int most = 0;
    long long offset = m_dataStart;
    for (int row = 0; row < kSampleRows; ++row) {
        m_lReadingRow = row;
        if (!ReadRecordAt(offset, false))
            break;
        most = std::max(most, NumFields());
        offset = m_nextOffset;
    }
    m_nNumCols = most;
}

void CQoInputFilterText::LoadColumnNames()
{
    if (!m_reader->IsOpen() || !m_bFirstRowHasNames)
        return;
    long current = m_lCurrentRow;
    m_lReadingRow = -1;
    long long offset = SkipLines(m_reader->BomLength(), m_nSkip);
    if (ReadRecordAt(offset, false)) {
        m_colNames.assign(m_nNumCols, CQoString());
        for (int i = 0; i < NumFields() && i < m_nNumCols; ++i) {
            char const *data;
            std::size_t length;
            FieldAt(i, data, length);
            m_colNames[i].Assign(data, length);
        }
    }
    m_lCurrentRow = -1;
    if (current >= 0)
        AbsoluteRow(current);
}

bool CQoInputFilterText::CloseFile()
{
    m_reader->Close();
    CQoInputFilter::CloseFile();
    m_nFields = 0;
    return true;
}

bool CQoInputFilterText::ReopenFile()
{
    Init(CQoString(m_strFileName));
    return true;
}

// --- rows ----------------------------------------------------------------------------

bool CQoInputFilterText::ReadRow(long row, long long offset)
{
    m_lReadingRow = row;
    if (!ReadRecordAt(offset, true)) {
        // A row of the index must still be there: the file was cut short.
        if (static_cast<std::size_t>(row) < m_index.size())
            CQoException::Throw("Die Datei hat sich beim Lesen ge\xE4ndert", m_strFileName);
        if (static_cast<std::size_t>(row) == m_index.size() || m_bNoCache) {
            m_indexComplete = !m_bNoCache;
            if (!m_bNumRowsKnown) {
                m_lNumRows = row;
                m_bNumRowsKnown = true;
            }
        }
        m_lCurrentRow = -1;
        m_nFields = 0;
        return false;
    }
    if (!m_bNoCache && static_cast<std::size_t>(row) == m_index.size())
        m_index.push_back(m_curOffset);
    m_lCurrentRow = row;
    return true;
}

bool CQoInputFilterText::FirstRow()
{
    if (!m_reader->IsOpen())
        return false;
    return ReadRow(0, m_dataStart);
}

bool CQoInputFilterText::NextRow()
{
    if (m_lCurrentRow < 0 || !m_reader->IsOpen())
        return false;
    long next = m_lCurrentRow + 1;
    long long offset = static_cast<std::size_t>(next) < m_index.size() ? m_index[next] : m_nextOffset;
    return ReadRow(next, offset);
}

bool CQoInputFilterText::AbsoluteRow(long row)
{
    if (row < 0 || !m_reader->IsOpen())
        return false;
    if (row == m_lCurrentRow)
        return true;
    if (static_cast<std::size_t>(row) < m_index.size())
        return ReadRow(row, m_index[row]);
    if (m_indexComplete)
        return false;
    // Walk forward from the furthest row known (without index: from the
    // current row, or from the start).
    if (m_bNoCache) {
        if ((m_lCurrentRow < 0 || m_lCurrentRow > row) && !FirstRow())
            return false;
    } else if (m_lCurrentRow < 0 || static_cast<std::size_t>(m_lCurrentRow) + 1 < m_index.size()) {
        bool ok = m_index.empty() ? FirstRow()
                                  : ReadRow(static_cast<long>(m_index.size()) - 1, m_index.back());
        if (!ok)
            return false;
    }
    while (m_lCurrentRow < row)
        if (!NextRow())
            return false;
    return true;
}

void CQoInputFilterText::Value(int col, CQoString &value)
{
    if (m_lCurrentRow < 0 || col < 0 || col >= NumFields() || col >= m_nNumCols) {
        value.Empty();
        return;
    }
    char const *data;
    std::size_t length;
    FieldAt(col, data, length);
    // A field of the reader's window may be read ahead; a repaired text or
    // an unescaped value is copied exactly.
    if (m_recordInReader && !m_fields[static_cast<std::size_t>(col)].scratch)
        value.AssignReadAhead(data, length);
    else
        value.Assign(data, length);
}

bool CQoInputFilterText::EmptyRow()
{
    if (m_lCurrentRow < 0)
        return true;
    for (std::size_t i = 0; i < m_nFields; ++i)
        if (m_fields[i].length)
            return false;
    return true;
}

void CQoInputFilterText::ColName(int col, CQoString &name)
{
    CQoInputFilter::ColName(col, name);
}

long CQoInputFilterText::CalculateRecordCount()
{
    if (m_bNumRowsKnown)
        return m_lNumRows;
    if (!m_reader->IsOpen())
        return 0;
    CreateIndexFile();
    return m_lNumRows;
}

bool CQoInputFilterText::CreateIndexFile()
{
    if (!m_reader->IsOpen())
        return false;
    if (!m_indexComplete || !m_bNumRowsKnown) {
        long current = m_lCurrentRow;
        // Start at the furthest row known, then read to the end.
        bool ok = m_index.empty() || m_bNoCache
                      ? FirstRow()
                      : ReadRow(static_cast<long>(m_index.size()) - 1, m_index.back());
        while (ok)
            ok = NextRow();
        if (current >= 0)
            AbsoluteRow(current);
    }
    return !m_bNoCache;
}

void CQoInputFilterText::NoCache(bool noCache)
{
    CQoInputFilter::NoCache(noCache);
    if (noCache) {
        m_index.clear();
        m_index.shrink_to_fit();
        m_indexComplete = false;
    }
}

long long CQoInputFilterText::getActPosInFile()
{
    return m_lCurrentRow >= 0 ? m_curOffset : -1;
}

// --- settings ------------------------------------------------------------------------

void CQoInputFilterText::CopyFrom(CQoInputFilter const &other)
{
    CQoInputFilter::CopyFrom(other);
    if (auto const *text = dynamic_cast<CQoInputFilterText const *>(&other))
        m_nSkip = text->m_nSkip;
}

void CQoInputFilterText::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilter::WriteConfig(cfg, section);
    cfg.SetValue(section, "skip", m_nSkip);
}

void CQoInputFilterText::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilter::ReadConfig(cfg, section);
    int skip = m_nSkip;
    if (cfg.GetValue(section, "skip", skip))
        Skip(skip);
}
