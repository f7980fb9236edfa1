#include "CQoConfigFile.h"
#include "QoLimits.h"

#include "CQoException.h"
#include "CQoFile.h"

#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>

namespace {

char const kHex[] = "0123456789ABCDEF";
// The first line of every file this writer stores: below it a value is raw
// unless it is quoted. Files without it are hand-written or come from the
// earlier writer, which escaped every value.
char const kMark[] = "; qotools 2";

bool IsNameSpecial(unsigned char c)
{
    return c == '=' || c == '[' || c == ']' || c == ';' || c == '#';
}

bool IsControl(unsigned char c) { return c < 0x20 || c == 0x7F; }

void AppendHex(unsigned char c, std::string &out)
{
    out += "\\x";
    out += kHex[c >> 4];
    out += kHex[c & 15];
}

// The escaped form of names (and of every value of the earlier writer):
// \\ \r \n \t, \s for a blank at either end, \xHH for other control bytes
// and, in names, for the characters that give a line its meaning.
void Escape(std::string_view text, bool name, std::string &out)
{
    std::size_t const n = text.size();
    for (std::size_t i = 0; i < n; ++i) {
        auto c = static_cast<unsigned char>(text[i]);
        switch (c) {
        case '\\': out += "\\\\"; continue;
        case '\r': out += "\\r"; continue;
        case '\n': out += "\\n"; continue;
        case '\t': out += "\\t"; continue;
        case ' ':
            if (i == 0 || i + 1 == n)
                out += "\\s";
            else
                out += ' ';
            continue;
        default: break;
        }
        if (IsControl(c) || (name && IsNameSpecial(c)))
            AppendHex(c, out);
        else
            out += static_cast<char>(c);
    }
}

int HexDigit(char c)
{
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    return -1;
}

// The byte of "\xHH" whose 'x' stands at p[i]; moves i to its last digit.
bool ReadHex(char const *p, std::size_t n, std::size_t &i, std::string &out)
{
    if (i + 2 >= n)
        return false;
    int hi = HexDigit(p[i + 1]);
    int lo = HexDigit(p[i + 2]);
    if (hi < 0 || lo < 0)
        return false;
    out += static_cast<char>(hi * 16 + lo);
    i += 2;
    return true;
}

// Undoes Escape. False for a backslash that starts no escape. `marked` tells
// whether an escape that only the escaped form needs (\\, \s, \xHH) was seen.
bool Unescape(char const *p, std::size_t n, std::string &out, bool *marked = nullptr)
{
    out.clear();
    bool strong = false;
    for (std::size_t i = 0; i < n; ++i) {
        if (p[i] != '\\') {
            out += p[i];
            continue;
        }
        if (++i == n)
            return false;
        switch (p[i]) {
        case '\\': out += '\\'; strong = true; break;
        case 'r': out += '\r'; break;
        case 'n': out += '\n'; break;
        case 't': out += '\t'; break;
        case 's': out += ' '; strong = true; break;
        case 'x': {
            if (!ReadHex(p, n, i, out))
                return false;
            strong = true;
            break;
        }
        default: return false;
        }
    }
    if (marked)
        *marked = strong;
    return true;
}

// A value that would be changed by the trip through a line (blanks and tabs
// at its ends are trimmed, a line end ends it, a leading quote would read as
// the quoted form) or that holds other control bytes is written quoted.
bool NeedsQuotes(std::string_view text)
{
    if (text.empty())
        return false;
    char const first = text.front();
    char const last = text.back();
    if (first == '"' || first == ' ' || first == '\t' || last == ' ' || last == '\t')
        return true;
    for (char c : text)
        if (IsControl(static_cast<unsigned char>(c)))
            return true;
    return false;
}

void Quote(std::string_view text, std::string &out)
{
    out += '"';
    for (char ch : text) {
        auto c = static_cast<unsigned char>(ch);
        switch (c) {
        case '\\': out += "\\\\"; break;
        case '"': out += "\\\""; break;
        case '\r': out += "\\r"; break;
        case '\n': out += "\\n"; break;
        case '\t': out += "\\t"; break;
        default:
            if (IsControl(c))
                AppendHex(c, out);
            else
                out += ch;
        }
    }
    out += '"';
}

void WriteValue(std::string_view text, std::string &out)
{
    if (NeedsQuotes(text))
        Quote(text, out);
    else
        out += text;
}

// The inside of a quoted value; false when it is not the quoted form (a bare
// quote, a backslash that starts no escape).
bool Unquote(char const *p, std::size_t n, std::string &out)
{
    out.clear();
    for (std::size_t i = 0; i < n; ++i) {
        char c = p[i];
        if (c == '"')
            return false;
        if (c != '\\') {
            out += c;
            continue;
        }
        if (++i == n)
            return false;
        switch (p[i]) {
        case '\\': out += '\\'; break;
        case '"': out += '"'; break;
        case 'r': out += '\r'; break;
        case 'n': out += '\n'; break;
        case 't': out += '\t'; break;
        case 'x': {
            if (!ReadHex(p, n, i, out))
                return false;
            break;
        }
        default: return false;
        }
    }
    return true;
}

// What a value's text in the file stands for. An escaped or quoted reading
// is taken only when that writer would have written exactly this text for
// it: anything else is what a user typed, and it is kept as typed.
void ReadValue(char const *p, std::size_t n, bool markedFile, std::string &out)
{
    std::string decoded;
    std::string canonical;
    if (markedFile) {
        if (n >= 2 && p[0] == '"' && p[n - 1] == '"' && Unquote(p + 1, n - 2, decoded) && NeedsQuotes(decoded)) {
            Quote(decoded, canonical);
            if (canonical.size() == n && std::memcmp(canonical.data(), p, n) == 0) {
                out.swap(decoded);
                return;
            }
        }
    } else {
        // The earlier writer's form, where it cannot be a typed path: a path
        // holds \t or \n as often as a tab, but a typed \\, \s or \xHH that is
        // also canonical is next to unheard of.
        bool strong = false;
        if (std::memchr(p, '\\', n) && Unescape(p, n, decoded, &strong) && strong) {
            Escape(decoded, false, canonical);
            if (canonical.size() == n && std::memcmp(canonical.data(), p, n) == 0) {
                out.swap(decoded);
                return;
            }
        }
    }
    out.assign(p, n);
}

// A name in the escaped form; a backslash that starts no escape is text.
void ReadName(char const *p, std::size_t n, std::string &out)
{
    if (!Unescape(p, n, out))
        out.assign(p, n);
}

bool IsSpaceOrTab(char c) { return c == ' ' || c == '\t'; }

// Cuts unescaped blanks and tabs off both ends of [begin, end).
void TrimRange(char const *&begin, char const *&end)
{
    while (begin < end && IsSpaceOrTab(*begin))
        ++begin;
    while (end > begin && IsSpaceOrTab(end[-1]))
        --end;
}

bool ParseLong(CQoString const &text, long &value)
{
    CQoString trimmed(text);
    trimmed.Trim();
    if (trimmed.IsEmpty())
        return false;
    char *stop = nullptr;
    errno = 0;
    long parsed = std::strtol(trimmed.GetString(), &stop, 10);
    if (errno == ERANGE || !stop || *stop != '\0')
        return false;
    value = parsed;
    return true;
}

char const *Safe(char const *text) { return text ? text : ""; }

} // namespace

