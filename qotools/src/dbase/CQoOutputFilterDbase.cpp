#include "CQoOutputFilterDbase.h"

#include "../core/QoBytes.h"

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "DbaseFormat.h"

#include <climits>
#include <cstdio>
#include <cstring>
#include <set>

namespace {

CDbaseField const kDefaultField("", 'C', CDbaseField::maxTextLength);

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

void TrimBlanks(char const *&first, char const *&stop)
{
    while (first < stop && (*first == ' ' || *first == '\t'))
        ++first;
    while (stop > first && (stop[-1] == ' ' || stop[-1] == '\t'))
        --stop;
}

std::string TooLong(CDbaseField const &field)
{
    char why[80];
    std::snprintf(why, sizeof why, "passt nicht in die Feldl\344nge %d", field.Length());
    return why;
}

// The dBase form of a name: letters A-Z, digits and '_', starting with a
// letter, at most 10 characters.
std::string FileName(CQoString const &wanted, int col)
{
    CQoString name(wanted);
    name.Trim();
    name.NoUmlaute();
    name.MakeUpper();
    std::string out;
    for (char c : name.Str()) {
        bool ok = (c >= 'A' && c <= 'Z') || IsDigit(c) || c == '_';
        out += ok ? c : '_';
    }
    if (!out.empty() && !(out[0] >= 'A' && out[0] <= 'Z'))
        out.insert(out.begin(), 'F');
    if (out.empty()) {
        char text[16];
        std::snprintf(text, sizeof text, "FELD%d", col + 1);
        out = text;
    }
    if (out.size() > std::size_t(CDbaseField::maxNameLength))
        out.resize(std::size_t(CDbaseField::maxNameLength));
    return out;
}

bool LeapYear(int y) { return (y % 4 == 0 && y % 100 != 0) || y % 400 == 0; }

bool ValidDate(int y, int m, int d)
{
    static int const days[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    if (y < 1 || y > 9999 || m < 1 || m > 12 || d < 1)
        return false;
    int limit = days[m - 1] + (m == 2 && LeapYear(y) ? 1 : 0);
    return d <= limit;
}

// The digits text[from .. from+count) as a number; a date part has at most
// four, more than nine would not fit.
bool ParseInt(std::string_view text, std::size_t from, std::size_t count, int &value)
{
    if (from + count > text.size() || count == 0 || count > 9)
        return false;
    value = 0;
    for (std::size_t i = from; i < from + count; ++i) {
        if (!IsDigit(text[i]))
            return false;
        value = value * 10 + (text[i] - '0');
    }
    return true;
}

} // namespace

CQoOutputFilterDbase::CQoOutputFilterDbase()
{
    // dBase files are DOS files unless told otherwise.
    m_nFileCharSet = CQoFile::ascii;
}

CQoOutputFilterDbase::~CQoOutputFilterDbase()
{
    try {
        ReleaseFile();
    } catch (CQoException const &) {
        // a destructor cannot report; callers who care call ReleaseFile
    }
}

// ---------------------------------------------------------------------------
// columns and their descriptions

void CQoOutputFilterDbase::NumCols(int cols)
{
    CQoOutputFilter::NumCols(cols);
    m_fields.resize(m_columnNames.size(), kDefaultField);
}

int CQoOutputFilterDbase::NumCols() const { return CQoOutputFilter::NumCols(); }

void CQoOutputFilterDbase::ColumnName(int col, CQoString const &name)
{
    CQoOutputFilter::ColumnName(col, name);
    m_fields[std::size_t(col)].Name(name);
}

void CQoOutputFilterDbase::SetFieldDescs(CQoArray<CDbaseField> const *fields)
{
    if (!fields) {
        NumCols(0);
        return;
    }
    NumCols(fields->GetSize());
    for (int i = 0; i < fields->GetSize(); ++i) {
        m_fields[std::size_t(i)] = fields->GetAt(i);
        if (fields->GetAt(i).Name().IsEmpty())
            m_fields[std::size_t(i)].Name(m_columnNames[std::size_t(i)]);
        else
            m_columnNames[std::size_t(i)] = fields->GetAt(i).Name();
    }
}

bool CQoOutputFilterDbase::GetFieldDesc(int col, CDbaseField &field) const
{
    if (col < 0 || col >= NumCols())
        return false;
    field = m_fields[std::size_t(col)];
    return true;
}

CQoString CQoOutputFilterDbase::FileFieldName(int col) const
{
    if (col < 0 || col >= int(m_fileFields.size()))
        return CQoString();
    return m_fileFields[std::size_t(col)].Name();
}

// ---------------------------------------------------------------------------
// the file

void CQoOutputFilterDbase::UseFile(char const *path)
{
    std::unique_ptr<CQoFile> file(new CQoFile());
    file->OpenOrThrow(path, CQoFile::write | CQoFile::create | CQoFile::binary);
    UseFile(file.get(), true);
    m_ownFile = std::move(file);
}

bool CQoOutputFilterDbase::Init()
{
    if (m_bWriting)
        Finish();
    m_llTruncated = 0;
    m_lRows = 0;
    if (!m_pFile || !m_pFile->IsOpen())
        return false;

    // The descriptions as they go into the file.
    if (NumCols() == 0)
        CQoException::Throw("Die dBase-Datei braucht mindestens ein Feld", m_pFile->FileName());
    if (NumCols() > qodbase::maxFields) {
        CQoString text;
        text.Format("Eine dBase-Datei hat h\366chstens %d Felder, nicht %d", int(qodbase::maxFields), NumCols());
        CQoException::Throw(text, m_pFile->FileName());
    }
    qodbase::Header header;
    std::set<std::string> used;
    for (int c = 0; c < NumCols(); ++c) {
        CDbaseField field = m_fields[std::size_t(c)];
        if (char const *problem = field.Problem()) {
            CQoString text;
            text.Format("Feld %s: %s", field.Name().GetString(), problem);
            CQoException::Throw(text, m_pFile->FileName());
        }
        std::string name = FileName(field.Name(), c);
        for (int n = 1; used.count(name); ++n) {
            char suffix[16];
            std::snprintf(suffix, sizeof suffix, "_%d", n);
            std::string base = FileName(field.Name(), c);
            base.resize(std::min(base.size(), std::size_t(CDbaseField::maxNameLength) - std::strlen(suffix)));
            name = base + suffix;
        }
        used.insert(name);
        field.Name(name.c_str());
        header.fields.push_back(field);
    }
    header.languageDriver = qodbase::LanguageDriverOfCharSet(m_nFileCharSet);
    std::string bytes = qodbase::BuildHeader(header);
    if (header.recordLength > 0xFFFF)
        CQoException::Throw("Die Felder sind zusammen l\344nger als ein dBase-Satz sein darf (65535 Bytes)",
                            m_pFile->FileName());
    m_fileFields = header.fields;
    m_offsets = header.offsets;
    m_nRecordLength = header.recordLength;

    // A dBase file is binary and starts anew, however the host opened it.
    std::string path = m_pFile->FileName();
    m_pFile->OpenOrThrow(path.c_str(), CQoFile::write | CQoFile::create | CQoFile::binary | CQoFile::ansi);
    m_llWroteBytes = 0;
    WriteToFile(bytes.data(), bytes.size());
    m_pFile->FileCharSet(m_nFileCharSet);
    m_bWriting = true;
    return true;
}

void CQoOutputFilterDbase::Finish()
{
    m_bWriting = false;
    if (!m_pFile || !m_pFile->IsOpen())
        return;
    m_pFile->FileCharSet(CQoFile::ansi);
    char const end = qodbase::endOfFile;
    WriteToFile(&end, 1);
    unsigned char count[4];
    qodbase::Put32(count, std::uint32_t(m_lRows));
    std::int64_t length = m_pFile->Tell();
    m_pFile->Seek(4);
    m_pFile->Write(count, sizeof count);
    m_pFile->Seek(length);
    m_pFile->FileCharSet(m_nFileCharSet);
    m_pFile->Flush();
}

void CQoOutputFilterDbase::ReleaseFile()
{
    if (m_bWriting)
        Finish();
    CQoOutputFilter::ReleaseFile();
    m_ownFile.reset();
}

// ---------------------------------------------------------------------------
// records

[[noreturn]] void CQoOutputFilterDbase::BadValue(int col, std::string_view value, char const *why) const
{
    CQoString text;
    text.Format("Satz %ld, Feld %s: der Wert '%.*s' %s", m_lRows + 1, m_fields[std::size_t(col)].Name().GetString(),
                static_cast<int>(value.size()), value.data(), why);
    CQoException::Throw(text, m_pFile ? m_pFile->FileName() : nullptr);
}

void CQoOutputFilterDbase::FormatValue(int col, std::string_view value, char *out)
{
    CDbaseField const &field = m_fileFields[std::size_t(col)];
    std::size_t length = std::size_t(field.Length());
    std::memset(out, ' ', length);
    switch (field.Type()) {
    case 'C': {
        std::size_t n = value.size();
        if (n > length) {
            n = length;
            ++m_llTruncated;
        }
        qobytes::Copy(out, value.data(), n);
        return;
    }
    case 'N':
    case 'F': {
        char const *p = value.data(), *stop = p + value.size();
        TrimBlanks(p, stop);
        if (p == stop)
            return;
        bool negative = false;
        if (*p == '+' || *p == '-')
            negative = *p++ == '-';
        char const *wholeStart = p;
        while (p < stop && IsDigit(*p))
            ++p;
        char const *wholeEnd = p;
        if (p < stop && (*p == '.' || *p == ','))
            ++p;
        char const *fracStart = p;
        while (p < stop && IsDigit(*p))
            ++p;
        char const *fracEnd = p;
        if (p != stop || (wholeStart == wholeEnd && fracStart == fracEnd))
            BadValue(col, value, "ist keine Zahl");
        while (wholeStart < wholeEnd - 1 && *wholeStart == '0')
            ++wholeStart;
        std::size_t decimals = std::size_t(field.Decimals());
        std::size_t wholeCount = std::size_t(wholeEnd - wholeStart), fracCount = std::size_t(fracEnd - fracStart);
        if (wholeCount > length)
            BadValue(col, value, TooLong(field).c_str());
        // digits: the whole part (at least "0") and the kept decimals, in a
        // buffer with room for a carry in front.
        char digits[2 * CDbaseField::maxNumberLength + 4];
        std::size_t n = 1;
        digits[0] = '0';
        if (wholeCount == 0)
            digits[n++] = '0';
        for (char const *q = wholeStart; q < wholeEnd; ++q)
            digits[n++] = *q;
        std::size_t keep = decimals > 0 ? decimals : fracCount;
        if (keep > length)
            BadValue(col, value, TooLong(field).c_str());
        for (std::size_t k = 0; k < keep; ++k)
            digits[n++] = k < fracCount ? fracStart[k] : '0';
        if (decimals > 0 && fracCount > decimals && fracStart[decimals] >= '5') {
            // Round half away from zero: add one unit of the last place.
            std::size_t k = n;
            while (digits[--k] == '9')
                digits[k] = '0';
            ++digits[k];
        }
        // Assemble sign, whole part without leading zeros, point, decimals.
        std::size_t wholeDigits = n - keep, first = 0;
        while (first < wholeDigits - 1 && digits[first] == '0')
            ++first;
        bool zero = true;
        for (std::size_t k = first; k < n; ++k)
            zero = zero && digits[k] == '0';
        char number[2 * CDbaseField::maxNumberLength + 8];
        std::size_t m = 0;
        if (negative && !zero)
            number[m++] = '-';
        for (std::size_t k = first; k < wholeDigits; ++k)
            number[m++] = digits[k];
        if (keep > 0) {
            number[m++] = '.';
            for (std::size_t k = wholeDigits; k < n; ++k)
                number[m++] = digits[k];
        }
        if (m > length)
            BadValue(col, value, TooLong(field).c_str());
        std::memcpy(out + (length - m), number, m);
        return;
    }
    case 'D': {
        char const *p = value.data(), *stop = p + value.size();
        TrimBlanks(p, stop);
        if (p == stop)
            return;
        if (stop - p == 8) {
            // The file's own form YYYYMMDD: checked and copied.
            int y = 0, m = 0, d = 0;
            bool digits = true;
            for (int k = 0; k < 8; ++k)
                digits = digits && IsDigit(p[k]);
            if (digits) {
                y = (p[0] - '0') * 1000 + (p[1] - '0') * 100 + (p[2] - '0') * 10 + (p[3] - '0');
                m = (p[4] - '0') * 10 + (p[5] - '0');
                d = (p[6] - '0') * 10 + (p[7] - '0');
                if (!ValidDate(y, m, d))
                    BadValue(col, value, "ist kein Datum");
                std::memcpy(out, p, 8);
                return;
            }
        }
        std::string text(p, stop);
        int y = 0, m = 0, d = 0;
        bool ok = false;
        std::size_t dot1 = text.find('.');
        if (text.size() == 8 && ParseInt(text, 0, 4, y) && ParseInt(text, 4, 2, m) && ParseInt(text, 6, 2, d)) {
            ok = true;
        } else if (text.size() == 10 && text[4] == '-' && text[7] == '-') {
            ok = ParseInt(text, 0, 4, y) && ParseInt(text, 5, 2, m) && ParseInt(text, 8, 2, d);
        } else if (dot1 != std::string::npos) {
            std::size_t dot2 = text.find('.', dot1 + 1);
            ok = dot2 != std::string::npos && text.size() - dot2 - 1 == 4 && ParseInt(text, 0, dot1, d) &&
                 ParseInt(text, dot1 + 1, dot2 - dot1 - 1, m) && ParseInt(text, dot2 + 1, 4, y) && dot1 <= 2 &&
                 dot2 - dot1 - 1 <= 2;
        }
        if (!ok || !ValidDate(y, m, d))
            BadValue(col, value, "ist kein Datum");
        char date[16];
        std::snprintf(date, sizeof date, "%04d%02d%02d", y, m, d);
        std::memcpy(out, date, 8);
        return;
    }
    case 'L': {
        char const *p = value.data(), *stop = p + value.size();
        TrimBlanks(p, stop);
        if (p == stop)
            return;
        if (stop - p == 1) {
            // The common case: one letter.
            switch (*p) {
            case 'T': case 't': case 'Y': case 'y': case 'J': case 'j': case '1':
                out[0] = 'T';
                return;
            case 'F': case 'f': case 'N': case 'n': case '0':
                out[0] = 'F';
                return;
            case '?':
                out[0] = '?';
                return;
            default:
                break;
            }
        }
        CQoString text(p, int(stop - p));
        text.MakeLower();
        static char const *const yes[] = {"wahr", "true", "ja", "yes"};
        static char const *const no[] = {"falsch", "false", "nein", "no"};
        for (char const *word : yes)
            if (text == word) {
                out[0] = 'T';
                return;
            }
        for (char const *word : no)
            if (text == word) {
                out[0] = 'F';
                return;
            }
        BadValue(col, value, "ist kein Wahrheitswert");
    }
    default:
        BadValue(col, value, "hat einen unbekannten Feldtyp");
    }
}

void CQoOutputFilterDbase::BuildRecord(std::string &record)
{
    record.assign(std::size_t(m_nRecordLength), ' ');
    for (std::size_t c = 0; c < m_fileFields.size() && c < m_values.size(); ++c)
        FormatValue(int(c), m_values[c].Str(), &record[std::size_t(m_offsets[c])]);
}

bool CQoOutputFilterDbase::WriteRow(CQoString *text)
{
    if (text) {
        if (!m_bWriting) {
            // A preview without Init: the layout of the current descriptions.
            qodbase::Header header;
            for (int c = 0; c < NumCols(); ++c) {
                CDbaseField const &field = m_fields[std::size_t(c)];
                if (char const *problem = field.Problem()) {
                    CQoString why;
                    why.Format("Feld %s: %s", field.Name().GetString(), problem);
                    CQoException::Throw(why, nullptr);
                }
                header.fields.push_back(field);
            }
            qodbase::BuildHeader(header);
            m_fileFields = header.fields;
            m_offsets = header.offsets;
            m_nRecordLength = header.recordLength;
        }
        BuildRecord(m_record);
        text->Assign(m_record.data(), m_record.size());
        return true;
    }
    if (!m_bWriting || !m_pFile || !m_pFile->IsOpen())
        return false;
    if (m_lRows == LONG_MAX || std::uint64_t(m_lRows) >= 0xFFFFFFFFull)
        CQoException::Throw("Die dBase-Datei kann keine weiteren S\344tze aufnehmen", m_pFile->FileName());
    BuildRecord(m_record);
    WriteToFile(m_record.data(), m_record.size());
    ++m_lRows;
    return true;
}

// ---------------------------------------------------------------------------
// settings

void CQoOutputFilterDbase::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoOutputFilter::WriteConfig(cfg, section);
    CQoString key;
    for (int c = 0; c < NumCols(); ++c) {
        CDbaseField const &field = m_fields[std::size_t(c)];
        key.Format("column%d_type", c);
        cfg.SetValue(section, key, CQoString(field.Type()));
        key.Format("column%d_len", c);
        cfg.SetValue(section, key, field.Length());
        key.Format("column%d_dec", c);
        cfg.SetValue(section, key, field.Decimals());
    }
}

void CQoOutputFilterDbase::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoOutputFilter::ReadConfig(cfg, section); // column count (virtual NumCols) and names
    CQoString key;
    for (int c = 0; c < NumCols(); ++c) {
        CDbaseField &field = m_fields[std::size_t(c)];
        field.Name(m_columnNames[std::size_t(c)]);
        CQoString type(field.Type());
        key.Format("column%d_type", c);
        if (cfg.GetValue(section, key, type) && type.GetLength() == 1)
            field.Type(type.GetAt(0));
        int value = field.Length();
        key.Format("column%d_len", c);
        cfg.GetValue(section, key, value);
        field.Length(value);
        value = field.Decimals();
        key.Format("column%d_dec", c);
        cfg.GetValue(section, key, value);
        field.Decimals(value);
    }
}
