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
// storage

void CQoString::Reserve(std::size_t capacity)
{
    if (capacity <= m_capacity)
        return;
    // Lengths are int to the callers (GetLength): no text grows beyond that.
    if (capacity > kMaxLength)
        CQoException::Throw(CQoException::outOfMemory, "CQoString");
    // Grows by half at least, so that appending byte by byte stays linear.
    std::size_t grown = m_capacity + m_capacity / 2;
    if (capacity < grown)
        capacity = grown < kMaxLength ? grown : kMaxLength;
    char *data = new char[capacity + 1];
    std::memcpy(data, m_data, m_length + 1);
    Release();
    m_data = data;
    m_capacity = capacity;
}

void CQoString::Release()
{
    if (m_data != m_inline)
        delete[] m_data;
    m_data = m_inline;
    m_capacity = kInline;
}

CQoString::~CQoString()
{
    Release();
}

void CQoString::EraseFront(std::size_t count)
{
    if (count == 0)
        return;
    if (count > m_length)
        count = m_length;
    std::memmove(m_data, m_data + count, m_length - count);
    SetLength(m_length - count);
}

// ---------------------------------------------------------------------------
// construction and assignment

CQoString::CQoString(char const *text)
{
    if (text)
        Assign(text, std::strlen(text));
}

CQoString::CQoString(char const *text, int length)
{
    if (text && length > 0)
        Assign(text, static_cast<std::size_t>(length));
}

CQoString::CQoString(char ch, int count)
{
    if (count > 0) {
        Reserve(static_cast<std::size_t>(count));
        std::memset(m_data, ch, static_cast<std::size_t>(count));
        SetLength(static_cast<std::size_t>(count));
    }
}

CQoString::CQoString(std::string const &text)
{
    Assign(text.data(), text.size());
}

CQoString::CQoString(std::string_view text)
{
    Assign(text.data(), text.size());
}

CQoString::CQoString(CQoString const &other)
{
    Assign(other.m_data, other.m_length);
}

CQoString::CQoString(CQoString &&other) noexcept
{
    *this = std::move(other);
}

CQoString &CQoString::operator=(CQoString const &other)
{
    Assign(other.m_data, other.m_length);
    return *this;
}

CQoString &CQoString::operator=(CQoString &&other) noexcept
{
    if (this == &other)
        return *this;
    if (other.m_data == other.m_inline) {
        // Short text is copied; the other keeps it.
        std::memcpy(m_data, other.m_inline, other.m_length + 1);
        m_length = other.m_length;
        return *this;
    }
    Release();
    m_data = other.m_data;
    m_length = other.m_length;
    m_capacity = other.m_capacity;
    other.m_data = other.m_inline;
    other.m_capacity = kInline;
    other.SetLength(0);
    return *this;
}

CQoString &CQoString::operator=(char const *text)
{
    text = Safe(text);
    Assign(text, std::strlen(text)); // also safe when text points into this string
    return *this;
}

CQoString &CQoString::operator=(char ch)
{
    m_data[0] = ch;
    SetLength(1);
    return *this;
}

CQoString &CQoString::operator+=(CQoString const &text)
{
    Append(text.m_data, text.m_length);
    return *this;
}

CQoString &CQoString::operator+=(char const *text)
{
    text = Safe(text);
    Append(text, std::strlen(text));
    return *this;
}

CQoString &CQoString::operator+=(char ch)
{
    Reserve(m_length + 1);
    m_data[m_length] = ch;
    SetLength(m_length + 1);
    return *this;
}

void CQoString::Assign(char const *data, std::size_t length)
{
    if (!data) {
        SetLength(0);
        return;
    }
    if (length <= m_capacity) {
        // Field values mostly: a copy and the end mark. The source may be
        // this string's own text.
        if (data + length <= m_data || data > m_data + m_length)
            qobytes::Copy(m_data, data, length);
        else
            std::memmove(m_data, data, length);
        SetLength(length);
        return;
    }
    // A new block first: `data` may point into the old one.
    if (length > kMaxLength)
        CQoException::Throw(CQoException::outOfMemory, "CQoString");
    char *block = new char[length + 1];
    std::memcpy(block, data, length);
    Release();
    m_data = block;
    m_capacity = length;
    SetLength(length);
}

void CQoString::AssignReadAhead(char const *data, std::size_t length)
{
    static_assert(kReadAhead == kInline + 1, "a short value and its end mark fill the inline text");
    if (data && length <= kInline && m_capacity >= kInline) {
        std::memcpy(m_data, data, kReadAhead);
        SetLength(length);
        return;
    }
    Assign(data, length);
}

void CQoString::Append(char const *data, std::size_t length)
{
    if (!data || length == 0)
        return;
    if (length > kMaxLength - m_length)
        CQoException::Throw(CQoException::outOfMemory, "CQoString");
    if (m_length + length > m_capacity) {
        if (data >= m_data && data <= m_data + m_length) {
            // Our own text: appended from a copy, the block may move.
            std::string const copy(data, length);
            Append(copy.data(), copy.size());
            return;
        }
        Reserve(m_length + length);
    }
    qobytes::Copy(m_data + m_length, data, length);
    SetLength(m_length + length);
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
    return m_data[index];
}