CQoConfigFile::CQoConfigFile() = default;
CQoConfigFile::~CQoConfigFile() = default;
CQoConfigFile::CQoConfigFile(CQoConfigFile const &other) = default;
CQoConfigFile &CQoConfigFile::operator=(CQoConfigFile const &other) = default;

// ---------------------------------------------------------------------------
// lookup

CQoConfigFile::Section *CQoConfigFile::FindSection(char const *name)
{
    for (Section &section : m_sections)
        if (section.name.CompareNoCase(name) == 0)
            return &section;
    return nullptr;
}

CQoConfigFile::Section const *CQoConfigFile::FindSection(char const *name) const
{
    return const_cast<CQoConfigFile *>(this)->FindSection(name);
}

CQoConfigFile::Entry const *CQoConfigFile::FindEntry(Section const &section, char const *key)
{
    for (Entry const &entry : section.entries)
        if (entry.key.CompareNoCase(key) == 0)
            return &entry;
    return nullptr;
}

CQoConfigFile::Section &CQoConfigFile::MakeSection(char const *name)
{
    if (Section *section = FindSection(name))
        return *section;
    m_sections.push_back(Section{CQoString(name), {}});
    return m_sections.back();
}

// ---------------------------------------------------------------------------
// values

bool CQoConfigFile::GetValue(char const *section, char const *key, CQoString &value) const
{
    Section const *s = FindSection(Safe(section));
    Entry const *e = s ? FindEntry(*s, Safe(key)) : nullptr;
    if (!e)
        return false;
    value = e->value;
    return true;
}

bool CQoConfigFile::GetValue(char const *section, char const *key, long &value) const
{
    CQoString text;
    return GetValue(section, key, text) && ParseLong(text, value);
}

