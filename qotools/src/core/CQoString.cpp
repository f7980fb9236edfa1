#include "CQoString.h"

#include "CQoException.h"
#include "QoBytes.h"

#include <array>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <utility>

namespace {

// Case tables of Windows-1252: a-z, the accented letters 0xE0-0xFE (without the
// division sign 0xF7) and the four letters of the 0x80 row (š œ ž ÿ).
struct CaseTables {
    std::array<unsigned char, 256> upper{};
    std::array<unsigned char, 256> lower{};

    CaseTables()
    {
        for (int c = 0; c < 256; ++c)
            upper[c] = lower[c] = static_cast<unsigned char>(c);
        auto pair = [this](int up, int low) {
            upper[low] = static_cast<unsigned char>(up);
            lower[up] = static_cast<unsigned char>(low);
        };
        for (int c = 'a'; c <= 'z'; ++c)
            pair(c - 32, c);
        for (int c = 0xE0; c <= 0xFE; ++c)
            if (c != 0xF7)
                pair(c - 0x20, c);
        pair(0x8A, 0x9A);
        pair(0x8C, 0x9C);
        pair(0x8E, 0x9E);
        pair(0x9F, 0xFF);
    }
};

CaseTables const &Tables()
{
    static CaseTables const tables;
    return tables;
}

bool IsBlank(char ch)
{
    return ch == ' ' || ch == '\t' || ch == '\r' || ch == '\n' || ch == '\v' || ch == '\f';
}

char const *Safe(char const *text) { return text ? text : ""; }

} // namespace

// ---------------------------------------------------------------------------
// construction and assignment

CQoString::CQoString(char const *text) : m_str(Safe(text)) {}

CQoString::CQoString(char const *text, int length)
{
    if (text && length > 0)
        m_str.assign(text, static_cast<std::size_t>(length));
}

CQoString::CQoString(char ch, int count)
{
    if (count > 0)
        m_str.assign(static_cast<std::size_t>(count), ch);
}

CQoString::CQoString(std::string text) : m_str(std::move(text)) {}

CQoString &CQoString::operator=(char const *text)
{
    m_str = Safe(text); // also safe when text points into m_str
    return *this;
}

CQoString &CQoString::operator=(char ch)
{
    m_str.assign(1, ch);
    return *this;
}

CQoString &CQoString::operator+=(CQoString const &text)
{
    m_str += text.m_str;
    return *this;
}

CQoString &CQoString::operator+=(char const *text)
{
    m_str += Safe(text);
    return *this;
}

CQoString &CQoString::operator+=(char ch)
{
    m_str += ch;
    return *this;
}

#if defined(_WIN32)
constexpr std::size_t kShortValue = 15; // what every std::string holds without allocating
#endif

void CQoString::Assign(char const *data, std::size_t length)
{
    char const *mine = m_str.data();
    if (!data) {
        m_str.clear();
    } else if (data + length <= mine || data > mine + m_str.capacity()) {
        // Apart from our own text: the usual case of a field value.
#if defined(_WIN32)
        if (length <= kShortValue) {
            // Written into the string's own storage (it always has room for
            // kShortValue bytes), then the length follows through inline
            // members: erase shortens, push_back lengthens (and writes the
            // end mark after each byte, so it takes the bytes from `data`).
            qobytes::Copy(&m_str[0], data, length);
            if (length <= m_str.size())
                m_str.erase(length);
            else
                while (m_str.size() < length)
                    m_str.push_back(data[m_str.size()]);
            return;
        }
#endif
        m_str.clear();
        m_str.append(data, length);
    } else {
        m_str.assign(data, length);
    }
}

void CQoString::Append(char const *data, std::size_t length)
{
    if (data)
        m_str.append(data, length);
}

CQoString operator+(CQoString const &a, CQoString const &b)
{
    CQoString result(a);
    result += b;
    return result;
}

CQoString operator+(CQoString const &a, char const *b)
{
    CQoString result(a);
    result += b;
    return result;
}

