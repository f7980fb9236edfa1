#include "CQoOutputFilterTextVar.h"

#include "../core/QoBytes.h"

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"

#include <cstdint>
#include <cstdio>
#include <cstring>

CQoOutputFilterTextVar::CQoOutputFilterTextVar() = default;

CQoOutputFilterTextVar::~CQoOutputFilterTextVar()
{
    try {
        ReleaseFile();
    } catch (CQoException const &) {
        // a destructor cannot report; callers who care call ReleaseFile
    }
}

char CQoOutputFilterTextVar::Delimiter() const { return m_chDelimiter; }
void CQoOutputFilterTextVar::Delimiter(char ch) { m_chDelimiter = ch; }
char CQoOutputFilterTextVar::Encloser() const { return m_chEncloser; }
void CQoOutputFilterTextVar::Encloser(char ch) { m_chEncloser = ch; }
char CQoOutputFilterTextVar::Escape() const { return m_chEscape; }
void CQoOutputFilterTextVar::Escape(char ch) { m_chEscape = ch; }
bool CQoOutputFilterTextVar::ForceEncloser() const { return m_bForceEncloser; }
void CQoOutputFilterTextVar::ForceEncloser(bool on) { m_bForceEncloser = on; }
bool CQoOutputFilterTextVar::WriteHeaderFlag() const { return m_bWriteHeader; }
void CQoOutputFilterTextVar::WriteHeaderFlag(bool on) { m_bWriteHeader = on; }

char const *CQoOutputFilterTextVar::SettingsProblem() const
{
    char d = m_chDelimiter, q = m_chEncloser, e = m_chEscape;
    if (d == 0)
        return "Es ist kein Trennzeichen angegeben";
    if (d == '\r' || d == '\n' || q == '\r' || q == '\n' || e == '\r' || e == '\n')
        return "Zeilenumbr\374che k\366nnen nicht als Trennzeichen, Begrenzer oder Escape dienen";
    if (d == q)
        return "Trennzeichen und Begrenzer d\374rfen nicht gleich sein";
    if (e != 0 && (e == d || e == q))
        return "Das Escape-Zeichen muss sich von Trennzeichen und Begrenzer unterscheiden";
    return nullptr;
}

bool CQoOutputFilterTextVar::Init()
{
    if (char const *problem = SettingsProblem())
        CQoException::Throw(problem, nullptr);
    if (!m_pFile || !m_pFile->IsOpen())
        return false;
    m_pFile->FileCharSet(m_nFileCharSet);
    return true;
}

namespace {
// A word with a high bit set in each byte of `word` that equals the byte
// repeated in `pattern` (and nowhere else when none does).
inline std::uint64_t BytesEqual(std::uint64_t word, std::uint64_t pattern)
{
    std::uint64_t const x = word ^ pattern;
    return (x - 0x0101010101010101ull) & ~x & 0x8080808080808080ull;
}
inline std::uint64_t Repeated(char c) { return 0x0101010101010101ull * static_cast<unsigned char>(c); }
} // namespace

bool CQoOutputFilterTextVar::IsPlain(char const *data, std::size_t size) const
{
    // Eight bytes at a time against the five stop bytes, the rest one by one.
    char const d = m_chDelimiter, q = m_chEncloser, e = m_chEscape;
    std::uint64_t const pd = Repeated(d), pq = Repeated(q), pe = Repeated(e);
    std::uint64_t const cr = Repeated('\r'), lf = Repeated('\n');
    std::size_t i = 0;
    for (; i + 8 <= size; i += 8) {
        std::uint64_t word;
        std::memcpy(&word, data + i, 8);
        std::uint64_t hit = BytesEqual(word, pd) | BytesEqual(word, cr) | BytesEqual(word, lf);
        if (q != 0)
            hit |= BytesEqual(word, pq);
        if (e != 0)
            hit |= BytesEqual(word, pe);
        if (hit)
            return false;
    }
    for (; i < size; ++i) {
        char const c = data[i];
        if (c == d || c == '\r' || c == '\n' || (q != 0 && c == q) || (e != 0 && c == e))
            return false;
    }
    return true;
}

