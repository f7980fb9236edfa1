// The delimited record parser. The common case (plain fields, enclosed fields
// without doubled enclosers or escapes) is cut without copying; everything
// else goes through the full state machine into the scratch text.
#include "CQoInputFilterTextVar.h"

#include "CQoConfigFile.h"
#include "CQoException.h"

#include <cstdint>
#include <cstring>

#if defined(__SSE2__) || defined(_M_X64)
#include <emmintrin.h>
#define QO_SCAN_SSE2 1
#endif

namespace {
enum fieldEnd { endDelimiter, endRecord, endEof, endMore, endOpen };

inline bool IsLineEnd(unsigned char c)
{
    return c == '\r' || c == '\n';
}

inline unsigned LowestBit(std::uint64_t mask)
{
#if defined(__GNUC__) || defined(__clang__)
    return static_cast<unsigned>(__builtin_ctzll(mask));
#else
    unsigned n = 0;
    while (!(mask & 1)) {
        mask >>= 1;
        ++n;
    }
    return n;
#endif
}

// Finds the bytes that end a run of plain characters, 64 bytes at a time: one
// bit mask of the bytes that stop a plain field (delimiter, line ends,
// escape) and one of those that stop enclosed text (encloser, escape). Fields
// are short, so several share one block of masks.
class StopScanner {
public:
    StopScanner(char const *end, bool const *stopPlain, bool const *stopQuoted, char delimiter, char encloser,
                char escape)
        : m_end(end), m_stopPlain(stopPlain), m_stopQuoted(stopQuoted)
    {
#ifdef QO_SCAN_SSE2
        // A character that is not in use repeats one that is, so that it
        // adds no stops of its own.
        m_delimiter = _mm_set1_epi8(delimiter);
        m_escape = _mm_set1_epi8(escape ? escape : delimiter);
        m_encloser = _mm_set1_epi8(encloser ? encloser : escape ? escape : '\n');
        m_quotedEscape = _mm_set1_epi8(escape ? escape : encloser ? encloser : '\n');
#else
        (void)delimiter;
        (void)encloser;
        (void)escape;
#endif
    }

    // The first byte at or after `p` that ends a plain field, or the end.
    char const *NextPlain(char const *p) { return Next(p, &StopScanner::m_plain); }
    // The first byte at or after `p` that ends a run inside enclosers, or the end.
    char const *NextQuoted(char const *p) { return Next(p, &StopScanner::m_quoted); }

private:
    char const *Next(char const *p, std::uint64_t StopScanner::*which)
    {
        if (!m_base || p < m_base || p - m_base >= 64)
            Load(p);
        for (;;) {
            std::uint64_t mask = this->*which & (~std::uint64_t(0) << (p - m_base));
            if (mask)
                return m_base + LowestBit(mask);
            if (m_end - m_base <= 64)
                return m_end;
            Load(m_base + 64);
            p = m_base;
        }
    }

    void Load(char const *at)
    {
        m_base = at;
        m_plain = m_quoted = 0;
        std::ptrdiff_t avail = m_end - at;
#ifdef QO_SCAN_SSE2
        if (avail >= 64) {
            __m128i const cr = _mm_set1_epi8('\r'), lf = _mm_set1_epi8('\n');
            for (int k = 0; k < 4; ++k) {
                __m128i v = _mm_loadu_si128(reinterpret_cast<__m128i const *>(at + 16 * k));
                __m128i plain = _mm_or_si128(_mm_or_si128(_mm_cmpeq_epi8(v, m_delimiter), _mm_cmpeq_epi8(v, m_escape)),
                                             _mm_or_si128(_mm_cmpeq_epi8(v, cr), _mm_cmpeq_epi8(v, lf)));
                __m128i quoted = _mm_or_si128(_mm_cmpeq_epi8(v, m_encloser), _mm_cmpeq_epi8(v, m_quotedEscape));
                m_plain |= std::uint64_t(static_cast<std::uint16_t>(_mm_movemask_epi8(plain))) << (16 * k);
                m_quoted |= std::uint64_t(static_cast<std::uint16_t>(_mm_movemask_epi8(quoted))) << (16 * k);
            }
            return;
        }
#endif
        std::ptrdiff_t n = avail < 64 ? avail : 64;
        auto const *u = reinterpret_cast<unsigned char const *>(at);
        for (std::ptrdiff_t i = 0; i < n; ++i) {
            m_plain |= std::uint64_t(m_stopPlain[u[i]]) << i;
            m_quoted |= std::uint64_t(m_stopQuoted[u[i]]) << i;
        }
    }