bool CQoConfigFile::GetValue(char const *section, char const *key, int &value) const
{
    long parsed = 0;
    if (!GetValue(section, key, parsed) || parsed < INT_MIN || parsed > INT_MAX)
        return false;
    value = static_cast<int>(parsed);
    return true;
}

bool CQoConfigFile::GetValue(char const *section, char const *key, int &value, int low, int high) const
{
    CQoString text;
    if (!GetValue(section, key, text))
        return false;
    CQoString trimmed(text);
    trimmed.Trim();
    char *stop = nullptr;
    errno = 0;
    long long parsed = std::strtoll(trimmed.GetString(), &stop, 10);
    if (trimmed.IsEmpty() || !stop || *stop != '\0') {
        CQoString why;
        why.Format("'%s' ist keine Zahl (%s)", text.GetString(), Safe(key));
        throw CQoException(CQoException::invalidArgument, why, nullptr);
    }
    // strtoll saturates on overflow, which the bound check then refuses.
    value = qolimits::Checked(key, parsed, low, high);
    return true;
}

bool CQoConfigFile::SetValue(char const *section, char const *key, char const *value)
{
    return SetValue(section, key, CQoString(value));
}

bool CQoConfigFile::SetValue(char const *section, char const *key, CQoString const &value)
{
    if (!section || !*section || !key || !*key)
        return false;
    CQoString copy(value); // value may live inside this configuration
    Section &s = MakeSection(section);
    for (Entry &entry : s.entries)
        if (entry.key.CompareNoCase(key) == 0) {
            entry.value = copy;
            return true;
        }
    s.entries.push_back(Entry{CQoString(key), copy});
    return true;
}

bool CQoConfigFile::SetValue(char const *section, char const *key, int value)
{
    return SetValue(section, key, static_cast<long>(value));
}

bool CQoConfigFile::SetValue(char const *section, char const *key, long value)
{
    CQoString text;
    text.Format("%ld", value);
    return SetValue(section, key, text);
}

bool CQoConfigFile::DeleteKey(char const *section, char const *key)
{
    Section *s = FindSection(Safe(section));
    if (!s)
        return false;
    for (auto it = s->entries.begin(); it != s->entries.end(); ++it)
        if (it->key.CompareNoCase(Safe(key)) == 0) {
            s->entries.erase(it);
            return true;
        }
    return false;
}

bool CQoConfigFile::DeleteSection(char const *section)
{
    for (auto it = m_sections.begin(); it != m_sections.end(); ++it)
        if (it->name.CompareNoCase(Safe(section)) == 0) {
            m_sections.erase(it);
            return true;
        }
    return false;
}

void CQoConfigFile::CopySection(CQoConfigFile const &other, char const *section)
{
    if (&other == this)
        return;
    Section const *source = other.FindSection(Safe(section));
    if (!source) {
        DeleteSection(section);
        return;
    }
    if (Section *target = FindSection(Safe(section)))
        target->entries = source->entries;
    else
        m_sections.push_back(*source);
}

void CQoConfigFile::Clear()
{
    m_sections.clear();
}

bool CQoConfigFile::HasSection(char const *section) const
{
    return FindSection(Safe(section)) != nullptr;
}

bool CQoConfigFile::HasKey(char const *section, char const *key) const
{
    Section const *s = FindSection(Safe(section));
    return s && FindEntry(*s, Safe(key));
}

std::vector<CQoString> CQoConfigFile::GetSections() const
{
    std::vector<CQoString> names;
    for (Section const &section : m_sections)
        names.push_back(section.name);
    return names;
}

std::vector<CQoString> CQoConfigFile::GetKeys(char const *section) const
{
    std::vector<CQoString> keys;
    if (Section const *s = FindSection(Safe(section)))
        for (Entry const &entry : s->entries)
            keys.push_back(entry.key);
    return keys;
}

// ---------------------------------------------------------------------------
// text form

CQoString CQoConfigFile::ToText() const
{
    std::string out = kMark;
    out += "\r\n";
    bool first = true;
    for (Section const &section : m_sections) {
        if (!first)
            out += "\r\n";
        first = false;
        out += '[';
        Escape(section.name.Str(), true, out);
        out += "]\r\n";
        for (Entry const &entry : section.entries) {
            Escape(entry.key.Str(), true, out);
            out += '=';
            WriteValue(entry.value.Str(), out);
            out += "\r\n";
        }
    }
    return CQoString(std::move(out));
}

