// CQoString: the text value of the record model.
//
// A CQoString is a plain value (copy, assign, compare) that holds Windows-1252
// text and converts implicitly to `char const *`, so it can be handed to any C
// API. Records, field values, file names and configuration values all travel
// as CQoString; the case and umlaut helpers know the Windows-1252 letters.
//
// Positions and lengths are `int`, counted in bytes (one byte is one character
// in Windows-1252). Functions that cut text (Left, Mid, Right) clamp their
// arguments to the text, as callers expect from such a string; GetAt and SetAt
// raise the index error (CQoException code 19) for a position outside it.
// A null `char const *` given to any operation counts as empty text.
#pragma once

#include "QoToolsApi.h"

#include <cstddef>
#include <string>
#include <string_view>

#if defined(__GNUC__)
#  define QO_PRINTF_FORMAT(fmt, args) __attribute__((format(printf, fmt, args)))
#else
#  define QO_PRINTF_FORMAT(fmt, args)
#endif

class QOTOOLS_API CQoString {
public:
    CQoString() = default;
    CQoString(char const *text);
    CQoString(char const *text, int length);
    CQoString(char ch, int count = 1);
    CQoString(std::string const &text);
    explicit CQoString(std::string_view text);
    CQoString(CQoString const &other);
    CQoString(CQoString &&other) noexcept;
    ~CQoString();

    // --- assignment and concatenation ------------------------------------
    CQoString &operator=(CQoString const &other);
    CQoString &operator=(CQoString &&other) noexcept;
    CQoString &operator=(char const *text);
    CQoString &operator=(char ch);

    CQoString &operator+=(CQoString const &text);
    CQoString &operator+=(char const *text);
    CQoString &operator+=(char ch);

    // Byte-exact assignment and appending, also of text with embedded NULs
    // (file readers use these to avoid a strlen per line).
    void Assign(char const *data, std::size_t length);
    // Assign for a reader that keeps kReadAhead readable bytes after every
    // value of its buffer (never this string's own text): a short value is
    // then copied in one fixed-size move, without a branch on its length.
    static constexpr std::size_t kReadAhead = 16;
    void AssignReadAhead(char const *data, std::size_t length);
    void Append(char const *data, std::size_t length);

    // --- access ----------------------------------------------------------
    operator char const *() const { return m_data; }
    char const *GetString() const { return m_data; }
    // The bytes without the end mark; valid until the string changes.
    std::string_view Str() const { return std::string_view(m_data, m_length); }

    int GetLength() const { return static_cast<int>(m_length); }
    bool IsEmpty() const { return m_length == 0; }
    void Empty() { SetLength(0); }

    char GetAt(int index) const;
    void SetAt(int index, char ch);

    // --- comparison --------------------------------------------------------
    // Compare is byte-wise (unsigned); CompareNoCase folds the Windows-1252
    // letters, so "Ärger" and "äRGER" are equal.
    int Compare(CQoString const &text) const;
    int Compare(char const *text) const;
    int CompareNoCase(char const *text) const;

    // --- formatting --------------------------------------------------------
    // printf-style; the result may be of any length.
    void Format(char const *format, ...) QO_PRINTF_FORMAT(2, 3);

    // --- pieces --------------------------------------------------------------
    CQoString Left(int count) const;
    CQoString Mid(int first) const;
    CQoString Mid(int first, int count) const;
    CQoString Right(int count) const;

    // Position of the first match at or after `start`, or -1.
    int Find(char ch, int start = 0) const;
    int Find(char const *text, int start = 0) const;
    // Position of the last occurrence of `ch`, or -1.
    int ReverseFind(char ch) const;

    // Replaces every non-overlapping occurrence, left to right; returns the
    // number of replacements. An empty `oldText` replaces nothing.
    int Replace(char const *oldText, char const *newText);
    int Replace(char oldChar, char newChar);

    // --- trimming --------------------------------------------------------------
    // Removes every trailing CR and LF (only those).
    CQoString &TrimNewline();
    // White space is blank, tab, CR, LF, vertical tab and form feed.
    CQoString &Trim();
    CQoString &TrimLeft();
    CQoString &TrimRight();
    // Removes the given characters instead of white space.
    CQoString &TrimLeft(char const *chars);
    CQoString &TrimRight(char const *chars);

    // --- case and umlauts (Windows-1252) ----------------------------------------
    // ß has no single upper-case letter in Windows-1252 and stays as it is.
    CQoString &MakeUpper();
    CQoString &MakeLower();
    // Replaces ä ö ü Ä Ö Ü ß by ae oe ue Ae Oe Ue ss. The case of the rest is
    // kept: upper-casing is a separate step for callers that want it.
    CQoString &NoUmlaute();

    static char ToUpper(char ch);
    static char ToLower(char ch);

private:
    // Makes room for `capacity` bytes (and the end mark), keeping the text.
    void Reserve(std::size_t capacity);
    void SetLength(std::size_t length)
    {
        m_length = length;
        m_data[length] = '\0';
    }
    void Release();
    void EraseFront(std::size_t count);

    // Up to kInline bytes live in the object itself, so that a field value
    // of a typical record needs no allocation; longer text is on the heap.
    static constexpr std::size_t kInline = 15;
    static constexpr std::size_t kMaxLength = 0x7FFFFFFE; // GetLength is an int
    char *m_data = m_inline;
    std::size_t m_length = 0;
    std::size_t m_capacity = kInline; // bytes that fit before the end mark
    char m_inline[kInline + 1] = {};
};

QOTOOLS_API CQoString operator+(CQoString const &a, CQoString const &b);
QOTOOLS_API CQoString operator+(CQoString const &a, char const *b);
QOTOOLS_API CQoString operator+(char const *a, CQoString const &b);
QOTOOLS_API CQoString operator+(CQoString const &a, char b);
QOTOOLS_API CQoString operator+(char a, CQoString const &b);

inline bool operator==(CQoString const &a, CQoString const &b) { return a.Str() == b.Str(); }
inline bool operator==(CQoString const &a, char const *b) { return a.Compare(b) == 0; }
inline bool operator==(char const *a, CQoString const &b) { return b.Compare(a) == 0; }
inline bool operator!=(CQoString const &a, CQoString const &b) { return !(a == b); }
inline bool operator!=(CQoString const &a, char const *b) { return !(a == b); }
inline bool operator!=(char const *a, CQoString const &b) { return !(a == b); }
inline bool operator<(CQoString const &a, CQoString const &b) { return a.Compare(b) < 0; }
inline bool operator<(CQoString const &a, char const *b) { return a.Compare(b) < 0; }
inline bool operator<(char const *a, CQoString const &b) { return b.Compare(a) > 0; }
inline bool operator>(CQoString const &a, CQoString const &b) { return a.Compare(b) > 0; }
inline bool operator>(CQoString const &a, char const *b) { return a.Compare(b) > 0; }
inline bool operator>(char const *a, CQoString const &b) { return b.Compare(a) < 0; }
inline bool operator<=(CQoString const &a, CQoString const &b) { return !(a > b); }
inline bool operator<=(CQoString const &a, char const *b) { return !(a > b); }
inline bool operator<=(char const *a, CQoString const &b) { return !(a > b); }
inline bool operator>=(CQoString const &a, CQoString const &b) { return !(a < b); }
inline bool operator>=(CQoString const &a, char const *b) { return !(a < b); }
inline bool operator>=(char const *a, CQoString const &b) { return !(a < b); }