    char const *m_end;
    char const *m_base = nullptr;
    std::uint64_t m_plain = 0;
    std::uint64_t m_quoted = 0;
    bool const *m_stopPlain;
    bool const *m_stopQuoted;
#ifdef QO_SCAN_SSE2
    __m128i m_delimiter, m_escape, m_encloser, m_quotedEscape;
#endif
};
}

CQoInputFilterTextVar::CQoInputFilterTextVar()
{
    m_fileType = filterTextVar;
    BuildTables();
}

void CQoInputFilterTextVar::BuildTables()
{
    std::memset(m_stopPlain, 0, sizeof m_stopPlain);
    std::memset(m_stopQuoted, 0, sizeof m_stopQuoted);
    m_stopPlain[static_cast<unsigned char>(m_cDelimiter)] = true;
    m_stopPlain[static_cast<unsigned char>('\r')] = true;
    m_stopPlain[static_cast<unsigned char>('\n')] = true;
    if (m_cEscape) {
        m_stopPlain[static_cast<unsigned char>(m_cEscape)] = true;
        m_stopQuoted[static_cast<unsigned char>(m_cEscape)] = true;
    }
    if (m_cEncloser)
        m_stopQuoted[static_cast<unsigned char>(m_cEncloser)] = true;
}

void CQoInputFilterTextVar::Delimiter(char delimiter)
{
    if (delimiter == 0 || delimiter == '\r' || delimiter == '\n')
        CQoException::Throw(CQoException::invalidArgument, "Trennzeichen");
    if (delimiter != m_cDelimiter) {
        m_cDelimiter = delimiter;
        m_bModified = true;
        BuildTables();
    }
}

void CQoInputFilterTextVar::Encloser(char encloser)
{
    if (encloser == '\r' || encloser == '\n')
        encloser = 0;
    if (encloser != m_cEncloser) {
        m_cEncloser = encloser;
        m_bModified = true;
        BuildTables();
    }
}

void CQoInputFilterTextVar::Escape(char escape)
{
    if (escape == '\r' || escape == '\n')
        escape = 0;
    if (escape != m_cEscape) {
        m_cEscape = escape;
        m_bModified = true;
        BuildTables();
    }
}

// The full state machine for one field, from its first character (the opening
// encloser when `quoted`); the field goes into the scratch text.
int CQoInputFilterTextVar::SlowField(char const *&p, char const *end, bool eof, bool quoted)
{
    enum { plain, escaped, inQuotes, escapedInQuotes, quoteInQuotes } state = plain;
    unsigned char const delimiter = static_cast<unsigned char>(m_cDelimiter);
    int const encloser = m_cEncloser ? static_cast<unsigned char>(m_cEncloser) : -1;
    int const escape = m_cEscape && m_cEscape != m_cEncloser ? static_cast<unsigned char>(m_cEscape) : -1;
    BeginScratchField();
    if (quoted) {
        state = inQuotes;
        ++p;
    }
    for (; p < end; ++p) {
        unsigned char c = static_cast<unsigned char>(*p);
        switch (state) {
        case plain:
            if (c == delimiter) {
                EndScratchField();
                ++p;
                return endDelimiter;
            }
            if (IsLineEnd(c)) {
                EndScratchField();
                return endRecord;
            }
            if (c == escape)
                state = escaped;
            else
                AppendScratch(static_cast<char>(c));
            break;
        case escaped:
            AppendScratch(static_cast<char>(c));
            state = plain;
            break;
        case inQuotes:
            if (c == escape)
                state = escapedInQuotes;
            else if (c == encloser)
                state = quoteInQuotes;
            else
                AppendScratch(static_cast<char>(c));
            break;
        case escapedInQuotes:
            AppendScratch(static_cast<char>(c));
            state = inQuotes;
            break;
        case quoteInQuotes:
            if (c == encloser) {
                AppendScratch(static_cast<char>(c));
                state = inQuotes;
            } else if (c == delimiter) {
                EndScratchField();
                ++p;
                return endDelimiter;
            } else if (IsLineEnd(c)) {
                EndScratchField();
                return endRecord;
            } else {
                AppendScratch(static_cast<char>(c));
                state = plain;
            }
            break;
        }
    }
    if (!eof)
        return endMore;
    if (state == inQuotes || state == escapedInQuotes)
        return endOpen;
    EndScratchField();
    return endEof;
}