CQoString operator+(char const *a, CQoString const &b)
{
    CQoString result(a);
    result += b;
    return result;
}

CQoString operator+(CQoString const &a, char b)
{
    CQoString result(a);
    result += b;
    return result;
}

CQoString operator+(char a, CQoString const &b)
{
    CQoString result(a);
    result += b;
    return result;
}

// ---------------------------------------------------------------------------
// access

char CQoString::GetAt(int index) const
{
    if (index < 0 || index >= GetLength())
        CQoException::Throw(CQoException::indexError, "CQoString::GetAt");
    return m_str[static_cast<std::size_t>(index)];
}

void CQoString::SetAt(int index, char ch)
{
    if (index < 0 || index >= GetLength())
        CQoException::Throw(CQoException::indexError, "CQoString::SetAt");
    m_str[static_cast<std::size_t>(index)] = ch;
}

// ---------------------------------------------------------------------------
// comparison

int CQoString::Compare(CQoString const &text) const
{
    int r = m_str.compare(text.m_str); // char_traits<char> compares as unsigned bytes
    return r < 0 ? -1 : (r > 0 ? 1 : 0);
}

int CQoString::Compare(char const *text) const
{
    int r = std::strcmp(m_str.c_str(), Safe(text));
    return r < 0 ? -1 : (r > 0 ? 1 : 0);
}

int CQoString::CompareNoCase(char const *text) const
{
    CaseTables const &t = Tables();
    auto const *a = reinterpret_cast<unsigned char const *>(m_str.c_str());
    auto const *b = reinterpret_cast<unsigned char const *>(Safe(text));
    for (;; ++a, ++b) {
        int ca = t.lower[*a];
        int cb = t.lower[*b];
        if (ca != cb)
            return ca < cb ? -1 : 1;
        if (ca == 0)
            return 0;
    }
}

// ---------------------------------------------------------------------------
// formatting

void CQoString::Format(char const *format, ...)
{
    if (!format) {
        m_str.clear();
        return;
    }
    char small[256];
    va_list args;
    va_start(args, format);
    va_list again;
    va_copy(again, args);
    int needed = std::vsnprintf(small, sizeof small, format, args);
    va_end(args);
    if (needed < 0) {
        va_end(again);
        CQoException::Throw(CQoException::formatError, "CQoString::Format");
    }
    if (static_cast<std::size_t>(needed) < sizeof small) {
        va_end(again);
        m_str.assign(small, static_cast<std::size_t>(needed));
        return;
    }
    // Build into a separate buffer: an argument may be this string's own text.
    std::string result(static_cast<std::size_t>(needed) + 1, '\0');
    std::vsnprintf(&result[0], result.size(), format, again);
    va_end(again);
    result.resize(static_cast<std::size_t>(needed));
    m_str.swap(result);
}

// ---------------------------------------------------------------------------
// pieces

CQoString CQoString::Left(int count) const
{
    if (count <= 0)
        return CQoString();
    if (count >= GetLength())
        return *this;
    return CQoString(m_str.substr(0, static_cast<std::size_t>(count)));
}

CQoString CQoString::Mid(int first) const
{
    return Mid(first, GetLength());
}

CQoString CQoString::Mid(int first, int count) const
{
    int length = GetLength();
    if (first < 0)
        first = 0;
    if (first >= length || count <= 0)
        return CQoString();
    if (count > length - first)
        count = length - first;
    return CQoString(m_str.substr(static_cast<std::size_t>(first), static_cast<std::size_t>(count)));
}

CQoString CQoString::Right(int count) const
{
    int length = GetLength();
    if (count <= 0)
        return CQoString();
    if (count >= length)
        return *this;
    return CQoString(m_str.substr(static_cast<std::size_t>(length - count)));
}

int CQoString::Find(char ch, int start) const
{
    if (start < 0)
        start = 0;
    if (start >= GetLength())
        return -1;
    std::size_t pos = m_str.find(ch, static_cast<std::size_t>(start));
    return pos == std::string::npos ? -1 : static_cast<int>(pos);
}