void CQoString::SetAt(int index, char ch)
{
    if (index < 0 || index >= GetLength())
        CQoException::Throw(CQoException::indexError, "CQoString::SetAt");
    m_data[index] = ch;
}

// ---------------------------------------------------------------------------
// comparison

int CQoString::Compare(CQoString const &text) const
{
    int r = Str().compare(text.Str()); // char_traits<char> compares as unsigned bytes
    return r < 0 ? -1 : (r > 0 ? 1 : 0);
}

int CQoString::Compare(char const *text) const
{
    int r = std::strcmp(m_data, Safe(text));
    return r < 0 ? -1 : (r > 0 ? 1 : 0);
}

int CQoString::CompareNoCase(char const *text) const
{
    CaseTables const &t = Tables();
    auto const *a = reinterpret_cast<unsigned char const *>(m_data);
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
        SetLength(0);
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
        Assign(small, static_cast<std::size_t>(needed));
        return;
    }
    // Build into a separate buffer: an argument may be this string's own text.
    std::string result(static_cast<std::size_t>(needed) + 1, '\0');
    std::vsnprintf(&result[0], result.size(), format, again);
    va_end(again);
    Assign(result.data(), static_cast<std::size_t>(needed));
}

// ---------------------------------------------------------------------------
// pieces

CQoString CQoString::Left(int count) const
{
    if (count <= 0)
        return CQoString();
    if (count >= GetLength())
        return *this;
    return CQoString(Str().substr(0, static_cast<std::size_t>(count)));
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
    return CQoString(Str().substr(static_cast<std::size_t>(first), static_cast<std::size_t>(count)));
}

CQoString CQoString::Right(int count) const
{
    int length = GetLength();
    if (count <= 0)
        return CQoString();
    if (count >= length)
        return *this;
    return CQoString(Str().substr(static_cast<std::size_t>(length - count)));
}

int CQoString::Find(char ch, int start) const
{
    if (start < 0)
        start = 0;
    if (start >= GetLength())
        return -1;
    std::size_t pos = Str().find(ch, static_cast<std::size_t>(start));
    return pos == std::string::npos ? -1 : static_cast<int>(pos);
}

int CQoString::Find(char const *text, int start) const
{
    if (start < 0)
        start = 0;
    if (start > GetLength())
        return -1;
    std::size_t pos = Str().find(Safe(text), static_cast<std::size_t>(start));
    return pos == std::string::npos ? -1 : static_cast<int>(pos);
}

int CQoString::ReverseFind(char ch) const
{
    std::size_t pos = Str().rfind(ch);
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
        std::size_t hit = Str().find(from, pos);
        if (hit == std::string::npos)
            break;
        result.append(m_data + pos, hit - pos);
        result += to;
        pos = hit + from.size();
        ++count;
    }
    if (count > 0) {
        result.append(m_data + pos, m_length - pos);
        Assign(result.data(), result.size());
    }
    return count;
}

int CQoString::Replace(char oldChar, char newChar)
{
    int count = 0;
    for (std::size_t i = 0; i < m_length; ++i)
        if (m_data[i] == oldChar) {
            m_data[i] = newChar;
            ++count;
        }
    return count;
}

// ---------------------------------------------------------------------------
// trimming

CQoString &CQoString::TrimNewline()
{
    std::size_t n = m_length;
    while (n > 0 && (m_data[n - 1] == '\r' || m_data[n - 1] == '\n'))
        --n;
    SetLength(n);
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
    while (n < m_length && IsBlank(m_data[n]))
        ++n;
    EraseFront(n);
    return *this;
}

CQoString &CQoString::TrimRight()
{
    std::size_t n = m_length;
    while (n > 0 && IsBlank(m_data[n - 1]))
        --n;
    SetLength(n);
    return *this;
}

CQoString &CQoString::TrimLeft(char const *chars)
{
    std::size_t n = Str().find_first_not_of(Safe(chars));
    EraseFront(n == std::string::npos ? m_length : n);
    return *this;
}

CQoString &CQoString::TrimRight(char const *chars)
{
    std::size_t n = Str().find_last_not_of(Safe(chars));
    SetLength(n == std::string::npos ? 0 : n + 1);
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
    for (std::size_t i = 0; i < m_length; ++i)
        m_data[i] = static_cast<char>(t.upper[static_cast<unsigned char>(m_data[i])]);
    return *this;
}

CQoString &CQoString::MakeLower()
{
    CaseTables const &t = Tables();
    for (std::size_t i = 0; i < m_length; ++i)
        m_data[i] = static_cast<char>(t.lower[static_cast<unsigned char>(m_data[i])]);
    return *this;
}

CQoString &CQoString::NoUmlaute()
{
    std::string result;
    result.reserve(m_length + 8);
    for (char c : Str()) {
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
    Assign(result.data(), result.size());
    return *this;
}
