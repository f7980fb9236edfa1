#include "QoSqlName.h"

#include <cstring>

namespace {

bool IsWordByte(unsigned char c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_' || c == '$'
        || c == '#' || c == '@' || c >= 0x80;
}

bool IsControl(unsigned char c)
{
    return c < 0x20 || c == 0x7F;
}

} // namespace

bool QoCheckSqlName(const CQoString& name, CQoString& problem)
{
    problem.Empty();
    const char* p = name.GetString();
    const int length = name.GetLength();
    if (length == 0) {
        problem = "ist leer";
        return false;
    }
    // Checked over the whole length: a NUL would end the name for the driver
    // and leave the rest of the statement to whatever follows it.
    for (int i = 0; i < length; ++i) {
        if (IsControl((unsigned char)p[i])) {
            problem = "enth\xE4lt ein Steuerzeichen";
            return false;
        }
    }
    int i = 0;
    for (;;) {
        // One part: quoted or a plain word.
        char open = p[i];
        if (open == '"' || open == '`' || open == '[') {
            char close = open == '[' ? ']' : open;
            ++i;
            bool closed = false;
            bool empty = true;
            while (i < length) {
                if (p[i] == close) {
                    if (i + 1 < length && p[i + 1] == close) {
                        i += 2;   // a doubled quote stands for itself
                        empty = false;
                        continue;
                    }
                    ++i;
                    closed = true;
                    break;
                }
                ++i;
                empty = false;
            }
            if (!closed) {
                problem = "hat ein unpaariges Anf\xFChrungszeichen";
                return false;
            }
            if (empty) {
                problem = "hat einen leeren Namensteil";
                return false;
            }
        } else {
            int start = i;
            while (i < length && IsWordByte((unsigned char)p[i]))
                ++i;
            if (i == start) {
                if (i == length || p[i] == '.') {
                    problem = "hat einen leeren Namensteil";
                    return false;
                }
            }
        }
        if (i == length)
            return true;
        if (p[i] == '.') {
            ++i;
            if (i == length) {
                problem = "hat einen leeren Namensteil";
                return false;
            }
            continue;
        }
        // Whatever follows a part here would be read as SQL of its own.
        if (std::strchr("\"`[]'", p[i]) != nullptr)
            problem = "hat ein unpaariges Anf\xFChrungszeichen";
        else
            problem = "ist kein einfacher Name (Leerzeichen oder Satzzeichen au\xDF" "erhalb von Anf\xFChrungszeichen)";
        return false;
    }
}

CQoString QoQuoteSqlName(const CQoString& name, const char* quote)
{
    if (quote == nullptr || *quote == '\0')
        return name;
    CQoString open = quote;
    CQoString close = open == "[" ? CQoString("]") : open;
    CQoString quoted = open;
    const char* p = name.GetString();
    const int length = name.GetLength();
    const int closeLength = close.GetLength();
    for (int i = 0; i < length;) {
        if (i + closeLength <= length && std::memcmp(p + i, close.GetString(), (std::size_t)closeLength) == 0) {
            quoted += close;
            quoted += close;
            i += closeLength;
        } else {
            quoted += p[i];
            ++i;
        }
    }
    quoted += close;
    return quoted;
}

int QoSqlNameLastPart(const CQoString& name)
{
    const char* p = name.GetString();
    const int length = name.GetLength();
    int last = 0;
    for (int i = 0; i < length;) {
        char open = p[i];
        if (open == '"' || open == '`' || open == '[') {
            char close = open == '[' ? ']' : open;
            for (++i; i < length; ++i) {
                if (p[i] != close)
                    continue;
                if (i + 1 < length && p[i + 1] == close) {
                    ++i;
                    continue;
                }
                ++i;
                break;
            }
        } else if (open == '.') {
            last = ++i;
        } else {
            ++i;
        }
    }
    return last;
}

CQoString QoRunTableName(const CQoString& key)
{
    unsigned int hash = 2166136261u;   // FNV-1a
    for (int i = 0; i < key.GetLength(); ++i) {
        hash ^= static_cast<unsigned char>(key.GetString()[i]);
        hash *= 16777619u;
    }
    CQoString name;
    name.Format("qo_neu_%08x", hash);
    return name;
}