int CQoInputFilterTextVar::ParseRecord(char const *begin, char const *end, bool eof, std::size_t &used)
{
    char const *p = begin;
    if (p == end)
        return eof ? parseEnd : parseMore;
    int const encloser = m_cEncloser ? static_cast<unsigned char>(m_cEncloser) : -1;
    char const delimiter = m_cDelimiter;
    StopScanner scan(end, m_stopPlain, m_stopQuoted, m_cDelimiter, m_cEncloser, m_cEscape);
    // An empty line is a row without fields.
    if (!IsLineEnd(static_cast<unsigned char>(*p))) {
        for (;;) {
            if (p == end) {
                if (!eof)
                    return parseMore;
                AddField(p, 0); // after a delimiter at the end of the file
                used = static_cast<std::size_t>(p - begin);
                return parseRecord;
            }
            char const *start = p;
            int result;
            if (static_cast<unsigned char>(*p) == encloser) {
                char const *content = ++p;
                p = scan.NextQuoted(p);
                if (p + 1 < end && static_cast<unsigned char>(*p) == encloser &&
                    (p[1] == delimiter || IsLineEnd(static_cast<unsigned char>(p[1])))) {
                    AddField(content, static_cast<std::size_t>(p - content));
                    ++p;
                    result = *p == delimiter ? (++p, endDelimiter) : endRecord;
                } else if (p + 1 == end && eof && static_cast<unsigned char>(*p) == encloser) {
                    AddField(content, static_cast<std::size_t>(p - content));
                    ++p;
                    result = endEof;
                } else {
                    p = start;
                    result = SlowField(p, end, eof, true);
                }
            } else {
                p = scan.NextPlain(p);
                if (p == end) {
                    if (!eof)
                        return parseMore;
                    AddField(start, static_cast<std::size_t>(p - start));
                    result = endEof;
                } else if (*p == delimiter) {
                    AddField(start, static_cast<std::size_t>(p - start));
                    ++p;
                    result = endDelimiter;
                } else if (IsLineEnd(static_cast<unsigned char>(*p))) {
                    AddField(start, static_cast<std::size_t>(p - start));
                    result = endRecord;
                } else {
                    p = start;
                    result = SlowField(p, end, eof, false);
                }
            }
            if (result == endDelimiter)
                continue;
            if (result == endMore)
                return parseMore;
            if (result == endOpen)
                return parseUnterminated;
            if (result == endEof) {
                used = static_cast<std::size_t>(p - begin);
                return parseRecord;
            }
            break; // endRecord: p stands on the line end
        }
    }
    // The line end: CR LF, LF or CR.
    if (*p == '\r') {
        if (p + 1 == end && !eof)
            return parseMore;
        ++p;
        if (p < end && *p == '\n')
            ++p;
    } else {
        ++p;
    }
    used = static_cast<std::size_t>(p - begin);
    return parseRecord;
}

CQoString CQoInputFilterTextVar::CheckRecord()
{
    if (NumFields() <= m_nNumCols)
        return CQoString();
    CQoString why;
    why.Format("%d Felder statt %d", NumFields(), m_nNumCols);
    return why;
}

static CQoString CharText(char c)
{
    if (c == 0)
        return "keines";
    if (c == '\t')
        return "[TAB]";
    return CQoString(c);
}

bool CQoInputFilterTextVar::StartDescription(CQoString &line)
{
    BeginDescription();
    AddDescription("Trennzeichen: " + CharText(m_cDelimiter));
    AddDescription("Begrenzer: " + CharText(m_cEncloser));
    AddDescription("Escape: " + CharText(m_cEscape));
    CQoString skip;
    skip.Format("\xDC" "berlesen: %d", m_nSkip);
    AddDescription(skip);
    return NextDescription(line);
}

void CQoInputFilterTextVar::CopyFrom(CQoInputFilter const &other)
{
    CQoInputFilterText::CopyFrom(other);
    if (auto const *var = dynamic_cast<CQoInputFilterTextVar const *>(&other)) {
        m_cDelimiter = var->m_cDelimiter;
        m_cEncloser = var->m_cEncloser;
        m_cEscape = var->m_cEscape;
        BuildTables();
    }
}

// The characters are stored as their codes, so that a blank, a tab or a
// semicolon survive any editor.
void CQoInputFilterTextVar::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilterText::WriteConfig(cfg, section);
    cfg.SetValue(section, "delimiter", static_cast<int>(static_cast<unsigned char>(m_cDelimiter)));
    cfg.SetValue(section, "encloser", static_cast<int>(static_cast<unsigned char>(m_cEncloser)));
    cfg.SetValue(section, "escape", static_cast<int>(static_cast<unsigned char>(m_cEscape)));
}

void CQoInputFilterTextVar::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilterText::ReadConfig(cfg, section);
    int value = 0;
    if (cfg.GetValue(section, "delimiter", value) && value > 0 && value < 256 && value != '\r' &&
        value != '\n')
        Delimiter(static_cast<char>(value));
    if (cfg.GetValue(section, "encloser", value) && value >= 0 && value < 256)
        Encloser(static_cast<char>(value));
    if (cfg.GetValue(section, "escape", value) && value >= 0 && value < 256)
        Escape(static_cast<char>(value));
}