void CQoConfigFile::FromText(char const *text, std::size_t length)
{
    // A UTF-8 byte-order mark (written by many editors) is not part of the
    // first line: left there, it would hide the first section.
    if (length >= 3 && std::memcmp(text, "\xEF\xBB\xBF", 3) == 0) {
        text += 3;
        length -= 3;
    }
    CQoConfigFile parsed;
    Section *current = nullptr;
    std::string name;
    std::string value;
    char const *p = text ? text : "";
    char const *const stop = p + (text ? length : 0);
    bool markedFile = false;
    bool firstLine = true;
    while (p < stop) {
        // CR LF, LF and CR all end a line: editors on every system write one.
        char const *lineEnd = p;
        while (lineEnd < stop && *lineEnd != '\n' && *lineEnd != '\r')
            ++lineEnd;
        char const *begin = p;
        char const *end = lineEnd;
        p = lineEnd;
        if (p < stop && *p++ == '\r' && p < stop && *p == '\n')
            ++p;
        TrimRange(begin, end);
        if (firstLine) {
            firstLine = false;
            std::size_t const markLength = sizeof kMark - 1;
            markedFile = static_cast<std::size_t>(end - begin) == markLength
                         && std::memcmp(begin, kMark, markLength) == 0;
        }
        if (begin == end || *begin == ';' || *begin == '#')
            continue;

        // Raw control bytes never come from the writer: the line is junk.
        bool junk = false;
        for (char const *c = begin; c < end; ++c)
            if (static_cast<unsigned char>(*c) < 0x20 && *c != '\t')
                junk = true;

        if (*begin == '[') {
            current = nullptr; // keys after a bad header must not land elsewhere
            if (junk || end - begin < 2 || end[-1] != ']')
                continue;
            char const *nb = begin + 1;
            char const *ne = end - 1;
            TrimRange(nb, ne);
            ReadName(nb, static_cast<std::size_t>(ne - nb), name);
            // A name is handed around as C text: one that holds a NUL cannot be kept.
            if (name.empty() || name.find('\0') != std::string::npos)
                continue;
            current = &parsed.MakeSection(name.c_str());
            continue;
        }
        if (junk || !current)
            continue;
        char const *eq = begin;
        while (eq < end && *eq != '=')
            ++eq;
        if (eq == end)
            continue;
        char const *kb = begin;
        char const *ke = eq;
        char const *vb = eq + 1;
        char const *ve = end;
        TrimRange(kb, ke);
        TrimRange(vb, ve);
        ReadName(kb, static_cast<std::size_t>(ke - kb), name);
        if (name.empty() || name.find('\0') != std::string::npos)
            continue;
        ReadValue(vb, static_cast<std::size_t>(ve - vb), markedFile, value);
        CQoString key(name);
        CQoString val(value);
        bool found = false;
        for (Entry &entry : current->entries)
            if (entry.key.CompareNoCase(key) == 0) {
                entry.value = val;
                found = true;
                break;
            }
        if (!found)
            current->entries.push_back(Entry{key, val});
    }
    m_sections.swap(parsed.m_sections);
}

// ---------------------------------------------------------------------------
// files

bool CQoConfigFile::Open(char const *path)
{
    if (!path || !*path)
        return false;
    if (!CQoFile::Exists(path)) {
        Clear();
        return true;
    }
    std::string text;
    try {
        CQoFile file(4);
        if (!file.Open(path, CQoFile::read | CQoFile::binary))
            return false;
        char chunk[64 * 1024];
        for (;;) {
            std::size_t got = file.Read(chunk, sizeof chunk);
            if (got == 0)
                break;
            text.append(chunk, got);
        }
    } catch (CQoException const &) {
        return false;
    }
    FromText(text.data(), text.size());
    return true;
}

bool CQoConfigFile::Write(char const *path) const
{
    if (!path || !*path)
        return false;
    std::string const temp = CQoFile::NewTempFileBeside(path);
    if (temp.empty())
        return false;
    CQoString const text = ToText();
    bool written = false;
    {
        CQoFile file(1);
        if (!file.Open(temp.c_str(), CQoFile::write | CQoFile::create | CQoFile::binary))
            return false;
        try {
            file.Write(text);
            file.Flush(true);
            file.Close();
            written = true;
        } catch (CQoException const &) {
            // the destructor closes the file before it is removed below
        }
    }
    if (!written) {
        CQoFile::Remove(temp.c_str());
        return false;
    }
    bool replaced = CQoFile::MoveOver(temp.c_str(), path);
    if (!replaced)
        CQoFile::Remove(temp.c_str());
    return replaced;
}