int CQoString::Find(char const *text, int start) const
{
    if (start < 0)
        start = 0;
    if (start > GetLength())
        return -1;
    std::size_t pos = m_str.find(Safe(text), static_cast<std::size_t>(start));
    return pos == std::string::npos ? -1 : static_cast<int>(pos);
}

int CQoString::ReverseFind(char ch) const
{
    std::size_t pos = m_str.rfind(ch);
    return pos == std::string::npos ? -1 : static_cast<int>(pos);
}

int CQoString::Replace(char const *oldText, char const *newText)
{
    // Copies first: either argument may point into this string.
    std::string const from(Safe(oldText));
    std::string const to(Safe(newText));
    if (from.empty())
        return 0;
    std::string result;
    int count = 0;
    std::size_t pos = 0;
    for (;;) {
        std::size_t hit = m_str.find(from, pos);
        if (hit == std::string::npos)
            break;
        result.append(m_str, pos, hit - pos);
        result += to;
        pos = hit + from.size();
        ++count;
    }
    if (count > 0) {
        result.append(m_str, pos, std::string::npos);
        m_str.swap(result);
    }
    return count;
}

int CQoString::Replace(char oldChar, char newChar)
{
    int count = 0;
    for (char &c : m_str)
        if (c == oldChar) {
            c = newChar;
            ++count;
        }
    return count;
}

// ---------------------------------------------------------------------------
// trimming

CQoString &CQoString::TrimNewline()
{
    std::size_t n = m_str.size();
    while (n > 0 && (m_str[n - 1] == '\r' || m_str[n - 1] == '\n'))
        --n;
    m_str.resize(n);
    return *this;
}

CQoString &CQoString::Trim()
{
    TrimRight();
    return TrimLeft();
}

CQoString &CQoString::TrimLeft()
{
    std::size_t n = 0;
    while (n < m_str.size() && IsBlank(m_str[n]))
        ++n;
    m_str.erase(0, n);
    return *this;
}

CQoString &CQoString::TrimRight()
{
    std::size_t n = m_str.size();
    while (n > 0 && IsBlank(m_str[n - 1]))
        --n;
    m_str.resize(n);
    return *this;
}

CQoString &CQoString::TrimLeft(char const *chars)
{
    std::size_t n = m_str.find_first_not_of(Safe(chars));
    m_str.erase(0, n == std::string::npos ? m_str.size() : n);
    return *this;
}

CQoString &CQoString::TrimRight(char const *chars)
{
    std::size_t n = m_str.find_last_not_of(Safe(chars));
    m_str.resize(n == std::string::npos ? 0 : n + 1);
    return *this;
}

// ---------------------------------------------------------------------------
// case and umlauts

char CQoString::ToUpper(char ch)
{
    return static_cast<char>(Tables().upper[static_cast<unsigned char>(ch)]);
}

char CQoString::ToLower(char ch)
{
    return static_cast<char>(Tables().lower[static_cast<unsigned char>(ch)]);
}

CQoString &CQoString::MakeUpper()
{
    CaseTables const &t = Tables();
    for (char &c : m_str)
        c = static_cast<char>(t.upper[static_cast<unsigned char>(c)]);
    return *this;
}

CQoString &CQoString::MakeLower()
{
    CaseTables const &t = Tables();
    for (char &c : m_str)
        c = static_cast<char>(t.lower[static_cast<unsigned char>(c)]);
    return *this;
}

CQoString &CQoString::NoUmlaute()
{
    std::string result;
    result.reserve(m_str.size() + 8);
    for (char c : m_str) {
        switch (static_cast<unsigned char>(c)) {
        case 0xE4: result += "ae"; break; // ä
        case 0xF6: result += "oe"; break; // ö
        case 0xFC: result += "ue"; break; // ü
        case 0xC4: result += "Ae"; break; // Ä
        case 0xD6: result += "Oe"; break; // Ö
        case 0xDC: result += "Ue"; break; // Ü
        case 0xDF: result += "ss"; break; // ß
        default: result += c; break;
        }
    }
    m_str.swap(result);
    return *this;
}