void CQoOutputFilterTextVar::AppendField(std::string &out, std::string_view value) const
{
    char const d = m_chDelimiter, q = m_chEncloser, e = m_chEscape;
    if (!m_bForceEncloser) {
        // Most values hold nothing special: one scan, one copy.
        if (IsPlain(value.data(), value.size())) {
            qobytes::Append(out, value.data(), value.size());
            return;
        }
    }
    if (q != 0) {
        // Enclosed when forced or when the value holds a delimiter or a line
        // break; without an escape character an encloser needs it too (doubled).
        bool enclose = m_bForceEncloser;
        for (std::size_t i = 0; i < value.size() && !enclose; ++i) {
            char c = value[i];
            if ((c == d && d != 0) || c == '\r' || c == '\n' || (c == q && e == 0))
                enclose = true;
        }
        if (enclose)
            out += q;
        for (char c : value) {
            if (c == q) {
                out += e != 0 ? e : q;
            } else if (e != 0 && c == e) {
                out += e;
            }
            out += c;
        }
        if (enclose)
            out += q;
        return;
    }
    // No encloser: escape what would split the value.
    for (char c : value) {
        if ((c == d && d != 0) || c == '\r' || c == '\n' || (e != 0 && c == e)) {
            if (e == 0) {
                char text[160];
                std::snprintf(text, sizeof text,
                              "Der Wert enth\344lt %s, aber weder Begrenzer noch Escape-Zeichen sind angegeben",
                              c == d ? "das Trennzeichen" : "einen Zeilenumbruch");
                CQoException::Throw(text, nullptr);
            }
            out += e;
        }
        out += c;
    }
}

void CQoOutputFilterTextVar::AppendLine(std::string &out, std::vector<CQoString> const &values) const
{
    out.clear();
    for (std::size_t c = 0; c < values.size(); ++c) {
        if (c > 0 && m_chDelimiter != 0)
            out += m_chDelimiter;
        AppendField(out, values[c].Str());
    }
    if (values.size() == 1 && values[0].IsEmpty() && m_chEncloser != 0 && !m_bForceEncloser) {
        out += m_chEncloser;
        out += m_chEncloser;
    }
    out += "\r\n";
}

void CQoOutputFilterTextVar::Emit(std::string const &line, CQoString *text)
{
    if (text) {
        text->Assign(line.data(), line.size());
        return;
    }
    if (char const *problem = SettingsProblem())
        CQoException::Throw(problem, m_pFile ? m_pFile->FileName() : nullptr);
    WriteToFile(line.data(), line.size());
}

bool CQoOutputFilterTextVar::WriteHeader(CQoString *text)
{
    if (!m_bWriteHeader) {
        if (text)
            text->Empty();
        return true;
    }
    AppendLine(m_line, m_columnNames);
    Emit(m_line, text);
    return true;
}

bool CQoOutputFilterTextVar::WriteRow(CQoString *text)
{
    AppendLine(m_line, m_values);
    Emit(m_line, text);
    return true;
}

void CQoOutputFilterTextVar::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoOutputFilter::WriteConfig(cfg, section);
    cfg.SetValue(section, "delimiter", int(static_cast<unsigned char>(m_chDelimiter)));
    cfg.SetValue(section, "encloser", int(static_cast<unsigned char>(m_chEncloser)));
    cfg.SetValue(section, "escape", int(static_cast<unsigned char>(m_chEscape)));
    cfg.SetValue(section, "forceencloser", m_bForceEncloser ? 1 : 0);
    cfg.SetValue(section, "header", m_bWriteHeader ? 1 : 0);
}

void CQoOutputFilterTextVar::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoOutputFilter::ReadConfig(cfg, section);
    auto readChar = [&](char const *key, char &ch) {
        int value = static_cast<unsigned char>(ch);
        if (cfg.GetValue(section, key, value) && value >= 0 && value <= 255)
            ch = static_cast<char>(value);
    };
    readChar("delimiter", m_chDelimiter);
    readChar("encloser", m_chEncloser);
    readChar("escape", m_chEscape);
    int flag = m_bForceEncloser ? 1 : 0;
    cfg.GetValue(section, "forceencloser", flag);
    m_bForceEncloser = flag != 0;
    flag = m_bWriteHeader ? 1 : 0;
    cfg.GetValue(section, "header", flag);
    m_bWriteHeader = flag != 0;
}
