#include "CQoOutputFilterTextFix.h"

#include "../core/QoBytes.h"

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "QoLimits.h"

#include <climits>
#include <cstring>

CQoOutputFilterTextFix::CQoOutputFilterTextFix() = default;

CQoOutputFilterTextFix::~CQoOutputFilterTextFix()
{
    try {
        ReleaseFile();
    } catch (CQoException const &) {
        // a destructor cannot report; callers who care call ReleaseFile
    }
}

bool CQoOutputFilterTextFix::Init()
{
    m_llTruncated = 0;
    if (!m_pFile || !m_pFile->IsOpen())
        return false;
    m_pFile->FileCharSet(m_nFileCharSet);
    return true;
}

void CQoOutputFilterTextFix::NumCols(int cols)
{
    std::size_t before = m_columnNames.size();
    CQoOutputFilter::NumCols(cols);
    m_lengths.resize(m_columnNames.size(), defaultLength);
    if (RecordLength() > qolimits::maxRecordLength) {
        // New columns of the default length would make the record too long.
        CQoOutputFilter::NumCols(static_cast<int>(before));
        m_lengths.resize(before);
        CQoString text;
        text.Format("%d Spalten w\xE4ren zusammen l\xE4nger als %d Zeichen", cols, qolimits::maxRecordLength);
        throw CQoException(CQoException::invalidArgument, text, "columns");
    }
}

int CQoOutputFilterTextFix::NumCols() const { return CQoOutputFilter::NumCols(); }

namespace {
CQoString LengthKey(int col)
{
    CQoString key;
    key.Format("column%d_len", col);
    return key;
}
}

void CQoOutputFilterTextFix::SetLength(int col, int length)
{
    CheckColumn(col);
    if (length > qolimits::maxRecordLength)
        qolimits::Checked(LengthKey(col), length, 0, qolimits::maxRecordLength);
    long long total = static_cast<long long>(RecordLength()) - Width(col) + (length > 0 ? length : 0);
    if (total > qolimits::maxRecordLength) {
        CQoString text;
        text.Format("Die Spalten w\xE4ren zusammen %lld Zeichen lang; h\xF6" "chstens %d sind m\xF6glich", total,
                    qolimits::maxRecordLength);
        throw CQoException(CQoException::invalidArgument, text, LengthKey(col));
    }
    m_lengths[std::size_t(col)] = length;
}

int CQoOutputFilterTextFix::Width(int col) const
{
    int length = m_lengths[std::size_t(col)];
    return length > 0 ? length : 0;
}

int CQoOutputFilterTextFix::GetLength(int col)
{
    CheckColumn(col);
    return m_lengths[std::size_t(col)];
}

void CQoOutputFilterTextFix::CrLf(bool on) { m_bCrLf = on; }

bool CQoOutputFilterTextFix::GetCrLf() const { return m_bCrLf; }

int CQoOutputFilterTextFix::RecordLength() const
{
    // Bounded by SetLength and NumCols; summed in 64 bits all the same.
    long long sum = 0;
    for (int length : m_lengths)
        sum += length > 0 ? length : 0;
    return static_cast<int>(sum);
}

void CQoOutputFilterTextFix::BuildRecord(std::string &record)
{
    record.assign(std::size_t(RecordLength()) + (m_bCrLf ? 2 : 0), ' ');
    char *out = &record[0];
    for (std::size_t c = 0; c < m_lengths.size(); ++c) {
        std::size_t length = m_lengths[c] > 0 ? std::size_t(m_lengths[c]) : 0;
        std::string_view const value = m_values[c].Str();
        std::size_t n = value.size();
        if (n > length) {
            n = length;
            ++m_llTruncated;
        }
        qobytes::Copy(out, value.data(), n);
        if (m_bCrLf)
            for (std::size_t k = 0; k < n; ++k)
                if (out[k] == '\r' || out[k] == '\n')
                    out[k] = ' ';
        out += length;
    }
    if (m_bCrLf) {
        out[0] = '\r';
        out[1] = '\n';
    }
}

bool CQoOutputFilterTextFix::WriteRow(CQoString *text)
{
    BuildRecord(m_record);
    if (text) {
        text->Assign(m_record.data(), m_record.size());
        return true;
    }
    WriteToFile(m_record.data(), m_record.size());
    return true;
}

void CQoOutputFilterTextFix::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoOutputFilter::WriteConfig(cfg, section);
    cfg.SetValue(section, "crlf", m_bCrLf ? 1 : 0);
    for (int c = 0; c < NumCols(); ++c)
        cfg.SetValue(section, LengthKey(c), m_lengths[std::size_t(c)]);
}

void CQoOutputFilterTextFix::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoOutputFilter::ReadConfig(cfg, section); // sets the column count (virtual NumCols)
    int crlf = m_bCrLf ? 1 : 0;
    cfg.GetValue(section, "crlf", crlf);
    m_bCrLf = crlf != 0;
    for (int c = 0; c < NumCols(); ++c) {
        int length = m_lengths[std::size_t(c)];
        if (cfg.GetValue(section, LengthKey(c), length, INT_MIN, INT_MAX))
            SetLength(c, length);
    }
}
